// SPDX-License-Identifier: MIT
// One sweep, one result, byte for byte: whoever computes it.
#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>
#include <random>

#include "support/random.hpp"
#include "sweeps.hpp"
#include "tool/run_tool.hpp"
#include "tool/temporary_directory.hpp"

namespace quarzel::test {

namespace {

/// Stops a sweep after some ticks.
class Impatience : public sweep::Observer {
  public:
    explicit Impatience(unsigned ticks) : itsTicks(ticks) {}
    void tick(sweep::Dispatcher& dispatcher) override {
        if (itsTicks-- == 0) {
            dispatcher.stop();
        }
    }

  private:
    unsigned itsTicks;
};

#if defined(__SANITIZE_ADDRESS__) || defined(QUARZEL_EMULATED)
const char* const blocksOfLongerSweep = "101";
#else
const char* const blocksOfLongerSweep = "2501";
#endif

const std::vector<std::string> longerSweep = {"sweep",
                                              "--block-size",
                                              "40,512",
                                              "--iterations",
                                              "6",
                                              "--ebn0",
                                              "0:1:3",
                                              "--algorithm",
                                              "1,2",
                                              "--max-blocks",
                                              blocksOfLongerSweep,
                                              "--seed",
                                              "99",
                                              "--max-block-errors",
                                              "400"};

std::vector<std::string> with(std::vector<std::string> arguments, const std::vector<std::string>& more) {
    arguments.insert(arguments.end(), more.begin(), more.end());
    return arguments;
}

}  // namespace

// The stored results pin bits, noise, channel, core and the form of the file, on every machine and in every
// version: what alters them alters every result that users have kept. These two are in version 1 of the
// format.
TEST(SameAnswer, IsTheStoredOne) {
    const sweep::Result stored = sweep::readResult(readFile(QUARZEL_SWEEP_DATA "/small_sweep.json"));
    sweep::Configuration configuration = smallSweep();
    configuration.perIteration = true;
    configuration.quantisers = {{link::Quantiser::Kind::llr, 8}};
    sweep::Result result = resultOf(configuration);
    result.quarzel = "1.0.0";
    EXPECT_EQ(sweep::resultText(result), sweep::resultText(stored));
}

// All units and algorithms, a size of many windows, amplitudes, and the greatest seed.
TEST(SameAnswer, IsTheStoredOneForEveryCore) {
    const sweep::Result stored = sweep::readResult(readFile(QUARZEL_SWEEP_DATA "/every_core.json"));
    ASSERT_EQ(stored.points.size(), 36U);
    EXPECT_EQ(sweep::resultText(repeated(stored)), sweep::resultText(stored));
}

// Version 2 of the format.
TEST(SameAnswer, IsTheStoredOneForSeveralQuantisers) {
    sweep::Configuration configuration = smallSweep();
    configuration.blockSizes = {40};
    configuration.quantisers = {{link::Quantiser::Kind::llr, 2},
                                {link::Quantiser::Kind::amplitude, 12.5},
                                {link::Quantiser::Kind::llr, 0.5}};
    sweep::Result result = resultOf(configuration);
    result.quarzel = "1.1.0";
    EXPECT_EQ(sweep::resultText(result), readFile(QUARZEL_SWEEP_DATA "/quantisers.json"));
}

TEST(SameAnswer, IsTheStoredOneForCodedLinks) {
    for (const char* const file : {"/coded_links.json", "/transport_blocks.json"}) {
        const sweep::Result stored = sweep::readResult(readFile(QUARZEL_SWEEP_DATA + std::string(file)));
        EXPECT_EQ(sweep::resultText(repeated(stored)), sweep::resultText(stored));
    }
}

TEST(SameAnswer, ComesFromAnyNumberOfThreads) {
    for (const sweep::Configuration& configuration : everyKindOfSweep()) {
        const std::string expected = sweep::resultText(resultOf(configuration));
        for (const unsigned threads : {2U, 8U}) {
            EXPECT_EQ(sweep::resultText(resultOf(configuration, threads)), expected) << threads;
        }
    }
}

TEST(SameAnswer, ComesFromAnyNumberOfShards) {
    for (const std::uint64_t maxBlockErrors : {50U, 0U}) {
        for (const bool perIteration : {false, true}) {
            sweep::Configuration configuration = smallSweep();
            configuration.stopRule.maxBlockErrors = maxBlockErrors;
            configuration.perIteration = perIteration;
            const std::string expected = sweep::resultText(resultOf(configuration));
            for (const std::uint64_t shards : {2U, 45U}) {  // sometimes more than there are points or octets
                EXPECT_EQ(sweep::resultText(sweep::merge(partsOf(configuration, shards))), expected)
                    << shards;
            }
        }
    }
}

TEST(SameAnswer, ComesFromAnyNumberOfShardsOfCodedLinks) {
    for (sweep::Configuration configuration : {codedSweep(), transportSweep()}) {
        for (const std::uint64_t maxBlockErrors : {std::uint64_t{0}, configuration.stopRule.maxBlockErrors}) {
            configuration.stopRule.maxBlockErrors = maxBlockErrors;
            const std::string expected = sweep::resultText(resultOf(configuration));
            for (const std::uint64_t shards : {2U, 9U}) {
                EXPECT_EQ(sweep::resultText(sweep::merge(partsOf(configuration, shards))), expected)
                    << shards;
            }
        }
    }
}

TEST(SameAnswer, ComesOutForFewerPointsAndForThemAlone) {
    const sweep::Result all = resultOf(smallSweep());
    sweep::Configuration one = smallSweep();
    one.blockSizes = {104};
    one.algorithms = {2};
    one.ebN0 = {{1'500'000}};
    const sweep::Result result = resultOf(one);
    const auto& [setup, alone] = *result.points.begin();
    const sweep::PointState& among = all.points.at(setup);
    EXPECT_EQ(alone.blocks, among.blocks);
    EXPECT_EQ(alone.last(), among.last());
}

TEST(SameAnswer, ComesOutAfterAnyNumberOfInterruptions) {
    for (sweep::Configuration configuration : everyKindOfSweep()) {
        configuration.blockSizes = {1024};
        configuration.stopRule.maxBlocks = 150;
        const std::string expected = sweep::resultText(resultOf(configuration));
        sweep::Points known;
        for (bool isFinished = false; !isFinished;) {
            sweep::Dispatcher dispatcher(sweep::planOf(configuration, {}, known));
            Impatience impatience(0);
            sweep::ThreadWorkers(2).run(dispatcher, impatience);
            isFinished = dispatcher.hasFinished();
            known = sweep::readResult(sweep::resultText({7, dispatcher.points(), {}})).points;
        }
        EXPECT_EQ(sweep::resultText({7, known, {}}), expected);
    }
}

// Fewer blocks first, then more: what is there goes on inside an octet of blocks.
TEST(SameAnswer, ComesOutInSteps) {
    for (const sweep::Configuration& whole : everyKindOfSweep()) {
        sweep::Configuration part = whole;
        part.stopRule.maxBlocks = 13;
        part.stopRule.maxBlockErrors = 5;
        EXPECT_EQ(sweep::resultText(resultOf(whole, 1, resultOf(part).points)),
                  sweep::resultText(resultOf(whole)));
    }
}

// Each kill comes at a random time within half of that of a whole run, which it goes on from what the runs
// before it have kept. When it is done before it is killed, it begins anew.
TEST(SameAnswer, SurvivesTwentyKills) {
    std::mt19937 random = seededRandom();
    const TemporaryDirectory directory;
    const std::string file = directory.path("result.json");
    const auto start = std::chrono::steady_clock::now();
    const std::string expected = runTool(with(longerSweep, {"--json"})).out;
    const std::chrono::duration<double> wholeRun = std::chrono::steady_clock::now() - start;
    const auto goOn = with(longerSweep, {"-o", file, "--checkpoint-every", "0", "--resume"});
    int kills = 0;
    for (int round = 0; round < 200 && kills < 20; ++round) {
        const double seconds = std::uniform_real_distribution<double>(0.001, wholeRun.count() / 2)(random);
        const ToolRun run = runTool(with({"-s", "KILL", std::to_string(seconds), QUARZEL_TOOL}, goOn),
                                    {.program = "/usr/bin/timeout"});
        if (run.exitCode == 0) {
            ASSERT_EQ(readFile(file), expected);
            std::filesystem::remove(file);
        } else {
            ASSERT_TRUE(run.exitCode == -9 || run.exitCode == 137) << run.exitCode << ' ' << run.err;
            ++kills;
        }
    }
    EXPECT_EQ(kills, 20);
    const ToolRun run = runTool(with(goOn, {"--json"}));
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.out, expected);
    EXPECT_EQ(readFile(file), expected);
}

}  // namespace quarzel::test
