// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "trace/trace_row_reader.hpp"
#include "trace/trace_signals.hpp"

namespace quarzel::tool {

/// What a field of a row means. A row tells a value of one signal (`signal`, `state`, and `raw`, `real` or
/// `value`), or those of several signals, each in a field under the heading of its column.
struct TraceField {
    enum class Role { block, pass, step, signal, state, raw, real, value, column };

    Role role;
    unsigned column = 0;  ///< where the role is `column`

    /// The field of a name; none when there is none.
    static std::optional<TraceField> named(std::string_view name);

    /// All names, for error messages.
    static const std::string& names();
};

/// Makes a row of texts in fields, for the forms whose fields have names.
class TraceFields {
  public:
    /// @param units  of values that do not say it themselves
    explicit TraceFields(TraceUnits units) : itsUnits(units) {}

    /// Begin a row.
    void start(std::size_t line);

    /// Take a field. An empty text is none.
    /// @return whether the text is what the field holds
    bool take(const TraceField& field, std::string_view text);

    /// What `take` expected of a field, for error messages.
    std::string_view expectedOf(const TraceField& field) const;

    /// End the row.
    /// @param row  receives it
    /// @return     what is wrong with the row as a whole; empty: nothing
    std::string finish(TraceRow& row);

  private:
    TraceUnits unitsOf(const TraceField& field) const;
    std::string finishValue();

    TraceUnits itsUnits;
    TraceRow itsRow;
    bool itsHasStep = false;
    bool itsHasSignal = false;
    std::string itsSignal;            ///< the last one
    TraceColumnSet itsSignalColumns;  ///< its columns
    std::optional<unsigned> itsState;
    TraceValue itsValue;
};

}  // namespace quarzel::tool
