// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "trace/trace_lines.hpp"
#include "trace/trace_row_reader.hpp"

namespace quarzel::tool {

/// Reads a trace as waves, as the tool writes them: at each time the variables show a step of a pass. A time
/// ends with the next one, so that waves that were cut off are not taken for whole ones.
class TraceVcdReader : public TraceRowReader {
  public:
    /// @param lines  at the first one
    explicit TraceVcdReader(std::unique_ptr<TraceLines> lines);

    bool next(TraceRow& row) override;

  private:
    struct Variable {
        bool isDeclared = false;
        std::string bits;  ///< its value
    };

    void readDeclarations();
    void readChanges();
    std::uint32_t place(std::size_t variable) const;
    TraceValue value(const Variable& variable) const;

    std::unique_ptr<TraceLines> itsLines;
    std::vector<Variable> itsVariables;           ///< as the names of the waves
    std::map<std::string, std::size_t> itsCodes;  ///< the variable of a code
    std::size_t itsTimeLine = 0;                  ///< where the time of the values stands
};

}  // namespace quarzel::tool
