// SPDX-License-Identifier: MIT
#include "sweeps/sweep_options.hpp"

#include <fmt/format.h>

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

}  // namespace

void addSweepOptions(CLI::App& command, SweepOptions& options) {
    const auto add = [&command](const char* name, auto& value, const char* type, const char* text) {
        return command.add_option(name, value, text)->type_name(type)->check(anyText());
    };
    add("--ebn0", options.ebN0, "LIST", "Eb/N0 in dB: 0.5 or 0:0.1:1.5 or 0,1:0.5:3")->required();
    addListOption(command, "--block-size", options.blockSizes, "K, as 1024 or 40,6144 (default 1024)", "LIST",
                  atLeast(0));
    addListOption(command, "--units", options.units, "Processing units: 2, 4 or 8 (default 2)", "LIST",
                  unitsCheck());
    addListOption(command, "--algorithm", options.algorithms,
                  "0 max-log, 1 max-log with extrinsic values\nscaled by 0.75, 2 max-star (default 1)",
                  "LIST", algorithmCheck());
    addListOption(command, "--iterations", options.iterations, "Iterations, 1 to 15 (default 6)", "LIST",
                  iterationsCheck());
    addQuantiserOptions(command, options.quantiser);
    add("--seed", options.seed, "N", "Of bits and noise (default 1)")->transform(atLeast(0));
    command.add_flag("--per-iteration", options.perIteration, "Count errors after every iteration");
    add("--max-block-errors", options.maxBlockErrors, "N",
        "End a point at its Nth block error (default 100;\n0: never)")
        ->transform(atLeast(0));
    add("--max-blocks", options.maxBlocks, "N", "End a point after N blocks (default 10000)")
        ->transform(atLeast(1));
    add("--max-time", options.maxSeconds, "SECONDS", "End a point after this time")->transform(atLeast(1));
    command.add_option("--shard", options.shard, "Decode part I of N only, for 'quarzel merge'")
        ->type_name("I/N")
        ->check(anyText());
}

sweep::Configuration configurationOf(const SweepOptions& options) {
    sweep::Configuration configuration;
    configuration.blockSizes.clear();
    for (const std::uint64_t K : options.blockSizes) {
        configuration.blockSizes.push_back(knownBlockSize(K, "--block-size").K);
    }
    configuration.units = options.units;
    configuration.algorithms = options.algorithms;
    configuration.iterations = options.iterations;
    configuration.ebN0 = readEbN0List("--ebn0", options.ebN0);
    configuration.quantiser = options.quantiser;
    configuration.seed = options.seed;
    configuration.maxBlocks = options.maxBlocks;
    configuration.maxBlockErrors = options.maxBlockErrors;
    configuration.maxSeconds = options.maxSeconds;
    configuration.perIteration = options.perIteration;
    try {
        configuration.check();
    } catch (const sweep::Error& error) {
        throw ToolError(ExitCode::usage, "", error.problem(), error.remedy());
    }
    return configuration;
}

sweep::Shard shardOf(const SweepOptions& options) {
    constexpr std::uint64_t maxShards = 1'000'000;
    const std::size_t slash = options.shard.find('/');
    const ToolError bad(ExitCode::usage, "--shard", fmt::format("'{}' is not I/N", options.shard),
                        "give the number of the part, from 1, and how many there are, as 1/8");
    if (slash == std::string::npos) {
        throw bad;
    }
    const std::string_view text = options.shard;
    const std::optional<std::uint64_t> number = readWholeNumber(text.substr(0, slash));
    const std::optional<std::uint64_t> count = readWholeNumber(text.substr(slash + 1));
    if (!number || !count || *number < 1 || *number > *count || *count > maxShards) {
        throw bad;
    }
    if (*count > 1 && options.maxSeconds != 0) {
        throw ToolError(ExitCode::usage, "--max-time", "parts that end by time cannot be joined",
                        "leave out --max-time or --shard");
    }
    return {*number - 1, *count};
}

}  // namespace quarzel::tool
