// SPDX-License-Identifier: MIT
#include "sweeps/sweep_command.hpp"

#include <fmt/format.h>
#include <CLI/CLI.hpp>
#include <filesystem>
#include <iostream>
#include <optional>
#include <string>
#include <utility>

#include "files/file_lock.hpp"
#include "files/input_file.hpp"
#include "files/output_file.hpp"
#include "options/threads_option.hpp"
#include "options/whole_number.hpp"
#include "report_text.hpp"
#include "sweeps/checkpoint.hpp"
#include "sweeps/failure_folder.hpp"
#include "sweeps/sweep_files.hpp"
#include "sweeps/sweep_options.hpp"
#include "sweeps/sweep_table.hpp"
#include "sweeps/sweep_watch.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

struct Options {
    SweepOptions sweep;
    std::optional<std::string> output;
    std::optional<std::string> checkpoint;
    std::uint64_t checkpointSeconds = 30;
    bool resume = false;
    std::uint64_t keptFailures = 0;  // of each point
    unsigned threads = 0;            // the usual number
    SweepForm form = SweepForm::table;

    bool isShard() const { return sweep.shard != "1/1"; }
};

constexpr const char* description = "Simulate a link: error rates over Eb/N0";

constexpr const char* footer = R"(A point is a block size, a core and an Eb/N0. Its blocks of random bits are
encoded, sent as -1 and +1 with white Gaussian noise, quantised to the 8 bits of
the core, decoded and compared. Eb/N0 is for an information bit at rate 1/3: the
noise has the variance 1.5 / (Eb/N0); the 12 tail bits are not counted. All
cores and quantisers get the same bits and the same noise.

With --code-rate, --coded-bits, --modulation, --channel, --demapping, --rv,
--harq, --transport-block or --stop blocks pass the chain of LTE: CRCs and
segmentation of transport blocks, rate matching, symbols, fading that the
receiver knows, soft values added up over transmissions. Eb/N0 then counts the
information bits for each coded bit of one transmission. A block is sent again
until the receiver accepts it: its CRCs hold or, without CRC, no bit is wrong.
Errors are what is left after so many transmissions; the throughput is the
information bits of right blocks for each coded bit that was sent. With --stop
crc it is told how many iterations a receiver would use that looks at the CRCs
after each of them; the core still runs them all.

What is counted at a point depends only on the seed, the point and the number of
its blocks: not on threads, parts, interruptions or the machine. (That number
depends on the clock with --max-time.) The interval holds the true block error
rate with a probability of 95 %.

Files:
  OUT         the result, JSON: for 'quarzel show', 'quarzel plot' and 'quarzel
              verify-result'. A result that is already there is extended: new
              points are added, points with fewer blocks than asked for go on
              where they ended, nothing is decoded twice and no point is lost.
              With --shard it is a part of a result, for 'quarzel merge'. It is
              written at the end, whole or not at all. With - it goes to
              standard output, and the table to standard error.
  FILE        what is done so far, renewed while the sweep runs and when it is
              interrupted (SIGINT, SIGTERM, SIGHUP), removed once the result is
              in its place. --resume goes on from it, or begins at the beginning
              when there is none. FILE.lock and OUT.lock keep other
              commands from them.

  OUT.failures
              with --keep-failures: captures of failing blocks, those with the
              lowest numbers at each point of OUT, for 'quarzel decode'. For
              each size and core NAME.soft.npy holds the soft values and
              NAME.sent.npy the bits that were sent; failures.csv tells of each
              row the seed, the point in OUT and the number of the block, all
              counted from 0. 'quarzel rebuild' makes any block again.

A sweep of more than a second tells on standard error how far it is: on a
terminal as a growing table, elsewhere as a line for each point that has ended
and one a minute for the whole. Without OUT an interruption prints what is done.

Examples:
  quarzel sweep --ebn0 0:0.2:1 --iterations 8 -o result.json
  quarzel sweep --ebn0 0:0.2:1 --algorithm 0,1,2 --block-size 40,6144 --csv
  quarzel sweep --ebn0 0:0.1:1.4 --iterations 8 -o result.json
  quarzel sweep --ebn0 2:1:8 --code-rate 3/4 --modulation 16qam --harq 4
  quarzel sweep --ebn0 1:0.1:2 --max-blocks 1000000 --shard 3/16 -o part3.json
)";

void checkOptions(const Options& options, Checkpoint& checkpoint) {
    if (options.output && options.output->empty()) {
        throw ToolError(ExitCode::usage, "-o", "the name of the file is empty", "give one");
    }
    if (options.isShard() && !options.output) {
        throw ToolError(ExitCode::usage, "--shard", "a part is only useful in a file", "name one with -o");
    }
    if (options.resume && checkpoint.file().empty()) {
        throw ToolError(ExitCode::usage, "--resume", "there is no file to go on from",
                        "name the output with -o, or the checkpoint with --checkpoint");
    }
    if (options.output && !checkpoint.file().empty() && isSameFile(*options.output, checkpoint.file())) {
        throw ToolError(ExitCode::usage, "--checkpoint", "it is also the output of -o", "give another name");
    }
    if (options.output) {
        probeOutput(*options.output);
    }
    if (options.keptFailures != 0) {
        if (!options.output || !isWhole(*options.output)) {
            throw ToolError(ExitCode::usage, "--keep-failures", "there is no result to keep them beside",
                            "name a file with -o");
        }
        FailureFolder(*options.output).probe();
    }
    checkpoint.lock();
    if (!options.resume && checkpoint.exists()) {
        throw fileError(checkpoint.file(), "is the checkpoint of an interrupted sweep",
                        "go on from it with --resume, or remove it to begin anew");
    }
    checkpoint.probe();
}

/// What the output and the checkpoint already hold.
sweep::Result knownResult(const Options& options, const Checkpoint& checkpoint, std::uint64_t seed,
                          const std::optional<sweep::Part>& part) {
    sweep::NamedResult known{options.output.value_or(""), {seed, {}, part}};
    for (const std::string& file : {known.name, checkpoint.file()}) {
        std::error_code ignored;
        if (!isStandardStream(file) && std::filesystem::is_regular_file(file, ignored)) {
            joinSweepFile(known, file);
        }
    }
    return known.result;
}

/// Keep the first failing blocks of each point beside the result, which is there.
void keepFailures(const Options& options, const sweep::Result& result, const sweep::Dispatcher& dispatcher,
                  const MakeWorkers& makeWorkers) {
    if (options.keptFailures != 0) {
        const FailingBlocks failing =
            failingBlocksOf(result.points, dispatcher, *makeWorkers(options.threads));
        FailureFolder(*options.output).write(result, failing);
    }
}

/// The plan of a sweep that goes on from what is known.
sweep::Plan planOf(const Options& options, const sweep::Configuration& configuration,
                   const sweep::Shard& shard, const sweep::Points& known) {
    try {
        sweep::Plan plan = sweep::planOf(configuration, shard, known);
        plan.keptFailures = options.keptFailures;
        return plan;
    } catch (const sweep::Error& error) {
        throw fileError(options.output.value_or(""), error.problem(), error.remedy());
    }
}

[[noreturn]] void failInterrupted(const sweep::Dispatcher& dispatcher, bool isKept,
                                  const Checkpoint& checkpoint) {
    const std::string problem = fmt::format("interrupted when {} of {} points were done",
                                            dispatcher.firstUnfinished(), dispatcher.plan().points.size());
    if (checkpoint.file().empty()) {
        throw ToolError(ExitCode::interrupted, "", problem, "next time name a file with -o to keep them");
    }
    if (!isKept) {
        throw ToolError(
            ExitCode::interrupted, checkpoint.file(), problem + ", and they could not be kept",
            checkpoint.exists() ? "go on from what was kept before with --resume" : "run the command again");
    }
    throw ToolError(ExitCode::interrupted, "", problem, "go on with the same command and --resume");
}

/// What the user can do, beyond what the failure itself says, when the result could not be written.
const char* remedyForResult(bool isKept, const Checkpoint& checkpoint) {
    if (isKept) {
        return "the sweep is done: --resume then writes it at once";
    }
    return checkpoint.exists() ? "--resume then goes on from what was kept" : "the sweep then begins anew";
}

/// Write the output of a finished sweep. The checkpoint stays until the output is there.
void writeResult(const Options& options, const sweep::Dispatcher& dispatcher, const sweep::Result& result,
                 Checkpoint& checkpoint) {
    if (options.output) {
        const bool isKept = checkpoint.save(dispatcher);
        try {
            writeOutput(*options.output, sweep::resultText(result));
        } catch (const ToolError& error) {
            throw ToolError(error.code(), "", error.what(), remedyForResult(isKept, checkpoint));
        }
        checkpoint.remove();
    }
}

/// Where the report goes: standard output that holds the result holds nothing else.
std::ostream& reportStream(const Options& options, std::ostream& results) {
    return options.output && isStandardStream(*options.output) ? std::cerr : results;
}

void printResult(const Options& options, const sweep::Result& result, std::ostream& results) {
    std::ostream& stream = reportStream(options, results);
    if (!result.part) {
        printSweep(stream, result, options.form);
        return;
    }
    std::uint64_t blocks = 0;
    for (const auto& [setup, point] : result.points) {
        blocks += point.blocks;
    }
    const sweep::Shard& shard = result.part->shard;
    stream << fmt::format("{}: part {} of {}, {} with {} blocks\n", *options.output, shard.index + 1,
                          shard.count, counted(result.points.size(), "point", "points"), blocks);
}

/// Where an interruption loses nothing; empty: nowhere.
std::string checkpointOf(const Options& options) {
    if (options.checkpoint) {
        return *options.checkpoint;
    }
    return options.output && isWhole(*options.output) ? *options.output + ".checkpoint" : "";
}

void runSweep(const Options& options, std::ostream& results, const MakeWorkers& makeWorkers) {
    const sweep::Configuration configuration = configurationOf(options.sweep);
    const sweep::Shard shard = shardOf(options.sweep);
    const std::optional<sweep::Part> part = sweep::partOf(configuration, shard);
    Checkpoint checkpoint(checkpointOf(options), std::chrono::seconds(options.checkpointSeconds), part);
    checkOptions(options, checkpoint);
    // What the output has meanwhile received would be lost, too.
    const std::unique_ptr<FileLock> lock = lockOutput(options.output);
    sweep::Result result = knownResult(options, checkpoint, configuration.seed, part);
    sweep::Dispatcher dispatcher(planOf(options, configuration, shard, result.points));
    const bool isThere = !result.points.empty() && !checkpoint.exists();
    if (dispatcher.hasFinished() && isThere) {
        printResult(options, result, results);
        keepFailures(options, result, dispatcher, makeWorkers);
        return;
    }
    bool isShown = false;
    {
        SweepWatch watch(checkpoint);
        makeWorkers(options.threads)->run(dispatcher, watch);
        isShown = watch.finish(dispatcher) && options.form == SweepForm::table && !part;
    }
    if (!dispatcher.hasFinished()) {
        if ((!options.output || checkpoint.file().empty()) && !isShown) {
            printSweep(reportStream(options, results), {result.seed, dispatcher.points(), part},
                       options.form);
        }
        failInterrupted(dispatcher, checkpoint.save(dispatcher), checkpoint);
    }
    for (std::size_t i = 0; i < dispatcher.plan().points.size(); ++i) {
        const auto known = result.points.find(dispatcher.plan().points[i].setup);
        if (dispatcher.isLeftOut(i) && known != result.points.end() && !known->second.stoppedBy) {
            result.points.erase(known);  // begun by a run that was interrupted
        }
    }
    for (const auto& [setup, point] : dispatcher.points()) {
        result.points.insert_or_assign(setup, point);
    }
    isShown = isShown && result.points.size() == dispatcher.plan().points.size();
    try {
        writeResult(options, dispatcher, result, checkpoint);
    } catch (const ToolError&) {
        if (!result.part && !isShown) {
            printResult(options, result, results);  // perhaps all that is left of it
        }
        throw;
    }
    if (!isShown) {
        printResult(options, result, results);
    }
    if (!options.output && results.flush()) {
        checkpoint.remove();
    }
    keepFailures(options, result, dispatcher, makeWorkers);
}

}  // namespace

std::unique_ptr<sweep::Workers> makeThreadWorkers(unsigned threads) {
    return std::make_unique<sweep::ThreadWorkers>(threads == 0 ? allCores() : threads);
}

void addSweepCommand(CLI::App& app, std::ostream& results, MakeWorkers makeWorkers) {
    auto options = std::make_shared<Options>();
    CLI::App* command = app.add_subcommand("sweep", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    addSweepOptions(*command, options->sweep);
    command->add_option("-o,--output", options->output, "Write the result to this file")->type_name("OUT");
    command
        ->add_option("--checkpoint", options->checkpoint,
                     "Keep what is done in this file (default:\nOUT.checkpoint)")
        ->type_name("FILE");
    command
        ->add_option("--checkpoint-every", options->checkpointSeconds, "How often it is renewed (default 30)")
        ->type_name("SECONDS")
        ->transform(wholeNumber([](std::uint64_t n) { return n <= 86400; }, "a number from 0 to 86400"));
    command->add_flag("--resume", options->resume, "Go on where an earlier run was interrupted");
    command
        ->add_option("--keep-failures", options->keptFailures,
                     "Keep the first N failing blocks of each point in\nOUT.failures (default none)")
        ->type_name("N")
        ->transform(
            wholeNumber([](std::uint64_t n) { return n >= 1 && n <= 1000; }, "a number from 1 to 1000"));
    addThreadsOption(*command, options->threads);
    addFormOptions(*command, options->form);
    command->callback([options, &results, makeWorkers = std::move(makeWorkers)] {
        runSweep(*options, results, makeWorkers);
    });
}

}  // namespace quarzel::tool
