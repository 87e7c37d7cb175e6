// SPDX-License-Identifier: MIT
#include "common/core.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <random>
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

Outcome open(Core& core, int units = 2, int algorithm = 1, int tagWidth = 8) {
    return core.open({units, algorithm, tagWidth});
}

/// A block of one value everywhere, and room for its bits.
template <class Value>
struct Even {
    std::vector<Value> stream;
    std::vector<unsigned char> bits;

    explicit Even(std::size_t K, Value value = -8) : stream(K + 4, value), bits(K, 0xEE) {}

    SoftBlock block(SoftType type) {
        return {{stream.data(), stream.data(), stream.data()}, type, stream.size(), bits.data()};
    }
};

TEST(BindingsCore, DecodesMixedSizesAndTypesAsSingleCallsDo) {
    std::mt19937 random = quarzel::test::seededRandom();
    Core core;
    ASSERT_TRUE(open(core, 8, 2).done());
    const auto state = quarzel::test::makeState(quarzel::test::genericsOf(8, 8, 2));
    std::vector<std::vector<int>> ints;
    std::vector<std::vector<std::int8_t>> bytes;
    std::vector<std::vector<unsigned char>> bits;
    std::vector<SoftBlock> blocks;
    constexpr std::size_t sizes[] = {40, 1024, 40, 512, 64};
    for (std::size_t i = 0; i < 300; ++i) {
        const std::size_t K = sizes[random() % 5];
        std::vector<int>& values = ints.emplace_back(3 * (K + 4));
        std::generate(values.begin(), values.end(), [&] { return static_cast<int>(random() % 41) - 20; });
        bytes.emplace_back(values.begin(), values.end());
        bits.emplace_back(K);
    }
    for (std::size_t i = 0; i < ints.size(); ++i) {
        const std::size_t positions = bits[i].size() + 4;
        const bool narrow = random() % 2 == 0;
        const auto stream = [&](std::size_t number) -> const void* {
            return narrow ? static_cast<const void*>(bytes[i].data() + number * positions)
                          : static_cast<const void*>(ints[i].data() + number * positions);
        };
        blocks.push_back({{stream(0), stream(1), stream(2)},
                          narrow ? SoftType::int8 : SoftType::int32,
                          positions,
                          bits[i].data(),
                          static_cast<unsigned>(i % 256)});
    }
    const Outcome outcome = core.decode(blocks, 3);
    ASSERT_TRUE(outcome.done()) << outcome.message();
    EXPECT_THAT(outcome.warnings, IsEmpty());
    for (std::size_t i = 0; i < ints.size(); ++i) {
        const std::size_t positions = bits[i].size() + 4;
        const int* const soft = ints[i].data();
        const auto expected = quarzel::test::simulate(
            state.get(), {soft, soft + positions, soft + 2 * positions, static_cast<int>(positions), 3, 0});
        ASSERT_EQ(expected.status, 0);
        EXPECT_TRUE(std::equal(bits[i].begin(), bits[i].end(), expected.bits.begin())) << "block " << i;
        EXPECT_EQ(blocks[i].tag, i % 256);
    }
}

TEST(BindingsCore, RefusesSettingsByTheNamesOfTheHost) {
    Core core;
    EXPECT_EQ(open(core, 3).text, "units must be 2, 4 or 8, not 3");
    EXPECT_EQ(open(core, 2, 3).text, "algorithm must be 0, 1 or 2, not 3");
    EXPECT_EQ(open(core, 2, 1, 33).text, "tag width must be a number from 0 to 32, not 33");
    EXPECT_EQ(algorithmOf("max-star"), 2);
    EXPECT_THROW(algorithmOf("log-map"), BindingError);
}

TEST(BindingsCore, RefusesAWrongSizeWithTheNearestOnes) {
    Core core;
    ASSERT_TRUE(open(core).done());
    Even<int> even(41);
    SoftBlock block = even.block(SoftType::int32);
    const Outcome outcome = core.decode({&block, 1}, 6);
    EXPECT_EQ(outcome.fault, Fault::value);
    EXPECT_EQ(outcome.text,
              "streams of 45 soft values fit no block size; the nearest that do: 44 (K = 40), 52 (K = 48)");
    EXPECT_EQ(even.bits[0], 0xEE);
}

TEST(BindingsCore, RefusesIterationsThatTheCoreDoesNotHave) {
    Core core;
    ASSERT_TRUE(open(core).done());
    Even<int> even(40);
    SoftBlock block = even.block(SoftType::int32);
    EXPECT_EQ(core.decode({&block, 1}, 16).text, "iterations must be a number from 1 to 15, not 16");
}

TEST(BindingsCore, RefusesWorkAfterTheEnd) {
    Core core;
    ASSERT_TRUE(open(core).done());
    EXPECT_TRUE(core.close().done());
    EXPECT_TRUE(core.close().done());
    Even<int> even(40);
    SoftBlock block = even.block(SoftType::int32);
    EXPECT_EQ(core.decode({&block, 1}, 6).fault, Fault::closed);
    std::string text;
    EXPECT_EQ(core.trace(block, 6, 1, text).fault, Fault::closed);
}

TEST(BindingsCore, RefusesASecondThreadAndAnEndDuringACall) {
    Core core;
    ASSERT_TRUE(open(core).done());
    Even<int> even(40);
    SoftBlock block = even.block(SoftType::int32);
    Fault decoding = Fault::none;
    Fault closing = Fault::none;
    const Outcome first = core.decode({&block, 1}, 6, [&] {
        std::thread([&] {
            SoftBlock other = even.block(SoftType::int32);
            decoding = core.decode({&other, 1}, 6).fault;
            closing = core.close().fault;
        }).join();
        return false;
    });
    EXPECT_TRUE(first.done());
    EXPECT_EQ(decoding, Fault::busy);
    EXPECT_EQ(closing, Fault::busy);
    EXPECT_TRUE(core.decode({&block, 1}, 6).done());
}

TEST(BindingsCore, StopsWhenTheUserAsksForIt) {
    Core core;
    ASSERT_TRUE(open(core).done());
    Even<int> even(40);
    SoftBlock block = even.block(SoftType::int32);
    EXPECT_EQ(core.decode({&block, 1}, 6, [] { return true; }).fault, Fault::interrupted);
}

TEST(BindingsCore, TakesWholeRealNumbersOnly) {
    Core core;
    ASSERT_TRUE(open(core).done());
    for (const double value : {0.5, 1e10, std::numeric_limits<double>::quiet_NaN()}) {
        Even<double> even(40, value);
        SoftBlock block = even.block(SoftType::float64);
        EXPECT_THAT(core.decode({&block, 1}, 6).text, StartsWith("a soft value is no whole number"));
    }
    Even<double> whole(40, 8.0);
    Even<int> same(40, 8);
    SoftBlock blocks[] = {whole.block(SoftType::float64), same.block(SoftType::int32)};
    EXPECT_TRUE(core.decode(blocks, 6).done());
    EXPECT_EQ(whole.bits, same.bits);
}

TEST(BindingsCore, HandsOverTheWarningsOfTheModelAndPrintsNothing) {
    Core core;
    ASSERT_TRUE(open(core, 2, 1, 4).done());
    Even<std::int16_t> even(40, 200);
    SoftBlock block = even.block(SoftType::int16);
    block.tag = 0x1F;
    Outcome outcome;
    const auto printed = quarzel::test::capture([&] { outcome = core.decode({&block, 1}, 6); });
    EXPECT_THAT(outcome.warnings, ElementsAre("RSC1 systematic value in position 0 saturated positively, "
                                              "further saturation will not be reported",
                                              "Input block tag has been truncated to 4 bits, "
                                              "further truncation will not be reported"));
    EXPECT_EQ(block.tag, 0xFU);
    EXPECT_EQ(printed.out, "");
    EXPECT_EQ(printed.err, "");
}

TEST(BindingsCore, TracesTheFirstPassesOfOneBlock) {
    Core core;
    ASSERT_TRUE(open(core).done());
    Even<int> even(40);
    SoftBlock block = even.block(SoftType::int32);
    std::string text;
    ASSERT_TRUE(core.trace(block, 2, 3, text).done());
    EXPECT_THAT(text, HasSubstr("decode=0 siso=2\n"));
    EXPECT_THAT(text, testing::Not(HasSubstr("siso=3")));
    ASSERT_TRUE(core.decode({&block, 1}, 2).done());
    ASSERT_TRUE(core.trace(block, 2, 30, text).done());
    EXPECT_THAT(text, HasSubstr("decode=2 siso=3\n"));
    EXPECT_EQ(text.find("itsSys [0]"), text.rfind("itsSys [0]")) << "one block alone";
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
