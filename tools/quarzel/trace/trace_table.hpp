// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "decoder/trace_columns.hpp"
#include "fixed/number_format.hpp"

namespace quarzel::tool {

/// A stream of a block's soft inputs, as a trace shows it.
struct TraceStream {
    const char* label;    ///< what its line begins with
    const char* signal;   ///< its name in the forms for other programs
    const char* meaning;  ///< the same in words
};

/// The streams, in the order of their lines.
inline constexpr std::array<TraceStream, 6> traceStreams = {{
    {"itsSys [0]=[", "code1_sys", "systematic values of constituent code 1"},
    {"itsPar0[0]=[", "code1_par0", "first parity of constituent code 1"},
    {"itsPar1[0]=[", "code1_par1", "second parity of constituent code 1"},
    {"itsSys [1]=[", "code2_sys", "systematic values of constituent code 2"},
    {"itsPar0[1]=[", "code2_par0", "first parity of constituent code 2"},
    {"itsPar1[1]=[", "code2_par1", "second parity of constituent code 2"},
}};

/// The number format of every value in a trace.
const TNumberFormat& traceFormat();

/// A table of a trace: the soft inputs of a block, a row for each stream, or the signals of a pass, a row for
/// each trellis step.
struct TraceTable {
    std::uint64_t decode = 0;           ///< blocks decoded before this one
    std::optional<std::uint32_t> siso;  ///< number of the pass; none for soft inputs
    std::uint32_t steps = 0;            ///< trellis steps of the block, with its 3 termination steps
    std::size_t firstLine = 0;          ///< number of the line that holds the first row
    std::vector<std::int16_t> values;   ///< words of the trace format, row by row

    std::size_t rowLength() const { return siso ? traceColumnCount : steps; }

    /// @name Where the value `index` stands
    /// @{
    std::size_t lineOf(std::size_t index) const { return firstLine + index / rowLength(); }
    std::size_t stepOf(std::size_t index) const { return siso ? index / rowLength() : index % rowLength(); }
    /// The column of a pass; the stream of soft inputs.
    std::size_t columnOf(std::size_t index) const { return siso ? index % rowLength() : index / rowLength(); }
    /// Whether it belongs to a termination step of a pass, whose metrics no core computes.
    bool isTermination(std::size_t index) const { return siso && stepOf(index) + 3 >= steps; }
    /// @}

    std::size_t indexOf(std::size_t step, std::size_t column) const {
        return siso ? step * rowLength() + column : column * rowLength() + step;
    }

    TraceColumn column(std::size_t number) const {
        return siso ? traceColumns[number] : TraceColumn{traceStreams[number].signal, -1, false};
    }

    std::int32_t raw(std::size_t index) const { return traceFormat().toInteger(values[index]); }
    double real(std::size_t index) const { return traceFormat().toReal(values[index]); }
};

/// What stands over a column of the table of a pass.
std::string headingOf(const TraceColumn& column);

/// What a trace calls a block, for its reader: the first one is 1.
inline std::uint64_t blockNumber(const TraceTable& table) {
    return table.decode + 1;
}

/// The constituent code that a pass decodes.
inline unsigned constituentCode(std::uint32_t siso) {
    return siso % 2 == 0 ? 2 : 1;
}

}  // namespace quarzel::tool
