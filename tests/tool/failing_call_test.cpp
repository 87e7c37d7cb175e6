// SPDX-License-Identifier: MIT
// Each call of the system that a command makes fails once, and from then on: the command ends with an error,
// or it does all that it was to do; nothing half-written is left, and it can be run again.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <iostream>
#include <map>
#include <set>

#include "npy_data.hpp"
#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace fs = std::filesystem;

namespace quarzel::test {

namespace {

using Files = std::map<std::string, std::string>;

class FailingCall : public testing::Test {
  protected:
    void SetUp() override {
#ifdef __SANITIZE_ADDRESS__
        GTEST_SKIP() << "the sanitizer's library wants to be the first";
#endif
        fs::create_directory(itsOutput);
    }

    /// The name of an output.
    std::string out(const std::string& name) const {
        return itsOutput + '/' + name;
    }

    /// The content of every output.
    Files outputs() const {
        Files files;
        for (const auto& entry : fs::recursive_directory_iterator(itsOutput)) {
            if (entry.is_regular_file()) {
                files[entry.path().lexically_relative(itsOutput).string()] = readFile(entry.path().string());
            }
        }
        return files;
    }

    /// Put what was there before in the place of all outputs.
    void restore(const Files& older) {
        fs::remove_all(itsOutput);
        fs::create_directory(itsOutput);
        for (const auto& [name, content] : older) {
            fs::create_directories(fs::path(out(name)).parent_path());
            itsDirectory.write("out/" + name, content);
        }
    }

    /// @param failing  the call, and which of its calls; empty: none
    ToolRun run(const std::string& failing) const {
        std::vector<std::string> words = {"QUARZEL_FAILING=" + failing, "QUARZEL_FAILED=" + itsMark,
                                          "LD_PRELOAD=" QUARZEL_FAILING_CALLS, QUARZEL_TOOL};
        words.insert(words.end(), itsArguments.begin(), itsArguments.end());
        return runTool(words, {.program = "/usr/bin/env"});
    }

    /// Every file or folder is what was there before, or the whole of what was to be there. What a sweep
    /// keeps to go on may be there too, and what could not be removed.
    void expectOlderOrWhole(const Files& left, const Files& older) const {
        std::set<std::string> names;
        for (const Files* files : {&left, &older, &itsWhole}) {
            for (const auto& file : *files) {
                names.insert(file.first.substr(0, file.first.find('/')));
            }
        }
        for (const std::string& name : names) {
            const auto part = [&name](Files files) {
                std::erase_if(files, [&](const auto& file) {
                    return file.first != name && !file.first.starts_with(name + '/');
                });
                return files;
            };
            if (!name.ends_with(".checkpoint") && !name.starts_with(".quarzel-")) {
                EXPECT_TRUE(part(left) == part(older) || part(left) == part(itsWhole)) << name;
            }
        }
    }

    /// Run the command with a call that fails, and again without.
    /// @return whether the command makes so many calls
    bool check(const std::string& failing, const Files& older) {
        SCOPED_TRACE(failing);
        restore(older);
        const ToolRun failed = run(failing);
        if (!fs::remove(itsMark)) {
            return false;
        }
        const Files left = outputs();
        expectOlderOrWhole(left, older);
        if (failed.exitCode == 0) {
            EXPECT_TRUE(std::includes(left.begin(), left.end(), itsWhole.begin(), itsWhole.end()))
                << failed.err;
            EXPECT_TRUE(left.size() == itsWhole.size() ||
                        failed.err.find(" are kept in ") != std::string::npos);
            return true;
        }
        ++itsFailures;
        EXPECT_GT(failed.exitCode, 0) << "it crashed";
        EXPECT_LT(failed.exitCode, 10);
        EXPECT_THAT(failed.err, testing::HasSubstr("quarzel: error: "));
        EXPECT_THAT(failed.err, testing::Not(testing::HasSubstr("report this")));
        if (left != older) {
            const ToolRun again = run("");
            EXPECT_EQ(again.exitCode, 0) << again.err;
            EXPECT_EQ(outputs(), itsWhole);
        }
        return true;
    }

    /// Check every call of every function for a command.
    /// @param older  outputs that are there before
    void expectAllOrNothing(const std::vector<std::string>& arguments, const Files& older = {}) {
        itsArguments = arguments;
        restore(older);
        const ToolRun whole = run("");
        ASSERT_EQ(whole.exitCode, 0) << whole.err;
        itsWhole = outputs();
        int runs = 0;
        for (const std::string name :
             {"open",   "openat",    "fopen64",        "mkostemp",     "mkdtemp",      "mkdir",  "write",
              "pwrite", "ftruncate", "fchmod",         "chmod",        "fsync",        "syncfs", "flock",
              "rename", "renameat2", "pthread_create", "memfd_create", "posix_spawnp", "close"}) {
            for (int number = 1;; ++number) {
                const std::string call = name + ' ' + std::to_string(number);
                if (!check(call, older)) {
                    break;
                }
                check(call + '+', older);
                runs += 2;
            }
        }
        std::cout << runs << " runs with a call that failed, " << itsFailures
                  << " of them ended with an error\n";
        EXPECT_GT(itsFailures, 0);
    }

    TemporaryDirectory itsDirectory;
    std::string itsOutput = itsDirectory.path("out");
    std::string itsMark = itsDirectory.path("failed");
    std::vector<std::string> itsArguments;
    Files itsWhole;
    int itsFailures = 0;
};

}  // namespace

TEST_F(FailingCall, LeavesASweepItsResultOrWhatItKept) {
    expectAllOrNothing({"sweep", "--block-size", "40", "--ebn0", "1,2", "--iterations", "2", "--max-blocks",
                        "50", "--threads", "2", "--resume", "-o", out("result.json")});
}

TEST_F(FailingCall, LeavesADecodeItsOlderDecisions) {
    const std::string capture = itsDirectory.path("capture.npy");
    xt::xarray<std::int8_t> soft = xt::zeros<std::int8_t>({1, 3, 44});
    xt::dump_npy(capture, soft);
    expectAllOrNothing({"decode", capture, "--iterations", "1", "--trace", "4", "--trace-file",
                        out("trace.csv"), "-o", out("bits.npy")},
                       {{"bits.npy", "older"}, {"trace.csv", "older"}});
}

TEST_F(FailingCall, LeavesVectorsTheirOlderSet) {
    itsArguments = {"vectors", out("set"), "--block-size", "40", "--blocks", "1"};
    ASSERT_EQ(run("").exitCode, 0);
    const Files older = outputs();
    expectAllOrNothing({"vectors", out("set"), "--block-size", "40", "--blocks", "2", "--replace"}, older);
}

TEST_F(FailingCall, LeavesAMergeItsParts) {
    for (const std::string part : {"1", "2"}) {
        itsArguments = {"sweep",
                        "--block-size",
                        "40",
                        "--ebn0",
                        "1,2",
                        "--iterations",
                        "2",
                        "--max-blocks",
                        "50",
                        "--shard",
                        part + "/2",
                        "-o",
                        itsDirectory.path("part" + part + ".json")};
        ASSERT_EQ(run("").exitCode, 0);
    }
    expectAllOrNothing({"merge", itsDirectory.path("part1.json"), itsDirectory.path("part2.json"), "-o",
                        out("result.json")});
}

}  // namespace quarzel::test
