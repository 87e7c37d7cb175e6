// SPDX-License-Identifier: MIT
#include "sweeps/merge_command.hpp"

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "files/output_file.hpp"
#include "sweep/part.hpp"
#include "sweeps/sweep_files.hpp"
#include "sweeps/sweep_table.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

struct Options {
    std::vector<std::string> parts;
    std::optional<std::string> output;
    SweepForm form = SweepForm::table;
};

constexpr const char* description = "Join the parts of a sweep";

constexpr const char* footer =
    R"(PART... are the files that 'quarzel sweep --shard I/N -o PART' has written, all
parts of one sweep, in any order. The result is that of the sweep without
--shard, byte for byte.

Example:
  quarzel merge part*.json -o result.json
)";

void mergeParts(const Options& options, std::ostream& results) {
    if (options.output) {
        for (const std::string& file : options.parts) {
            if (isSameFile(file, *options.output)) {
                throw ToolError(ExitCode::usage, "-o", *options.output + " is also read",
                                "give another name");
            }
        }
        probeOutput(*options.output);
    }
    std::vector<sweep::NamedPart> parts;
    for (const std::string& file : options.parts) {
        parts.push_back({file, aboutFile(file, [&file] { return sweep::readPart(readBytes(file)); })});
    }
    std::optional<sweep::Result> result;
    try {
        result = sweep::merge(parts);
    } catch (const sweep::Error& error) {
        throw fileError("", error.problem(), error.remedy());
    }
    if (options.output) {
        writeOutput(*options.output, sweep::resultText(*result));
    }
    printSweep(results, *result, options.form);
}

}  // namespace

void addMergeCommand(CLI::App& app, std::ostream& results) {
    auto options = std::make_shared<Options>();
    CLI::App* command = app.add_subcommand("merge", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    command->add_option("PART", options->parts, "Parts of a sweep")->required()->type_name("");
    command->add_option("-o,--output", options->output, "Write the result to this file")->type_name("OUT");
    addFormOptions(*command, options->form);
    command->callback([options, &results] { mergeParts(*options, results); });
}

}  // namespace quarzel::tool
