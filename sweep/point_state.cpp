// SPDX-License-Identifier: MIT
#include "sweep/point_state.hpp"

#include <array>

namespace quarzel::sweep {

namespace {

constexpr std::array<std::string_view, 3> names = {"block errors", "blocks", "time"};

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
        counts[i].bitErrors += row[i];
        counts[i].blockErrors += row[i] != 0 ? 1 : 0;
    }
    const std::uint64_t last = row[counts.size() - 1];
    bitErrorSquares += last * last;
}

}  // namespace quarzel::sweep
