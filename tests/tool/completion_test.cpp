// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <regex>
#include <sstream>

#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::IsSupersetOf;

std::vector<std::string> linesOf(const std::string& text) {
    std::istringstream stream(text);
    std::vector<std::string> lines;
    for (std::string line; std::getline(stream, line);) {
        lines.push_back(line);
    }
    return lines;
}

/// What bash offers for the last of these words, asked as bash itself asks.
class BashCompletion : public testing::Test {
  protected:
    std::vector<std::string> offers(const std::vector<std::string>& words) {
        itsDirectory.write("script", runTool({"completion", "bash"}).out);
        std::string array;
        for (const std::string& word : words) {
            array += " '" + word + '\'';
        }
        const std::string test = itsDirectory.write(
            "test", "cd '" + itsDirectory.path("work") + "' && source '" + itsDirectory.path("script") +
                        "'\n"
                        "COMP_WORDS=(quarzel" +
                        array + ")\nCOMP_CWORD=" + std::to_string(words.size()) +
                        "\n_quarzel && printf '%s\\n' \"${COMPREPLY[@]}\"\n");
        const ToolRun run = runTool({"--norc", "--noprofile", test}, {.program = "/bin/bash"});
        EXPECT_EQ(run.err, "");
        std::vector<std::string> lines = linesOf(run.out);
        if (lines == std::vector<std::string>{""}) {
            lines.clear();
        }
        std::sort(lines.begin(), lines.end());
        return lines;
    }

    void SetUp() override {
        std::filesystem::create_directory(itsDirectory.path("work"));
        itsDirectory.write("work/capture one.npy", "");
        itsDirectory.write("work/other.npy", "");
    }

    TemporaryDirectory itsDirectory;
};

/// The commands that the help lists.
std::vector<std::string> commandsOfHelp() {
    std::vector<std::string> commands;
    bool isList = false;
    for (const std::string& line : linesOf(runTool({"--help"}).out)) {
        if (isList && !line.starts_with("  ")) {
            break;
        }
        if (isList && line[2] != ' ') {
            commands.push_back(line.substr(2, line.find(' ', 2) - 2));
        }
        isList = isList || line == "Commands:";
    }
    return commands;
}

/// The options that the help of a command lists.
std::vector<std::string> optionsOfHelp(const std::string& command) {
    std::vector<std::string> options;
    for (const std::string& line : linesOf(runTool({command, "--help"}).out)) {
        std::smatch match;
        if (std::regex_search(line, match, std::regex("^  (?:(-[a-z]),)?(--[a-z0-9-]+)[ \n]")) ||
            std::regex_search(line, match, std::regex("^  (?:(-[a-z]),)?(--[a-z0-9-]+)$"))) {
            options.push_back(match[2]);
            if (match[1].matched) {
                options.push_back(match[1]);
            }
        }
    }
    std::sort(options.begin(), options.end());
    return options;
}

}  // namespace

TEST_F(BashCompletion, OffersTheCommandsOfTheHelp) {
    std::vector<std::string> commands = commandsOfHelp();
    std::sort(commands.begin(), commands.end());
    ASSERT_THAT(commands, IsSupersetOf({"completion", "decode", "info", "vectors"}));
    EXPECT_EQ(offers({""}), commands);
    EXPECT_THAT(offers({"dec"}), ElementsAre("decode"));
    EXPECT_THAT(offers({"-"}), ElementsAre("--help", "--version", "-h"));
}

TEST_F(BashCompletion, OffersTheOptionsOfTheHelpForEveryCommand) {
    for (const std::string& command : commandsOfHelp()) {
        EXPECT_EQ(offers({command, "-"}), optionsOfHelp(command)) << command;
    }
    EXPECT_THAT(offers({"decode", "capture", "--trace-f"}), ElementsAre("--trace-file", "--trace-format"));
}

TEST_F(BashCompletion, OffersTheValuesOfAnOption) {
    EXPECT_THAT(offers({"decode", "--units", ""}), ElementsAre("2", "4", "8"));
    EXPECT_THAT(offers({"decode", "--trace-format", "=", "j"}), ElementsAre("json"));
    EXPECT_THAT(offers({"decode", "--trace-format", "="}), ElementsAre("csv", "json", "text", "vcd"));
    EXPECT_THAT(offers({"completion", ""}), ElementsAre("bash", "fish", "zsh"));
    EXPECT_THAT(offers({"decode", "--iterations", ""}), IsEmpty()) << "a number is the user's";
}

TEST_F(BashCompletion, OffersFilesWhereFilesAreWanted) {
    EXPECT_THAT(offers({"decode", "c"}), ElementsAre("capture one.npy"));
    EXPECT_THAT(offers({"decode", "x", "--reference", ""}), ElementsAre("capture one.npy", "other.npy"));
    EXPECT_THAT(offers({"decode", "x", "-o", "=", "o"}), ElementsAre("other.npy"));
    EXPECT_THAT(offers({"info", "c"}), IsEmpty()) << "K is no file";
}

TEST(Completion, HasEveryCommandAndOptionInOtherShellsToo) {
    const std::string zsh = runTool({"completion", "zsh"}).out;
    const std::string fish = runTool({"completion", "fish"}).out;
    for (const std::string& command : commandsOfHelp()) {
        EXPECT_NE(zsh.find("\n        '" + command + ":"), std::string::npos) << command;
        EXPECT_NE(fish.find("-a " + command + " -d"), std::string::npos) << command;
        for (const std::string& option : optionsOfHelp(command)) {
            EXPECT_NE(zsh.find('\'' + option + '['), std::string::npos) << option;
            const std::string inFish =
                (option.starts_with("--") ? " -l " + option.substr(2) : " -s " + option.substr(1)) + ' ';
            EXPECT_NE(fish.find(inFish), std::string::npos) << option;
        }
    }
}

TEST(Completion, IsRefusedForAnotherShell) {
    const ToolRun run = runTool({"completion", "csh"});
    EXPECT_EQ(run.err,
              "quarzel: error: SHELL: 'csh' is none of bash, zsh, fish; see 'quarzel completion --help'\n");
    EXPECT_EQ(run.exitCode, 2);
}

}  // namespace quarzel::test
