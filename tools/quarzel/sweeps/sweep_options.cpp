// SPDX-License-Identifier: MIT
#include "sweep_options.hpp"

#include <fmt/format.h>

#include <functional>
#include <vector>

#include "block_sizes.hpp"
#include "choices.hpp"
#include "sweep/error.hpp"
#include "tool_error.hpp"
#include "value_lists.hpp"
#include "whole_number.hpp"

namespace quarzel::tool {

namespace {

template <class T>
std::vector<T> readList(const std::string& option, const std::string& text,
                        const std::function<bool(std::uint64_t)>& isWanted, std::string_view wanted) {
    std::vector<T> list;
    for (const std::uint64_t number : readNumberList(option, text)) {
        if (!isWanted(number)) {
            throw ToolError(ExitCode::usage, option, fmt::format("'{}' is not {}", number, wanted),
                            "see 'quarzel sweep --help'");
        }
        list.push_back(static_cast<T>(number));
    }
    return list;
}

std::vector<std::uint32_t> readBlockSizes(const std::string& text) {
    std::vector<std::uint32_t> sizes;
    for (const std::uint64_t K : readNumberList("--block-size", text)) {
        sizes.push_back(blockSizeRow(K, "--block-size").K);
    }
    return sizes;
}

CLI::Validator atLeast(std::uint64_t least) {
    return wholeNumber([least](std::uint64_t n) { return n >= least; },
                       least == 0 ? "a whole number" : fmt::format("a whole number from {}", least));
}

lte::Quantiser quantiserOf(const SweepOptions& options) {
    const bool isAmplitude = options.scale.has_value();
    const double scale = isAmplitude ? *options.scale : options.llr.value_or(4);
    if (!(scale > 0) || !(scale <= 1e6)) {
        throw ToolError(ExitCode::usage, isAmplitude ? "--scale" : "--llr",
                        fmt::format("{} is not above 0 and up to 1000000", scale), "give a number that is");
    }
    return {isAmplitude ? lte::Quantiser::Kind::amplitude : lte::Quantiser::Kind::llr, scale};
}

}  // namespace

void addSweepOptions(CLI::App& command, SweepOptions& options) {
    const auto add = [&command](const char* name, auto& value, const char* type, const char* text) {
        return command.add_option(name, value, text)->type_name(type)->check(anyText());
    };
    add("--ebn0", options.ebN0, "LIST", "Eb/N0 in dB: 0.5 or 0:0.1:1.5 or 0,1:0.5:3")->required();
    add("--block-size", options.blockSizes, "LIST", "K, as 1024 or 40,6144 (default 1024)");
    add("--units", options.units, "LIST", "Processing units: 2, 4 or 8 (default 2)");
    add("--algorithm", options.algorithms, "LIST",
        "0 max-log, 1 max-log with extrinsic values\nscaled by 0.75, 2 max-star (default 1)");
    add("--iterations", options.iterations, "LIST", "Iterations, 1 to 15 (default 6)");
    CLI::Option* const scale = add("--scale", options.scale, "S", "Soft value round(S y), y = +-1 + noise");
    add("--llr", options.llr, "S",
        "Soft value round(S L), L the log-likelihood ratio\n2 y / sigma^2 (default, with S = 4)")
        ->excludes(scale);
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
    configuration.blockSizes = readBlockSizes(options.blockSizes);
    configuration.units = readList<int>(
        "--units", options.units, [](std::uint64_t n) { return n == 2 || n == 4 || n == 8; }, "2, 4 or 8");
    configuration.algorithms = readList<int>(
        "--algorithm", options.algorithms, [](std::uint64_t n) { return n <= 2; }, "0, 1 or 2");
    configuration.iterations = readList<int>(
        "--iterations", options.iterations, [](std::uint64_t n) { return n >= 1 && n <= 15; },
        "a number from 1 to 15");
    configuration.ebN0 = readEbN0List("--ebn0", options.ebN0);
    configuration.quantiser = quantiserOf(options);
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
    constexpr std::uint64_t mostShards = 1'000'000;
    const std::size_t slash = options.shard.find('/');
    const ToolError bad(ExitCode::usage, "--shard", fmt::format("'{}' is not I/N", options.shard),
                        "give the number of the part, from 1, and how many there are, as 1/8");
    if (slash == std::string::npos) {
        throw bad;
    }
    std::uint64_t number = 0;
    std::uint64_t count = 0;
    try {
        number = readNumberList("", options.shard.substr(0, slash)).at(0);
        count = readNumberList("", options.shard.substr(slash + 1)).at(0);
    } catch (const ToolError&) {
        throw bad;
    }
    if (number < 1 || number > count || count > mostShards) {
        throw bad;
    }
    if (count > 1 && options.maxSeconds != 0) {
        throw ToolError(ExitCode::usage, "--max-time", "parts that time has stopped do not fit together",
                        "leave it out, or --shard");
    }
    return {number - 1, count};
}

}  // namespace quarzel::tool
