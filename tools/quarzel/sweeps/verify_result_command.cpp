// SPDX-License-Identifier: MIT
#include "sweeps/verify_result_command.hpp"

#include <fmt/format.h>

#include <memory>
#include <string>
#include <utility>

#include "options/threads_option.hpp"
#include "sweep/result.hpp"
#include "sweeps/sweep_files.hpp"
#include "sweeps/sweep_table.hpp"
#include "sweeps/sweep_watch.hpp"

namespace quarzel::tool {

namespace {

struct Options {
    std::string file;
    unsigned threads = 0;  // the usual number
};

constexpr const char* description = "Run the sweep of a result file again";

constexpr const char* footer =
    R"(RESULT is a file that 'quarzel sweep -o' or 'quarzel merge -o' has written. Its
sweep is run once more, which takes as long as it took, and the two files are
compared byte by byte. Points that --max-time has ended get the same number of
blocks. The file may come from another version of quarzel.

Example:
  quarzel verify-result result.json
)";

/// "K 1024, ..., 0.4 dB: 12 bit errors in 600 blocks, and 13 in 600 when run again": the first point that
/// differs.
std::string firstDifference(const sweep::Result& stored, const sweep::Result& again) {
    const std::vector<sweep::Curve> curves = stored.configuration.curves();
    const std::size_t pointsPerCurve = stored.configuration.ebN0.size();
    for (std::size_t i = 0; i < stored.points.size(); ++i) {
        const sweep::PointState& a = stored.points[i];
        const sweep::PointState& b = again.points[i];
        if (a.blocks != b.blocks || a.last().bitErrors != b.last().bitErrors ||
            a.last().blockErrors != b.last().blockErrors) {
            return fmt::format(
                "{}, {} dB: {} bit errors and {} block errors in {} blocks; when run again {} and {} in {}",
                curveText(curves[i / pointsPerCurve]), stored.configuration.ebN0[i % pointsPerCurve].value(),
                a.last().bitErrors, a.last().blockErrors, a.blocks, b.last().bitErrors, b.last().blockErrors,
                b.blocks);
        }
    }
    return "the counts are the same, what is computed from them or its form is not";
}

ExitCode verify(const Options& options, std::ostream& results, const MakeWorkers& makeWorkers) {
    const std::string text = readBytes(options.file);
    const sweep::Result stored = aboutFile(options.file, [&text] { return sweep::readResult(text); });
    sweep::Plan plan{stored.configuration, {}, {}, {}};
    std::uint64_t blocks = 0;
    for (const sweep::PointState& point : stored.points) {
        plan.timedOut.push_back(point.stoppedBy == sweep::StopReason::time ? point.blocks : 0);
        blocks += point.blocks;
    }
    sweep::Dispatcher dispatcher(std::move(plan));
    {
        Checkpoint none("", std::chrono::seconds(0));
        SweepWatch watch(none);
        makeWorkers(options.threads)->run(dispatcher, watch);
    }
    if (!dispatcher.hasFinished()) {
        throw ToolError(ExitCode::interrupted, options.file, "the verification was interrupted",
                        "run it again");
    }
    const sweep::Result again{stored.configuration, dispatcher.states(), stored.quarzel};
    if (sweep::resultText(again) == text) {
        results << fmt::format("{}: the same byte for byte, {} points with {} blocks\n", options.file,
                               stored.points.size(), blocks);
        return ExitCode::done;
    }
    results << fmt::format("{}: differs: {}\n", options.file, firstDifference(stored, again));
    return ExitCode::resultsDiffer;
}

}  // namespace

void addVerifyResultCommand(CLI::App& app, std::ostream& results, ExitCode& exitCode,
                            MakeWorkers makeWorkers) {
    auto options = std::make_shared<Options>();
    CLI::App* command = app.add_subcommand("verify-result", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    command->add_option("RESULT", options->file, "The result of a sweep")->required()->type_name("");
    addThreadsOption(*command, options->threads);
    command->callback([options, &results, &exitCode, makeWorkers = std::move(makeWorkers)] {
        exitCode = verify(*options, results, makeWorkers);
    });
}

}  // namespace quarzel::tool
