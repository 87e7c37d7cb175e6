// SPDX-License-Identifier: MIT
#include "sweep/sending.hpp"

#include <fmt/format.h>

#include <array>

namespace quarzel::sweep {

namespace {

constexpr std::array<std::string_view, 2> stops = {"none", "crc"};

}  // namespace

std::string_view nameOf(Stop stop) {
    return stops.at(static_cast<std::size_t>(stop));
}

std::optional<Stop> stopOf(std::string_view name) {
    for (const auto stop : {Stop::none, Stop::crc}) {
        if (nameOf(stop) == name) {
            return stop;
        }
    }
    return std::nullopt;
}

std::string sendingText(const Sending& sending) {
    const Sending usual;
    std::string text;
    const auto append = [&text](bool isUsual, const std::string& part) {
        text += isUsual ? "" : ", " + part;
    };
    append(sending.transportBlock == usual.transportBlock,
           fmt::format("transport blocks of {} bits", sending.transportBlock));
    append(sending.codedBits == usual.codedBits, fmt::format("{} coded bits", sending.codedBits));
    append(sending.modulation == usual.modulation, std::string(nameOf(sending.modulation)));
    append(sending.fading == usual.fading,
           std::string(link::channelNames.at(static_cast<std::size_t>(sending.fading))));
    append(sending.demapping == usual.demapping,
           fmt::format("{} demapping", link::demappingNames.at(static_cast<std::size_t>(sending.demapping))));
    append(sending.redundancyVersions == usual.redundancyVersions,
           fmt::format("rv {}", fmt::join(sending.redundancyVersions, " ")));
    append(sending.stop == usual.stop, fmt::format("stop {}", nameOf(sending.stop)));
    return text;
}

}  // namespace quarzel::sweep
