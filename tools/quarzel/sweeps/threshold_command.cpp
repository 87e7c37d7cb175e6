// SPDX-License-Identifier: MIT
#include "sweeps/threshold_command.hpp"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <filesystem>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "files/file_lock.hpp"
#include "files/output_file.hpp"
#include "options/list_option.hpp"
#include "options/threads_option.hpp"
#include "sweep/plan.hpp"
#include "sweeps/checkpoint.hpp"
#include "sweeps/sweep_files.hpp"
#include "sweeps/sweep_options.hpp"
#include "sweeps/sweep_watch.hpp"
#include "sweeps/threshold_table.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

struct Options {
    SweepOptions sweep;
    std::vector<double> rates = {0.1};
    double precision = 0.02;
    std::optional<std::string> output;
    unsigned threads = 0;  // the usual number
    SweepForm form = SweepForm::table;
};

constexpr const char* description = "Find the Eb/N0 of a block error rate";

constexpr const char* footer =
    R"(For every combination of the lists, the Eb/N0 where the block error rate is P.
On a grid of 0.05, 0.1 or 0.2 dB a few blocks at each point lead to the two
neighbours between which the rate is reached. Both then get at least 100 block
errors, and more until the interval is narrow enough. Between them the logarithm
of the rate is taken as a straight line. The interval holds the Eb/N0 with a
probability of 95 %; it comes from the binomial variance of both counts and the
slope of the line. What is simulated is described by 'quarzel sweep --help'.

All iterations of --iterations are counted in one decode of as many as the
greatest of them. What is found depends on the options above -o and on what OUT
holds, not on threads, interruptions or the machine.

  OUT         the points that were simulated, a result as of 'quarzel sweep'. If
              it is there, its points are used and it is extended. When a signal
              ends the search (SIGINT, SIGTERM), it receives what is done; the
              same command then goes on. OUT.lock keeps other commands from it.

Examples:
  quarzel threshold --block-size 40,1024,6144 --target-bler 0.1,0.01
  quarzel threshold --iterations 4,6,8 --algorithm 0,1,2 -o points.json --csv
)";

/// The curves that are decoded: with the greatest number of iterations, and counts after every one if there
/// are several.
sweep::Configuration decodedCurves(const Options& options) {
    sweep::Configuration configuration = configurationOf(options.sweep);
    configuration.perIteration = configuration.iterations.size() > 1;
    configuration.iterations = {
        *std::max_element(configuration.iterations.begin(), configuration.iterations.end())};
    return configuration;
}

std::vector<sweep::Target> targetsOf(const Options& options, const sweep::Configuration& decoded) {
    std::vector<int> iterations = options.sweep.iterations;
    std::sort(iterations.begin(), iterations.end());
    std::vector<double> rates = options.rates;
    std::sort(rates.begin(), rates.end(), std::greater<>());
    std::vector<sweep::Target> targets;
    for (const sweep::Setup& curve : decoded.setups()) {
        for (const int count : iterations) {
            for (const double rate : rates) {
                targets.push_back({curve, count, rate, options.precision});
            }
        }
    }
    return targets;
}

/// The blocks that all searches need next.
std::map<sweep::Setup, std::uint64_t> needsOf(const std::vector<sweep::Target>& targets,
                                              const sweep::Points& points) {
    std::map<sweep::Setup, std::uint64_t> needs;
    for (const sweep::Target& target : targets) {
        for (const sweep::Need& need : sweep::stateOf(target, points).needs) {
            std::uint64_t& blocks = needs[need.setup];
            blocks = std::max(blocks, need.blocks);
        }
    }
    return needs;
}

/// Simulate what is needed.
/// @return whether it was done: no signal came
bool simulate(const sweep::Configuration& configuration, const std::map<sweep::Setup, std::uint64_t>& needs,
              sweep::Points& points, sweep::Workers& workers) {
    sweep::Plan plan{configuration.seed, {}, 0, {}};
    for (const auto& [setup, blocks] : needs) {
        const auto known = points.find(setup);
        plan.points.push_back(
            {setup, {blocks, 0, 0}, known == points.end() ? configuration.startOf(setup) : known->second});
    }
    sweep::Dispatcher dispatcher(std::move(plan));
    Checkpoint none("", std::chrono::seconds(0));
    SweepWatch watch(none);
    workers.run(dispatcher, watch);
    watch.finish(dispatcher);
    if (!dispatcher.hasFinished()) {
        return false;
    }
    for (const auto& [setup, point] : dispatcher.points()) {
        points.insert_or_assign(setup, point);
    }
    return true;
}

void write(const Options& options, const sweep::Result& result) {
    if (options.output) {
        writeOutput(*options.output, sweep::resultText(result));
    }
}

/// What the output already holds.
sweep::Result knownResult(const Options& options, const sweep::Configuration& configuration) {
    sweep::NamedResult known{options.output.value_or(""), {configuration.seed, {}, {}}};
    std::error_code ignored;
    if (options.output) {
        if (std::filesystem::is_regular_file(*options.output, ignored)) {
            joinSweepFile(known, *options.output);
        }
    }
    const std::vector<sweep::Setup> curves = configuration.setups();
    for (const auto& [setup, point] : known.result.points) {
        sweep::Setup curve = setup;
        curve.ebN0 = {};
        if (point.counts.size() < configuration.countsOf(setup) &&
            std::binary_search(curves.begin(), curves.end(), curve)) {
            throw fileError(known.name, "has no counts after every iteration at " + sweep::setupText(setup),
                            "give one number of iterations or another name");
        }
    }
    return known.result;
}

void findThresholds(const Options& options, std::ostream& results, const MakeWorkers& makeWorkers) {
    const sweep::Configuration configuration = decodedCurves(options);
    const std::vector<sweep::Target> targets = targetsOf(options, configuration);
    if (options.output) {
        probeOutput(*options.output);
    }
    const std::unique_ptr<FileLock> lock = lockOutput(options.output);
    sweep::Result result = knownResult(options, configuration);
    const std::unique_ptr<sweep::Workers> workers = makeWorkers(options.threads);
    bool isExtended = false;
    for (auto needs = needsOf(targets, result.points); !needs.empty();
         needs = needsOf(targets, result.points)) {
        if (!simulate(configuration, needs, result.points, *workers)) {
            write(options, result);
            throw ToolError(ExitCode::interrupted, "", "the search was interrupted",
                            options.output ? "go on with the same command"
                                           : "next time name an output with -o to keep what is done");
        }
        isExtended = true;
    }
    if (isExtended) {
        write(options, result);
    }
    std::vector<FoundThreshold> found;
    for (const sweep::Target& target : targets) {
        found.push_back({target, sweep::stateOf(target, result.points).threshold});
    }
    printThresholds(results, result.seed, found, options.form);
}

}  // namespace

void addThresholdCommand(CLI::App& app, std::ostream& results, MakeWorkers makeWorkers) {
    auto options = std::make_shared<Options>();
    CLI::App* command = app.add_subcommand("threshold", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    addListOption(*command, "--target-bler", options->rates, "P, block error rates as 0.1,0.01 (default 0.1)",
                  "LIST", between(1e-6, 0.9));
    addCurveOptions(*command, options->sweep);
    command
        ->add_option("--precision", options->precision,
                     "Half the width of the interval, in dB (default 0.02)")
        ->type_name("DB")
        ->transform(between(0.001, 1));
    command->add_option("-o,--output", options->output, "Keep the points in this file")->type_name("OUT");
    addThreadsOption(*command, options->threads);
    addFormOptions(*command, options->form);
    command->callback([options, &results, makeWorkers = std::move(makeWorkers)] {
        findThresholds(*options, results, makeWorkers);
    });
}

}  // namespace quarzel::tool
