// SPDX-License-Identifier: MIT
#include "sweeps/sweep_command.hpp"

#include <fmt/format.h>
#include <filesystem>
#include <optional>
#include <string>
#include <utility>

#include "files/output_file.hpp"
#include "options/threads_option.hpp"
#include "options/whole_number.hpp"
#include "sweep/part.hpp"
#include "sweeps/checkpoint.hpp"
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
    unsigned threads = 0;  // the usual number
    SweepForm form = SweepForm::table;

    bool isShard() const { return sweep.shard != "1/1"; }
};

constexpr const char* description = "Simulate a link: error rates over Eb/N0";

constexpr const char* footer = R"(A point is a block size, a core and an Eb/N0. Its blocks of random bits are
encoded, sent as -1 and +1 with white Gaussian noise, quantised to the 8 bits of
the core, decoded and compared. Eb/N0 is for an information bit at rate 1/3: the
noise has the variance 1.5 / (Eb/N0); the 12 tail bits are not counted. All
cores and quantisers get the same bits and the same noise.

The result depends only on the options above --shard: not on threads,
parts, interruptions or the machine. (With --max-time it depends on the clock.)
The interval holds the true block error rate with a probability of 95 %.

Files:
  OUT         the result, JSON: for 'quarzel plot' and 'quarzel verify-result'.
              With --shard a part of it, for 'quarzel merge'. It is written at
              the end, whole or not at all.
  FILE        what is done so far, renewed while the sweep runs and when it is
              interrupted (SIGINT, SIGTERM), removed at the end. --resume goes
              on from it, or begins at the beginning when there is none.

Examples:
  quarzel sweep --ebn0 0:0.2:1 --iterations 8 -o result.json
  quarzel sweep --ebn0 0:0.2:1 --algorithm 0,1,2 --block-size 40,6144 --csv
  quarzel sweep --ebn0 1:0.1:2 --max-blocks 1000000 --shard 3/16 -o part3.json
)";

void checkOptions(const Options& options, const Checkpoint& checkpoint) {
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
    if (!options.resume && checkpoint.exists()) {
        throw fileError(checkpoint.file(), "is the checkpoint of an interrupted sweep",
                        "go on from it with --resume, or remove it to begin anew");
    }
    if (options.output) {
        probeOutput(*options.output);
    }
    checkpoint.probe();
}

/// What the output holds, if it exists and --resume has no checkpoint to go on from.
std::optional<sweep::Result> finishedResult(const Options& options, const Checkpoint& checkpoint,
                                            const sweep::Configuration& configuration,
                                            const sweep::Shard& shard) {
    std::error_code ignored;
    if (!options.resume || checkpoint.exists() || !options.output ||
        !std::filesystem::is_regular_file(*options.output, ignored)) {
        return std::nullopt;
    }
    return aboutFile(*options.output, [&] {
        const std::string text = readBytes(*options.output);
        if (!shard.isWhole()) {
            sweep::Part part = sweep::readPart(text);
            sweep::requireSameRun(part, configuration, shard);
            return sweep::Result{part.configuration, std::move(part.points)};
        }
        sweep::Result result = sweep::readResult(text);
        sweep::requireSameRun({result.configuration, shard, {}}, configuration, shard);
        return result;
    });
}

[[noreturn]] void failInterrupted(const sweep::Dispatcher& dispatcher, bool isKept,
                                  const Checkpoint& checkpoint) {
    const std::string problem =
        fmt::format("interrupted when {} of {} points were done", dispatcher.firstUnfinished(),
                    dispatcher.configuration().points());
    if (checkpoint.file().empty()) {
        throw ToolError(ExitCode::interrupted, "", problem, "next time name an output with -o to keep them");
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
            writeOutput(*options.output,
                        dispatcher.shard().isWhole()
                            ? sweep::resultText(result)
                            : sweep::partText({result.configuration, dispatcher.shard(), result.points}));
        } catch (const ToolError& error) {
            throw ToolError(error.code(), "", error.what(), remedyForResult(isKept, checkpoint));
        }
    }
    checkpoint.remove();
}

void printResult(const Options& options, const sweep::Shard& shard, const sweep::Result& result,
                 std::ostream& results) {
    if (!shard.isWhole()) {
        std::uint64_t blocks = 0;
        for (const sweep::PointState& point : result.points) {
            blocks += point.blocks;
        }
        results << fmt::format("{}: part {} of {}, {} blocks\n", *options.output, shard.index + 1,
                               shard.count, blocks);
        return;
    }
    printSweep(results, result, options.form);
}

void runSweep(const Options& options, std::ostream& results, const MakeWorkers& makeWorkers) {
    const sweep::Configuration configuration = configurationOf(options.sweep);
    const sweep::Shard shard = shardOf(options.sweep);
    Checkpoint checkpoint(options.checkpoint ? *options.checkpoint
                          : options.output   ? *options.output + ".checkpoint"
                                             : "",
                          std::chrono::seconds(options.checkpointSeconds));
    checkOptions(options, checkpoint);
    if (const auto result = finishedResult(options, checkpoint, configuration, shard)) {
        printResult(options, shard, *result, results);
        return;
    }
    sweep::Plan plan{configuration, shard, {}, {}};
    if (checkpoint.exists()) {
        plan.start = checkpoint.load(configuration, shard).points;
    }
    sweep::Dispatcher dispatcher(std::move(plan));
    {
        SweepWatch watch(checkpoint);
        makeWorkers(options.threads)->run(dispatcher, watch);
    }
    if (!dispatcher.hasFinished()) {
        failInterrupted(dispatcher, checkpoint.save(dispatcher), checkpoint);
    }
    const sweep::Result result{configuration, dispatcher.states()};
    try {
        writeResult(options, dispatcher, result, checkpoint);
    } catch (const ToolError&) {
        if (shard.isWhole()) {
            printSweep(results, result, options.form);  // perhaps all that is left of it
        }
        throw;
    }
    printResult(options, shard, result, results);
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
    addThreadsOption(*command, options->threads);
    addFormOptions(*command, options->form);
    command->callback([options, &results, makeWorkers = std::move(makeWorkers)] {
        runSweep(*options, results, makeWorkers);
    });
}

}  // namespace quarzel::tool
