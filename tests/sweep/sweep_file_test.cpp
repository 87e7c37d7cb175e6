// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <functional>

#include "support/random.hpp"
#include "sweep/error.hpp"
#include "sweeps.hpp"
#include "tool/temporary_directory.hpp"

namespace quarzel::test {

namespace {

std::string complaintOf(const std::function<void()>& read) {
    try {
        read();
    } catch (const sweep::Error& error) {
        return error.what();
    }
    return "none";
}

const std::string& smallResultText() {
    static const std::string text = sweep::resultText(resultOf(smallSweep()));
    return text;
}

}  // namespace

TEST(SweepFile, KeepsAResult) {
    sweep::Configuration configuration = smallSweep();
    configuration.quantisers.push_back({link::Quantiser::Kind::amplitude, 0.1});
    for (const bool perIteration : {false, true}) {
        configuration.perIteration = perIteration;
        const sweep::Result original = resultOf(configuration);
        const sweep::Result result = sweep::readResult(sweep::resultText(original));
        EXPECT_EQ(result.seed, 7U);
        ASSERT_EQ(result.points.size(), 24U);
        for (const auto& [setup, point] : result.points) {
            const sweep::PointState& expected = original.points.at(setup);
            EXPECT_EQ(point.blocks, expected.blocks);
            EXPECT_EQ(point.counts, expected.counts);
            EXPECT_EQ(point.bitErrorSquares, expected.bitErrorSquares);
            EXPECT_EQ(point.stoppedBy, expected.stoppedBy);
        }
    }
}

TEST(SweepFile, KeepsAPart) {
    sweep::Configuration configuration = smallSweep();
    configuration.perIteration = true;
    const std::string text = sweep::resultText(partResult(configuration, {1, 3}).result);
    EXPECT_EQ(sweep::resultText(sweep::readResultOrPart(text)), text);
    EXPECT_EQ(complaintOf([&] { sweep::readResult(text); }),
              "is a part of a sweep; join all its parts with 'quarzel merge'");
}

TEST(SweepFile, KeepsAPointThatHasNotEnded) {
    sweep::PointState point;
    point.blocks = 16;
    point.seconds = 0.25;
    const std::string text = sweep::resultText({1, {{sweep::Setup{}, point}}, {}});
    const sweep::PointState kept = sweep::readResult(text).points.at({});
    EXPECT_EQ(kept.stoppedBy, std::nullopt);
    EXPECT_EQ(kept.seconds, 0.25);
}

// The version of quarzel stands in a file for people; the version of the format decides.
TEST(SweepFile, IsReadWhicheverVersionOfQuarzelWroteIt) {
    sweep::Result result = resultOf(smallSweep());
    for (const char* const version : {"1.0.0", "9.8.7-beta"}) {
        result.quarzel = version;
        const std::string text = sweep::resultText(result);
        EXPECT_NE(text.find("\"quarzel\": \"" + result.quarzel + '"'), std::string::npos);
        EXPECT_EQ(sweep::readResult(text).quarzel, version);
        EXPECT_EQ(sweep::resultText(sweep::readResult(text)), text);
    }
}

TEST(SweepFile, OfAPartInVersion1IsRefused) {
    EXPECT_EQ(complaintOf([] { sweep::readResultOrPart(readFile(QUARZEL_SWEEP_DATA "/part_1_of_2.json")); }),
              "has version 1 of its format, which this quarzel does not read; use the quarzel that wrote it");
}

TEST(SweepFile, IsRefusedWhereverItIsCut) {
    const std::string& text = smallResultText();
    for (std::size_t length = 0; length < text.size(); ++length) {
        EXPECT_THROW(sweep::readResult(text.substr(0, length)), sweep::Error) << length;
    }
    EXPECT_EQ(complaintOf([&] { sweep::readResult(text.substr(0, text.size() / 2)); }),
              "is truncated or altered: it is not a whole JSON object; use another copy of it");
}

TEST(SweepFile, IsRefusedWhateverDigitIsAltered) {
    const std::string& text = smallResultText();
    std::mt19937 random = seededRandom();
    for (int round = 0; round < 100;) {
        std::string altered = text;
        char& letter = altered[random() % altered.size()];
        if (letter >= '0' && letter <= '8') {
            ++letter;
            EXPECT_THROW(sweep::readResult(altered), sweep::Error);
            ++round;
        }
    }
}

TEST(SweepFile, IsRefusedWithItsReason) {
    const auto altered = [](const std::string& from, const std::string& to) {
        std::string text = smallResultText();
        text.replace(text.find(from), from.size(), to);
        return complaintOf([&text] { sweep::readResult(text); });
    };
    EXPECT_EQ(altered("\"seed\": 7", "\"seed\": 8"),
              "has been altered: its checksum does not match; use another copy of it");
    for (const std::string version : {"0", "3", "null", "2.5"}) {
        EXPECT_EQ(altered("\"version\": 2", "\"version\": " + version),
                  "has version " + version +
                      " of its format, which this quarzel does not read; use the quarzel that wrote it");
    }
    EXPECT_EQ(altered("quarzel sweep result", "quarzel sweep"),
              "is not a quarzel sweep result; give the name of one");
    EXPECT_EQ(complaintOf([] { sweep::readResult("[1]"); }),
              "is not a quarzel sweep result; give the name of one");
    EXPECT_EQ(complaintOf([] { sweep::readResultOrPart("quarzel"); }),
              "is not a quarzel sweep result; give the name of one");
}

TEST(SweepFile, IsRefusedWhenItHoldsWhatIsNotPossible) {
    const auto complaintWith = [](const sweep::Setup& setup, const sweep::PointState& point) {
        const std::string text = sweep::resultText({1, {{setup, point}}, {}});
        return complaintOf([&text] { sweep::readResult(text); });
    };
    sweep::Setup setup;
    setup.blockSize = 41;
    EXPECT_THAT(complaintWith(setup, sweep::PointState()),
                testing::StartsWith("is not understood: block size 41 is not possible"));
    EXPECT_EQ(complaintWith({}, sweep::PointState(3)),
              "is not understood: a point does not have a count for each iteration; use another copy of it");
}

}  // namespace quarzel::test
