// SPDX-License-Identifier: MIT
#include "sweep/point_state.hpp"

#include <array>

namespace quarzel::sweep {

namespace {

constexpr std::array<std::string_view, 3> names = {"block errors", "blocks", "time"};

std::uint32_t wrongBitsOf(std::uint32_t entry) {
    return entry & ~(undetectedMark | rejectedMark);
}

}  // namespace

std::string_view nameOf(StopReason reason) {
    return names.at(static_cast<std::size_t>(reason));
}

std::optional<StopReason> stopReasonOf(std::string_view name) {
    for (std::size_t i = 0; i < names.size(); ++i) {
        if (names.at(i) == name) {
            return static_cast<StopReason>(i);
        }
    }
    return std::nullopt;
}

void PointState::add(const std::uint32_t* row) {
    for (std::size_t i = 0; i < counts.size(); ++i) {
        counts[i].bitErrors += wrongBitsOf(row[i]);
        counts[i].blockErrors += row[i] != 0 ? 1 : 0;
        counts[i].undetected += (row[i] & undetectedMark) != 0 ? 1 : 0;
    }
    for (std::size_t i = counts.size(); i < columns(); ++i) {
        if (row[i] != 0) {
            ++iterationsUsed.at(row[i] - 1);
        }
    }
    const std::uint64_t last = wrongBitsOf(row[counts.size() - 1]);
    bitErrorSquares += last * last;
}

}  // namespace quarzel::sweep
