// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <numeric>

#include "sweep/error.hpp"
#include "sweep/statistics.hpp"
#include "sweeps.hpp"
#include "tool/run_tool.hpp"

namespace quarzel::test {

namespace {

using sweep::PointState;

/// Retransmissions over fading, a fixed number of blocks.
sweep::Configuration retransmissions(std::vector<unsigned> versions) {
    sweep::Configuration configuration = codedSweep();
    configuration.redundancyVersions = std::move(versions);
    configuration.stopRule.maxBlockErrors = 0;
    return configuration;
}

std::vector<PointState> statesOf(const sweep::Configuration& configuration) {
    std::vector<PointState> states;
    for (const auto& [setup, point] : resultOf(configuration).points) {
        states.push_back(point);
    }
    return states;
}

std::uint64_t sum(const std::vector<std::uint64_t>& values) {
    return std::accumulate(values.begin(), values.end(), std::uint64_t{0});
}

}  // namespace

TEST(CodedSweep, TakesARateToWholeSymbols) {
    sweep::Configuration configuration = codedSweep();
    configuration.blockSizes = {40};
    configuration.codedSizes = {{0, 0.5}, {0, 0.7}, {132, 0}};
    configuration.fadings = {link::Fading::none};
    std::vector<std::uint32_t> sizes;
    for (const sweep::Setup& setup : configuration.setups()) {
        if (setup.ebN0 == configuration.ebN0.front()) {
            sizes.push_back(setup.sending.codedBits);
        }
    }
    EXPECT_EQ(sizes, (std::vector<std::uint32_t>{0, 56, 80})) << "132 bits are each code bit once";
}

TEST(CodedSweep, SendsEachCodeBitOnceAsASweepDoesWithoutOptions) {
    sweep::Configuration configuration = smallSweep();
    const std::vector<PointState> plain = statesOf(configuration);
    configuration.modulations = {link::Modulation::qpsk};  // whose components are BPSK
    const std::vector<PointState> coded = statesOf(configuration);
    ASSERT_EQ(plain.size(), coded.size());
    for (std::size_t i = 0; i < plain.size(); ++i) {
        EXPECT_EQ(plain[i].blocks, coded[i].blocks);
        EXPECT_EQ(plain[i].counts, coded[i].counts);
        EXPECT_EQ(plain[i].bitErrorSquares, coded[i].bitErrorSquares);
    }
}

TEST(CodedSweep, CountsAfterEachTransmissionWhatFewerOfThemLeave) {
    const std::vector<PointState> three = statesOf(retransmissions({0, 2, 3}));
    std::uint64_t repaired = 0;
    for (const std::size_t transmissions : {1U, 2U}) {
        std::vector<unsigned> versions = {0, 2};
        versions.resize(transmissions);
        const std::vector<PointState> fewer = statesOf(retransmissions(versions));
        ASSERT_EQ(fewer.size(), three.size());
        for (std::size_t i = 0; i < fewer.size(); ++i) {
            EXPECT_EQ(fewer[i].last(), three[i].counts[transmissions - 1]);
            EXPECT_EQ(sweep::blocksSent(three[i], transmissions), fewer[i].last().blockErrors);
            repaired += fewer[i].last().blockErrors - three[i].last().blockErrors;
        }
    }
    EXPECT_GT(repaired, 100U);
}

TEST(CodedSweep, DividesRightBitsByAllCodedBitsForTheThroughput) {
    sweep::Setup setup;
    setup.blockSize = 40;
    setup.sending.codedBits = 80;
    setup.sending.redundancyVersions = {0, 2};
    PointState point(2);
    point.blocks = 10;
    point.counts = {{50, 4, 0}, {7, 1, 0}};
    EXPECT_DOUBLE_EQ(sweep::throughput(setup, point, 0), 6 * 40.0 / (10 * 80));
    EXPECT_DOUBLE_EQ(sweep::throughput(setup, point, 1), 9 * 40.0 / (14 * 80));
    EXPECT_EQ(sweep::throughput(setup, PointState(2), 1), 0);
}

TEST(CodedSweep, SendsABlockWhoseErrorsAreNotDetectedNoMore) {
    PointState point(2, 3);
    ASSERT_EQ(point.columns(), 4U);
    const std::vector<std::vector<std::uint32_t>> rows = {
        {5 | sweep::undetectedMark, 5 | sweep::undetectedMark, 2, 0},
        {sweep::rejectedMark, 0, 3, 1},  // its bits were right, its CRC was not
        {9, 4, 3, 3},
        {0, 0, 1, 0}};
    for (const std::vector<std::uint32_t>& row : rows) {
        point.add(row.data());
        ++point.blocks;
    }
    EXPECT_EQ(point.counts[0], (sweep::ErrorCount{14, 3, 1}));
    EXPECT_EQ(point.counts[1], (sweep::ErrorCount{9, 2, 1}));
    EXPECT_EQ(point.bitErrorSquares, 25U + 16U);
    EXPECT_EQ(sweep::blocksSent(point, 1), 2U);
    EXPECT_EQ(point.iterationsUsed, (std::vector<std::uint64_t>{2, 1, 3}));
    EXPECT_DOUBLE_EQ(sweep::meanIterations(point), 13.0 / 6);
}

TEST(CodedSweep, CountsTheErrorsOfTransportBlocks) {
    sweep::Configuration configuration = transportSweep();
    configuration.stopRule.maxBlockErrors = 0;
    for (const auto& [setup, point] : resultOf(configuration).points) {
        EXPECT_EQ(setup.blockSize, setup.sending.transportBlock == 90 ? 120U : 3136U);
        EXPECT_EQ(point.blocks, 61U);
        EXPECT_EQ(point.last().undetected, 0U);
        EXPECT_LE(point.last().blockErrors, point.counts[0].blockErrors);
        EXPECT_EQ(sum(point.iterationsUsed), 61 + sweep::blocksSent(point, 1));
    }
}

// A receiver that stops sees a block right at the first iteration after which it is.
TEST(CodedSweep, StopsWhenTheCrcHolds) {
    sweep::Configuration configuration = transportSweep();
    configuration.redundancyVersions = {0};
    configuration.iterations = {8};
    configuration.stopRule.maxBlockErrors = 0;
    const std::vector<PointState> stopped = statesOf(configuration);
    configuration.stop = sweep::Stop::none;
    configuration.perIteration = true;
    const std::vector<PointState> all = statesOf(configuration);
    ASSERT_EQ(stopped.size(), all.size());
    for (std::size_t i = 0; i < all.size(); ++i) {
        EXPECT_EQ(stopped[i].iterationsUsed[0], all[i].blocks - all[i].counts[0].blockErrors);
        EXPECT_LE(stopped[i].last().blockErrors, all[i].last().blockErrors);
        std::uint64_t rightBefore = 0;
        for (std::size_t iteration = 0; iteration + 1 < 8; ++iteration) {
            rightBefore += stopped[i].iterationsUsed[iteration];
            EXPECT_GE(rightBefore, all[i].blocks - all[i].counts[iteration].blockErrors);
        }
    }
}

TEST(CodedSweep, IsKeptInAFile) {
    for (const sweep::Configuration& configuration : {codedSweep(), transportSweep()}) {
        const sweep::Result result = resultOf(configuration);
        const std::string text = sweep::resultText(result);
        const sweep::Result kept = sweep::readResult(text);
        EXPECT_EQ(sweep::resultText(kept), text);
        for (const auto& [setup, point] : result.points) {
            EXPECT_EQ(kept.points.at(setup).counts, point.counts);
            EXPECT_EQ(kept.points.at(setup).iterationsUsed, point.iterationsUsed);
        }
    }
}

TEST(CodedSweep, PrintsATable) {
    const ToolRun run = runTool({"sweep",
                                 "--transport-block",
                                 "90",
                                 "--code-rate",
                                 "1/2",
                                 "--modulation",
                                 "qpsk",
                                 "--channel",
                                 "rayleigh-block",
                                 "--rv",
                                 "0,3",
                                 "--stop",
                                 "crc",
                                 "--iterations",
                                 "3",
                                 "--ebn0",
                                 "5",
                                 "--max-blocks",
                                 "61",
                                 "--seed",
                                 "7"});
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(
        run.out,
        R"(K 120, 2 units, algorithm 1, 3 iterations, llr 4, transport blocks of 90 bits, 180 coded bits, qpsk, rayleigh-block, rv 0 3, stop crc
  Eb/N0    blocks bit errors  block e.       BER      BLER  95 % of BLER
      5        61         63         5  1.15e-02  8.20e-02  3.55e-02 1.78e-01
   sent  1      61        379        24  6.90e-02  3.93e-01  throughput 0.3033
   sent  2      24         63         5  1.15e-02  8.20e-02  throughput 0.3294
        undetected errors 0
        iterations used 1.765: 51 3 31
)");
}

TEST(CodedSweep, PrintsCsv) {
    const ToolRun run =
        runTool({"sweep", "--block-size", "40", "--coded-bits", "80", "--harq", "2", "--iterations", "3",
                 "--ebn0", "2", "--max-blocks", "100", "--seed", "7", "--csv"});
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(
        run.out,
        R"(block_size,units,algorithm,iterations,quantiser,scale,transport_block,coded_bits,modulation,channel,demapping,redundancy_versions,stop,ebn0_db,iteration,blocks,bits,bit_errors,block_errors,ber,bler,ber_low,ber_high,bler_low,bler_high,stopped_by,transmission,blocks_sent,undetected_errors,throughput,mean_iterations,iterations_used
40,2,1,3,llr,4,0,80,bpsk,awgn,maxlog,0 2,none,2,3,100,4000,113,21,0.02825,0.21,,,,,blocks,1,100,,0.395,,
40,2,1,3,llr,4,0,80,bpsk,awgn,maxlog,0 2,none,2,3,100,4000,0,0,0,0,0,0.03699349820698568,0,0.03699349820698568,blocks,2,21,,0.4132231404958678,,
)");
}

}  // namespace quarzel::test
