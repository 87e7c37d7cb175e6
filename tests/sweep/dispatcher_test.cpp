// SPDX-License-Identifier: MIT
// The stop rule against a plain loop over the blocks, with made-up errors that come back in any order.
#include "sweep/dispatcher.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <optional>
#include <random>
#include <utility>
#include <vector>

#include "support/random.hpp"
#include "sweep/error.hpp"
#include "sweep/merge.hpp"

namespace quarzel::test {

namespace {

/// The bit errors of each block, made up.
using BitErrors = std::vector<std::uint32_t>;

sweep::ErrorList outcomeOf(const sweep::Task& task, const sweep::Shard& shard, const BitErrors& bitErrors) {
    sweep::ErrorList list;
    for (const std::uint64_t octet : sweep::octetNumbers(task, shard)) {
        for (std::uint64_t block = 8 * octet;
             block < std::min<std::uint64_t>(8 * octet + 8, bitErrors.size()); ++block) {
            if (bitErrors[block] != 0) {
                list.append(block, &bitErrors[block], 1);
            }
        }
    }
    return list;
}

/// Take all tasks of a plan of one point and give back what comes of them in random order, some of them
/// early.
sweep::PointState runInAnyOrder(const sweep::Plan& plan, const BitErrors& bitErrors, std::mt19937& random) {
    sweep::Dispatcher dispatcher(plan);
    std::vector<sweep::Task> atWork;
    while (true) {
        const std::optional<sweep::Task> task = dispatcher.next(1 + static_cast<unsigned>(random() % 3));
        if (task) {
            atWork.push_back(*task);
        }
        while (!atWork.empty() && (!task || random() % 2 == 0)) {
            const std::size_t pick = random() % atWork.size();
            dispatcher.complete(atWork[pick], outcomeOf(atWork[pick], dispatcher.plan().shard, bitErrors));
            atWork.erase(atWork.begin() + static_cast<std::ptrdiff_t>(pick));
        }
        if (!task) {
            EXPECT_TRUE(dispatcher.hasFinished());
            return dispatcher.stateOf(0);
        }
    }
}

BitErrors someErrors(std::mt19937& random) {
    BitErrors bitErrors(608);
    const std::uint64_t oneIn = 1 + random() % 40;
    for (std::uint32_t& errors : bitErrors) {
        errors = random() % oneIn == 0 ? 1 + static_cast<std::uint32_t>(random() % 500) : 0;
    }
    return bitErrors;
}

sweep::StopRule someRule(std::mt19937& random) {
    return {1 + random() % 600, random() % 20, 0};
}

/// A plan of one point.
sweep::Plan planOf(const sweep::StopRule& rule, const sweep::PointState& start = sweep::PointState()) {
    return {1, {{sweep::Setup{}, rule, start}}, 0, {}};
}

sweep::PointState plainLoop(const sweep::StopRule& rule, const BitErrors& bitErrors) {
    sweep::PointState point;
    while (point.blocks < rule.maxBlocks) {
        const std::uint32_t& errors = bitErrors[point.blocks++];
        point.add(&errors);
        if (errors != 0 && point.last().blockErrors == rule.maxBlockErrors) {
            point.stoppedBy = sweep::StopReason::blockErrors;
            return point;
        }
    }
    point.stoppedBy = sweep::StopReason::blocks;
    return point;
}

void expectEqual(const sweep::PointState& point, const sweep::PointState& expected) {
    EXPECT_EQ(point.blocks, expected.blocks);
    EXPECT_EQ(point.last(), expected.last());
    EXPECT_EQ(point.bitErrorSquares, expected.bitErrorSquares);
    EXPECT_EQ(point.stoppedBy, expected.stoppedBy);
}

}  // namespace

TEST(Dispatcher, EndsAPointWhereAPlainLoopDoesWhateverTheOrder) {
    std::mt19937 random = seededRandom();
    for (int round = 0; round < 200; ++round) {
        const BitErrors bitErrors = someErrors(random);
        const sweep::StopRule rule = someRule(random);
        const sweep::PointState expected = plainLoop(rule, bitErrors);
        expectEqual(runInAnyOrder(planOf(rule), bitErrors, random), expected);

        // The same in two sweeps, the second of which goes on where the first has ended.
        const sweep::StopRule former = someRule(random);
        const sweep::PointState begun = runInAnyOrder(planOf(former), bitErrors, random);
        const sweep::PointState extended = runInAnyOrder(planOf(rule, begun), bitErrors, random);
        expectEqual(extended, begun.blocks >= expected.blocks ? begun : expected);
        ASSERT_FALSE(HasFailure()) << "round " << round;
    }
}

// Such as one that was interrupted and goes on with a lower limit. Repeated, it has to come out the same.
TEST(Dispatcher, EndsAPointByBlocksThatHasMoreErrorsThanAsked) {
    sweep::PointState start;
    start.blocks = 16;
    start.counts[0] = {9, 9};
    sweep::Dispatcher dispatcher(planOf({100, 5, 0}, start));
    EXPECT_TRUE(dispatcher.hasFinished());
    EXPECT_EQ(dispatcher.stateOf(0).stoppedBy, sweep::StopReason::blocks);
    EXPECT_EQ(dispatcher.stateOf(0).blocks, 16U);
}

TEST(Dispatcher, DividesBlocksAmongShards) {
    std::mt19937 random = seededRandom();
    for (int round = 0; round < 50; ++round) {
        const BitErrors bitErrors = someErrors(random);
        const sweep::StopRule rule{1 + random() % bitErrors.size(), 0, 0};
        const std::uint64_t shards = 2 + random() % 90;  // sometimes more than there are octets
        std::vector<sweep::NamedResult> parts;
        for (std::uint64_t index = 0; index < shards; ++index) {
            sweep::Plan plan = planOf(rule);
            plan.shard = {index, shards};
            const sweep::PointState point = runInAnyOrder(plan, bitErrors, random);
            parts.push_back({"", {1, {{sweep::Setup{}, point}}, sweep::Part{plan.shard, ""}}});
        }
        expectEqual(sweep::merge(parts).points.begin()->second, plainLoop(rule, bitErrors));
        ASSERT_FALSE(HasFailure()) << "round " << round;
    }
}

TEST(Dispatcher, GoesOnFromWhatIsDone) {
    std::mt19937 random = seededRandom();
    const BitErrors bitErrors = someErrors(random);
    for (const auto& [rule, shard] : {std::pair{sweep::StopRule{403, 30, 0}, sweep::Shard{0, 1}},
                                      std::pair{sweep::StopRule{403, 0, 0}, sweep::Shard{1, 3}}}) {
        sweep::Plan plan = planOf(rule);
        plan.shard = shard;
        const sweep::PointState whole = runInAnyOrder(plan, bitErrors, random);
        for (bool isFinished = false; !isFinished;) {
            sweep::Dispatcher dispatcher(plan);
            if (const auto task = dispatcher.next()) {
                dispatcher.complete(*task, outcomeOf(*task, shard, bitErrors));
            }
            isFinished = dispatcher.hasFinished();
            plan.points[0].start = dispatcher.stateOf(0);
        }
        expectEqual(plan.points[0].start, whole);
    }
}

TEST(Dispatcher, EndsAPointAtItsTimeLimitAndRepeatsItWithoutOne) {
    sweep::Plan plan = planOf({1000, 100, 3600});
    plan.points.push_back(plan.points[0]);
    plan.points[1].setup.ebN0 = {1'000'000};
    plan.points[0].start.seconds = 3600;
    sweep::Dispatcher dispatcher(plan);
    const auto task = dispatcher.next();
    dispatcher.complete(*task, {});
    const sweep::PointState stopped = dispatcher.stateOf(0);
    EXPECT_EQ(stopped.stoppedBy, sweep::StopReason::time);
    EXPECT_EQ(stopped.blocks, 8 * task->octets);
    EXPECT_EQ(dispatcher.next()->point, 1U);

    sweep::Dispatcher again(sweep::repetitionOf(1, {{plan.points[0].setup, stopped}}));
    again.complete(*again.next(), {});
    EXPECT_EQ(again.stateOf(0).blocks, stopped.blocks);
    EXPECT_TRUE(again.hasFinished());
}

TEST(Dispatcher, HandsOutNothingAfterItWasStopped) {
    sweep::Dispatcher dispatcher(planOf({}));
    EXPECT_TRUE(dispatcher.next());
    dispatcher.stop();
    EXPECT_FALSE(dispatcher.next());
    EXPECT_FALSE(dispatcher.hasFinished());
}

// The second point of four has a rate below the target. Tasks of the third one are under way by then.
TEST(Dispatcher, EndsACurveBelowItsTarget) {
    sweep::Plan plan = planOf({100, 0, 0});
    plan.targetBler = 0.1;
    const BitErrors often(100, 1);
    BitErrors seldom(100, 0);
    std::fill_n(seldom.begin(), 9, 1);
    for (const std::int32_t ebN0 : {1, 2, 3}) {
        plan.points.push_back(plan.points.front());
        plan.points.back().setup.ebN0 = {ebN0};
    }
    plan.points.push_back(plan.points.front());
    plan.points.back().setup.iterations = 7;
    sweep::Dispatcher dispatcher(plan);
    std::vector<sweep::Task> tasks;
    while (tasks.empty() || tasks.back().point < 2) {
        tasks.push_back(*dispatcher.next());
    }
    std::reverse(tasks.begin(), tasks.end());
    for (const sweep::Task& task : tasks) {
        dispatcher.complete(task, outcomeOf(task, {}, task.point == 1 ? seldom : often));
    }
    EXPECT_EQ(dispatcher.firstUnfinished(), 4U);
    while (const auto task = dispatcher.next()) {
        EXPECT_EQ(task->point, 4U);
        dispatcher.complete(*task, outcomeOf(*task, {}, often));
    }
    EXPECT_TRUE(dispatcher.hasFinished());
    const sweep::Points points = dispatcher.points();
    EXPECT_EQ(points.size(), 3U);
    EXPECT_TRUE(points.contains(plan.points[1].setup));
    EXPECT_TRUE(points.contains(plan.points[4].setup));
}

TEST(Configuration, IsRefusedWhereItIsNotPossible) {
    const auto refuses = [](auto change) {
        sweep::Configuration configuration;
        configuration.ebN0 = {{0}};
        change(configuration);
        EXPECT_THROW(configuration.check(), sweep::Error);
    };
    refuses([](sweep::Configuration& c) { c.ebN0.clear(); });
    refuses([](sweep::Configuration& c) { c.ebN0 = {{41'000'000}}; });
    refuses([](sweep::Configuration& c) { c.blockSizes = {41}; });
    refuses([](sweep::Configuration& c) { c.units = {3}; });
    refuses([](sweep::Configuration& c) { c.algorithms = {3}; });
    refuses([](sweep::Configuration& c) { c.iterations = {16}; });
    refuses([](sweep::Configuration& c) { c.iterations = {}; });
    refuses([](sweep::Configuration& c) { c.stopRule.maxBlocks = 0; });
    refuses([](sweep::Configuration& c) { c.quantisers[0].scale = 0; });
    refuses([](sweep::Configuration& c) { c.ebN0.resize(10001); });
}

}  // namespace quarzel::test
