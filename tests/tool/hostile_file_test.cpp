// SPDX-License-Identifier: MIT
// Files and circumstances that are meant to end the tool without a word: it ends with one line that says why.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <nlohmann/json.hpp>

#include "npy_data.hpp"
#include "run_tool.hpp"
#include "sweep/sha256.hpp"
#include "sweep/sweeps.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

using Json = nlohmann::ordered_json;

void expectOneLine(const ToolRun& run, const std::string& message, int exitCode = 3) {
    EXPECT_EQ(run.err, "quarzel: error: " + message + '\n');
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(run.exitCode, exitCode);
}

/// A value nested in very many arrays.
std::string deepValue() {
    constexpr std::size_t depth = 200'000;
    return std::string(depth, '[') + std::string(depth, ']');
}

/// A file of a sweep after an edit, with the checksum that fits.
template <class Edit>
std::string edited(const std::string& text, const Edit& edit) {
    Json document = Json::parse(text);
    document.erase("checksum");
    edit(document);
    document["checksum"] = sweep::sha256(document.dump());
    return document.dump(1) + '\n';
}

/// Run the tool where no thread can be made: there is no room for its stack.
ToolRun runWithoutThreads(const std::vector<std::string>& arguments) {
    std::vector<std::string> words = {"-c", R"(ulimit -s 100000000000 && exec "$0" "$@")", QUARZEL_TOOL};
    words.insert(words.end(), arguments.begin(), arguments.end());
    return runTool(words, {.program = "/bin/sh"});
}

}  // namespace

TEST(HostileFile, OfASweepMayBeNestedDeeply) {
    const TemporaryDirectory directory;
    const std::string start = R"({"format":"quarzel sweep result","version":)";
    for (const std::string& text : {start + deepValue() + '}', start + R"(1,"x":)" + deepValue() + '}',
                                    start + std::string(200'000, '[')}) {
        const std::string file = directory.write("result.json", text);
        expectOneLine(
            runTool({"verify-result", file}),
            file + ": is truncated or altered: it is not a whole JSON object; use another copy of it");
        expectOneLine(
            runTool({"merge", file}),
            file + ": is truncated or altered: it is not a whole JSON object; use another copy of it");
    }
}

TEST(HostileFile, OfAVectorSetMayBeNestedDeeply) {
    const TemporaryDirectory directory;
    const std::string set = directory.path("set");
    std::filesystem::create_directory(set);
    directory.write("set/manifest.json",
                    R"({"format":"quarzel test vectors","version":)" + deepValue() + '}');
    expectOneLine(runTool({"compare", set, "x"}),
                  set +
                      "/manifest.json: is truncated or altered: it is not a whole JSON object; make the set "
                      "again with 'quarzel vectors'");
    expectOneLine(runTool({"vectors", set, "--replace"}),
                  set + ": is not empty and no vector set; give another name");
}

TEST(HostileFile, MayClaimMoreBlocksThanThereAreNumbers) {
    const TemporaryDirectory directory;
    const std::string empty = directory.write("empty.hex", "");
    for (const char* shape :
         {"(2305843009213693952, 8)", "(3689348814741910324, 5)", "(1125899906842624, 5)"}) {
        const std::string file = directory.write("bits.npy", rawNpy(npyHeader("|u1", shape)));
        expectOneLine(runTool({"compare", file, empty}),
                      file + ": ends within its array; copy it again, it was cut short");
    }
}

TEST(HostileFile, MayHoldWhatNoSweepGives) {
    const TemporaryDirectory directory;
    sweep::Configuration configuration = smallSweep();
    configuration.perIteration = true;
    const std::string text = sweep::resultText(resultOf(configuration));
    const auto expectRefused = [&](const std::string& problem, const auto& edit) {
        const std::string file = directory.write(
            "result.json", edited(text, [&](Json& result) { edit(result["curves"][0]["points"][0]); }));
        expectOneLine(runTool({"verify-result", file}),
                      file + ": is not understood: " + problem + "; use another copy of it");
    };
    const std::string uncounted = "a point does not have a count for each iteration";
    const std::string impossible = "a point has more errors or blocks than there can be";
    expectRefused(uncounted, [](Json& point) { point["per_iteration"] = Json::array(); });
    expectRefused(uncounted, [](Json& point) { point["per_iteration"].erase(0); });
    const std::string range = " is not a whole number from 0 to 18446744073709551615";
    expectRefused("-1" + range, [](Json& point) { point["blocks"] = -1; });
    expectRefused("1e+300" + range, [](Json& point) { point["blocks"] = 1e300; });
    expectRefused("1e+300" + range, [](Json& point) { point["per_iteration"][0]["bit_errors"] = 1e300; });
    expectRefused(impossible, [](Json& point) { point["blocks"] = 0; });
    expectRefused(impossible, [](Json& point) {  // the link has no CRC that could miss them
        point["per_iteration"][0].update({{"block_errors", 1}, {"undetected_errors", 1}});
    });
    expectRefused("an Eb/N0 is not a number of decibels", [](Json& point) { point["ebn0_db"] = 1e300; });
}

TEST(HostileFile, MayBeAPartOfVeryMany) {
    const TemporaryDirectory directory;
    const std::string part = sweep::resultText(partResult(smallSweep(), {0, 2}).result);
    const std::string file = directory.write("part.json", edited(part, [](Json& document) {
                                                 document["part"]["count"] = std::uint64_t{1} << 63;
                                             }));
    expectOneLine(runTool({"merge", file}),
                  file + ": is not understood: its part is not one of a sweep; use another copy of it");
}

TEST(HostileCircumstance, MayBeThatThereIsNoThread) {
    expectOneLine(
        runWithoutThreads({"sweep", "--ebn0", "1", "--max-blocks", "10", "--threads", "2"}),
        "the system refuses a thread: Resource temporarily unavailable; raise the limits of processes "
        "and memory (ulimit -u, ulimit -v)",
        1);
    const TemporaryDirectory directory;
    const ToolRun run = runWithoutThreads({"vectors", directory.path("set"), "--threads", "8"});
    EXPECT_EQ(run.err, "") << "this thread does the work alone";
    EXPECT_EQ(run.exitCode, 0);
    EXPECT_EQ(directory.names(), std::vector<std::string>{"set"});
}

// A file that is opened would get the number of the closed stream.
TEST(HostileCircumstance, MayBeThatStandardErrorIsClosed) {
    const TemporaryDirectory directory;
    const std::string soft = directory.write("loud.csv", [] {
        std::string text = "systematic,parity1,parity2\n";
        for (int i = 0; i < 44; ++i) {
            text += "1000,0,0\n";
        }
        return text;
    }());
    const std::vector<std::string> decode = {"decode", soft, "--trace", "1", "--trace-file"};
    std::vector<std::string> words = decode;
    words.push_back(directory.path("expected"));
    const ToolRun run = runTool(words);
    ASSERT_NE(run.err, "") << "the decoder warns";
    words = {"-c", R"(exec "$0" "$@" 2>&-)", QUARZEL_TOOL};
    words.insert(words.end(), decode.begin(), decode.end());
    words.push_back(directory.path("trace"));
    EXPECT_EQ(runTool(words, {.program = "/bin/sh"}).exitCode, 0);
    EXPECT_EQ(readFile(directory.path("trace")), readFile(directory.path("expected")));
}

TEST(HostileCircumstance, MayBeThatStandardOutputIsClosed) {
    const TemporaryDirectory directory;
    const std::string output = directory.path("out.npy");
    const ToolRun run =
        runTool({"-c", R"(exec "$0" decode "$1" -o "$2" >&-)", QUARZEL_TOOL, shipped("k40.soft.npy"), output},
                {.program = "/bin/sh"});
    expectOneLine(run, "standard output: cannot be written; free some space or send it elsewhere");
    EXPECT_EQ(readFile(output), readFile(shipped("k40.decided.npy")));
}

}  // namespace quarzel::test
