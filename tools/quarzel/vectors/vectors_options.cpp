// SPDX-License-Identifier: MIT
#include "vectors/vectors_options.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <cmath>
#include <numeric>

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

/// An option of the link that is given; empty when none is.
std::string linkOptionOf(const VectorsOptions& options) {
    const auto given = std::find_if(options.linkOptions.begin(), options.linkOptions.end(),
                                    [](const CLI::Option* option) { return option->count() != 0; });
    return given == options.linkOptions.end() ? "" : (*given)->get_name();
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
    const std::string linkOption = linkOptionOf(options);
    if (request.cover) {
        constexpr const char* takesAll = "--cover, which takes all";
        requireUnused(!options.blockSizes.empty(), "--block-size", takesAll);
        requireUnused(!options.stimuli.empty(), "--stimulus", takesAll);
        requireUnused(!linkOption.empty(), linkOption, takesAll);
        request.blockSizes = blockSizesOf({"all"}, "--block-size");
        request.units = orDefault(request.units, {2, 4, 8});
        request.algorithms = orDefault(request.algorithms, {0, 1, 2});
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

void addVectorsOptions(CLI::App& command, VectorsOptions& options) {
    VectorRequest& request = options.request;
    command.add_option("DIRECTORY", options.directory, "Where the set is made")->required()->type_name("");
    command.add_flag("--cover", request.cover, "Make a set that reaches everything, see below");
    addListOption(command, "--block-size", options.blockSizes,
                  "Block sizes, divided by commas, or all (default\n40)", "K,...", blockSizeOrAll());
    addListOption(command, "--stimulus", options.stimuli, "Stimuli, see below (default noise)", "NAME,...",
                  oneOfStimuli());
    addListOption(command, "--units", request.units,
                  "Processing units of the cores: 2, 4 or 8\n(default 2; with --cover 2,4,8)", "N,...",
                  unitsCheck());
    addListOption(command, "--algorithm", request.algorithms,
                  "0, 1 or 2, see 'quarzel decode --help' (default 1;\nwith --cover 0,1,2)", "N,...",
                  algorithmCheck());
    addListOption(command, "--iterations", request.iterations,
                  "Iterations, 1 to 15 (default 6; with --cover 1 to\n15, one after the other)", "N,...",
                  iterationsCheck());
    command
        .add_option("--blocks", options.blocks,
                    "Blocks of each K, iterations and stimulus (default\n10; with --cover of noise, default "
                    "1); of a link, its\nblocks in all")
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
    const std::vector<CLI::Option*> all = command.get_options();
    options.linkOptions.assign(all.begin() + static_cast<std::ptrdiff_t>(others), all.end());
    command.add_option("--seed", request.seed, "Seed of bits and noise (default 1)")
        ->type_name("N")
        ->transform(wholeNumber([](std::uint64_t) { return true; }, "a whole number"));
    addThreadsOption(command, options.threads);
    command.add_flag("--replace", options.replace, "Replace the vector set in DIRECTORY");
    command.add_flag("--json", options.json, "Print one JSON object instead of text");
}

}  // namespace quarzel::tool
