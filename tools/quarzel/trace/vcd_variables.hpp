// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <string>
#include <vector>

#include "trace/trace_signals.hpp"

/// The variables of a trace as waves: a value change dump of IEEE 1364.
namespace quarzel::tool {

/// Where a step of a pass is, and the soft inputs that its code has there.
inline constexpr std::array<const char*, 4> vcdPlaces = {"block", "pass", "code", "step"};
inline constexpr std::array<const char*, 3> vcdInputs = {"sys", "par0", "par1"};

/// The names of all variables: the two above and the columns of a pass.
inline const std::vector<std::string>& vcdNames() {
    static const std::vector<std::string> names = [] {
        std::vector<std::string> list(vcdPlaces.begin(), vcdPlaces.end());
        list.insert(list.end(), vcdInputs.begin(), vcdInputs.end());
        for (const TraceColumn& column : passColumns()) {
            list.push_back(column.heading());
        }
        return list;
    }();
    return names;
}

/// The column of a variable that is a value: a soft input of a code, or of the pass.
inline unsigned vcdColumn(std::size_t variable, unsigned code) {
    variable -= vcdPlaces.size();
    if (variable < vcdInputs.size()) {
        return static_cast<unsigned>(passColumns().size() + (code - 1) * vcdInputs.size() + variable);
    }
    return static_cast<unsigned>(variable - vcdInputs.size());
}

}  // namespace quarzel::tool
