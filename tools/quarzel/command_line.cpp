// SPDX-License-Identifier: MIT
#include "command_line.hpp"

#include <fmt/format.h>

#include <CLI/CLI.hpp>
#include <algorithm>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "coverage/coverage_command.hpp"
#include "decode/decode_command.hpp"
#include "decode/info_command.hpp"
#include "plot/plot_command.hpp"
#include "shell/nearest_name.hpp"
#include "shell/shell_commands.hpp"
#include "sweeps/merge_command.hpp"
#include "sweeps/rebuild_command.hpp"
#include "sweeps/show_command.hpp"
#include "sweeps/sweep_command.hpp"
#include "sweeps/threshold_command.hpp"
#include "sweeps/verify_result_command.hpp"
#include "tool_error.hpp"
#include "trace/trace_diff_command.hpp"
#include "vectors/compare_command.hpp"
#include "vectors/vectors_command.hpp"

namespace quarzel::tool {

namespace {

constexpr const char* description = "A bit-accurate model of a hardware turbo decoder core for 3GPP LTE";

constexpr const char* footer =
    R"('quarzel help COMMAND' tells what a command reads, writes and prints. A file
named - is standard input or output.
Results go to standard output; errors, warnings and progress to standard error.

Examples:
  quarzel info 6144
  quarzel decode capture.npy --units 8 --reference sent.npy
  quarzel decode capture.npy --trace 12 --trace-file model.txt
  quarzel trace-diff model.txt simulation.txt --ignore-termination
  quarzel vectors vectors --block-size 40,6144 --ebn0 0.8
  quarzel compare vectors/u2_a1 simulated.hex
  quarzel coverage --vectors vectors
  quarzel sweep --ebn0 0:0.2:1 --iterations 8 -o result.json
  quarzel show result.json
  quarzel rebuild result.json --number 1234 --trace 12
  quarzel plot result.json -o curves.svg
)";

class HelpFormatter : public CLI::Formatter {
  public:
    HelpFormatter() {
        column_width(20);
        label("SUBCOMMAND", "COMMAND");
        label("Positionals", "Arguments");
        label("REQUIRED", "");
    }

    std::string make_usage(const CLI::App* app, std::string name) const override {
        return '\n' + Formatter::make_usage(app, name);
    }

    std::string make_option_opts(const CLI::Option* option) const override {
        const std::string type = option->get_type_name();
        return type.empty() ? "" : ' ' + type;
    }
};

/// What is wrong with a command line, in our words where CLI11 speaks of its own notions.
std::string problemWith(const CLI::App& app, const CLI::ParseError& error) {
    std::string text = error.what();
    const std::vector<std::string> leftOver = app.remaining(true);
    if (!leftOver.empty()) {
        return fmt::format("'{}' is not understood", leftOver.front());
    }
    if (app.get_subcommands().empty()) {
        return "a command is missing";
    }
    if (dynamic_cast<const CLI::ArgumentMismatch*>(&error) != nullptr) {
        return text.substr(0, text.find(':')) + ": exactly one value is needed";
    }
    return text;
}

/// The words that may stand where one was not understood: options, or else commands.
std::vector<std::string> namesLike(const std::string& word, const CLI::App& app) {
    const std::vector<CLI::App*> chosen = app.get_subcommands();
    std::vector<std::string> names;
    if (word.starts_with('-')) {
        for (const CLI::Option* option : (chosen.empty() ? &app : chosen.front())->get_options()) {
            for (const std::string& name : option->get_lnames()) {
                names.push_back("--" + name);
            }
        }
    } else if (chosen.empty()) {
        for (const CLI::App* command : app.get_subcommands({})) {
            names.push_back(command->get_name());
        }
    }
    return names;
}

std::string remedyFor(const CLI::App& app) {
    const std::vector<CLI::App*> chosen = app.get_subcommands();
    const std::string help =
        fmt::format("see 'quarzel {}--help'", chosen.empty() ? "" : chosen.front()->get_name() + ' ');
    const std::vector<std::string> leftOver = app.remaining(true);
    if (leftOver.empty()) {
        return help;
    }
    const std::string word = leftOver.front().substr(0, leftOver.front().find('='));
    const std::optional<std::string> nearest = nearestName(word, namesLike(word, app));
    return nearest ? fmt::format("did you mean '{}'? {}", *nearest, help) : help;
}

/// The error for a command line that was not understood.
ToolError usageError(const CLI::App& app, const CLI::ParseError& error) {
    return {ExitCode::usage, "", problemWith(app, error), remedyFor(app)};
}

/// The command line with every --json behind the command, wherever the user typed it.
std::vector<const char*> withJsonBehindCommand(int argc, const char* const* argv) {
    std::vector<const char*> arguments(argv, argv + argc);
    const auto first = arguments.begin() + std::min(argc, 1);
    const auto command =
        std::find_if(first, arguments.end(), [](std::string_view word) { return !word.starts_with('-'); });
    if (command != arguments.end()) {
        const auto moved =
            std::stable_partition(first, command, [](std::string_view word) { return word != "--json"; });
        std::rotate(moved, command, command + 1);
    }
    return arguments;
}

}  // namespace

ExitCode runCommandLine(int argc, const char* const* argv, std::ostream& results,
                        const MakeWorkers& makeWorkers) {
    CLI::App app(description, "quarzel");
    app.formatter(std::make_shared<HelpFormatter>());
    app.set_help_flag("-h,--help", "Print help");
    app.set_version_flag("--version", "quarzel " QUARZEL_VERSION, "Print version");
    app.footer(std::string(footer) + '\n' + exitCodesHelp);
    app.require_subcommand(1);
    addDecodeCommand(app, results);
    addInfoCommand(app, results);
    ExitCode exitCode = ExitCode::done;
    addTraceDiffCommand(app, results, exitCode);
    addVectorsCommand(app, results);
    addCompareCommand(app, results, exitCode);
    addCoverageCommand(app, results);
    addSweepCommand(app, results, makeWorkers);
    addThresholdCommand(app, results, makeWorkers);
    addShowCommand(app, results);
    addMergeCommand(app, results);
    addRebuildCommand(app, results);
    addVerifyResultCommand(app, results, exitCode, makeWorkers);
    addPlotCommand(app, results);
    addShellCommands(app, results);
    try {
        const std::vector<const char*> arguments = withJsonBehindCommand(argc, argv);
        app.parse(argc, arguments.data());
    } catch (const CLI::CallForHelp& help) {
        if (app.get_subcommands().empty() && !app.remaining().empty()) {
            throw usageError(app, help);
        }
        results << app.help();
    } catch (const CLI::CallForVersion& version) {
        results << version.what() << '\n';
    } catch (const CLI::ParseError& error) {
        throw usageError(app, error);
    }
    return exitCode;
}

}  // namespace quarzel::tool
