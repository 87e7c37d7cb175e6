// SPDX-License-Identifier: MIT
#pragma once

#include <CLI/CLI.hpp>
#include <cstdint>
#include <string>
#include <vector>

#include "sweep/configuration.hpp"

namespace quarzel::tool {

/// The options of a sweep; Eb/N0 and shard as text.
struct SweepOptions {
    std::vector<std::uint64_t> blockSizes = {1024};
    std::vector<int> units = {2};
    std::vector<int> algorithms = {1};
    std::vector<int> iterations = {6};
    std::string ebN0;
    link::Quantiser quantiser;
    std::uint64_t maxBlocks = 10000;
    std::uint64_t maxBlockErrors = 100;
    std::uint64_t maxSeconds = 0;
    std::uint64_t seed = 1;
    bool perIteration = false;
    std::string shard = "1/1";
};

/// Add the options that the result of a sweep depends on, and --shard.
/// @param options  holds the defaults and receives the choice; must outlive the parse
void addSweepOptions(CLI::App& command, SweepOptions& options);

/// @throws ToolError when what the user chose is not possible
sweep::Configuration configurationOf(const SweepOptions& options);
sweep::Shard shardOf(const SweepOptions& options);

}  // namespace quarzel::tool
