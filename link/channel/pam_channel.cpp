// SPDX-License-Identifier: MIT
#include "link/channel/pam_channel.hpp"

#include <utility>

namespace quarzel::link {

PamChannel::PamChannel(const ChannelSetup& setup, Decibels ebN0, CodeRate rate)
    : itsBits(bitsOfSymbol(setup.modulation) / 2) {
    PamTable table = makePamTable(setup, ebN0, rate);
    itsSoft = std::move(table.soft);
    for (std::vector<std::uint64_t>& thresholds : table.thresholds) {
        itsPieces.emplace_back(std::move(thresholds));
    }
}

void PamChannel::transmit(const RandomSource& source, const std::uint8_t* codedBits, unsigned lane,
                          std::size_t count, std::int8_t* soft) const {
    Draws draws(source, Purpose::noise, Purpose::refinement);
    for (std::size_t symbol = 0; symbol < count; symbol += 2 * itsBits) {
        for (std::size_t component = symbol; component < symbol + 2; ++component) {
            std::size_t level = 0;
            for (std::size_t bit = 0; bit < itsBits; ++bit) {
                level = 2 * level + (codedBits[component + 2 * bit] >> lane & 1U);
            }
            const PamSoft& values = itsSoft[draws.next(itsPieces[level])];
            for (std::size_t bit = 0; bit < itsBits; ++bit) {
                soft[component + 2 * bit] = values[bit];
            }
        }
    }
}

}  // namespace quarzel::link
