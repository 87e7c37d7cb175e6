// SPDX-License-Identifier: MIT
#include "link/channel/draw_table.hpp"

#include <algorithm>
#include <utility>

namespace quarzel::link {

DrawTable::DrawTable(std::vector<std::uint64_t> thresholds)
    : itsThresholds(std::move(thresholds)), itsNumbers(std::size_t{1} << 16) {
    std::size_t number = 0;
    for (std::size_t random = 0; random < itsNumbers.size(); ++random) {
        const std::uint64_t first = std::uint64_t{random} << refinementBits;
        const std::uint64_t end = first + (std::uint64_t{1} << refinementBits);
        while (number < itsThresholds.size() && itsThresholds[number] <= first) {
            ++number;
        }
        const bool isDecided = number == itsThresholds.size() || itsThresholds[number] >= end;
        itsNumbers[random] = isDecided ? static_cast<std::uint16_t>(number) : undecided;
    }
}

std::size_t DrawTable::decide(std::uint32_t random, std::uint32_t further) const {
    const auto above = std::upper_bound(itsThresholds.begin(), itsThresholds.end(),
                                        std::uint64_t{random} << refinementBits | further);
    return static_cast<std::size_t>(above - itsThresholds.begin());
}

}  // namespace quarzel::link
