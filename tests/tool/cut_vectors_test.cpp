// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <map>

#include "npy_data.hpp"
#include "refusal.hpp"
#include "run_tool.hpp"
#include "temporary_directory.hpp"
#include "vectors/expected_decisions.hpp"

namespace quarzel::test {

namespace {

/// A small vector set, of which a file is cut, empty or mixed up with another.
class CutVectors : public testing::Test {
  protected:
    CutVectors() { EXPECT_EQ(runTool({"vectors", itsSet, "--blocks", "1"}).exitCode, 0); }

    /// The line that the user sees; empty when the set is read.
    std::string refusal() const {
        return refusalOf([this] { tool::readExpected(itsSet); });
    }

    void expectRefusedWhereverItIsCut(const std::string& file, std::size_t ends) {
        const std::string whole = readFile(itsSet + '/' + file);
        const std::string start = "quarzel: error: " + itsSet + '/' + file + ": ";
        for (std::size_t length = 0; length + ends < whole.size(); ++length) {
            itsDirectory.write("set/" + file, whole.substr(0, length));
            const std::string line = refusal();
            ASSERT_TRUE(line.starts_with(start)) << length << ": " << line;
            ASSERT_EQ(std::count(line.begin(), line.end(), '\n'), 1) << line;
        }
        itsDirectory.write("set/" + file, whole);
        EXPECT_EQ(refusal(), "");
    }

    TemporaryDirectory itsDirectory;
    std::string itsSet = itsDirectory.path("set");
};

}  // namespace

TEST_F(CutVectors, AreRefusedWhereverTheDecisionsAreCut) {
    expectRefusedWhereverItIsCut("u2_a1/dout.hex", 0);
}

TEST_F(CutVectors, AreRefusedWhereverTheManifestIsCut) {
    expectRefusedWhereverItIsCut("manifest.json", 1);  // without its last line end it is whole
}

TEST_F(CutVectors, AreRefusedWhenTheyAreMixed) {
    ASSERT_EQ(runTool({"vectors", itsDirectory.path("other"), "--blocks", "1", "--seed", "2"}).exitCode, 0);
    itsDirectory.write("set/u2_a1/dout.hex", readFile(itsDirectory.path("other/u2_a1/dout.hex")));
    EXPECT_EQ(refusal(),
              "quarzel: error: " + itsSet +
                  "/u2_a1/dout.hex: is not the file that was made with this set: its SHA-256 differs; "
                  "make the set again with 'quarzel vectors'\n");
}

TEST_F(CutVectors, AreRefusedWhenTheManifestHoldsWhatCannotBe) {
    const std::string whole = readFile(itsSet + "/manifest.json");
    const std::string size = "\"block_size\":40,";
    const std::string unknown = "it has a block size that LTE has not";
    const std::string range = " is not a whole number from 0 to 4294967295";
    for (const auto& [other, problem] :
         std::map<std::string, std::string>{{"41", unknown},
                                            {"0", unknown},
                                            {"-1", "-1" + range},
                                            {"40.5", "40.5" + range},
                                            {"1e300", "1e+300" + range},
                                            {"\"40\"", "\"40\"" + range},
                                            {"4294967336", "4294967336" + range}}) {
        std::string altered = whole;
        altered.replace(altered.find(size), size.size(), "\"block_size\":" + other + ',');
        itsDirectory.write("set/manifest.json", altered);
        EXPECT_EQ(refusal(), "quarzel: error: " + itsSet + "/manifest.json: is not a well-formed manifest: " +
                                 problem + "; make the set again with 'quarzel vectors'\n");
    }
}

TEST_F(CutVectors, OfACaptureAreNotMadeWhereverItIsCut) {
    const std::string whole = rawNpy(npyHeader("|i1", "(1, 3, 44)"), std::string(132, '\1'));
    const std::string own = itsDirectory.path("own");
    std::vector<std::size_t> lengths = {0, 1, 20, whole.size() - 132, whole.size() - 131, whole.size() - 1};
    for (const std::size_t length : lengths) {
        const std::string file = itsDirectory.write("cut.npy", whole.substr(0, length));
        const ToolRun run = runTool({"vectors", own, "--capture", file});
        EXPECT_EQ(run.exitCode, 3) << length;
        EXPECT_TRUE(run.err.starts_with("quarzel: error: " + file + ": ")) << run.err;
        EXPECT_EQ(std::count(run.err.begin(), run.err.end(), '\n'), 1) << run.err;
    }
    EXPECT_EQ(itsDirectory.names(), (std::vector<std::string>{"cut.npy", "set"}));
}

}  // namespace quarzel::test
