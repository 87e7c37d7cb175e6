// SPDX-License-Identifier: MIT
#include "sweep/threshold.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cmath>
#include <random>

#include "support/random.hpp"
#include "sweep/natural_log.hpp"
#include "sweeps.hpp"
#include "tool/run_tool.hpp"
#include "tool/temporary_directory.hpp"

namespace quarzel::test {

namespace {

/// A made-up curve: the rate is 0.1 at `start` and falls to a tenth every `perDecade`.
struct Curve {
    double start;
    double perDecade;

    double rateAt(double ebN0) const { return std::min(std::pow(10, (start - ebN0) / perDecade - 1), 1.0); }
    double reaches(double rate) const { return start - perDecade * std::log10(10 * rate); }
};

/// Search on a curve, with blocks that are wrong at random.
sweep::Threshold search(const Curve& curve, const sweep::Target& target, std::mt19937& random) {
    sweep::Points points;
    for (int rounds = 0; rounds < 100; ++rounds) {
        const sweep::SearchState state = sweep::stateOf(target, points);
        if (state.needs.empty()) {
            EXPECT_TRUE(state.threshold);
            return state.threshold.value_or(sweep::Threshold{});
        }
        for (const auto& [setup, blocks] : state.needs) {
            sweep::PointState& point = points.try_emplace(setup, 1).first->second;
            EXPECT_GT(blocks, point.blocks) << "every round adds something";
            std::binomial_distribution<std::uint64_t> errors(blocks - point.blocks,
                                                             curve.rateAt(setup.ebN0.value()));
            point.counts[0].blockErrors += errors(random);
            point.blocks = blocks;
        }
    }
    ADD_FAILURE() << "the search does not end";
    return {};
}

}  // namespace

TEST(NaturalLog, IsThatOfTheCLibrary) {
    for (const double x : {1e-300, 1e-6, 0.1, 0.74, 0.75, 0.99, 1.0, 1.01, 1.5, 1.51, 2.0, 1e10}) {
        EXPECT_NEAR(sweep::naturalLog(x), std::log(x), 1e-14 * (1 + std::abs(std::log(x)))) << x;
    }
}

// 95 of 100 intervals hold the threshold. Of 400, fewer than 360 do once in a million times. The curves lie
// elsewhere than usual and are up to twice as steep or as flat.
TEST(Threshold, LiesInItsIntervalAsOftenAsItSays) {
    std::mt19937 random = seededRandom();
    int hits = 0;
    for (int round = 0; round < 400; ++round) {
        const auto between = [&](double a, double b) {
            return std::uniform_real_distribution<double>(a, b)(random);
        };
        sweep::Setup setup;
        setup.blockSize = round % 2 == 0 ? 40 : 6144;
        const Curve curve{between(-3, 5), (0.05 + 6 / std::sqrt(setup.blockSize)) * between(0.5, 2)};
        const sweep::Target target{setup, 6, round % 3 == 0 ? 0.01 : 0.1, 0.02};
        const sweep::Threshold found = search(curve, target, random);
        EXPECT_LE((found.high - found.low) / 2, 0.02);
        EXPECT_DOUBLE_EQ((found.high + found.low) / 2, found.ebN0);
        const double truth = curve.reaches(target.rate);
        EXPECT_NEAR(found.ebN0, truth, 0.06) << "six deviations";
        hits += found.low <= truth && truth <= found.high ? 1 : 0;
    }
    EXPECT_GT(hits, 360);
}

TEST(Threshold, IsNotFoundWhereTheRateIsNotReached) {
    const sweep::Target target{{}, 6, 0.01, 0.02};
    sweep::Points points;
    for (const double rate : {0.02, 0.001}) {  // a floor, and a curve that is always good
        points.clear();
        sweep::SearchState state;
        while (!(state = sweep::stateOf(target, points)).needs.empty()) {
            for (const auto& [setup, blocks] : state.needs) {
                sweep::PointState& point = points.try_emplace(setup, 1).first->second;
                point.blocks = blocks;
                point.counts[0].blockErrors = static_cast<std::uint64_t>(rate * static_cast<double>(blocks));
            }
        }
        EXPECT_FALSE(state.threshold);
    }
}

// The curves of docs/curves, of other Eb/N0, cross 0.1 at 1.52, 1.31, 1.33 and 1.22 dB, to about 0.1 dB.
TEST(ThresholdCommand, FindsWhereAStoredCurveCrosses) {
    const std::vector<std::string> arguments = {
        "threshold", "--block-size", "40", "--iterations", "8,4", "--algorithm", "0,1", "--precision", "0.1"};
    const ToolRun run = runTool(arguments);
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.out, R"(K 40, 2 units, algorithm 0, 4 iterations, llr 4
     BLER    Eb/N0  95 % of Eb/N0
      0.1    1.431  1.378 1.484
K 40, 2 units, algorithm 0, 8 iterations, llr 4
     BLER    Eb/N0  95 % of Eb/N0
      0.1    1.257  1.201 1.313
K 40, 2 units, algorithm 1, 4 iterations, llr 4
     BLER    Eb/N0  95 % of Eb/N0
      0.1    1.300  1.264 1.337
K 40, 2 units, algorithm 1, 8 iterations, llr 4
     BLER    Eb/N0  95 % of Eb/N0
      0.1    1.206  1.189 1.224
)");
}

TEST(ThresholdCommand, GivesTheSameWhateverTheThreadsAndGoesOnFromItsFile) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("points.json");
    const auto thresholds = [&](const char* threads, const char* rates, const std::string& output) {
        return runTool({"threshold", "--block-size", "40,48", "--iterations", "2,4", "--target-bler", rates,
                        "--precision", "0.2", "--threads", threads, "-o", output, "--csv"})
            .out;
    };
    const std::string alone = thresholds("1", "0.5,0.1", file);
    EXPECT_EQ(thresholds("3", "0.1,0.5", directory.path("other.json")), alone);
    const std::string points = readFile(file);
    EXPECT_EQ(readFile(directory.path("other.json")), points);
    EXPECT_EQ(thresholds("2", "0.5,0.1", file), alone);
    EXPECT_EQ(readFile(file), points) << "there is nothing to do";
    EXPECT_THAT(alone,
                testing::StartsWith("block_size,units,algorithm,iterations,quantiser,scale,bler,ebn0_db,"
                                    "ebn0_low,ebn0_high\n40,2,1,2,llr,4,0.5,"));
    EXPECT_EQ(runTool({"verify-result", file}).exitCode, 0);
}

TEST(ThresholdCommand, RefusesWhatIsNotPossible) {
    const auto complaintOf = [](std::vector<std::string> arguments) {
        arguments.insert(arguments.begin(), "threshold");
        const ToolRun run = runTool(arguments);
        EXPECT_EQ(run.exitCode, 2);
        return run.err;
    };
    const std::string see = "; see 'quarzel threshold --help'\n";
    EXPECT_EQ(complaintOf({"--target-bler", "0.1,1"}),
              "quarzel: error: --target-bler: '1' is not a number from 1e-06 to 0.9" + see);
    EXPECT_EQ(complaintOf({"--precision", "0"}),
              "quarzel: error: --precision: '0' is not a number from 0.001 to 1" + see);
    EXPECT_EQ(complaintOf({"--block-size", "41"}),
              "quarzel: error: --block-size: 41 is not a block size of LTE; the nearest: 40, 48\n");
}

TEST(ThresholdCommand, RefusesPointsWithoutTheCountsThatItNeeds) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("points.json");
    runTool({"sweep", "--block-size", "40", "--ebn0", "1", "--max-blocks", "8", "-o", file});
    const ToolRun run = runTool({"threshold", "--block-size", "40", "--iterations", "3,6", "-o", file});
    EXPECT_EQ(run.err,
              "quarzel: error: " + file +
                  ": has no counts after every iteration at K 40, 2 units, algorithm 1, 6 iterations, "
                  "llr 4, 1 dB; give one number of iterations or another name\n");
    EXPECT_EQ(run.exitCode, 3);
}

}  // namespace quarzel::test
