// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "quarzel/code.hpp"

namespace quarzel::tool {

/// A stream of a block's soft inputs, as a trace shows it.
struct TraceStream {
    const char* label;        ///< what its line begins with
    const char* signal;       ///< its name in the forms for other programs
    const char* description;  ///< the same in words
};

/// The streams, in the order of their lines: three of each constituent code.
inline constexpr std::array<TraceStream, 6> traceStreams = {{
    {"itsSys [0]=[", "code1_sys", "systematic values of constituent code 1"},
    {"itsPar0[0]=[", "code1_par0", "first parity of constituent code 1"},
    {"itsPar1[0]=[", "code1_par1", "second parity of constituent code 1"},
    {"itsSys [1]=[", "code2_sys", "systematic values of constituent code 2"},
    {"itsPar0[1]=[", "code2_par0", "first parity of constituent code 2"},
    {"itsPar1[1]=[", "code2_par1", "second parity of constituent code 2"},
}};

/// What a value of a trace belongs to: a column in the table of a pass, a stream of soft inputs.
struct TraceColumn {
    const char* signal;
    const char* description;         ///< the signal in words
    std::optional<unsigned> number;  ///< of the column, where the signal has several

    /// What stands over it.
    std::string heading() const { return number ? signal + std::to_string(*number) : signal; }
};

/// The columns in the table of a pass, in their order.
const std::vector<TraceColumn>& passColumns();

/// @name What a word of a trace stands for: 12 bits, 3 of them fractional, at the top of 16
/// @{
constexpr int rawOf(std::int16_t word) {
    return word >> 4;
}
constexpr double realOf(std::int16_t word) {
    return rawOf(word) / 8.0;
}
/// @}

/// A table of a trace: the soft inputs of a block, a row for each stream, or the signals of a pass, a row for
/// each trellis step.
struct TraceTable {
    std::uint64_t decode = 0;           ///< blocks decoded before this one
    std::optional<std::uint32_t> siso;  ///< number of the pass; none for soft inputs
    std::uint32_t steps = 0;            ///< trellis steps of the block, with its 3 termination steps
    std::size_t firstLine = 0;          ///< number of the line that holds the first row
    std::vector<std::int16_t> values;   ///< words, row by row

    std::size_t rowLength() const { return siso ? passColumns().size() : steps; }

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
        if (siso) {
            return passColumns()[number];
        }
        return {traceStreams[number].signal, traceStreams[number].description, std::nullopt};
    }

    int raw(std::size_t index) const { return rawOf(values[index]); }
    double real(std::size_t index) const { return realOf(values[index]); }
};

/// What a trace calls a block, for its reader: the first one is 1.
inline std::uint64_t blockNumber(const TraceTable& table) {
    return table.decode + 1;
}

/// The constituent code that a pass decodes.
inline unsigned constituentCode(std::uint32_t siso) {
    return siso % 2 == 0 ? 2 : 1;
}

}  // namespace quarzel::tool
