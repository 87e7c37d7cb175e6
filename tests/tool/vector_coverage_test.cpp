// SPDX-License-Identifier: MIT
#include "vectors/vector_coverage.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "quarzel/code.hpp"

namespace quarzel::test {

namespace {

/// A block whose soft values are all 8, but for those listed (position in all three streams, value).
std::vector<std::int8_t> softWith(std::uint32_t K,
                                  const std::vector<std::pair<std::size_t, std::int8_t>>& others = {}) {
    std::vector<std::int8_t> soft(3 * (K + 4), 8);
    for (const auto& [position, value] : others) {
        soft[position] = value;
    }
    return soft;
}

const std::vector<std::string> allOfThem = {"a block size",
                                            "a window shape",
                                            "a correction in an only segment",
                                            "a correction in a first segment",
                                            "a correction in a middle segment",
                                            "a correction in a last segment",
                                            "-128 in rsc1_sys",
                                            "127 in rsc1_sys",
                                            "-128 in rsc1_par",
                                            "127 in rsc1_par",
                                            "-128 in rsc2_par",
                                            "127 in rsc2_par"};

}  // namespace

TEST(VectorCoverage, MissesEverythingWithoutABlock) {
    EXPECT_EQ(tool::VectorCoverage(2).missing(), allOfThem);
}

TEST(VectorCoverage, CountsEndsOfTheRangeByStream) {
    tool::VectorCoverage coverage(2);
    coverage.add(40, 6, "x", softWith(40, {{0, -128}, {44, 127}, {131, -128}, {130, 0}}),
                 std::vector<unsigned char>(40, 1));
    const nlohmann::ordered_json streams = coverage.toJson().at("values_by_stream");
    EXPECT_EQ(streams.at("rsc1_sys").dump(), R"({"-128":1,"0":0,"127":0})");
    EXPECT_EQ(streams.at("rsc1_par").dump(), R"({"-128":0,"0":0,"127":1})");
    EXPECT_EQ(streams.at("rsc2_par").dump(), R"({"-128":1,"0":1,"127":0})");
}

// A core of 2 units cuts 512 bits into 8 segments of 64.
TEST(VectorCoverage, CountsCorrectionsBySegment) {
    tool::VectorCoverage coverage(2);
    coverage.add(512, 6, "x", softWith(512, {{0, -8}, {63, -1}, {64, -8}, {447, -8}, {511, -8}, {100, 0}}),
                 std::vector<unsigned char>(512, 1));
    EXPECT_EQ(coverage.toJson().at("corrections_by_segment").dump(),
              R"({"only":0,"first":2,"middle":2,"last":1})");
    coverage.add(40, 6, "x", softWith(40, {{7, -8}}), std::vector<unsigned char>(40, 1));
    EXPECT_EQ(coverage.toJson().at("corrections_by_segment").at("only"), 1);
    EXPECT_THAT(coverage.missing(), testing::Not(testing::Contains(testing::HasSubstr("correction"))));
}

TEST(VectorCoverage, WantsEveryBlockSize) {
    tool::VectorCoverage coverage(8);
    for (const BlockSize& size : blockSizes()) {
        EXPECT_THAT(coverage.missing(), testing::Contains("a block size"));
        coverage.add(size.K, 1, "x", softWith(size.K), std::vector<unsigned char>(size.K, 1));
    }
    EXPECT_THAT(coverage.missing(), testing::Not(testing::Contains("a block size")));
    EXPECT_THAT(coverage.missing(), testing::Not(testing::Contains("a window shape")));
    EXPECT_EQ(coverage.toJson().at("blocks_by_iterations").dump(), R"({"1":188})");
}

}  // namespace quarzel::test
