// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
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
    configuration.stopRule.maxBlocks = 100;
    return configuration;
}

std::string complaintOf(const std::vector<sweep::NamedResult>& parts) {
    try {
        sweep::merge(parts);
    } catch (const sweep::Error& error) {
        return error.what();
    }
    return "none";
}

}  // namespace

TEST(Merge, NamesTheShardsThatAreMissing) {
    std::vector<sweep::NamedResult> parts = partsOf(oneEasyPoint(), 5);
    parts.erase(parts.begin() + 4);
    parts.erase(parts.begin() + 1);
    EXPECT_EQ(
        complaintOf(parts),
        "2 of 5 shards of the sweep of part 2 are missing: 1/5, 4/5; run them and give their files too");
}

TEST(Merge, RefusesAShardGivenTwice) {
    std::vector<sweep::NamedResult> parts = partsOf(oneEasyPoint(), 2);
    parts.push_back(parts.front());
    parts.back().name = "copy";
    EXPECT_EQ(complaintOf(parts), "copy and part 2 are both shard 2/2; give each shard once");
}

TEST(Merge, TakesShardsOfAnotherSweepForIncomplete) {
    std::vector<sweep::NamedResult> parts = partsOf(oneEasyPoint(), 2);
    sweep::Configuration other = oneEasyPoint();
    other.stopRule.maxBlocks = 101;
    for (const sweep::NamedResult& part : {partResult(other, {0, 2}), partResult(oneEasyPoint(), {0, 3})}) {
        parts[1] = part;
        EXPECT_THAT(complaintOf(parts), testing::HasSubstr(" shards of the sweep of part "));
    }
}

TEST(Merge, RefusesAShardThatIsUnfinished) {
    std::vector<sweep::NamedResult> parts = partsOf(oneEasyPoint(), 2);
    for (sweep::NamedResult& part : parts) {
        if (!part.result.points.empty()) {
            pointAt(part.result, 0).stoppedBy.reset();
        }
    }
    EXPECT_EQ(complaintOf(parts), "part 1 is unfinished; run its sweep to the end with --resume");
}

TEST(Merge, RefusesNothing) {
    EXPECT_EQ(complaintOf({}), "there is nothing to join; give results, or all parts of a sweep");
}

TEST(Merge, JoinsResultsByPoints) {
    const sweep::Result all = resultOf(smallSweep());
    sweep::Configuration some = smallSweep();
    some.blockSizes = {40};
    some.stopRule.maxBlocks = 200;
    sweep::Configuration others = smallSweep();
    others.blockSizes = {104};
    sweep::Configuration more = smallSweep();
    more.algorithms = {0};
    sweep::Configuration parts = smallSweep();
    parts.algorithms = {2};
    std::vector<sweep::NamedResult> results = partsOf(parts, 3);
    results.push_back({"some", resultOf(some)});
    results.push_back({"others", resultOf(others)});
    results.push_back({"more", resultOf(more)});
    EXPECT_EQ(sweep::resultText(sweep::merge(results)), sweep::resultText(all));
}

// The other one is a part of it: errors after every iteration of as many blocks tell more.
TEST(Merge, KeepsThePointThatTellsMost) {
    sweep::Configuration configuration = smallSweep();
    const sweep::NamedResult last = {"last", resultOf(configuration)};
    configuration.perIteration = true;
    const sweep::NamedResult every = {"every", resultOf(configuration)};
    EXPECT_EQ(sweep::resultText(sweep::merge({last, every})), sweep::resultText(every.result));
    EXPECT_EQ(sweep::resultText(sweep::merge({every, last})), sweep::resultText(every.result));
}

TEST(Merge, GivesTheSameInAnyOrder) {
    const sweep::NamedResult ended = {"ended", resultOf(oneEasyPoint())};
    sweep::NamedResult interrupted = {"interrupted", ended.result};
    pointAt(interrupted.result, 0).stoppedBy.reset();
    EXPECT_EQ(sweep::resultText(sweep::merge({ended, interrupted})), sweep::resultText(ended.result));
    EXPECT_EQ(sweep::resultText(sweep::merge({interrupted, ended})), sweep::resultText(ended.result));
}

TEST(Merge, RefusesResultsOfTwoSeeds) {
    EXPECT_EQ(complaintOf({{"a", {1, {}, {}}}, {"b", {2, {}, {}}}}),
              "b has seed 2 and a seed 1; only results of one seed can be joined");
}

TEST(Merge, RefusesPointsThatContradictEachOther) {
    const sweep::NamedResult right = {"right", resultOf(oneEasyPoint())};
    const std::string complaint =
        "wrong and right contradict each other at K 40, 2 units, algorithm 1, 1 iteration, llr 4, 5 dB; find "
        "the wrong one with 'quarzel verify-result'";
    sweep::NamedResult wrong = {"wrong", right.result};
    pointAt(wrong.result, 0).counts[0].bitErrors += 1;
    EXPECT_EQ(complaintOf({right, wrong}), complaint);
    pointAt(wrong.result, 0).blocks -= 1;
    EXPECT_EQ(complaintOf({right, wrong}), complaint);
}

}  // namespace quarzel::test
