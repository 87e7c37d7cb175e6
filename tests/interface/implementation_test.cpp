// SPDX-License-Identifier: MIT
// Lanes decode where nothing can tell them from a literal decode: each thing that could has its test here.
#include <gtest/gtest.h>

#include <functional>
#include <iostream>
#include <string>
#include <vector>

#include "decoder/decoder_3gpu.hpp"
#include "engine/engine_mod_hash.hpp"
#include "interface/lane_implementation.hpp"
#include "interleaver/interleaver_3gpplte.hpp"
#include "support/capture.hpp"
#include "support/model.hpp"
#include "support/random.hpp"

namespace quarzel::test {
namespace {

std::vector<std::string> names() {
    std::vector<std::string> all;
    while (const char* name = vardel_ip_quarzel_get_implementation_name(static_cast<int>(all.size()))) {
        all.emplace_back(name);
    }
    return all;
}

TEST(Implementation, TheLastNameIsLiteralAndAStateStartsWithTheFirst) {
    const std::vector<std::string> all = names();
    ASSERT_GE(all.size(), 2U);
    EXPECT_EQ(all.back(), "literal");
    EXPECT_EQ(vardel_ip_quarzel_get_implementation_name(-1), nullptr);
    EXPECT_EQ(vardel_ip_quarzel_get_implementation(makeState().get()), all.front());
}

TEST(Implementation, EachNameCanBeChosenAndGivesTheSameBits) {
    std::mt19937 random = seededRandom();
    Block block(1056 + 4);
    for (std::vector<int>* stream : {&block.systematic, &block.parity1, &block.parity2}) {
        for (int& value : *stream) {
            value = static_cast<int>(random() % 40) - 20;
        }
    }
    const Result expected = simulate(makeState().get(), block.inputs());
    for (const std::string& name : names()) {
        std::cout << "implementation run: " << name << '\n';
        const State state = makeState();
        ASSERT_EQ(vardel_ip_quarzel_set_implementation(state.get(), name.c_str()), 0);
        EXPECT_EQ(vardel_ip_quarzel_get_implementation(state.get()), name);
        EXPECT_EQ(takesLanes(*state, 1056), name != "literal");
        EXPECT_EQ(simulate(state.get(), block.inputs()).bits, expected.bits) << name;
    }
}

TEST(Implementation, AnUnknownNameIsRefusedAndChangesNothing) {
    const State state = makeState();
    const std::string before = vardel_ip_quarzel_get_implementation(state.get());
    const Output output = capture([&] {
        EXPECT_EQ(vardel_ip_quarzel_set_implementation(state.get(), "abacus"), 1);
        EXPECT_EQ(vardel_ip_quarzel_set_implementation(state.get(), nullptr), 1);
    });
    EXPECT_EQ(output.err,
              "ERROR:decoder:There is no implementation 'abacus' on this machine\n"
              "ERROR:decoder:There is no implementation '' on this machine\n");
    EXPECT_EQ(vardel_ip_quarzel_get_implementation(state.get()), before);
}

/// Something that a program with its hands in a state may do.
struct Change {
    const char* name;
    int algorithm;
    std::function<void(vardel_ip_quarzel_state&)> apply;
    bool lanes = false;  ///< whether lanes may decode afterwards
};

void replace(TNumberFormat*& format, const TNumberFormat& by) {
    *format = by;
}

std::vector<std::uint32_t> reversed(std::uint32_t K) {
    std::vector<std::uint32_t> table(K);
    for (std::uint32_t i = 0; i < K; ++i) {
        table[i] = K - 1 - i;
    }
    return table;
}

std::vector<std::uint32_t> standard(std::uint32_t K) {
    std::vector<std::uint32_t> table;
    TInterleaver3GPPLTE().calcInterleaver(table, K);
    return table;
}

TCalculationEngine* newEngine(vardel_ip_quarzel_state& state, const char* properties) {
    delete state.engine;
    state.engine = TCalculationEngine::create(properties);
    state.engine->setFormats(state.input_format, state.state_format, state.branch_format);
    EXPECT_TRUE(state.engine->initialise());
    state.decoder->connect(state.interleaver, state.engine);
    return state.engine;
}

struct OwnDecoder : TDecoder3GPU {
    OwnDecoder() : TDecoder3GPU(false, 2, 4) {}
};

void newDecoder(vardel_ip_quarzel_state& state, TDecoder* decoder) {
    const double scale = state.decoder->extrinsicScale();
    delete state.decoder;
    state.decoder = decoder;
    decoder->connect(state.interleaver, state.engine);
    decoder->setExtrinsicScale(scale);
}

struct OwnInterleaver : TInterleaver3GPPLTE {};

const std::vector<Change>& changes() {
    static const std::vector<Change> all = {
        {"input format", 1, [](auto& state) { replace(state.input_format, TNumberFormat(6, 3)); }},
        {"state format", 1, [](auto& state) { replace(state.state_format, TNumberFormat(11, 3)); }},
        {"branch format", 1, [](auto& state) { replace(state.branch_format, TNumberFormat(7, 3)); }},
        {"a field of the state format", 1, [](auto& state) { state.state_format->mask = -256; }},
        {"a limit of the input format", 1, [](auto& state) { state.input_format->max = 16384; }},
        {"extrinsic scale", 1, [](auto& state) { state.decoder->setExtrinsicScale(0.5); }},
        {"the scale of another type", 1, [](auto& state) { state.decoder->setExtrinsicScale(1.0); }},
        {"engine of another type", 0, [](auto& state) { newEngine(state, "MOD#:16"); }},
        {"engine with another table", 2, [](auto& state) { newEngine(state, "MOD#:8"); }},
        {"a table built for another format", 2,
         [](auto& state) {
             const TNumberFormat right = *state.state_format;
             replace(state.state_format, TNumberFormat(12, 4));
             newEngine(state, "MOD#:16");
             replace(state.state_format, right);
         }},
        {"engine without a table", 2, [](auto& state) { newEngine(state, "MOD"); }},
        {"a state format that the engine does not have", 1,
         [](auto& state) {
             static TNumberFormat right = *state.state_format;
             state.engine->setFormats(state.input_format, &right, state.branch_format);
             replace(state.state_format, TNumberFormat(11, 3));
         }},
        {"an equal engine", 2, [](auto& state) { newEngine(state, "MOD#:16"); }, true},
        {"a decoder with other units", 1,
         [](auto& state) { newDecoder(state, new TDecoder3GPU(false, 8, 4)); }},
        {"a decoder of the other layout", 1,
         [](auto& state) { newDecoder(state, new TDecoder3GPU(true, 2, 4)); }},
        {"a decoder of a class of its own", 1, [](auto& state) { newDecoder(state, new OwnDecoder); }},
        {"an equal decoder", 1, [](auto& state) { newDecoder(state, new TDecoder3GPU(false, 2, 4)); }, true},
        {"an interleaver of a class of its own", 1,
         [](auto& state) {
             delete state.interleaver;
             state.interleaver = new OwnInterleaver;
             state.decoder->connect(state.interleaver, state.engine);
         }},
        {"a permutation of the block's size", 1,
         [](auto& state) { state.interleaver->itsPermutation = reversed(512); }},
        {"an inverse permutation of the block's size", 1,
         [](auto& state) { state.interleaver->itsInversePermutation = reversed(512); }},
        {"an inverse permutation that ends otherwise", 1,
         [](auto& state) {
             TInterleaver& interleaver = *state.interleaver;
             interleaver.itsInversePermutation.resize(512);
             for (std::uint32_t i = 0; i < 512; ++i) {
                 interleaver.itsInversePermutation[standard(512)[i]] = i;
             }
             std::swap(interleaver.itsInversePermutation[510], interleaver.itsInversePermutation[511]);
         }},
        {"a permutation of another size", 1,
         [](auto& state) { state.interleaver->itsPermutation = reversed(40); }, true},
        {"an equal permutation", 1, [](auto& state) { state.interleaver->itsPermutation = standard(512); },
         true},
        {"a verbosity", 1, [](auto& state) { state.decoder->setVerbosity(1); }},
        {"a dump", 1, [](auto& state) { vardel_ip_quarzel_bitacc_dump_config(&state, 1); }},
        {"a-priori values", 1,
         [](auto& state) { state.decoder->setExtrinsicIn(std::vector<short>(515, 800)); }},
        {"no lanes", 1,
         [](auto& state) {
             delete state.lanes;
             state.lanes = nullptr;
             EXPECT_STREQ(vardel_ip_quarzel_get_implementation(&state), "literal");
             EXPECT_EQ(vardel_ip_quarzel_set_implementation(&state, "literal"), 0);
             EXPECT_EQ(vardel_ip_quarzel_set_implementation(&state, "baseline"), 1);
         }},
        {"passes asked for", 1,
         [](auto& state) {
             vardel_ip_quarzel_set_passes(
                 &state, 1, [](void*, const vardel_ip_quarzel_pass*) {}, nullptr);
         }},
    };
    return all;
}

TEST(Implementation, LanesDecodeOnlyWhereNothingCanTell) {
    std::mt19937 random = seededRandom();
    for (const Change& change : changes()) {
        SCOPED_TRACE(change.name);
        Block block(512 + 4);
        for (std::vector<int>* stream : {&block.systematic, &block.parity1, &block.parity2}) {
            for (int& value : *stream) {
                value = static_cast<int>(random() % 60) - 30;
            }
        }
        const auto run = [&](bool literal, Output& output) {
            std::vector<Result> results;
            output = capture([&] {
                const State state = makeState(genericsOf(2, 8, change.algorithm));
                if (literal) {
                    vardel_ip_quarzel_set_implementation(state.get(), "literal");
                }
                results.push_back(simulate(state.get(), block.inputs()));
                change.apply(*state);
                EXPECT_EQ(takesLanes(*state, 512), change.lanes && !literal);
                results.push_back(simulate(state.get(), block.inputs()));
                results.push_back(simulate(state.get(), Block(44, 5).inputs()));
                results.push_back(simulate(state.get(), block.inputs()));
            });
            return results;
        };
        Output literalOutput;
        Output output;
        const std::vector<Result> expected = run(true, literalOutput);
        const std::vector<Result> got = run(false, output);
        for (std::size_t i = 0; i < got.size(); ++i) {
            EXPECT_EQ(got[i].status, expected[i].status) << "call " << i;
            EXPECT_EQ(got[i].bits, expected[i].bits) << "call " << i;
        }
        EXPECT_EQ(output.out, literalOutput.out);
        EXPECT_EQ(output.err, literalOutput.err);
    }
}

/// What a trace shows after blocks of some sizes were decoded and something changed.
/// @param K  of the block that is traced
Output traceAfter(bool literal, const std::vector<std::size_t>& sizes,
                  const std::function<void(vardel_ip_quarzel_state&)>& change, std::size_t K) {
    const State state = makeState(genericsOf(8, 8, 2));
    if (literal) {
        vardel_ip_quarzel_set_implementation(state.get(), "literal");
    }
    return capture([&] {
        std::mt19937 random(7);
        for (const std::size_t size : sizes) {
            Block block(size + 4);
            for (std::vector<int>* stream : {&block.systematic, &block.parity1, &block.parity2}) {
                for (int& value : *stream) {
                    value = static_cast<int>(random() % 256) - 128;
                }
            }
            EXPECT_EQ(simulate(state.get(), block.inputs()).status, 0);
        }
        change(*state);
        vardel_ip_quarzel_bitacc_dump_config(state.get(), 2);
        simulate(state.get(), Block(K + 4, 3).inputs());
    });
}

/// The same for a trace of K = 40 after larger blocks.
Output traceAfter(bool literal, const std::function<void(vardel_ip_quarzel_state&)>& change) {
    return traceAfter(literal, {512, 6144, 40, 1024}, change, 40);
}

TEST(LaneHistory, ATraceShowsWhatLiteralDecodesWouldHaveLeftWhateverWasChangedSince) {
    const std::vector<Change> later = {
        {"nothing", 2, [](auto&) {}},
        {"scale", 2, [](auto& state) { state.decoder->setExtrinsicScale(0.25); }},
        {"engine", 2, [](auto& state) { newEngine(state, "MOD"); }},
        {"permutation", 2, [](auto& state) { state.interleaver->itsPermutation = reversed(1024); }},
        {"verbosity", 2, [](auto& state) { state.decoder->setVerbosity(9); }},
        {"a block that the decoder was given", 2,
         [](auto& state) {
             std::vector<unsigned char> decisions;
             EXPECT_TRUE(state.decoder->decode(std::vector<short>(3 * 48 + 12, 320), decisions, 2));
         }},
        {"implementation", 2, [](auto& state) { vardel_ip_quarzel_set_implementation(&state, "literal"); }},
    };
    for (const Change& change : later) {
        SCOPED_TRACE(change.name);
        const Output expected = traceAfter(true, change.apply);
        const Output got = traceAfter(false, change.apply);
        ASSERT_GT(expected.out.size(), 10000U);
        EXPECT_EQ(got.out, expected.out);
        EXPECT_EQ(got.err, expected.err);
    }
}

TEST(LaneHistory, ABlockHidesTheSmallerOnesBeforeIt) {
    const auto nothing = [](auto&) {};
    EXPECT_EQ(traceAfter(false, {2048, 512, 6144, 40}, nothing, 1056).out,
              traceAfter(true, {2048, 512, 6144, 40}, nothing, 1056).out);
}

TEST(LaneHistory, AnotherDecoderHasNone) {
    const auto change = [](vardel_ip_quarzel_state& state) {
        newDecoder(state, new TDecoder3GPU(false, 8, 4));
    };
    EXPECT_EQ(traceAfter(false, change).out, traceAfter(true, change).out);
}

TEST(LaneHistory, ADumpThatIsToStopTheDecodeStillDoes) {
    const State state = makeState();
    simulate(state.get(), Block(1024 + 4).inputs());
    state->decoder->setDump(1, true);
    const Output output = capture([&] { EXPECT_EQ(simulate(state.get(), Block(44).inputs()).status, 2); });
    EXPECT_EQ(output.err, "STOP:Dump complete\n");
}

TEST(LaneHistory, CountersGoOnAsIfAllWasDecodedLiterally) {
    const State state = makeState();
    Block block(44);
    block.iterations = 5;
    simulate(state.get(), block.inputs());
    simulate(state.get(), block.inputs());
    EXPECT_EQ(state->decoder->decodeCount(), 2U);
    EXPECT_EQ(state->decoder->sisoCount(), 20U);
    capture([&] {
        vardel_ip_quarzel_bitacc_dump_config(state.get(), 1);
        simulate(state.get(), block.inputs());
    });
    EXPECT_EQ(state->decoder->decodeCount(), 3U);
    EXPECT_EQ(state->decoder->sisoCount(), 30U);
}

}  // namespace
}  // namespace quarzel::test
