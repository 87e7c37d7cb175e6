// SPDX-License-Identifier: MIT
// The stop rule against a plain loop over the blocks, with made-up errors that come back in any order.
#include "sweep/dispatcher.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <optional>
#include <random>
#include <vector>

#include "support/random.hpp"
#include "sweep/error.hpp"
#include "sweep/part.hpp"

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

/// Take all tasks and give back what comes of them in random order, some of them early.
void runInAnyOrder(sweep::Dispatcher& dispatcher, const BitErrors& bitErrors, std::mt19937& random) {
    std::vector<sweep::Task> atWork;
    while (true) {
        const std::optional<sweep::Task> task = dispatcher.next(1 + static_cast<unsigned>(random() % 3));
        if (task) {
            atWork.push_back(*task);
        }
        while (!atWork.empty() && (!task || random() % 2 == 0)) {
            const std::size_t pick = random() % atWork.size();
            dispatcher.complete(atWork[pick], outcomeOf(atWork[pick], dispatcher.shard(), bitErrors));
            atWork.erase(atWork.begin() + static_cast<std::ptrdiff_t>(pick));
        }
        if (!task) {
            return;
        }
    }
}

sweep::PointState plainLoop(const sweep::Configuration& configuration, const BitErrors& bitErrors) {
    sweep::PointState point;
    for (const std::uint32_t& errors : bitErrors) {
        ++point.blocks;
        point.add(&errors);
        if (errors != 0 && point.last().blockErrors == configuration.maxBlockErrors) {
            point.stoppedBy = sweep::StopReason::blockErrors;
            return point;
        }
    }
    point.stoppedBy = sweep::StopReason::blocks;
    return point;
}

void expectEqual(const sweep::PointState& point, const sweep::PointState& expected) {
    EXPECT_EQ(point.blocks, expected.blocks);
    EXPECT_EQ(point.last().bitErrors, expected.last().bitErrors);
    EXPECT_EQ(point.last().blockErrors, expected.last().blockErrors);
    EXPECT_EQ(point.stoppedBy, expected.stoppedBy);
}

}  // namespace

TEST(Dispatcher, EndsAPointWhereAPlainLoopDoesWhateverTheOrderAndTheShards) {
    std::mt19937 random = seededRandom();
    for (int round = 0; round < 100; ++round) {
        sweep::Configuration configuration;
        configuration.blockSizes = {1024};
        configuration.ebN0 = {{0}};
        configuration.maxBlocks = 1 + random() % 600;
        configuration.maxBlockErrors = random() % 20;
        BitErrors bitErrors(configuration.maxBlocks);
        const std::uint64_t oneIn = 1 + random() % 40;
        for (std::uint32_t& errors : bitErrors) {
            errors = random() % oneIn == 0 ? 1 + static_cast<std::uint32_t>(random() % 500) : 0;
        }
        const sweep::PointState expected = plainLoop(configuration, bitErrors);

        sweep::Dispatcher whole({configuration});
        runInAnyOrder(whole, bitErrors, random);
        ASSERT_TRUE(whole.hasFinished());
        expectEqual(whole.states()[0], expected);
        EXPECT_EQ(whole.states()[0].bitErrorSquares, expected.bitErrorSquares);

        const std::uint64_t shards = 2 + random() % 90;  // sometimes more than there are octets
        std::vector<sweep::NamedPart> parts;
        for (std::uint64_t index = 0; index < shards; ++index) {
            sweep::Dispatcher shard({configuration, {index, shards}});
            runInAnyOrder(shard, bitErrors, random);
            ASSERT_TRUE(shard.hasFinished());
            parts.push_back({"", {configuration, {index, shards}, shard.states()}});
        }
        const sweep::Result merged = sweep::merge(parts);
        expectEqual(merged.points[0], expected);
        EXPECT_EQ(merged.points[0].bitErrorSquares, expected.bitErrorSquares);
        ASSERT_FALSE(HasFailure()) << "round " << round;
    }
}

TEST(Dispatcher, GoesOnFromWhatIsDone) {
    std::mt19937 random = seededRandom();
    sweep::Configuration configuration;
    configuration.ebN0 = {{0}};
    configuration.maxBlocks = 403;
    configuration.maxBlockErrors = 30;
    BitErrors bitErrors(configuration.maxBlocks);
    for (std::uint32_t& errors : bitErrors) {
        errors = random() % 12 == 0 ? 7 : 0;
    }
    for (const sweep::Shard shard : {sweep::Shard{0, 1}, sweep::Shard{1, 3}}) {
        sweep::Dispatcher whole({configuration, shard});
        runInAnyOrder(whole, bitErrors, random);
        sweep::Plan plan{configuration, shard, {}, {}};
        for (bool isFinished = false; !isFinished;) {
            sweep::Dispatcher dispatcher(plan);
            if (const auto task = dispatcher.next()) {
                dispatcher.complete(*task, outcomeOf(*task, shard, bitErrors));
            }
            isFinished = dispatcher.hasFinished();
            plan.start = sweep::readPart(sweep::partText({configuration, shard, dispatcher.states()})).points;
        }
        expectEqual(plan.start[0], whole.states()[0]);
        EXPECT_EQ(plan.start[0].errors.blocks, whole.states()[0].errors.blocks);
    }
}

TEST(Dispatcher, EndsAPointAtItsTimeLimitAndRepeatsItWithoutOne) {
    sweep::Configuration configuration;
    configuration.ebN0 = {{0}, {1'000'000}};
    configuration.maxBlocks = 1000;
    configuration.maxSeconds = 3600;
    std::vector<sweep::PointState> late(2);
    late[0].seconds = 3600;
    sweep::Dispatcher dispatcher({configuration, {}, late});
    const auto task = dispatcher.next();
    dispatcher.complete(*task, {});
    const sweep::PointState stopped = dispatcher.states()[0];
    EXPECT_EQ(stopped.stoppedBy, sweep::StopReason::time);
    EXPECT_EQ(stopped.blocks, 8 * task->octets);
    EXPECT_EQ(dispatcher.next()->point, 1U);

    sweep::Dispatcher again({configuration, {}, {}, {stopped.blocks, 0}});
    again.complete(*again.next(), {});
    expectEqual(again.states()[0], stopped);
}

TEST(Dispatcher, HandsOutNothingAfterItWasStopped) {
    sweep::Configuration configuration;
    configuration.ebN0 = {{0}};
    sweep::Dispatcher dispatcher({configuration});
    EXPECT_TRUE(dispatcher.next());
    dispatcher.stop();
    EXPECT_FALSE(dispatcher.next());
    EXPECT_FALSE(dispatcher.hasFinished());
}

TEST(Dispatcher, RefusesWhatIsNotPossible) {
    const auto refuses = [](auto change) {
        sweep::Configuration configuration;
        configuration.ebN0 = {{0}};
        change(configuration);
        EXPECT_THROW(sweep::Dispatcher({configuration}), sweep::Error);
    };
    refuses([](sweep::Configuration& c) { c.ebN0.clear(); });
    refuses([](sweep::Configuration& c) { c.ebN0 = {{41'000'000}}; });
    refuses([](sweep::Configuration& c) { c.blockSizes = {41}; });
    refuses([](sweep::Configuration& c) { c.units = {3}; });
    refuses([](sweep::Configuration& c) { c.algorithms = {3}; });
    refuses([](sweep::Configuration& c) { c.iterations = {16}; });
    refuses([](sweep::Configuration& c) { c.iterations = {}; });
    refuses([](sweep::Configuration& c) { c.maxBlocks = 0; });
    refuses([](sweep::Configuration& c) { c.quantiser.scale = 0; });
    refuses([](sweep::Configuration& c) { c.ebN0.resize(10001); });
}

}  // namespace quarzel::test
