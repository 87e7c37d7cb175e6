// SPDX-License-Identifier: MIT
#include "coverage/coverage_command.hpp"

#include <fmt/format.h>
#include <unistd.h>
#include <CLI/CLI.hpp>

#include <iostream>
#include <list>
#include <map>
#include <memory>
#include <optional>
#include <sstream>
#include <string>
#include <vector>

#include "coverage/core_coverage.hpp"
#include "coverage/coverage_report.hpp"
#include "decode/progress.hpp"
#include "files/input_file.hpp"
#include "options/core_options.hpp"
#include "options/quantiser_options.hpp"
#include "options/threads_option.hpp"
#include "tool_error.hpp"
#include "vectors/manifest.hpp"

namespace quarzel::tool {

namespace {

struct CoverageOptions {
    std::string capture;
    std::string vectors;
    std::optional<double> scale;  ///< of real numbers
    CoreOptions core;
    unsigned threads = allCores();
    bool json = false;
    std::vector<const CLI::Option*> captureOptions;  ///< those that go with a capture, given or not
};

constexpr const char* description = "Count what blocks reach in the arithmetic of a core";

/// The part of the help that explains the events, a line for each.
std::string eventsHelp() {
    std::string text = "Events, with their positions:\n";
    for (const EventFacts& facts : eventFacts()) {
        text += fmt::format("  {:<18}{}\n", facts.name, facts.text);
    }
    return text;
}

constexpr const char* footer =
    R"(CAPTURE holds soft values as 'quarzel decode' reads it, decoded by the
core that the options name. DIR is a set that 'quarzel vectors' has made, with
its cores and iterations.

Every signal of every pass is computed again, and what happens there is counted
by its positions: states, columns of a trace, signs, and in the tree of maxima
the bit with the number of the state, pair or half. Differences are told by
their sign and the entry of the correction table, 16 being beyond it; -1 shares
the entry of 0. Events of circuits that a core does not have are left out; all
others can be reached.
)";

constexpr const char* example = R"(
Examples:
  quarzel coverage capture.npy --units 8
  quarzel coverage --vectors covering
)";

/// Throw when the options do not go together.
void check(const CoverageOptions& options) {
    if (options.vectors.empty() && options.capture.empty()) {
        throw ToolError(ExitCode::usage, "", "neither a capture nor --vectors is given",
                        "see 'quarzel coverage --help'");
    }
    if (options.vectors.empty()) {
        return;
    }
    for (const CLI::Option* const option : options.captureOptions) {
        if (option->count() != 0) {
            throw ToolError(ExitCode::usage, option->get_positional() ? "CAPTURE" : option->get_name(),
                            "does not go with --vectors, which tells all", "leave it out");
        }
    }
}

/// A core and its blocks.
struct CoreBlocks {
    std::string name;
    int units;
    int algorithm;
    std::vector<CoverageBlock> blocks;
};

/// The capture that holds a block of a set.
Capture captureOf(const std::string& directory, const std::string& name, const VectorContent& content) {
    std::istringstream stream(readUnaltered(directory, name, content));
    return readCapture(stream, directory + '/' + name);
}

/// @param captures  receives what the blocks stand in
std::vector<CoreBlocks> blocksOfSet(const std::string& directory, std::list<Capture>& captures) {
    std::vector<CoreBlocks> cores;
    const VectorContent content = readManifest(directory);
    for (const VectorCore& core : content.cores) {
        std::map<std::string, const Capture*> read;
        cores.push_back({core.directory, core.units, core.algorithm, {}});
        for (const VectorBlock& block : core.blocks) {
            const Capture*& capture = read[block.capture];
            if (capture == nullptr) {
                captures.push_back(captureOf(directory, core.directory + '/' + block.capture, content));
                capture = &captures.back();
            }
            if (block.row >= capture->blocks()) {
                throw fileError(capture->file, fmt::format("has no block {}", block.row),
                                "make the set again with 'quarzel vectors'");
            }
            cores.back().blocks.push_back({capture, block.row, block.iterations});
        }
    }
    return cores;
}

/// @param captures  receives the capture
CoreBlocks blocksOfCapture(const CoverageOptions& options, std::list<Capture>& captures) {
    const CoreOptions& core = options.core;
    CoreBlocks all{fmt::format("u{}_a{}", core.units, core.algorithm), core.units, core.algorithm, {}};
    std::ifstream stream = openInput(options.capture);
    captures.push_back(readCapture(stream, options.capture, options.scale));
    const Capture& capture = captures.back();
    for (std::size_t row = 0; row < capture.blocks(); ++row) {
        all.blocks.push_back({&capture, row, core.iterations});
    }
    return all;
}

void cover(const CoverageOptions& options, std::ostream& results) {
    check(options);
    std::list<Capture> captures;
    std::vector<CoreBlocks> cores;
    if (options.vectors.empty()) {
        cores.push_back(blocksOfCapture(options, captures));
    } else {
        cores = blocksOfSet(options.vectors, captures);
    }
    std::vector<CoverageReport> reports;
    for (const CoreBlocks& core : cores) {
        Progress progress(std::cerr, ::isatty(STDERR_FILENO) != 0, core.blocks.size());
        reports.push_back({core.name, core.units, core.algorithm, core.blocks.size(),
                           countEvents(core.blocks, core.units, core.algorithm, options.threads,
                                       [&progress](std::size_t done) { progress.update(done); })});
    }
    (options.json ? printJson : printText)(results, reports);
}

}  // namespace

void addCoverageCommand(CLI::App& app, std::ostream& results) {
    auto options = std::make_shared<CoverageOptions>();
    CLI::App* command = app.add_subcommand("coverage", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + eventsHelp() + example + '\n' + exitCodesHelp);
    const std::size_t before = command->get_options().size();
    command->add_option("CAPTURE", options->capture, "Soft values to decode")->type_name("");
    addRealNumberOptions(*command, options->scale);
    addModelOptions(*command, options->core);
    const std::vector<CLI::Option*> all = command->get_options();
    options->captureOptions.assign(all.begin() + static_cast<std::ptrdiff_t>(before), all.end());
    command->add_option("--vectors", options->vectors, "Take the blocks of this vector set instead")
        ->type_name("DIR");
    addThreadsOption(*command, options->threads);
    command->add_flag("--json", options->json, "Print one JSON object instead of text");
    command->callback([options, &results] { cover(*options, results); });
}

}  // namespace quarzel::tool
