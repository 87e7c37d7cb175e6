// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

/// What the trace of a pass shows of each trellis step, in the order of the table's columns. The table and
/// every other form of a trace are made from this list.
namespace quarzel {

struct TraceColumn {
    const char* signal;  ///< name; with the index behind it, the heading of the column
    int index;          ///< encoder state of a and b, number of the branch metric of g, -1 for a single value
    bool firstOfGroup;  ///< a gap stands before it
};

inline constexpr std::size_t traceColumnCount = 23;

inline constexpr std::array<TraceColumn, traceColumnCount> traceColumns = {{
    {"int", -1, false}, {"a", 0, true},    {"a", 1, false},    {"a", 2, false}, {"a", 3, false},
    {"a", 4, false},    {"a", 5, false},   {"a", 6, false},    {"a", 7, false}, {"b", 0, true},
    {"b", 1, false},    {"b", 2, false},   {"b", 3, false},    {"b", 4, false}, {"b", 5, false},
    {"b", 6, false},    {"b", 7, false},   {"g", 4, true},     {"g", 5, false}, {"g", 6, false},
    {"g", 7, false},    {"llr", -1, true}, {"ext", -1, false},
}};

/// The words of one step, an entry for each column.
using TraceRow = std::array<std::int16_t, traceColumnCount>;

}  // namespace quarzel
