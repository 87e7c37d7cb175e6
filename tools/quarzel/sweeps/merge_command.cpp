// SPDX-License-Identifier: MIT
#include "sweeps/merge_command.hpp"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <filesystem>
#include <iostream>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "files/file_lock.hpp"
#include "files/input_file.hpp"
#include "files/output_file.hpp"
#include "sweep/merge.hpp"
#include "sweeps/sweep_files.hpp"
#include "sweeps/sweep_table.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

struct Options {
    std::vector<std::string> files;
    std::optional<std::string> output;
    SweepForm form = SweepForm::table;
};

constexpr const char* description = "Join results and parts of sweeps";

constexpr const char* footer =
    R"(RESULT... are files that 'quarzel sweep -o' has written, in any order: results
of one seed, and all parts of sweeps with --shard. Points of several files are
put together; of a point that two files have, the one with more blocks is taken.
All parts of a sweep together give its result without --shard, byte for byte.
OUT, if it is there already, is joined too.

Examples:
  quarzel merge part*.json -o result.json
  quarzel merge small.json large.json -o all.json
)";

void mergeFiles(const Options& options, std::ostream& results) {
    std::vector<std::string> files = options.files;
    std::error_code ignored;
    if (options.output) {
        probeOutput(*options.output);
    }
    const std::unique_ptr<FileLock> lock = lockOutput(options.output);
    if (options.output) {
        const bool isGiven = std::any_of(files.begin(), files.end(), [&](const std::string& file) {
            return isSameFile(file, *options.output);
        });
        if (!isGiven && isWhole(*options.output) &&
            std::filesystem::is_regular_file(*options.output, ignored)) {
            files.push_back(*options.output);
        }
    }
    std::vector<sweep::NamedResult> read;
    for (const std::string& file : files) {
        read.push_back(readSweepFile(file));
    }
    std::optional<sweep::Result> result;
    try {
        result = sweep::merge(read);
    } catch (const sweep::Error& error) {
        throw fileError("", error.problem(), error.remedy());
    }
    if (options.output) {
        writeOutput(*options.output, sweep::resultText(*result));
    }
    const bool isTaken = options.output && isStandardStream(*options.output);
    printSweep(isTaken ? std::cerr : results, *result, options.form);
}

}  // namespace

void addMergeCommand(CLI::App& app, std::ostream& results) {
    auto options = std::make_shared<Options>();
    CLI::App* command = app.add_subcommand("merge", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    command->add_option("RESULT", options->files, "Results and parts of sweeps")->required()->type_name("");
    command->add_option("-o,--output", options->output, "Write the result to this file")->type_name("OUT");
    addFormOptions(*command, options->form);
    command->callback([options, &results] { mergeFiles(*options, results); });
}

}  // namespace quarzel::tool
