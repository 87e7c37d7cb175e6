// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "options/cli_fwd.hpp"
#include "options/link_options.hpp"
#include "sweep/shard.hpp"

namespace quarzel::tool {

/// The options of a sweep; stop rule of the receiver, block sizes, Eb/N0 and shard as text.
struct SweepOptions {
    std::vector<std::string> blockSizes = {"1024"};
    std::vector<int> units = {2};
    std::vector<int> algorithms = {1};
    std::vector<int> iterations = {6};
    std::string ebN0 = "0";
    std::vector<double> llrScales;
    std::vector<double> amplitudeScales;
    LinkOptions link;
    std::string stop = "none";
    sweep::StopRule stopRule;
    std::uint64_t seed = 1;
    double targetBler = 0;
    bool perIteration = false;
    std::string shard = "1/1";
};

/// The check of a number between two others.
CLI::Validator between(double low, double high);

/// Add the options that tell which curves are simulated, and --seed.
/// @param options  holds the defaults and receives the choice; must outlive the parse
void addCurveOptions(CLI::App& command, SweepOptions& options);

/// Add the options that the result of a sweep depends on, and --shard.
/// @param options  holds the defaults and receives the choice; must outlive the parse
void addSweepOptions(CLI::App& command, SweepOptions& options);

/// Without --ebn0 at 0 dB.
/// @throws ToolError when what the user chose is not possible
sweep::Configuration configurationOf(const SweepOptions& options);
sweep::Shard shardOf(const SweepOptions& options);

}  // namespace quarzel::tool
