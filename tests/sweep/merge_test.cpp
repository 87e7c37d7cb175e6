// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "sweep/error.hpp"
#include "sweeps.hpp"

namespace quarzel::test {

namespace {

sweep::Configuration oneEasyPoint() {
    sweep::Configuration configuration;
    configuration.blockSizes = {40};
    configuration.ebN0 = {{5'000'000}};
    configuration.iterations = {1};
    configuration.maxBlocks = 100;
    return configuration;
}

std::vector<sweep::NamedPart> partsOf(const sweep::Configuration& configuration, std::uint64_t count) {
    std::vector<sweep::NamedPart> parts;
    for (std::uint64_t index = 0; index < count; ++index) {
        parts.push_back(partOf(configuration, {index, count}));
    }
    return parts;
}

std::string complaintOf(const std::vector<sweep::NamedPart>& parts) {
    try {
        sweep::merge(parts);
    } catch (const sweep::Error& error) {
        return error.what();
    }
    return "none";
}

}  // namespace

TEST(Merge, NamesTheShardsThatAreMissing) {
    std::vector<sweep::NamedPart> parts = partsOf(oneEasyPoint(), 5);
    parts.erase(parts.begin() + 3);
    parts.erase(parts.begin());
    EXPECT_EQ(complaintOf(parts), "2 of 5 shards are missing: 1/5, 4/5; run them and give their files too");
}

TEST(Merge, RefusesAShardGivenTwice) {
    std::vector<sweep::NamedPart> parts = partsOf(oneEasyPoint(), 2);
    parts.push_back(parts.front());
    parts.back().name = "copy";
    EXPECT_EQ(complaintOf(parts), "copy and part 1 are both shard 1/2; give each shard once");
}

TEST(Merge, RefusesAShardOfAnotherSweep) {
    std::vector<sweep::NamedPart> parts = partsOf(oneEasyPoint(), 2);
    sweep::Configuration other = oneEasyPoint();
    other.seed = 2;
    parts[1] = partOf(other, {1, 2});
    EXPECT_EQ(
        complaintOf(parts),
        "part 2 and part 1 belong to different sweeps: the first has seed 2 instead of 1; give the shards of "
        "one sweep");
    parts[1] = partOf(oneEasyPoint(), {1, 3});
    EXPECT_EQ(
        complaintOf(parts),
        "part 2 and part 1 belong to different sweeps: shards 2/3 and 1/2; give the shards of one sweep");
}

TEST(Merge, RefusesAShardThatIsUnfinished) {
    std::vector<sweep::NamedPart> parts = partsOf(oneEasyPoint(), 2);
    parts[1].part.points[0].stoppedBy.reset();
    EXPECT_EQ(complaintOf(parts), "part 2 is unfinished; run its sweep to the end with --resume");
}

TEST(Merge, RefusesNothing) {
    EXPECT_EQ(complaintOf({}), "there is no part; give all shards of a sweep");
}

}  // namespace quarzel::test
