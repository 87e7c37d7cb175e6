// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "options/cli_fwd.hpp"

namespace quarzel::tool {

/// The coded link between the code bits of a block and the soft values of the core, for commands that send
/// blocks through it. Names are those of link/modulation and link/channel.
struct LinkOptions {
    std::vector<double> codeRates;
    std::vector<std::uint32_t> codedBits;
    std::vector<std::string> modulations = {"bpsk"};
    std::vector<std::string> channels = {"awgn"};
    std::vector<std::string> demappings = {"maxlog"};
    std::vector<std::uint32_t> transportBlocks;
    std::vector<unsigned> redundancyVersions;
    std::uint32_t transmissions = 0;  ///< of a block at most; 0: as many as there are redundancy versions
};

/// The check of a code rate, as 0.5 or 1/2.
CLI::Validator codeRateCheck();

/// Add --code-rate, --coded-bits, --modulation, --channel, --demapping, --transport-block, --rv and --harq.
/// @param options  holds the defaults and receives the choice; must outlive the parse
void addLinkOptions(CLI::App& command, LinkOptions& options);

/// The redundancy version of each transmission: those that were given, in turn; of several transmissions
/// without any, 0, 2, 3, 1.
std::vector<unsigned> redundancyVersionsOf(const LinkOptions& options);

}  // namespace quarzel::tool
