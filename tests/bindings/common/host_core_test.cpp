// SPDX-License-Identifier: MIT
#include "common/host_core.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <limits>
#include <new>
#include <random>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "common/encoding.hpp"
#include "support/capture.hpp"
#include "support/model.hpp"
#include "support/random.hpp"

namespace {

using namespace quarzel::bindings;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

Outcome open(HostCore& core, int units = 2, int algorithm = 1, int tagWidth = 8) {
    return core.open({units, algorithm, tagWidth});
}

/// Blocks of one size, and room for their bits.
template <class Value>
struct Blocks {
    std::size_t positions;
    std::vector<Value> values;
    std::vector<unsigned char> bits;
    std::vector<unsigned> tags;

    Blocks(std::size_t K, std::size_t count, Value value = -8)
        : positions(K + 4), values(3 * positions * count, value), bits(K * count, 0xEE), tags(count) {}

    DecodeJob job(int iterations) {
        return {quarzel::softBlocks<Value>(values, positions), iterations, bits, tags};
    }
};

template <class Value>
Blocks<Value> randomBlocks(std::mt19937& random, std::size_t K, std::size_t count) {
    Blocks<Value> blocks(K, count);
    std::generate(blocks.values.begin(), blocks.values.end(),
                  [&] { return static_cast<Value>(static_cast<int>(random() % 41) - 20); });
    std::generate(blocks.tags.begin(), blocks.tags.end(), [&] { return random() % 256; });
    return blocks;
}

/// What single calls of the C interface decide after some iterations of each block.
template <class Value>
std::vector<unsigned char> expectedBits(vardel_ip_quarzel_state* state, const Blocks<Value>& blocks,
                                        int iterations) {
    const std::vector<int> soft(blocks.values.begin(), blocks.values.end());
    const auto positions = static_cast<std::ptrdiff_t>(blocks.positions);
    std::vector<unsigned char> bits;
    for (const int* block = soft.data(); block != soft.data() + soft.size(); block += 3 * positions) {
        const auto result = quarzel::test::simulate(state, {block, block + positions, block + 2 * positions,
                                                            static_cast<int>(positions), iterations, 0});
        EXPECT_EQ(result.status, 0);
        bits.insert(bits.end(), result.bits.begin(), result.bits.begin() + positions - 4);
    }
    return bits;
}

template <class Value>
void expectSingleCalls(std::size_t K, std::size_t count) {
    std::mt19937 random = quarzel::test::seededRandom();
    HostCore core;
    ASSERT_TRUE(open(core, 8, 2).done());
    const auto state = quarzel::test::makeState(quarzel::test::genericsOf(8, 8, 2));
    Blocks<Value> blocks = randomBlocks<Value>(random, K, count);
    const std::vector<unsigned> tags = blocks.tags;
    const Outcome outcome = core.decode(blocks.job(3));
    ASSERT_TRUE(outcome.done()) << outcome.message();
    EXPECT_THAT(outcome.warnings, IsEmpty());
    EXPECT_EQ(blocks.bits, expectedBits(state.get(), blocks, 3));
    EXPECT_EQ(blocks.tags, tags);
}

TEST(HostCore, DecodesArraysOfSeveralGroupsAsSingleCallsDo) {
    expectSingleCalls<std::int8_t>(40, 4200);
    expectSingleCalls<std::int16_t>(1024, 150);
    expectSingleCalls<std::int32_t>(6144, 33);
}

TEST(HostCore, GivesTheDecisionsOfEveryIteration) {
    constexpr std::size_t K = 512;
    constexpr std::size_t count = 200;
    std::mt19937 random = quarzel::test::seededRandom();
    HostCore core;
    ASSERT_TRUE(open(core, 8, 2).done());
    const auto state = quarzel::test::makeState(quarzel::test::genericsOf(8, 8, 2));
    auto blocks = randomBlocks<std::int8_t>(random, K, count);
    std::vector<unsigned char> all(3 * K * count);
    DecodeJob job = blocks.job(3);
    job.bits = all;
    job.everyIteration = true;
    ASSERT_TRUE(core.decode(job).done());
    for (int iterations = 1; iterations <= 3; ++iterations) {
        const std::vector<unsigned char> expected = expectedBits(state.get(), blocks, iterations);
        for (std::size_t block = 0; block < count; ++block) {
            const std::size_t at = (3 * block + static_cast<std::size_t>(iterations) - 1) * K;
            EXPECT_TRUE(std::equal(expected.begin() + static_cast<std::ptrdiff_t>(K * block),
                                   expected.begin() + static_cast<std::ptrdiff_t>(K * (block + 1)),
                                   all.begin() + static_cast<std::ptrdiff_t>(at)))
                << "block " << block << " after " << iterations;
        }
    }
}

TEST(HostCore, DecodesBlocksOfSeveralSizesAsABatch) {
    std::mt19937 random = quarzel::test::seededRandom();
    HostCore core;
    ASSERT_TRUE(open(core, 8, 2).done());
    const auto state = quarzel::test::makeState(quarzel::test::genericsOf(8, 8, 2));
    std::vector<Blocks<int>> blocks;
    for (const std::size_t K : {40U, 1024U, 40U, 512U, 64U}) {
        blocks.push_back(randomBlocks<int>(random, K, 1));
    }
    std::vector<vardel_ip_quarzel_inputs> inputs;
    std::vector<vardel_ip_quarzel_outputs> outputs;
    for (Blocks<int>& block : blocks) {
        const int* const soft = block.values.data();
        inputs.push_back({soft, soft + block.positions, soft + 2 * block.positions,
                          static_cast<int>(block.positions), 3, block.tags[0]});
        outputs.push_back({block.bits.data(), static_cast<int>(block.bits.size()), 0, 0});
    }
    ASSERT_TRUE(core.decodeBatch(inputs, outputs).done());
    for (std::size_t i = 0; i < blocks.size(); ++i) {
        EXPECT_EQ(blocks[i].bits, expectedBits(state.get(), blocks[i], 3)) << "block " << i;
        EXPECT_EQ(outputs[i].tag, blocks[i].tags[0]);
    }
    EXPECT_TRUE(core.decodeBatch({}, {}).done());
    inputs[1].din_size = 45;
    EXPECT_THAT(core.decodeBatch(inputs, outputs).text, HasSubstr("streams of 45 soft values"));
    inputs[0].iterations = 0;
    EXPECT_THAT(core.decodeBatch(inputs, outputs).text, HasSubstr("not 0"));
}

TEST(HostCore, RefusesSettingsByTheNamesOfTheHost) {
    HostCore core;
    EXPECT_EQ(open(core, 3).text, "units must be 2, 4 or 8, not 3");
    EXPECT_EQ(open(core, 2, 3).text, "algorithm must be 0, 1 or 2, not 3");
    EXPECT_EQ(open(core, 2, 1, 33).text, "tag width must be a number from 0 to 32, not 33");
    EXPECT_EQ(algorithmOf("max-star"), 2);
    const Outcome outcome = guarded([] { algorithmOf("log-map"); });
    EXPECT_EQ(outcome.fault, Fault::value);
    EXPECT_EQ(outcome.text,
              "there is no algorithm 'log-map'; choose one of max-log, scaled-max-log, max-star");
}

TEST(HostCore, TakesTheImplementationThatIsAskedFor) {
    for (const std::string& name : quarzel::implementations()) {
        HostCore core;
        ASSERT_TRUE(core.open({}, name).done());
        EXPECT_EQ(core.implementation(), name);
    }
    HostCore core;
    EXPECT_THAT(core.open({}, "abacus").text,
                testing::AllOf(StartsWith("there is no implementation 'abacus'; choose one of "),
                               HasSubstr("literal")));
    ASSERT_TRUE(core.open({}).done());
    EXPECT_EQ(core.implementation(), quarzel::implementations().front());
}

TEST(HostCore, RefusesAWrongSizeWithTheNearestOnes) {
    HostCore core;
    ASSERT_TRUE(open(core).done());
    Blocks<int> blocks(41, 1);
    const Outcome outcome = core.decode(blocks.job(6));
    EXPECT_EQ(outcome.fault, Fault::value);
    EXPECT_EQ(outcome.text,
              "there is no block size for streams of 45 soft values; the nearest that have one: "
              "44 (K = 40), 52 (K = 48)");
    EXPECT_EQ(blocks.bits[0], 0xEE);
}

TEST(HostCore, RefusesIterationsThatTheCoreDoesNotHave) {
    HostCore core;
    ASSERT_TRUE(open(core).done());
    Blocks<int> blocks(40, 1);
    EXPECT_EQ(core.decode(blocks.job(16)).text, "iterations must be a number from 1 to 15, not 16");
}

TEST(HostCore, RefusesWorkAfterTheEnd) {
    HostCore core;
    ASSERT_TRUE(open(core).done());
    EXPECT_TRUE(core.close().done());
    EXPECT_TRUE(core.close().done());
    Blocks<int> blocks(40, 1);
    EXPECT_EQ(core.decode(blocks.job(6)).fault, Fault::closed);
    EXPECT_EQ(core.traceText(blocks.job(6), 1).fault, Fault::closed);
}

TEST(HostCore, RefusesASecondThreadAndAnEndDuringACall) {
    HostCore core;
    ASSERT_TRUE(open(core).done());
    Blocks<int> blocks(40, 1);
    Fault decoding = Fault::none;
    Fault closing = Fault::none;
    const Outcome first = core.decode(blocks.job(6), [&] {
        std::thread([&] {
            decoding = core.decode(blocks.job(6)).fault;
            closing = core.close().fault;
        }).join();
        return false;
    });
    EXPECT_TRUE(first.done());
    EXPECT_EQ(decoding, Fault::busy);
    EXPECT_EQ(closing, Fault::busy);
    EXPECT_TRUE(core.decode(blocks.job(6)).done());
}

TEST(HostCore, StopsBetweenGroupsWhenTheUserAsksForIt) {
    HostCore core;
    ASSERT_TRUE(open(core).done());
    Blocks<std::int8_t> blocks(6144, 100);
    int groups = 0;
    EXPECT_EQ(core.decode(blocks.job(1), [&] { return ++groups == 2; }).fault, Fault::interrupted);
    EXPECT_EQ(groups, 2);
    EXPECT_EQ(blocks.bits.back(), 0xEE) << "the last group was not decoded";
}

TEST(HostCore, HandsOverTheWarningsOfTheModelAndPrintsNothing) {
    HostCore core;
    ASSERT_TRUE(open(core, 2, 1, 4).done());
    Blocks<std::int16_t> blocks(40, 1, 200);
    blocks.tags[0] = 0x1F;
    Outcome outcome;
    const auto printed = quarzel::test::capture([&] { outcome = core.decode(blocks.job(6)); });
    EXPECT_THAT(outcome.warnings, ElementsAre("RSC1 systematic value in position 0 saturated positively, "
                                              "further saturation will not be reported",
                                              "Input block tag has been truncated to 4 bits, "
                                              "further truncation will not be reported"));
    EXPECT_EQ(blocks.tags[0], 0xFU);
    EXPECT_EQ(printed.out, "");
    EXPECT_EQ(printed.err, "");
}

TEST(HostCore, TracesTheFirstPassesOfOneBlockAsText) {
    HostCore core;
    ASSERT_TRUE(open(core).done());
    Blocks<int> blocks(40, 1);
    Outcome outcome = core.traceText(blocks.job(2), 3);
    ASSERT_TRUE(outcome.done());
    EXPECT_THAT(outcome.trace, HasSubstr("decode=0 siso=2\n"));
    EXPECT_THAT(outcome.trace, testing::Not(HasSubstr("siso=3")));
    EXPECT_THAT(core.decode(blocks.job(2)).trace, IsEmpty());
    outcome = core.traceText(blocks.job(2), 30);
    EXPECT_THAT(outcome.trace, HasSubstr("decode=2 siso=3\n"));
    EXPECT_EQ(outcome.trace.find("itsSys [0]"), outcome.trace.rfind("itsSys [0]")) << "one block alone";
    EXPECT_THAT(core.decode(blocks.job(2)).trace, IsEmpty());
}

TEST(HostCore, HandsOverTheFirstPassesOfOneBlock) {
    HostCore core;
    ASSERT_TRUE(open(core).done());
    Blocks<int> blocks(40, 1);
    std::vector<unsigned> passes;
    const auto note = [&](const vardel_ip_quarzel_pass& pass) { passes.push_back(pass.pass); };
    ASSERT_TRUE(core.tracePasses(blocks.job(2), 3, note).done());
    EXPECT_THAT(passes, ElementsAre(0, 1, 2));
    passes.clear();
    ASSERT_TRUE(core.tracePasses(blocks.job(1), 30, note).done());
    EXPECT_THAT(passes, ElementsAre(0, 1));
    ASSERT_TRUE(core.decode(blocks.job(2)).done());
    EXPECT_THAT(passes, ElementsAre(0, 1)) << "no pass of a later block";
}

TEST(HostCore, HandsOverNoPassAfterAFailure) {
    HostCore core;
    ASSERT_TRUE(open(core).done());
    Blocks<int> blocks(40, 1);
    int calls = 0;
    const Outcome outcome = core.tracePasses(blocks.job(2), 4, [&](const vardel_ip_quarzel_pass&) {
        ++calls;
        throw std::runtime_error("odd");
    });
    EXPECT_EQ(outcome.fault, Fault::model);
    EXPECT_STREQ(outcome.message(), "odd");
    calls = 0;
    ASSERT_TRUE(core.decode(blocks.job(2)).done());
    EXPECT_EQ(calls, 0);
}

TEST(Guarded, LetsNothingThrough) {
    EXPECT_EQ(guarded([] { throw std::bad_alloc(); }).fault, Fault::memory);
    EXPECT_EQ(guarded([] { throw 1; }).fault, Fault::model);
    EXPECT_EQ(guarded([] { throw std::invalid_argument("odd"); }).fault, Fault::value);
    EXPECT_EQ(guarded([] { throw quarzel::Error("no memory", 99); }).fault, Fault::memory);
    const Outcome outcome = guarded([] { throw std::runtime_error("odd"); });
    EXPECT_EQ(outcome.fault, Fault::model);
    EXPECT_STREQ(outcome.message(), "odd");
}

TEST(BindingsEncoding, RefusesSizesAndBitsThatThereAreNot) {
    std::vector<std::uint8_t> code(3 * 44);
    const std::vector<std::uint8_t> bits(41, 0);
    EXPECT_EQ(encode(bits.data(), 41, 1, code.data()).text,
              "there is no block size of 41 bits; the nearest: 40, 48");
    const std::vector<std::uint8_t> packed(40, 0xFF);
    EXPECT_THAT(encode(packed.data(), 40, 1, code.data()).text, StartsWith("a bit must be 0 or 1"));
    ASSERT_TRUE(encode(bits.data(), 40, 1, code.data()).done());
    EXPECT_THAT(code, testing::Each(0));
}

}  // namespace
