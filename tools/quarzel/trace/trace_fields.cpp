// SPDX-License-Identifier: MIT
#include "trace/trace_fields.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <limits>

#include "options/whole_number.hpp"
#include "trace/trace_signals.hpp"

namespace quarzel::tool {

namespace {

using Role = TraceField::Role;

constexpr std::array<std::pair<std::string_view, Role>, 8> namedRoles = {{
    {"block", Role::block},
    {"pass", Role::pass},
    {"step", Role::step},
    {"signal", Role::signal},
    {"state", Role::state},
    {"raw", Role::raw},
    {"real", Role::real},
    {"value", Role::value},
}};

/// Read a whole number into its place.
/// @return whether the text is one that the place holds
template <class Number>
bool readInto(std::optional<Number>& place, std::string_view text) {
    const std::optional<std::uint64_t> number = readWholeNumber(text);
    if (!number || *number > std::numeric_limits<Number>::max()) {
        return false;
    }
    place = static_cast<Number>(*number);
    return true;
}

}  // namespace

std::optional<TraceField> TraceField::named(std::string_view name) {
    const auto role = std::ranges::find(namedRoles, name, &std::pair<std::string_view, Role>::first);
    if (role != namedRoles.end()) {
        return TraceField{role->second};
    }
    const std::optional<unsigned> column = columnUnder(name);
    return column ? std::optional(TraceField{Role::column, *column}) : std::nullopt;
}

const std::string& TraceField::names() {
    static const std::string list =
        "block, pass, step, signal, state, raw, real, value, int, a0 to a7, b0 to b7, g4 to g7, llr, ext, "
        "code1_sys to code2_par1";
    return list;
}

void TraceFields::start(std::size_t line) {
    itsRow.block.reset();
    itsRow.pass.reset();
    itsRow.line = line;
    itsRow.values.clear();
    itsHasStep = false;
    itsHasSignal = false;
    itsState.reset();
    itsValue = TraceValue();
}

TraceUnits TraceFields::unitsOf(const TraceField& field) const {
    return field.role == Role::raw ? TraceUnits::raw : field.role == Role::real ? TraceUnits::real : itsUnits;
}

bool TraceFields::take(const TraceField& field, std::string_view text) {
    if (text.empty()) {
        return true;
    }
    switch (field.role) {
        case Role::block:
            return readInto(itsRow.block, text);
        case Role::pass:
            return readInto(itsRow.pass, text);
        case Role::state:
            return readInto(itsState, text);
        case Role::step: {
            std::optional<std::uint32_t> step;
            itsHasStep = readInto(step, text);
            itsRow.step = step.value_or(0);
            return itsHasStep;
        }
        case Role::signal:
            itsHasSignal = true;
            if (itsSignal != text) {
                itsSignal = text;
                itsSignalColumns = columnsNamed(text);
            }
            return itsSignalColumns.any();
        default:
            break;
    }
    const std::optional<TraceValue> value = TraceValue::read(text, unitsOf(field));
    if (value && field.role == Role::column) {
        itsRow.values.emplace_back(field.column, *value);
    } else if (value && (field.role != Role::real || !itsValue.isThere())) {
        // Real numbers made of an unknown integer are known; the integer goes before them.
        itsValue = *value;
    }
    return value.has_value();
}

std::string_view TraceFields::expectedOf(const TraceField& field) const {
    switch (field.role) {
        case Role::block:
        case Role::pass:
        case Role::step:
        case Role::state:
            return "a whole number from 0 on";
        case Role::signal:
            return "int, a, b, g, llr, ext or code1_sys to code2_par1";
        default:
            return expectedValue(unitsOf(field));
    }
}

std::string TraceFields::finishValue() {
    const bool isOne = itsSignalColumns.count() == 1;
    unsigned column = 0;
    while (column < traceColumns().size() &&
           !(itsSignalColumns[column] && (isOne || traceColumns()[column].number == itsState))) {
        ++column;
    }
    if (column == traceColumns().size() || (itsState && traceColumns()[column].number != itsState)) {
        return itsState ? fmt::format("has no state {} of signal {}", *itsState, itsSignal)
                        : fmt::format("has no state for signal {}", itsSignal);
    }
    if (!itsValue.isThere()) {
        return fmt::format("has no value of {}", traceColumns()[column].heading());
    }
    itsRow.values.emplace_back(column, itsValue);
    return "";
}

std::string TraceFields::finish(TraceRow& row) {
    if (!itsHasStep) {
        return "has no step";
    }
    if (itsHasSignal) {
        if (std::string problem = finishValue(); !problem.empty()) {
            return problem;
        }
    } else if (itsValue.isThere()) {
        return "has no signal";
    }
    if (itsRow.values.empty()) {
        return "has no value";
    }
    if (!itsRow.pass && !std::ranges::all_of(itsRow.values, [](const auto& v) { return isInput(v.first); })) {
        return "has no pass";
    }
    std::swap(row, itsRow);
    return "";
}

}  // namespace quarzel::tool
