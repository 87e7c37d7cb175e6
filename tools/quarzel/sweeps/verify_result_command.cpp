// SPDX-License-Identifier: MIT
#include "sweeps/verify_result_command.hpp"

#include <fmt/format.h>
#include <CLI/CLI.hpp>

#include <memory>
#include <nlohmann/json.hpp>
#include <optional>
#include <string>
#include <utility>

#include "options/threads_option.hpp"
#include "report_text.hpp"
#include "sweep/result.hpp"
#include "sweeps/sweep_files.hpp"
#include "sweeps/sweep_watch.hpp"

namespace quarzel::tool {

namespace {

struct Options {
    std::string file;
    unsigned threads = 0;  // the usual number
    bool json = false;
};

/// What came out.
struct Verdict {
    std::size_t points;
    std::uint64_t blocks;
    bool isSameText;                        // byte for byte
    std::optional<std::string> difference;  // none: every number is the same
};

constexpr const char* description = "Run the sweep of a result file again";

constexpr const char* footer =
    R"(RESULT is a file that 'quarzel sweep -o' or 'quarzel merge -o' has written. Its
points are simulated once more, each up to its last block, which takes as long
as it took, and the two files are compared byte by byte. The file may come from
another version of quarzel; of one in an older format the numbers are compared.

Example:
  quarzel verify-result result.json
)";

/// "K 1024, ..., 0.4 dB: 12 bit errors in 600 blocks, and 13 in 600 when run again": the first point that
/// differs.
std::string firstDifference(const sweep::Points& stored, const sweep::Points& again) {
    for (const auto& [setup, a] : stored) {
        const sweep::PointState& b = again.at(setup);
        if (a.blocks != b.blocks || a.last() != b.last()) {
            return fmt::format(
                "{}: {} bit errors and {} block errors in {} blocks; when run again {} and {} in {}",
                sweep::setupText(setup), a.last().bitErrors, a.last().blockErrors, a.blocks,
                b.last().bitErrors, b.last().blockErrors, b.blocks);
        }
    }
    return "the errors after the last iteration are the same, something else is not";
}

/// The points of a dispatcher, ended for the same reasons as the stored ones: what the clock or a signal has
/// done cannot be repeated.
sweep::Points repeated(const sweep::Dispatcher& dispatcher, const sweep::Points& stored) {
    sweep::Points points = dispatcher.points();
    for (auto& [setup, point] : points) {
        const sweep::PointState& former = stored.at(setup);
        if (point.stoppedBy == sweep::StopReason::blocks) {
            point.stoppedBy = former.stoppedBy;
        }
        point.seconds = former.seconds;
    }
    return points;
}

void print(std::ostream& stream, const Options& options, const Verdict& verdict) {
    if (options.json) {
        const nlohmann::ordered_json object = {
            {"result", options.file},
            {"same", !verdict.difference},
            {"byte_for_byte", verdict.isSameText},
            {"points", verdict.points},
            {"blocks", verdict.blocks},
            {"difference",
             verdict.difference ? nlohmann::ordered_json(*verdict.difference) : nlohmann::ordered_json()}};
        // A file name need not be UTF-8; what is not becomes U+FFFD.
        stream << object.dump(-1, ' ', false, nlohmann::ordered_json::error_handler_t::replace) << '\n';
    } else if (verdict.difference) {
        stream << fmt::format("{}: differs: {}\n", options.file, *verdict.difference);
    } else {
        stream << fmt::format("{}: the same {}, {} with {} blocks\n", options.file,
                              verdict.isSameText ? "byte for byte" : "in every number",
                              counted(verdict.points, "point", "points"), verdict.blocks);
    }
}

ExitCode verify(const Options& options, std::ostream& results, const MakeWorkers& makeWorkers) {
    const std::string text = readBytes(options.file);
    sweep::Result result = aboutFile(options.file, [&text] { return sweep::readResult(text); });
    const sweep::Points stored = result.points;
    const std::string renewed = sweep::resultText(result);
    sweep::Dispatcher dispatcher(sweep::repetitionOf(result.seed, stored));
    {
        Checkpoint none("", std::chrono::seconds(0));
        SweepWatch watch(none);
        makeWorkers(options.threads)->run(dispatcher, watch);
        watch.finish(dispatcher);
    }
    if (!dispatcher.hasFinished()) {
        throw ToolError(ExitCode::interrupted, options.file, "the verification was interrupted",
                        "run it again");
    }
    result.points = repeated(dispatcher, stored);
    Verdict verdict{stored.size(), 0, false, {}};
    for (const auto& [setup, point] : stored) {
        verdict.blocks += point.blocks;
    }
    const std::string repeatedText = sweep::resultText(result);
    verdict.isSameText = repeatedText == text;
    if (repeatedText != renewed) {
        verdict.difference = firstDifference(stored, result.points);
    }
    print(results, options, verdict);
    return verdict.difference ? ExitCode::resultsDiffer : ExitCode::done;
}

}  // namespace

void addVerifyResultCommand(CLI::App& app, std::ostream& results, ExitCode& exitCode,
                            MakeWorkers makeWorkers) {
    auto options = std::make_shared<Options>();
    CLI::App* command = app.add_subcommand("verify-result", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    command->add_option("RESULT", options->file, "The result of a sweep")->required()->type_name("");
    addThreadsOption(*command, options->threads);
    command->add_flag("--json", options->json, "Print one JSON object instead of text");
    command->callback([options, &results, &exitCode, makeWorkers = std::move(makeWorkers)] {
        exitCode = verify(*options, results, makeWorkers);
    });
}

}  // namespace quarzel::tool
