// SPDX-License-Identifier: MIT
// The passes that a receiver gets are those that the text trace prints.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "decoder/trace_columns.hpp"
#include "engine/dump_columns.hpp"
#include "fixed/number_format.hpp"
#include "support/capture.hpp"
#include "support/model.hpp"
#include "support/random.hpp"

namespace quarzel::test {
namespace {

/// The text trace, put together from passes.
struct PassText {
    std::string text;
    int passes = 0;
    std::vector<unsigned> codes;

    void take(const vardel_ip_quarzel_pass& pass) {
        ++passes;
        codes.push_back(pass.code);
        EXPECT_EQ(pass.steps, pass.block_size + 3);
        if (pass.pass == 0) {
            text += std::string(120, '-') + "\n";
            static constexpr const char* labels[] = {"itsSys ", "itsPar0", "itsPar1"};
            for (std::size_t code = 0; code < 2; ++code) {
                for (std::size_t stream = 0; stream < 3; ++stream) {
                    std::string line;
                    for (unsigned step = 0; step < pass.steps; ++step) {
                        line += (step == 0 ? "" : " ") + std::to_string(pass.inputs[code][stream][step]);
                    }
                    text += labels[stream] + ("[" + std::to_string(code) + "]=[") + line + "]\n";
                }
            }
        }
        text += std::string(289, '-') + "\ndecode=" + std::to_string(pass.block) +
                " siso=" + std::to_string(pass.pass) + "\n" + heading() + "\n";
        const TNumberFormat format(12, 3);
        for (unsigned step = 0; step < pass.steps; ++step) {
            appendStep(text, step);
            appendReal(text, pass.intrinsic[step], format);
            const auto group = [&](const std::int16_t* values, unsigned width) {
                text += "  ";
                for (unsigned i = 0; i < width; ++i) {
                    appendReal(text, values[width * step + i], format);
                }
            };
            group(pass.alpha, 8);
            group(pass.beta, 8);
            group(pass.gamma, 4);
            group(pass.llr, 1);
            appendReal(text, pass.extrinsic[step], format);
            text += "\n";
        }
    }

    /// From the names of the signals: they stand over the columns.
    static std::string heading() {
        std::string text = "n    ";
        vardel_ip_quarzel_signal signal{};
        for (int i = 0; vardel_ip_quarzel_get_signal(i, &signal) == 0; ++i) {
            for (unsigned value = 0; value < signal.width; ++value) {
                const bool gap = value == 0 && i >= 1 && i <= 4;
                std::string name = signal.name;
                name += signal.width > 1 ? std::to_string(signal.first + value) : "";
                text += (gap ? "  " : "") + name;
                // The table's own heading is not wholly aligned: the last column ends with its name.
                text += std::string(i == 5 ? 0 : 12 - name.size(), ' ');
            }
        }
        return text;
    }

    static void receive(void* cookie, const vardel_ip_quarzel_pass* pass) {
        static_cast<PassText*>(cookie)->take(*pass);
    }
};

Block noisyBlock(std::mt19937& random, std::size_t K) {
    Block block(K + 4);
    for (std::vector<int>* stream : {&block.systematic, &block.parity1, &block.parity2}) {
        for (int& value : *stream) {
            value = static_cast<int>(random() % 256) - 128;
        }
    }
    return block;
}

TEST(PassPort, GivesWhatTheTextTracePrints) {
    std::mt19937 random = seededRandom();
    for (const std::size_t K : {40U, 512U}) {
        const State state = makeState(genericsOf(4, 8, 2));
        // Blocks decoded in lanes before leave their metrics, which the termination steps show.
        simulate(state.get(), noisyBlock(random, 1024).inputs());
        PassText passes;
        const Output output = capture([&] {
            vardel_ip_quarzel_bitacc_dump_config(state.get(), 6);
            EXPECT_EQ(vardel_ip_quarzel_set_passes(state.get(), 6, PassText::receive, &passes), 0);
            simulate(state.get(), noisyBlock(random, K).inputs());
            simulate(state.get(), noisyBlock(random, 40).inputs());
        });
        EXPECT_EQ(passes.passes, 6);
        EXPECT_EQ(passes.codes, (std::vector<unsigned>{2, 1, 2, 1, 2, 1}));
        EXPECT_EQ(passes.text, output.out);
    }
}

TEST(PassPort, NeedsNoTextTraceAndChangesNoDecision) {
    std::mt19937 random = seededRandom();
    const Block block = noisyBlock(random, 1056);
    const State plain = makeState();
    const State watched = makeState();
    PassText passes;
    vardel_ip_quarzel_set_passes(watched.get(), 3, PassText::receive, &passes);
    Result result;
    const Output output = capture([&] { result = simulate(watched.get(), block.inputs()); });
    EXPECT_EQ(output.out, "");
    EXPECT_EQ(passes.passes, 3);
    EXPECT_EQ(result.bits, simulate(plain.get(), block.inputs()).bits);
}

TEST(PassPort, EndsWithACountOfZeroOrWithoutAReceiver) {
    const State state = makeState();
    PassText passes;
    vardel_ip_quarzel_set_passes(state.get(), 4, PassText::receive, &passes);
    vardel_ip_quarzel_set_passes(state.get(), 0, PassText::receive, &passes);
    simulate(state.get(), Block(44).inputs());
    vardel_ip_quarzel_set_passes(state.get(), 4, nullptr, &passes);
    simulate(state.get(), Block(44).inputs());
    EXPECT_EQ(passes.passes, 0);
}

TEST(PassPort, ComesBeforeTheTextOfThePass) {
    const State state = makeState();
    struct Seen {
        std::string order;
    } seen;
    vardel_ip_quarzel_set_messages(
        state.get(),
        [](void* cookie, int, const char* text) {
            if (std::string(text).starts_with("decode=")) {
                static_cast<Seen*>(cookie)->order += "text ";
            }
        },
        &seen);
    vardel_ip_quarzel_bitacc_dump_config(state.get(), 2);
    vardel_ip_quarzel_set_passes(
        state.get(), 2,
        [](void* cookie, const vardel_ip_quarzel_pass*) { static_cast<Seen*>(cookie)->order += "pass "; },
        &seen);
    simulate(state.get(), Block(44).inputs());
    EXPECT_EQ(seen.order, "pass text pass text ");
}

}  // namespace
}  // namespace quarzel::test
