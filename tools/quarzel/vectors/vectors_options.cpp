// SPDX-License-Identifier: MIT
#include "vectors/vectors_options.hpp"

#include <fmt/format.h>
#include <CLI/CLI.hpp>

#include <algorithm>
#include <cmath>
#include <numeric>

#include "files/input_file.hpp"
#include "options/block_sizes.hpp"
#include "options/choices.hpp"
#include "options/core_options.hpp"
#include "options/list_option.hpp"
#include "options/quantiser_options.hpp"
#include "options/whole_number.hpp"
#include "tool_error.hpp"
#include "vectors/link_request.hpp"

namespace quarzel::tool {

namespace {

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

/// Throw when an option is given that another one makes no use of.
void requireUnused(bool isGiven, const std::string& option, const std::string& other) {
    if (isGiven) {
        throw ToolError(ExitCode::usage, option, fmt::format("does not go with {}", other), "leave it out");
    }
}

/// The first one of some options that is given; empty when none is.
std::string givenOf(const std::vector<const CLI::Option*>& options) {
    const auto given = std::find_if(options.begin(), options.end(),
                                    [](const CLI::Option* option) { return option->count() != 0; });
    return given == options.end() ? "" : (*given)->get_name();
}

/// Take the blocks of a capture, for cores and iterations of the user's choice.
void takeCapture(VectorRequest& request, const VectorsOptions& options) {
    constexpr const char* hasBlocks = "--capture, which has the blocks";
    requireUnused(options.coverFaults, "--cover", hasBlocks);
    requireUnused(options.coverSizes, "--cover-sizes", hasBlocks);
    for (const CLI::Option* option : options.blockOptions) {
        const std::string name = option->get_name();
        const bool isOfQuantiser = name == "--llr" || name == "--scale";
        const bool isGiven = option->count() != 0;
        requireUnused(isGiven && !isOfQuantiser && name != "--iterations", name, hasBlocks);
        request.isScaled = request.isScaled || (isGiven && isOfQuantiser);
    }
    std::ifstream stream = openInput(*options.capture);
    request.capture = std::make_shared<const Capture>(readCapture(
        stream, *options.capture, request.isScaled ? std::optional(request.quantiser.scale) : std::nullopt));
    request.blockSizes = {request.capture->blockSize};
    request.blocks = request.capture->blocks();
}

/// One core, and the usual iterations, where none are named.
void takeUsualCore(VectorRequest& request) {
    request.units = orDefault(request.units, {2});
    request.algorithms = orDefault(request.algorithms, {1});
    request.iterations = orDefault(request.iterations, {6});
}

/// All cores, where none are named.
void coverAllCores(VectorRequest& request) {
    request.units = orDefault(request.units, {2, 4, 8});
    request.algorithms = orDefault(request.algorithms, {0, 1, 2});
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

VectorRequest requestOf(const VectorsOptions& options) {
    VectorRequest request = options.request;
    const std::string linkOption = givenOf(options.linkOptions);
    if (options.capture) {
        takeCapture(request, options);
        takeUsualCore(request);
        return request;
    }
    if (options.coverFaults) {
        constexpr const char* isChosen = "--cover, whose blocks are chosen";
        requireUnused(options.coverSizes, "--cover-sizes", isChosen);
        const std::string blockOption = givenOf(options.blockOptions);
        requireUnused(!blockOption.empty(), blockOption, isChosen);
        request.cover = Cover::faults;
        coverAllCores(request);
        return request;
    }
    if (options.coverSizes) {
        constexpr const char* takesAll = "--cover-sizes, which takes all";
        request.cover = Cover::sizes;
        requireUnused(!options.blockSizes.empty(), "--block-size", takesAll);
        requireUnused(!options.stimuli.empty(), "--stimulus", takesAll);
        requireUnused(!linkOption.empty(), linkOption, takesAll);
        request.blockSizes = blockSizesOf({"all"}, "--block-size");
        coverAllCores(request);
        request.iterations = orDefault(request.iterations, numbersTo(15));
        for (std::size_t i = 0; i < stimulusNames.size(); ++i) {
            request.stimuli.push_back(static_cast<Stimulus>(i));
        }
    } else {
        request.blockSizes = blockSizesOf(options.blockSizes, "--block-size");
        if (!linkOption.empty()) {
            requireUnused(!options.stimuli.empty(), "--stimulus",
                          fmt::format("{}: the blocks of a link are noise", linkOption));
            request.link = linkSetupOf(options.link, request.blockSizes, request.quantiser);
            request.blockSizes.clear();
        } else {
            request.blockSizes = orDefault(request.blockSizes, {40});
        }
        takeUsualCore(request);
        for (const std::string& name : options.stimuli) {
            const auto found = std::find(stimulusNames.begin(), stimulusNames.end(), name);
            request.stimuli.push_back(static_cast<Stimulus>(found - stimulusNames.begin()));
        }
        request.stimuli = orDefault(request.stimuli, {Stimulus::noise});
    }
    request.blocks = options.blocks.value_or(options.coverSizes ? 1 : 10);
    request.ebN0.micro = static_cast<std::int32_t>(std::lround(options.ebN0 * 1e6));
    return request;
}

void addVectorsOptions(CLI::App& command, VectorsOptions& options) {
    VectorRequest& request = options.request;
    command.add_option("DIRECTORY", options.directory, "Where the set is made")->required()->type_name("");
    command.add_flag("--cover", options.coverFaults,
                     "Make a small set that finds the faults of designs, see\nbelow");
    command.add_flag("--cover-sizes", options.coverSizes,
                     "Make a set of every K and every shape of windows,\nsee below");
    command.add_option("--capture", options.capture, "Take the blocks of this capture, see below")
        ->type_name("FILE");
    addListOption(
        command, "--units", request.units,
        "Processing units of the cores: 2, 4 or 8 (default 2;\nwith --cover and --cover-sizes 2,4,8)",
        "N,...", unitsCheck());
    addListOption(command, "--algorithm", request.algorithms,
                  "0, 1 or 2, see 'quarzel decode --help' (default 1;\nwith --cover and --cover-sizes 0,1,2)",
                  "N,...", algorithmCheck());
    const std::size_t before = command.get_options().size();
    addListOption(command, "--block-size", options.blockSizes,
                  "Block sizes, divided by commas, or all (default\n40)", "K,...", blockSizeOrAll());
    addListOption(command, "--stimulus", options.stimuli, "Stimuli, see below (default noise)", "NAME,...",
                  oneOfStimuli());
    addListOption(command, "--iterations", request.iterations,
                  "Iterations, 1 to 15 (default 6; with --cover-sizes\n1 to 15, one after the other)",
                  "N,...", iterationsCheck());
    command
        .add_option("--blocks", options.blocks,
                    "Blocks of each K, iterations and stimulus (default\n10; with --cover-sizes of noise, "
                    "default 1); of a\nlink, its blocks in all")
        ->type_name("N")
        ->transform(wholeNumber([](std::uint64_t n) { return n >= 1 && n <= 1000000; },
                                "a number from 1 to 1000000"));
    command
        .add_option("--ebn0", options.ebN0,
                    "Eb/N0 of the noise in dB, at rate 1/3 or that of a\nlink (default 1)")
        ->type_name("DB")
        ->transform(numberIn(-50, 50));
    addQuantiserOptions(command, request.quantiser);
    const std::size_t others = command.get_options().size();
    addLinkOptions(command, options.link);
    const std::size_t ofLink = command.get_options().size();
    command.add_option("--seed", request.seed, "Seed of bits and noise (default 1)")
        ->type_name("N")
        ->transform(wholeNumber([](std::uint64_t) { return true; }, "a whole number"));
    const std::vector<CLI::Option*> all = command.get_options();
    const auto at = [&all](std::size_t place) { return all.begin() + static_cast<std::ptrdiff_t>(place); };
    options.blockOptions.assign(at(before), all.end());
    options.linkOptions.assign(at(others), at(ofLink));
    addThreadsOption(command, options.threads);
    command.add_flag("--replace", options.replace, "Replace the vector set in DIRECTORY");
    command.add_flag("--json", options.json, "Print one JSON object instead of text");
}

}  // namespace quarzel::tool
