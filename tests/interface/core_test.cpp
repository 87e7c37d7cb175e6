// SPDX-License-Identifier: MIT
// The C++ class over the C interface.
#include "quarzel/core.hpp"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "support/capture.hpp"

namespace quarzel::test {
namespace {

const std::vector<int> zeros(44, -8);

TEST(Core, DecodesABlockAndMasksItsTag) {
    Core core({.units = 4, .algorithm = 2, .tagWidth = 4}, [](MessageKind, std::string_view) {});
    std::vector<unsigned char> bits(40, 7);
    EXPECT_EQ(core.decode(zeros, zeros, zeros, 3, bits, 0x1F), 0xFU);
    EXPECT_EQ(bits, std::vector<unsigned char>(40, 0));
}

TEST(Core, ThrowsWhatIsWrong) {
    const auto messageOf = [](const auto& work) -> std::string {
        try {
            work();
        } catch (const Error& error) {
            return error.what() + std::string(", status ") + std::to_string(error.status()) + ", block " +
                   std::to_string(error.block());
        } catch (const std::invalid_argument& error) {
            return error.what();
        }
        return "";
    };
    const Output output = capture([&] {
        EXPECT_EQ(messageOf([] { const Core core({.units = 3}); }),
                  "C_NUM_PU must be either 2, 4 or 8, status 1, block 0");
        Core core;
        std::vector<unsigned char> bits(120);
        EXPECT_EQ(messageOf([&] { core.decode(zeros, zeros, zeros, 16, bits); }),
                  "Number of iterations must be in the range 1 to 15, status 1, block 0");
        EXPECT_EQ(messageOf([&] { core.decode(zeros, {}, zeros, 1, bits); }),
                  "the three streams must be of one length");
        std::vector<vardel_ip_quarzel_inputs> inputs(3, {zeros.data(), zeros.data(), zeros.data(), 44, 2, 0});
        inputs[1].din_size = 43;
        std::vector<vardel_ip_quarzel_outputs> outputs;
        for (std::size_t i = 0; i < 3; ++i) {
            outputs.push_back({bits.data() + 40 * i, 40, 0, 0});
        }
        EXPECT_EQ(messageOf([&] { core.decode(inputs, outputs); }),
                  "The interleaver has no block size of 39 bits, status 2, block 1");
        EXPECT_EQ(outputs[2].dout_size, 40);
        EXPECT_EQ(messageOf([&] { core.decode(inputs, std::span(outputs).first(2)); }),
                  "there must be one output for each input");
        const std::vector<std::int8_t> values(3 * 44);
        const auto blocks = softBlocks<std::int8_t>(values, 44);
        EXPECT_EQ(messageOf([&] { core.decode(blocks, 1, bits); }),
                  "there must be room for 40 decisions, not 120");
        EXPECT_EQ(messageOf([&] { softBlocks<std::int8_t>(values, 43); }),
                  "132 soft values are not whole blocks of 3 x 43");
        EXPECT_EQ(messageOf([&] { core.choose("abacus"); }),
                  "There is no implementation 'abacus' on this machine, status 1, block 0");
        core.decode(zeros, zeros, zeros, 1, bits);  // good for the next block
    });
    EXPECT_EQ(output.out + output.err, "");
}

TEST(Core, HandsWarningsToItsHandlerOrToTheStandardOutputStream) {
    const std::vector<int> loud(44, 200);
    std::vector<unsigned char> bits(40);
    std::string seen;
    const Output silence = capture([&] {
        Core core({}, [&](MessageKind kind, std::string_view text) {
            seen += std::to_string(static_cast<int>(kind)) + std::string(text);
        });
        core.decode(loud, zeros, zeros, 1, bits);
    });
    EXPECT_EQ(seen,
              "2WARNING:decoder:RSC1 systematic value in position 0 saturated positively, further saturation "
              "will not be reported");
    EXPECT_EQ(silence.out, "");
    const Output output = capture([&] { Core().decode(loud, zeros, zeros, 1, bits); });
    EXPECT_EQ("2" + output.out, seen + "\n");
    EXPECT_EQ(plainText("WARNING:decoder:a: b"), "a: b");
}

TEST(Core, LetsWhatAHandlerThrowsThroughOnceTheCallIsDone) {
    Core core;
    int passes = 0;
    core.passes(3, [&](const vardel_ip_quarzel_pass&) {
        ++passes;
        throw std::runtime_error("enough");
    });
    std::vector<unsigned char> bits(40, 7);
    EXPECT_THROW(core.decode(zeros, zeros, zeros, 2, bits), std::runtime_error);
    EXPECT_EQ(passes, 1);  // no handler is called again once one has thrown
    EXPECT_EQ(bits[0], 0);
    core.decode(zeros, zeros, zeros, 2, bits);
}

TEST(Core, DecodesArraysAndGivesEveryIteration) {
    Core core({.units = 8});
    const std::vector<std::int16_t> values(2 * 3 * 68, 5);
    const auto blocks = softBlocks<std::int16_t>(values, 68);
    std::vector<unsigned char> last(2 * 64);
    std::vector<unsigned char> every(2 * 3 * 64);
    std::vector<unsigned> tags = {1, 0x102};
    capture([&] { core.decode(blocks, 3, last, tags); });
    core.decodeEveryIteration(blocks, 3, every);
    EXPECT_EQ(tags, (std::vector<unsigned>{1, 2}));
    for (std::size_t i = 0; i < 2; ++i) {
        EXPECT_TRUE(std::equal(last.begin() + static_cast<std::ptrdiff_t>(64 * i),
                               last.begin() + static_cast<std::ptrdiff_t>(64 * (i + 1)),
                               every.begin() + static_cast<std::ptrdiff_t>(64 * (3 * i + 2))));
    }
}

TEST(Core, MovesWithItsHandlers) {
    int lines = 0;
    Core first({}, [&](MessageKind, std::string_view) { ++lines; });
    Core second = std::move(first);
    second.trace(1);
    std::vector<unsigned char> bits(40);
    second.decode(zeros, zeros, zeros, 1, bits);
    EXPECT_GT(lines, 40);
    second.choose("literal");
    EXPECT_EQ(second.implementation(), "literal");
    EXPECT_EQ(implementations().back(), "literal");
}

}  // namespace
}  // namespace quarzel::test
