// SPDX-License-Identifier: MIT
#pragma once

#include <compare>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "link/channel/channel.hpp"

namespace quarzel::sweep {

/// When a receiver ends the iterations of a block: after all of them, or when the CRCs of its transport block
/// hold.
enum class Stop { none, crc };

/// How files and options call it.
std::string_view nameOf(Stop stop);
std::optional<Stop> stopOf(std::string_view name);

/// How blocks are sent and received, but for their size, quantiser and Eb/N0. The default is code blocks
/// alone, each code bit once, as BPSK over white Gaussian noise.
struct Sending {
    std::uint32_t transportBlock = 0;  ///< A; 0: code blocks alone
    std::uint32_t codedBits = 0;       ///< E or G of a transmission; 0: each bit of code blocks alone once
    link::Modulation modulation = link::Modulation::bpsk;
    link::Fading fading = link::Fading::none;
    link::Demapping demapping = link::Demapping::maxLog;
    std::vector<unsigned> redundancyVersions = {0};  ///< of each transmission; a block gets no more of them
    Stop stop = Stop::none;

    auto operator<=>(const Sending&) const = default;

    bool isPlain() const { return *this == Sending{}; }
};

/// Call a function for each field: its name in files and CSV, and the member.
template <class AnySending, class Function>
void forEachSendingField(AnySending& sending, Function function) {
    function("transport_block", sending.transportBlock);
    function("coded_bits", sending.codedBits);
    function("modulation", sending.modulation);
    function("channel", sending.fading);
    function("demapping", sending.demapping);
    function("redundancy_versions", sending.redundancyVersions);
    function("stop", sending.stop);
}

/// ", 2048 coded bits, qpsk": what is not the default, each after a comma.
std::string sendingText(const Sending& sending);

}  // namespace quarzel::sweep
