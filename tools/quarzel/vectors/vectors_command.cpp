// SPDX-License-Identifier: MIT
#include "vectors/vectors_command.hpp"

#include <fmt/format.h>
#include <unistd.h>

#include <algorithm>
#include <cmath>
#include <iostream>
#include <memory>
#include <nlohmann/json.hpp>
#include <numeric>
#include <optional>
#include <string>

#include "decode/progress.hpp"
#include "options/block_sizes.hpp"
#include "options/choices.hpp"
#include "options/core_options.hpp"
#include "options/list_option.hpp"
#include "options/quantiser_options.hpp"
#include "options/threads_option.hpp"
#include "options/whole_number.hpp"
#include "report_text.hpp"
#include "sweeps/interruption.hpp"
#include "tool_error.hpp"
#include "vectors/vector_set.hpp"

namespace quarzel::tool {

namespace {

struct VectorsOptions {
    std::string directory;
    std::vector<std::string> blockSizes;
    std::vector<std::string> stimuli;
    std::optional<std::size_t> blocks;
    double ebN0 = 1.0;
    unsigned threads = allCores();
    bool replace = false;
    bool json = false;
    VectorRequest request;
};

constexpr const char* description = "Make stimulus and expected response for a test bench";

constexpr const char* footer = R"(Stimuli:
  noise          a code word of random bits over BPSK and white Gaussian noise;
                 the same blocks that 'quarzel sweep' decodes
  zero           0 everywhere
  full-scale     a code word at -128 and 127, without noise
  ties           8 and -8 at random, no code word: many metrics are equal
  saturating     -128 and 127 at random, no code word: metrics wrap around
  first-segment  a code word with noise in the first thread segment alone
  last-segment   a code word with noise in the last thread segment and the tail

Covering sets:
  With --cover the set has, for every K, blocks of noise and one of the other
  stimuli in turn, and all stimuli at the smallest and the greatest K of each
  number of thread segments. That reaches every K, every shape of windows,
  first, middle and last segments, both ends of the range in each stream, and
  all iteration counts; the manifest counts what is reached.

Directory:
  manifest.json  configuration, blocks, coverage, SHA-256 of every file
  README.md      what the files are
  u2_a1/ ...     one for each core, here of 2 units and algorithm 1:
    config.vh    sizes as localparams, to be included
    blocks.hex   4 words a block: K, iterations, address of its first soft value
                 and of its first decision
    rsc1_sys.hex, rsc1_par.hex, rsc2_par.hex
                 soft values of all blocks, two's complement bytes
    dout.hex     the decisions expected, a bit a word
    npy/         the same blocks by K and iterations, for 'quarzel decode'
  The .hex files are for $readmemh. The directory is written whole or not at
  all. The same seed and options give the same bytes, whatever the number of
  threads.

Examples:
  quarzel vectors vectors --block-size 40,6144 --units 8 --ebn0 0.8
  quarzel vectors covering --cover --units 4 --algorithm 2
  quarzel compare vectors/u8_a1 simulated.hex
)";

/// The values of an option, or what stands for them when it is not given.
template <class Value>
std::vector<Value> orDefault(const std::vector<Value>& values, std::vector<Value> standard) {
    return values.empty() ? std::move(standard) : values;
}

std::vector<int> numbersTo(int last) {
    std::vector<int> numbers(static_cast<std::size_t>(last));
    std::iota(numbers.begin(), numbers.end(), 1);
    return numbers;
}

/// Throw when an option is given that --cover makes no use of.
void requireUnused(bool isGiven, const char* option) {
    if (isGiven) {
        throw ToolError(ExitCode::usage, option, "does not go with --cover, which takes all", "leave it out");
    }
}

VectorRequest requestOf(const VectorsOptions& options) {
    VectorRequest request = options.request;
    if (request.cover) {
        requireUnused(!options.blockSizes.empty(), "--block-size");
        requireUnused(!options.stimuli.empty(), "--stimulus");
        request.blockSizes = blockSizesOf({"all"}, "--block-size");
        request.units = orDefault(request.units, {2, 4, 8});
        request.algorithms = orDefault(request.algorithms, {0, 1, 2});
        request.iterations = orDefault(request.iterations, numbersTo(15));
        for (std::size_t i = 0; i < stimulusNames.size(); ++i) {
            request.stimuli.push_back(static_cast<Stimulus>(i));
        }
    } else {
        request.blockSizes = orDefault(blockSizesOf(options.blockSizes, "--block-size"), {40});
        request.units = orDefault(request.units, {2});
        request.algorithms = orDefault(request.algorithms, {1});
        request.iterations = orDefault(request.iterations, {6});
        for (const std::string& name : options.stimuli) {
            const auto found = std::find(stimulusNames.begin(), stimulusNames.end(), name);
            request.stimuli.push_back(static_cast<Stimulus>(found - stimulusNames.begin()));
        }
        request.stimuli = orDefault(request.stimuli, {Stimulus::noise});
    }
    request.blocks = options.blocks.value_or(request.cover ? 1 : 10);
    request.ebN0.micro = static_cast<std::int32_t>(std::lround(options.ebN0 * 1e6));
    return request;
}

void printSummary(std::ostream& results, const VectorsOptions& options, const VectorSetSummary& summary) {
    if (options.json) {
        const nlohmann::ordered_json object = {{"directory", options.directory}, {"cores", summary.cores},
                                               {"blocks", summary.blocks},       {"bits", summary.bits},
                                               {"files", summary.files},         {"bytes", summary.bytes}};
        results << object.dump(-1, ' ', false, nlohmann::ordered_json::error_handler_t::replace) << '\n';
        return;
    }
    std::string text;
    reportLine(text, "directory", options.directory);
    reportLine(text, "cores", std::to_string(summary.cores));
    reportLine(text, "blocks", std::to_string(summary.blocks));
    reportLine(text, "bits", std::to_string(summary.bits));
    reportLine(text, "files", fmt::format("{}, {:.1f} MB", summary.files, double(summary.bytes) / 1e6));
    results << text;
}

void makeVectors(const VectorsOptions& options, std::ostream& results) {
    const VectorRequest request = requestOf(options);
    const Interruption interruption;
    std::optional<Progress> progress;
    const VectorSetSummary summary =
        makeVectorSet(request, options.directory, options.replace, options.threads,
                      [&](std::size_t done, std::size_t total) {
                          if (interruption.hasCome()) {
                              throw ToolError(ExitCode::interrupted, options.directory,
                                              "was not made, since a signal came", "run the command again");
                          }
                          if (!progress) {
                              progress.emplace(std::cerr, ::isatty(STDERR_FILENO) != 0, total);
                          }
                          progress->update(done);
                      });
    progress.reset();
    printSummary(results, options, summary);
}

CLI::Validator numberIn(double low, double high) {
    const auto check = [low, high](std::string& text) {
        double number = 0;
        const bool isGood = CLI::detail::lexical_cast(text, number) && number >= low && number <= high;
        return isGood ? std::string() : fmt::format("'{}' is not a number from {} to {}", text, low, high);
    };
    return {check, ""};
}

CLI::Validator oneOfStimuli() {
    const auto check = [](std::string& text) {
        const bool isKnown =
            std::find(stimulusNames.begin(), stimulusNames.end(), text) != stimulusNames.end();
        return isKnown ? std::string()
                       : fmt::format("'{}' is none of {}", text, fmt::join(stimulusNames, ", "));
    };
    return withChoices({check, ""}, {stimulusNames.begin(), stimulusNames.end()});
}

}  // namespace

void addVectorsCommand(CLI::App& app, std::ostream& results) {
    auto options = std::make_shared<VectorsOptions>();
    VectorRequest& request = options->request;
    CLI::App* command = app.add_subcommand("vectors", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    command->add_option("DIRECTORY", options->directory, "Where the set is made")->required()->type_name("");
    command->add_flag("--cover", request.cover, "Make a set that reaches everything, see below");
    addListOption(*command, "--block-size", options->blockSizes,
                  "Block sizes, divided by commas, or all (default\n40)", "K,...", blockSizeOrAll());
    addListOption(*command, "--stimulus", options->stimuli, "Stimuli, see below (default noise)", "NAME,...",
                  oneOfStimuli());
    addListOption(*command, "--units", request.units,
                  "Processing units of the cores: 2, 4 or 8\n(default 2; with --cover 2,4,8)", "N,...",
                  unitsCheck());
    addListOption(*command, "--algorithm", request.algorithms,
                  "0, 1 or 2, see 'quarzel decode --help' (default 1;\nwith --cover 0,1,2)", "N,...",
                  algorithmCheck());
    addListOption(*command, "--iterations", request.iterations,
                  "Iterations, 1 to 15 (default 6; with --cover 1 to\n15, one after the other)", "N,...",
                  iterationsCheck());
    command
        ->add_option(
            "--blocks", options->blocks,
            "Blocks of each K, iterations and stimulus (default\n10; with --cover of noise, default 1)")
        ->type_name("N")
        ->transform(wholeNumber([](std::uint64_t n) { return n >= 1 && n <= 1000000; },
                                "a number from 1 to 1000000"));
    command->add_option("--ebn0", options->ebN0, "Eb/N0 of the noise in dB, at rate 1/3 (default 1)")
        ->type_name("DB")
        ->transform(numberIn(-50, 50));
    addQuantiserOptions(*command, request.quantiser);
    command->add_option("--seed", request.seed, "Seed of bits and noise (default 1)")
        ->type_name("N")
        ->transform(wholeNumber([](std::uint64_t) { return true; }, "a whole number"));
    addThreadsOption(*command, options->threads);
    command->add_flag("--replace", options->replace, "Replace the vector set in DIRECTORY");
    command->add_flag("--json", options->json, "Print one JSON object instead of text");
    command->callback([options, &results] { makeVectors(*options, results); });
}

}  // namespace quarzel::tool
