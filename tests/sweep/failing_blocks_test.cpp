// SPDX-License-Identifier: MIT
#include "sweeps/failing_blocks.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <span>

#include "link/bit_errors.hpp"
#include "sweep/block_simulator.hpp"
#include "sweeps.hpp"

namespace quarzel::test {

namespace {

constexpr std::uint64_t kept = 5;

/// The first failing blocks of a point, from its blocks one octet after the other.
std::vector<sweep::FailingBlock> plainSearch(const sweep::Configuration& configuration,
                                             const sweep::Setup& setup, const sweep::PointState& point) {
    sweep::Channels channels;
    sweep::BlockSimulator simulator(configuration.seed, channels);
    std::vector<sweep::FailingBlock> failing;
    for (std::uint64_t octet = 0; octet * sweep::blocksPerOctet < point.blocks; ++octet) {
        const sweep::ErrorList errors = simulator.simulate(setup, point.counts.size(), {octet});
        for (std::size_t i = 0; i < errors.size(); ++i) {
            const std::uint32_t last = errors.row(i, point.columns())[point.counts.size() - 1];
            if (last != 0 && errors.blocks[i] < point.blocks && failing.size() < kept) {
                failing.push_back({errors.blocks[i], last & 0x3fffffffU});
            }
        }
    }
    return failing;
}

/// What is kept of a sweep that goes on from known points.
tool::FailingBlocks keptOf(const sweep::Configuration& configuration, unsigned threads,
                           const sweep::Points& known = {}, const sweep::Shard& shard = {}) {
    sweep::Plan plan = sweep::planOf(configuration, shard, known);
    plan.keptFailures = kept;
    sweep::Dispatcher dispatcher(plan);
    run(dispatcher, threads);
    sweep::ThreadWorkers workers(threads);
    return tool::failingBlocksOf(dispatcher.points(), dispatcher, workers);
}

/// Wrong bits of a code block that is decoded again.
std::uint32_t wrongBits(const sweep::Setup& setup, const sweep::SentBlock& block) {
    Core core(CoreSettings{setup.units, setup.algorithm});
    std::vector<unsigned char> decisions(block.bits.size());
    core.decode(softBlocks(std::span<const std::int8_t>(block.soft), block.bits.size() + tailPositions),
                setup.iterations, decisions);
    return link::bitErrors(block.bits.data(), 0, decisions.data(), decisions.size());
}

}  // namespace

TEST(FailingBlocks, AreTheFirstOnesOfEachPointWhateverTheNumberOfThreads) {
    for (const sweep::Configuration& configuration : everyKindOfSweep()) {
        const sweep::Result result = resultOf(configuration);
        const tool::FailingBlocks failing = keptOf(configuration, 1);
        for (const auto& [setup, point] : result.points) {
            const std::vector<sweep::FailingBlock> expected = plainSearch(configuration, setup, point);
            EXPECT_EQ(failing.contains(setup), !expected.empty()) << setupText(setup);
            if (!expected.empty()) {
                EXPECT_EQ(failing.at(setup), expected) << setupText(setup);
            }
        }
        EXPECT_EQ(keptOf(configuration, 4), failing);
    }
}

TEST(FailingBlocks, AreTheSameWhenAResultIsExtendedOrOnlyLookedAt) {
    for (const sweep::Configuration& configuration : everyKindOfSweep()) {
        const tool::FailingBlocks failing = keptOf(configuration, 1);
        sweep::Configuration first = configuration;
        first.stopRule.maxBlocks = 21;
        first.stopRule.maxBlockErrors = 3;
        EXPECT_EQ(keptOf(configuration, 2, resultOf(first).points), failing);
        EXPECT_EQ(keptOf(configuration, 2, resultOf(configuration).points), failing);
    }
}

TEST(FailingBlocks, OfPartsAreThoseOfTheWholeTogether) {
    sweep::Configuration configuration = smallSweep();
    configuration.stopRule.maxBlockErrors = 0;  // so that blocks are divided
    tool::FailingBlocks together;
    for (std::uint64_t index = 0; index < 3; ++index) {
        const tool::FailingBlocks own = keptOf(configuration, 1, {}, {index, 3});
        const sweep::Points known = partResult(configuration, {index, 3}).result.points;
        EXPECT_EQ(keptOf(configuration, 2, known, {index, 3}), own) << "of a part that is only looked at";
        for (const auto& [setup, blocks] : own) {
            together[setup].insert(together[setup].end(), blocks.begin(), blocks.end());
        }
    }
    for (auto& [setup, blocks] : together) {
        std::sort(blocks.begin(), blocks.end(),
                  [](const auto& a, const auto& b) { return a.number < b.number; });
        blocks.resize(std::min<std::size_t>(blocks.size(), kept));
    }
    EXPECT_EQ(together, keptOf(configuration, 1));
}

TEST(FailingBlocks, AreMadeAgainAsTheyWereDecoded) {
    for (const sweep::Configuration& configuration : everyKindOfSweep()) {
        sweep::Channels channels;
        sweep::BlockSimulator simulator(configuration.seed, channels);
        for (const auto& [setup, blocks] : keptOf(configuration, 1)) {
            for (const sweep::FailingBlock& failing : blocks) {
                std::uint32_t wrong = 0;
                for (const sweep::SentBlock& block : simulator.makeAgain(setup, failing.number)) {
                    wrong += wrongBits(setup, block);
                }
                // The CRCs of a transport block are among the bits of its code blocks.
                if (setup.sending.transportBlock == 0) {
                    EXPECT_EQ(wrong, failing.bitErrors) << setupText(setup) << ", block " << failing.number;
                } else {
                    EXPECT_GE(wrong, failing.bitErrors) << setupText(setup) << ", block " << failing.number;
                    EXPECT_GT(wrong, 0U);
                }
            }
        }
    }
}

}  // namespace quarzel::test
