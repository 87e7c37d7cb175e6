// SPDX-License-Identifier: MIT
#include "sweeps/sweep_options.hpp"

#include <fmt/format.h>
#include <CLI/CLI.hpp>

#include <string_view>

#include "options/block_sizes.hpp"
#include "options/choices.hpp"
#include "options/core_options.hpp"
#include "options/list_option.hpp"
#include "options/quantiser_options.hpp"
#include "options/whole_number.hpp"
#include "sweep/error.hpp"
#include "sweeps/ebn0_list.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

CLI::Validator atLeast(std::uint64_t least) {
    return wholeNumber([least](std::uint64_t n) { return n >= least; },
                       least == 0 ? "a whole number" : fmt::format("a whole number from {}", least));
}

std::vector<link::Quantiser> quantisersOf(const SweepOptions& options) {
    std::vector<link::Quantiser> quantisers;
    for (const double scale : options.llrScales) {
        quantisers.push_back({link::Quantiser::Kind::llr, scale});
    }
    for (const double scale : options.amplitudeScales) {
        quantisers.push_back({link::Quantiser::Kind::amplitude, scale});
    }
    return quantisers.empty() ? std::vector{link::Quantiser{}} : quantisers;
}

std::vector<sweep::CodedSize> codedSizesOf(const LinkOptions& options) {
    std::vector<sweep::CodedSize> sizes;
    for (const std::uint32_t bits : options.codedBits) {
        sizes.push_back({bits, 0});
    }
    for (const double rate : options.codeRates) {
        sizes.push_back({0, rate});
    }
    return sizes.empty() ? std::vector{sweep::CodedSize{}} : sizes;
}

/// What the names of a list stand for.
template <class Value>
std::vector<Value> valuesOf(const std::vector<std::string>& names, Value (*valueOf)(std::string_view)) {
    std::vector<Value> values;
    for (const std::string& name : names) {
        values.push_back(valueOf(name));
    }
    return values;
}

/// @throws ToolError when options of the link do not go together
void requireTogether(const SweepOptions& options) {
    const LinkOptions& link = options.link;
    if (!link.transportBlocks.empty() && options.blockSizes != SweepOptions{}.blockSizes) {
        throw ToolError(ExitCode::usage, "--transport-block",
                        "the sizes of code blocks follow from those of transport blocks",
                        "leave out --block-size");
    }
    if (!link.transportBlocks.empty() && link.codedBits.empty() && link.codeRates.empty()) {
        throw ToolError(ExitCode::usage, "--transport-block", "the coded bits of a transmission are not told",
                        "give --code-rate or --coded-bits");
    }
    if (options.stop == "crc" && link.transportBlocks.empty()) {
        throw ToolError(ExitCode::usage, "--stop", "code blocks alone have no CRC to stop at",
                        "give --transport-block");
    }
}

}  // namespace

CLI::Validator between(double low, double high) {
    const auto check = [low, high](std::string& text) {
        double value = 0;
        const bool isGood = CLI::detail::lexical_cast(text, value) && value >= low && value <= high;
        return isGood ? std::string() : fmt::format("'{}' is not a number from {} to {}", text, low, high);
    };
    return {check, ""};
}

void addCurveOptions(CLI::App& command, SweepOptions& options) {
    addListOption(command, "--block-size", options.blockSizes, "K, as 1024, 40,6144 or all (default 1024)",
                  "LIST", blockSizeOrAll());
    addListOption(command, "--units", options.units, "Processing units: 2, 4 or 8 (default 2)", "LIST",
                  unitsCheck());
    addListOption(command, "--algorithm", options.algorithms,
                  "0 max-log, 1 scaled-max-log (extrinsic values\nscaled by 0.75), 2 max-star; numbers or "
                  "names\n(default 1)",
                  "LIST", algorithmCheck());
    addListOption(command, "--iterations", options.iterations, "Iterations, 1 to 15 (default 6)", "LIST",
                  iterationsCheck());
    addListOption(command, "--scale", options.amplitudeScales, "Soft value round(S y), y = +-1 + noise",
                  "LIST", scaleCheck());
    addListOption(command, "--llr", options.llrScales,
                  "Soft value round(S L), L the log-likelihood ratio\n2 y / sigma^2 (default, with S = 4)",
                  "LIST", scaleCheck());
    command.add_option("--seed", options.seed, "Of bits and noise (default 1)")
        ->type_name("N")
        ->transform(atLeast(0));
}

void addSweepOptions(CLI::App& command, SweepOptions& options) {
    const auto add = [&command](const char* name, auto& value, const char* type, const char* text) {
        return command.add_option(name, value, text)->type_name(type)->check(anyText());
    };
    add("--ebn0", options.ebN0, "LIST", "Eb/N0 in dB: 0.5 or 0:0.1:1.5 or 0,1:0.5:3")->required();
    addCurveOptions(command, options);
    addLinkOptions(command, options.link);
    add("--stop", options.stop, "RULE",
        "crc: the receiver ends the iterations of a block\nwhen its CRCs hold (default none)")
        ->transform(withChoices(CLI::IsMember({"none", "crc"}).description(""), {"none", "crc"}));
    command.add_flag("--per-iteration", options.perIteration, "Count errors after every iteration");
    add("--max-block-errors", options.stopRule.maxBlockErrors, "N",
        "End a point at its Nth block error (default 100;\n0: never)")
        ->transform(atLeast(0));
    add("--max-blocks", options.stopRule.maxBlocks, "N", "End a point after N blocks (default 10000)")
        ->transform(atLeast(1));
    add("--max-time", options.stopRule.maxSeconds, "SECONDS", "End a point after this time")
        ->transform(atLeast(1));
    command
        .add_option("--target-bler", options.targetBler,
                    "End a curve at its first point with a block error\nrate below P")
        ->type_name("P")
        ->transform(between(0, 1));
    command.add_option("--shard", options.shard, "Do part I of N only, for 'quarzel merge'")
        ->type_name("I/N")
        ->check(anyText());
}

sweep::Configuration configurationOf(const SweepOptions& options) {
    requireTogether(options);
    sweep::Configuration configuration;
    configuration.blockSizes = blockSizesOf(options.blockSizes, "--block-size");
    configuration.units = options.units;
    configuration.algorithms = options.algorithms;
    configuration.iterations = options.iterations;
    configuration.ebN0 = readEbN0List("--ebn0", options.ebN0);
    configuration.quantisers = quantisersOf(options);
    configuration.transportBlocks = options.link.transportBlocks;
    configuration.codedSizes = codedSizesOf(options.link);
    configuration.modulations = valuesOf(options.link.modulations, link::modulationOf);
    configuration.fadings = valuesOf(options.link.channels, link::fadingOf);
    configuration.demappings = valuesOf(options.link.demappings, link::demappingOf);
    configuration.redundancyVersions = redundancyVersionsOf(options.link);
    configuration.stop = sweep::stopOf(options.stop).value();
    configuration.seed = options.seed;
    configuration.stopRule = options.stopRule;
    configuration.targetBler = options.targetBler;
    configuration.perIteration = options.perIteration;
    try {
        configuration.check();
    } catch (const sweep::Error& error) {
        throw ToolError(ExitCode::usage, "", error.problem(), error.remedy());
    }
    return configuration;
}

sweep::Shard shardOf(const SweepOptions& options) {
    const std::size_t slash = options.shard.find('/');
    const ToolError bad(ExitCode::usage, "--shard", fmt::format("'{}' is not I/N", options.shard),
                        "give the number of the part, from 1, and how many there are, as 1/8");
    if (slash == std::string::npos) {
        throw bad;
    }
    const std::string_view text = options.shard;
    const std::optional<std::uint64_t> number = readWholeNumber(text.substr(0, slash));
    const std::optional<std::uint64_t> count = readWholeNumber(text.substr(slash + 1));
    if (!number || !count || *number < 1 || *number > *count || *count > sweep::Shard::highestCount) {
        throw bad;
    }
    if (*count > 1 && options.stopRule.maxSeconds != 0) {
        throw ToolError(ExitCode::usage, "--max-time", "parts that end by time cannot be joined",
                        "leave out --max-time or --shard");
    }
    if (*count > 1 && options.targetBler != 0) {
        throw ToolError(ExitCode::usage, "--target-bler", "parts do not know where the curves of others end",
                        "leave out --target-bler or --shard");
    }
    return {*number - 1, *count};
}

}  // namespace quarzel::tool
