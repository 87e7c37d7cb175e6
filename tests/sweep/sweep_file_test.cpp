// SPDX-License-Identifier: MIT
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
    const sweep::Result result = sweep::readResult(smallResultText());
    EXPECT_EQ(result.configuration, smallSweep());
    ASSERT_EQ(result.points.size(), 12U);
    const sweep::Result original = resultOf(smallSweep());
    for (std::size_t i = 0; i < result.points.size(); ++i) {
        EXPECT_EQ(result.points[i].blocks, original.points[i].blocks);
        EXPECT_EQ(result.points[i].last().bitErrors, original.points[i].last().bitErrors);
        EXPECT_EQ(result.points[i].stoppedBy, original.points[i].stoppedBy);
    }
}

TEST(SweepFile, KeepsAPart) {
    sweep::Configuration configuration = smallSweep();
    configuration.perIteration = true;
    const sweep::Part part = partOf(configuration, {1, 3}).part;
    const std::string text = sweep::partText(part);
    EXPECT_EQ(sweep::partText(sweep::readPart(text)), text);
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

// The stored parts come from version 1.0.0. Their result names the version that joined them.
TEST(SweepFile, OfAPartIsReadWhicheverVersionOfQuarzelWroteIt) {
    std::vector<sweep::NamedPart> parts;
    for (const char* const file : {"/part_1_of_2.json", "/part_2_of_2.json"}) {
        const std::string text = readFile(std::string(QUARZEL_SWEEP_DATA) + file);
        EXPECT_NE(text.find(R"("quarzel":"1.0.0")"), std::string::npos);
        parts.push_back({file, sweep::readPart(text)});
    }
    ASSERT_STRNE(VARDEL_IP_QUARZEL_VERSION, "1.0.0");
    const sweep::Result merged = sweep::merge(parts);
    EXPECT_EQ(sweep::resultText(merged), sweep::resultText(resultOf(merged.configuration)));
    EXPECT_EQ(merged.quarzel, VARDEL_IP_QUARZEL_VERSION);
}

TEST(SweepFile, IsRefusedWhereverItIsCut) {
    const std::string& text = smallResultText();
    std::mt19937 random = seededRandom();
    for (int round = 0; round < 100; ++round) {
        const std::string cut = text.substr(0, random() % (text.size() - 2));
        EXPECT_THROW(sweep::readResult(cut), sweep::Error) << cut.size();
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
    EXPECT_EQ(altered("\"version\": 1", "\"version\": 2"),
              "has version 2 of its format, not 1; use the quarzel that wrote it");
    EXPECT_EQ(altered("quarzel sweep result", "quarzel sweep part"),
              "is not a quarzel sweep result; give the name of one");
    EXPECT_EQ(complaintOf([] { sweep::readResult("[1]"); }),
              "is not a quarzel sweep result; give the name of one");
    EXPECT_EQ(complaintOf([] { sweep::readPart(smallResultText()); }),
              "is not a quarzel sweep part; give the name of one");
}

TEST(SweepFile, OfAnotherRunIsRefusedWithTheFirstDifference) {
    const sweep::Part part = sweep::freshPart(smallSweep(), {});
    sweep::Configuration other = smallSweep();
    other.ebN0.pop_back();
    EXPECT_EQ(
        complaintOf([&] { sweep::requireSameRun(part, other, {}); }),
        "belongs to another sweep: it has ebn0_db [0.0,1.5,3.0] instead of [0.0,1.5]; give the same options "
        "as before, or remove it to begin anew");
    EXPECT_EQ(complaintOf([&] {
                  sweep::requireSameRun(part, smallSweep(), {1, 4});
              }),
              "belongs to shard 1/1; give the same options as before, or remove it to begin anew");
    EXPECT_EQ(complaintOf([&] { sweep::requireSameRun(part, smallSweep(), {}); }), "none");
}

}  // namespace quarzel::test
