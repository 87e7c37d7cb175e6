// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <cstdint>
#include <optional>
#include <vector>

#include "trace/trace_signals.hpp"

namespace quarzel::tool {

/// Which values of a trace are wanted.
struct TraceSelection {
    TraceColumnSet columns;             ///< none: all
    std::vector<std::uint32_t> passes;  ///< none: all; soft inputs belong to none and are always wanted

    bool wants(unsigned column) const { return columns.none() || columns[column]; }
    bool wants(std::optional<std::uint32_t> pass) const {
        return passes.empty() || !pass || std::find(passes.begin(), passes.end(), *pass) != passes.end();
    }
};

}  // namespace quarzel::tool
