// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <iostream>
#include <random>

#include "interface/state.hpp"
#include "interleaver/interleaver.hpp"
#include "interleaver/lte_params.hpp"
#include "support/capture.hpp"
#include "support/model.hpp"

namespace quarzel::test {
namespace {

void expectUntouched(const Result& result) {
    EXPECT_EQ(result.outputs.dout_size, -77);
    EXPECT_EQ(result.outputs.tag, 0xDEADBEEFU);
    EXPECT_EQ(result.bits, std::vector<unsigned char>(6144, 0xEE));
}

/// Expect a call to be refused with a status and one line of error, its output record untouched.
void expectRefused(vardel_ip_quarzel_state* state, const vardel_ip_quarzel_inputs& inputs, int status,
                   const std::string& line) {
    Result result;
    const Output output = capture([&] { result = simulate(state, inputs); });
    EXPECT_EQ(result.status, status);
    EXPECT_EQ(output.err, line + "\n");
    EXPECT_EQ(output.out, "");
    expectUntouched(result);
}

TEST(Simulate, EachWrongArgumentIsNamedAndTheFirstOneWins) {
    const State state = makeState();
    const Block block(44);
    unsigned char bit = 0;
    vardel_ip_quarzel_outputs outputs{&bit, 1, -77, 5};
    vardel_ip_quarzel_outputs noBuffer{nullptr, 1, -77, 5};
    const vardel_ip_quarzel_inputs allWrong{nullptr, nullptr, nullptr, 0, 0, 0};
    const auto error = [](vardel_ip_quarzel_state* s, vardel_ip_quarzel_outputs* o,
                          vardel_ip_quarzel_inputs i) {
        return capture([&] { EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate(s, o, i), 1); }).err;
    };
    EXPECT_EQ(error(nullptr, nullptr, allWrong), "ERROR:decoder:Simulate called with null state structure\n");
    EXPECT_EQ(error(state.get(), nullptr, allWrong),
              "ERROR:decoder:Simulate called with null output structure\n");
    EXPECT_EQ(error(state.get(), &noBuffer, allWrong),
              "ERROR:decoder:Simulate called with null pointer for dout\n");
    EXPECT_EQ(error(state.get(), &outputs, allWrong), "ERROR:decoder:din_size must be a positive integer\n");
    vardel_ip_quarzel_inputs inputs = allWrong;
    inputs.din_size = 44;
    EXPECT_EQ(error(state.get(), &outputs, inputs), "ERROR:decoder:rsc1_sys must not be a null pointer\n");
    inputs.rsc1_sys = block.systematic.data();
    EXPECT_EQ(error(state.get(), &outputs, inputs), "ERROR:decoder:rsc1_par must not be a null pointer\n");
    inputs.rsc1_par = block.parity1.data();
    EXPECT_EQ(error(state.get(), &outputs, inputs), "ERROR:decoder:rsc2_par must not be a null pointer\n");
    inputs.rsc2_par = block.parity2.data();
    EXPECT_EQ(error(state.get(), &outputs, inputs),
              "ERROR:decoder:Number of iterations must be in the range 1 to 15\n");
    EXPECT_EQ(outputs.dout_size, -77);
    EXPECT_EQ(outputs.tag, 5U);
}

TEST(Simulate, IterationsFrom1To15AreAccepted) {
    const State state = makeState();
    Block block(44);
    for (int iterations = 1; iterations <= 15; ++iterations) {
        block.iterations = iterations;
        EXPECT_EQ(simulate(state.get(), block.inputs()).status, 0) << iterations;
    }
    for (const int iterations : {0, 16, -1, 2147483647, -2147483647 - 1}) {
        block.iterations = iterations;
        expectRefused(state.get(), block.inputs(), 1,
                      "ERROR:decoder:Number of iterations must be in the range 1 to 15");
    }
}

TEST(Simulate, NegativeSizeIsRefused) {
    const State state = makeState();
    vardel_ip_quarzel_inputs inputs = Block(44).inputs();
    inputs.din_size = -2147483647 - 1;
    expectRefused(state.get(), inputs, 1, "ERROR:decoder:din_size must be a positive integer");
}

TEST(Simulate, LengthsThatLeaveNoRoomForTheTailAreRefused) {
    const State state = makeState();
    for (const std::size_t size : {1U, 2U, 3U}) {
        expectRefused(state.get(), Block(size).inputs(), 2,
                      "ERROR:TDecoder3G:Number of soft inputs does not match rate and number of tail bits");
    }
}

TEST(Simulate, ABlockOfTailsAloneDecodesToNoBits) {
    const State state = makeState(genericsOf(8, 8, 0));
    for (int round = 0; round < 2; ++round) {
        const Result result = simulate(state.get(), Block(4).inputs());
        EXPECT_EQ(result.status, 0);
        EXPECT_EQ(result.outputs.dout_size, 0);
        EXPECT_EQ(simulate(state.get(), Block(44).inputs()).outputs.dout_size, 40);
    }
}

TEST(Simulate, SizesThatTheInterleaverLacksAreRefusedEachTimeAndTheStateStaysGood) {
    for (const int units : {2, 4, 8}) {
        const State state = makeState(genericsOf(units, 8, 1));
        for (const unsigned K : {1U, 7U, 8U, 32U, 41U, 44U, 520U, 6176U, 6208U, 8192U, 100000U}) {
            for (int round = 0; round < 3; ++round) {
                expectRefused(
                    state.get(), Block(K + 4).inputs(), 2,
                    "ERROR:TDecoder3G:The interleaver has no block size of " + std::to_string(K) + " bits");
            }
            const Result good = simulate(state.get(), Block(44).inputs());
            EXPECT_EQ(good.status, 0);
            EXPECT_EQ(good.outputs.dout_size, 40);
        }
    }
}

TEST(Simulate, SizesThatCannotBeSegmentedAreRefusedEachTime) {
    const State state = makeState(genericsOf(4, 8, 1));
    const std::string line = "ERROR:TDecoder3GPU:Block size not supported";
    for (int round = 0; round < 3; ++round) {
        expectRefused(state.get(), Block(1004 + 4).inputs(), 2, line);
        expectRefused(state.get(), Block(1004 + 4).inputs(), 2, line);
        expectRefused(state.get(), Block(6152 + 4).inputs(), 2, line);
        EXPECT_EQ(simulate(state.get(), Block(1008 + 4).inputs()).status, 0);
    }
}

TEST(Simulate, ARefusedSizeChangesNothingOfTheNextBlocks) {
    std::mt19937 random(20260801);
    std::uniform_int_distribution<int> value(-128, 127);
    for (const unsigned K : {40U, 512U, 1024U}) {
        Block block(K + 4);
        for (auto* stream : {&block.systematic, &block.parity1, &block.parity2}) {
            for (int& soft : *stream) {
                soft = value(random);
            }
        }
        const State fresh = makeState();
        const State used = makeState();
        capture([&] {
            simulate(used.get(), Block(45).inputs());
            simulate(used.get(), Block(1008).inputs());
            simulate(used.get(), Block(6148).inputs());
        });
        const Result expected = simulate(fresh.get(), block.inputs());
        EXPECT_EQ(simulate(used.get(), block.inputs()).bits, expected.bits) << K;
    }
}

TEST(Simulate, SaturationIsToldOnceInTheLifeOfAState) {
    const struct {
        const char* stream;
        std::vector<int> Block::*values;
    } streams[] = {{"RSC1 systematic", &Block::systematic},
                   {"RSC1 parity", &Block::parity1},
                   {"RSC2 parity", &Block::parity2}};
    for (const auto& [name, values] : streams) {
        for (const int value : {128, -129}) {
            const State state = makeState();
            Block block(44);
            (block.*values)[17] = value;
            (block.*values)[30] = -value;
            const std::string direction = value > 0 ? "positively" : "negatively";
            EXPECT_EQ(capture([&] { simulate(state.get(), block.inputs()); }).out,
                      "WARNING:decoder:" + std::string(name) + " value in position 17 saturated " +
                          direction + ", further saturation will not be reported\n");
            EXPECT_EQ(state->saturation_reported, 1);
            EXPECT_EQ(capture([&] { simulate(state.get(), block.inputs()); }).out, "");
        }
    }
}

TEST(Simulate, WarningsComeEvenWhenTheBlockIsRefused) {
    const State state = makeState();
    const Output output =
        capture([&] { EXPECT_EQ(simulate(state.get(), Block(45, 1000).inputs()).status, 2); });
    EXPECT_EQ(output.out,
              "WARNING:decoder:RSC1 systematic value in position 0 saturated positively, further saturation "
              "will not be reported\n");
    EXPECT_EQ(output.err, "ERROR:TDecoder3G:The interleaver has no block size of 41 bits\n");
}

TEST(Simulate, TagIsMaskedAndItsTruncationToldOnce) {
    const State state = makeState();
    Block block(44);
    block.tag = 0xFF;
    EXPECT_EQ(capture([&] { EXPECT_EQ(simulate(state.get(), block.inputs()).outputs.tag, 0xFFU); }).out, "");
    block.tag = 0x1FF;
    EXPECT_EQ(capture([&] { EXPECT_EQ(simulate(state.get(), block.inputs()).outputs.tag, 0xFFU); }).out,
              "WARNING:decoder:Input block tag has been truncated to 8 bits, further truncation will not be "
              "reported\n");
    EXPECT_EQ(capture([&] { EXPECT_EQ(simulate(state.get(), block.inputs()).outputs.tag, 0xFFU); }).out, "");
}

TEST(Simulate, TagWidthsOf0And32ClearEveryTag) {
    for (const int width : {0, 32}) {
        const State state = makeState(genericsOf(2, width, 1));
        Block block(44);
        block.tag = 0;
        EXPECT_EQ(capture([&] { simulate(state.get(), block.inputs()); }).out, "");
        block.tag = 1;
        EXPECT_EQ(capture([&] { EXPECT_EQ(simulate(state.get(), block.inputs()).outputs.tag, 0U); }).out,
                  "WARNING:decoder:Input block tag has been truncated to " + std::to_string(width) +
                      " bits, further truncation will not be reported\n");
    }
}

TEST(Simulate, BufferMustHoldEveryDecision) {
    const State state = makeState();
    const Block block(44);
    EXPECT_EQ(simulate(state.get(), block.inputs(), 40).status, 0);
    for (const int allocated : {39, 0}) {
        Result result;
        const Output output = capture([&] { result = simulate(state.get(), block.inputs(), allocated); });
        EXPECT_EQ(result.status, 1);
        EXPECT_EQ(output.err, "ERROR:decoder:Insufficient allocated space for output array\n");
        expectUntouched(result);
    }
}

TEST(Simulate, ANegativeBufferSizeIsTakenAsBoundless) {
    const State state = makeState();
    EXPECT_EQ(simulate(state.get(), Block(44).inputs(), -1).outputs.dout_size, 40);
}

TEST(Simulate, BytesBehindTheDecisionsAreUntouched) {
    const State state = makeState();
    const Result result = simulate(state.get(), Block(44).inputs());
    for (std::size_t i = 40; i < result.bits.size(); ++i) {
        ASSERT_EQ(result.bits[i], 0xEE) << i;
    }
}

TEST(Simulate, APositiveSoftValueMeansBit1) {
    // The code word of 40 zeros is all zeros; of any word, its systematic values alone decide at full scale.
    for (const int algorithm : {0, 1, 2}) {
        const State state = makeState(genericsOf(2, 8, algorithm));
        Block block(44, 0);
        for (std::size_t i = 0; i < 40; ++i) {
            block.systematic[i] = i % 3 == 0 ? 100 : -100;
        }
        const Result result = simulate(state.get(), block.inputs());
        for (std::size_t i = 0; i < 40; ++i) {
            EXPECT_EQ(result.bits[i], i % 3 == 0 ? 1 : 0) << algorithm << " " << i;
        }
    }
}

TEST(Simulate, ATieDecides1) {
    const State state = makeState();
    const Result result = simulate(state.get(), Block(44, 0).inputs());
    for (std::size_t i = 0; i < 40; ++i) {
        EXPECT_EQ(result.bits[i], 1) << i;
    }
}

TEST(Simulate, StatesDoNotAffectEachOtherAndBlocksAreForgotten) {
    constexpr unsigned seed = 42;
    std::cout << "seed " << seed << "\n";
    std::mt19937 random(seed);
    std::uniform_int_distribution<int> value(-40, 40);
    const State shared = makeState(genericsOf(8, 8, 2));
    for (int round = 0; round < 60; ++round) {
        const LteParams& params = lteParams[random() % lteParams.size()];
        Block block(params.K + 4);
        for (auto* stream : {&block.systematic, &block.parity1, &block.parity2}) {
            for (int& soft : *stream) {
                soft = value(random);
            }
        }
        const State fresh = makeState(genericsOf(8, 8, 2));
        ASSERT_EQ(simulate(shared.get(), block.inputs()).bits, simulate(fresh.get(), block.inputs()).bits)
            << "K " << params.K << " round " << round;
    }
}

TEST(Simulate, AHugeSizeIsRefusedWithoutATableForIt) {
    const State state = makeState();
    // The permutation alone would take 40 MB.
    const Block block(10'000'004);
    std::vector<unsigned char> bits(10'000'000);
    vardel_ip_quarzel_outputs outputs{bits.data(), 10'000'000, -77, 5};
    const Output output = capture(
        [&] { EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate(state.get(), &outputs, block.inputs()), 2); });
    EXPECT_EQ(output.err, "ERROR:TDecoder3G:The interleaver has no block size of 10000000 bits\n");
    EXPECT_EQ(state->interleaver->itsPermutation.capacity(), 0U);
    EXPECT_EQ(outputs.dout_size, -77);
}

}  // namespace
}  // namespace quarzel::test
