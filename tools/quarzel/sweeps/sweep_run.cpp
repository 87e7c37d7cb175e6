// SPDX-License-Identifier: MIT
#include "sweeps/sweep_run.hpp"

#include <fmt/format.h>

#include <chrono>
#include <filesystem>
#include <iostream>

#include "files/input_file.hpp"
#include "files/output_file.hpp"
#include "report_text.hpp"
#include "sweeps/failure_folder.hpp"
#include "sweeps/sweep_files.hpp"
#include "sweeps/sweep_watch.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

/// Where an interruption loses nothing; empty: nowhere.
std::string checkpointOf(const SweepRunOptions& options) {
    if (options.checkpoint) {
        return *options.checkpoint;
    }
    return options.output && isWhole(*options.output) ? *options.output + ".checkpoint" : "";
}

/// What the user can do, beyond what the failure itself says, when the result could not be written.
const char* remedyForResult(bool isKept, const Checkpoint& checkpoint) {
    if (isKept) {
        return "the sweep is done: --resume then writes it at once";
    }
    return checkpoint.exists() ? "--resume then goes on from what was kept" : "the sweep then begins anew";
}

}  // namespace

SweepRun::SweepRun(const SweepRunOptions& options, std::ostream& results)
    : itsOptions(options),
      // Standard output that holds the result holds nothing else.
      itsReport(options.output && isStandardStream(*options.output) ? std::cerr : results),
      itsConfiguration(configurationOf(options.sweep)),
      itsShard(shardOf(options.sweep)),
      itsCheckpoint(checkpointOf(options), std::chrono::seconds(options.checkpointSeconds),
                    sweep::partOf(itsConfiguration, itsShard)),
      itsLock(lockFiles()),
      itsResult(knownResult()),
      itsDispatcher(plan()) {}

void SweepRun::run(const MakeWorkers& makeWorkers) {
    if (itsDispatcher.hasFinished() && !itsResult.points.empty() && !itsCheckpoint.exists()) {
        print();
    } else {
        write(simulate(*makeWorkers(itsOptions.threads)));
    }
    keepFailures(makeWorkers);
}

std::unique_ptr<FileLock> SweepRun::lockFiles() {
    checkOptions();
    if (itsOptions.output) {
        probeOutput(*itsOptions.output);
    }
    if (itsOptions.keptFailures != 0) {
        FailureFolder(*itsOptions.output).probe();
    }
    itsCheckpoint.lock();
    if (!itsOptions.resume && itsCheckpoint.exists()) {
        throw fileError(itsCheckpoint.file(), "is the checkpoint of an interrupted sweep",
                        "go on from it with --resume, or remove it to begin anew");
    }
    itsCheckpoint.probe();
    // What the output has meanwhile received would be lost, too.
    return lockOutput(itsOptions.output);
}

void SweepRun::checkOptions() const {
    const std::optional<std::string>& output = itsOptions.output;
    const std::string& checkpoint = itsCheckpoint.file();
    if (output && output->empty()) {
        throw ToolError(ExitCode::usage, "-o", "the name of the file is empty", "give one");
    }
    if (!itsShard.isWhole() && !output) {
        throw ToolError(ExitCode::usage, "--shard", "a part is only useful in a file", "name one with -o");
    }
    if (itsOptions.resume && checkpoint.empty()) {
        throw ToolError(ExitCode::usage, "--resume", "there is no file to go on from",
                        "name the output with -o, or the checkpoint with --checkpoint");
    }
    if (output && !checkpoint.empty() && isSameFile(*output, checkpoint)) {
        throw ToolError(ExitCode::usage, "--checkpoint", "it is also the output of -o", "give another name");
    }
    if (itsOptions.keptFailures != 0 && (!output || !isWhole(*output))) {
        throw ToolError(ExitCode::usage, "--keep-failures", "there is no result to keep them beside",
                        "name a file with -o");
    }
}

/// What the output and the checkpoint already hold.
sweep::Result SweepRun::knownResult() const {
    sweep::NamedResult known{itsOptions.output.value_or(""),
                             {itsConfiguration.seed, {}, sweep::partOf(itsConfiguration, itsShard)}};
    for (const std::string& file : {known.name, itsCheckpoint.file()}) {
        std::error_code ignored;
        if (!isStandardStream(file) && std::filesystem::is_regular_file(file, ignored)) {
            joinSweepFile(known, file);
        }
    }
    return known.result;
}

/// The plan of a sweep that goes on from what is known.
sweep::Plan SweepRun::plan() const {
    try {
        sweep::Plan plan = sweep::planOf(itsConfiguration, itsShard, itsResult.points);
        plan.keptFailures = itsOptions.keptFailures;
        return plan;
    } catch (const sweep::Error& error) {
        throw fileError(itsOptions.output.value_or(""), error.problem(), error.remedy());
    }
}

/// @return whether the terminal already shows the table of the whole result
bool SweepRun::simulate(sweep::Workers& workers) {
    bool isShown = false;
    {
        SweepWatch watch(itsCheckpoint);
        workers.run(itsDispatcher, watch);
        isShown = watch.finish(itsDispatcher) && itsOptions.form == SweepForm::table && !itsResult.part;
    }
    if (!itsDispatcher.hasFinished()) {
        if ((!itsOptions.output || itsCheckpoint.file().empty()) && !isShown) {
            printSweep(itsReport, {itsResult.seed, itsDispatcher.points(), itsResult.part}, itsOptions.form);
        }
        failInterrupted();
    }
    takePoints();
    return isShown && itsResult.points.size() == itsDispatcher.plan().points.size();
}

void SweepRun::failInterrupted() {
    const std::string problem =
        fmt::format("interrupted when {} of {} points were done", itsDispatcher.firstUnfinished(),
                    itsDispatcher.plan().points.size());
    const bool isKept = itsCheckpoint.save(itsDispatcher);
    if (itsCheckpoint.file().empty()) {
        throw ToolError(ExitCode::interrupted, "", problem, "next time name a file with -o to keep them");
    }
    if (!isKept) {
        throw ToolError(ExitCode::interrupted, itsCheckpoint.file(), problem + ", and they could not be kept",
                        itsCheckpoint.exists() ? "go on from what was kept before with --resume"
                                               : "run the command again");
    }
    throw ToolError(ExitCode::interrupted, "", problem, "go on with the same command and --resume");
}

/// Put the simulated points into the result.
void SweepRun::takePoints() {
    for (std::size_t i = 0; i < itsDispatcher.plan().points.size(); ++i) {
        const auto known = itsResult.points.find(itsDispatcher.plan().points[i].setup);
        if (itsDispatcher.isLeftOut(i) && known != itsResult.points.end() && !known->second.stoppedBy) {
            itsResult.points.erase(known);  // begun by a run that was interrupted
        }
    }
    for (const auto& [setup, point] : itsDispatcher.points()) {
        itsResult.points.insert_or_assign(setup, point);
    }
}

/// Write the result, and print it where the terminal does not show it yet.
void SweepRun::write(bool isShown) {
    try {
        writeOutputFile();
    } catch (const ToolError&) {
        if (!itsResult.part && !isShown) {
            print();  // perhaps all that is left of it
        }
        throw;
    }
    if (!isShown) {
        print();
    }
    if (!itsOptions.output && itsReport.flush()) {
        itsCheckpoint.remove();
    }
}

/// The checkpoint stays until the output is there.
void SweepRun::writeOutputFile() {
    if (itsOptions.output) {
        const bool isKept = itsCheckpoint.save(itsDispatcher);
        try {
            writeOutput(*itsOptions.output, sweep::resultText(itsResult));
        } catch (const ToolError& error) {
            throw ToolError(error.code(), "", error.what(), remedyForResult(isKept, itsCheckpoint));
        }
        itsCheckpoint.remove();
    }
}

void SweepRun::print() const {
    if (!itsResult.part) {
        printSweep(itsReport, itsResult, itsOptions.form);
        return;
    }
    std::uint64_t blocks = 0;
    for (const auto& [setup, point] : itsResult.points) {
        blocks += point.blocks;
    }
    itsReport << fmt::format("{}: part {} of {}, {} with {} blocks\n", *itsOptions.output, itsShard.index + 1,
                             itsShard.count, counted(itsResult.points.size(), "point", "points"), blocks);
}

/// Keep the first failing blocks of each point beside the result, which is there.
void SweepRun::keepFailures(const MakeWorkers& makeWorkers) const {
    if (itsOptions.keptFailures != 0) {
        const FailingBlocks failing =
            failingBlocksOf(itsResult.points, itsDispatcher, *makeWorkers(itsOptions.threads));
        FailureFolder(*itsOptions.output).write(itsResult, failing);
    }
}

}  // namespace quarzel::tool
