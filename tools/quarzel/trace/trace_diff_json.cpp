// SPDX-License-Identifier: MIT
#include <nlohmann/json.hpp>

#include "trace/trace_diff_report.hpp"

namespace quarzel::tool {

namespace {

using Json = nlohmann::ordered_json;

template <class Value>
Json orNull(const std::optional<Value>& value) {
    return value ? Json(*value) : Json();
}

Json placeOf(const TraceDifference& first, std::size_t trace) {
    const auto& block = first.blocks[trace];
    if (!block || (first.steps != 0 && block->table(first.pass) == nullptr)) {
        return {};
    }
    return {{"block", orNull(block->number())}, {"pass", orNull(first.pass)}};
}

Json valueOf(const TraceDifference& first, std::size_t trace) {
    const TraceValue value = first.value(trace);
    const TraceTable& table = *first.blocks[trace]->table(first.pass);
    return {{"raw", value.isNumber() ? Json(value.raw()) : Json(value.text())},
            {"real", value.isNumber() ? Json(value.real()) : Json(value.text())},
            {"line", table.line(first.step, first.column)}};
}

void addFirstValue(Json& object, const TraceDifference& first) {
    const TraceColumn& column = traceColumns()[first.column];
    object["block"] = orNull(first.blocks[0]->number());
    object["block_b"] = orNull(first.blocks[1]->number());
    object["pass"] = orNull(first.pass);
    object["code"] = first.pass ? Json(constituentCode(*first.pass)) : Json();
    object["step"] = first.step;
    object["signal"] = column.signal;
    object["state"] = orNull(column.number);
    object["value_a"] = valueOf(first, 0);
    object["value_b"] = valueOf(first, 1);
}

}  // namespace

void printJson(std::ostream& stream, const TraceDiffReport& report) {
    const TraceComparison& comparison = report.comparison;
    Json bySignal = Json::object();
    for (const auto& [signal, count] : differencesBySignal(comparison)) {
        bySignal[signal] = count;
    }
    Json byPass = Json::array();
    for (const auto& [table, count] : comparison.byTable) {
        byPass.push_back({{"block", orNull(table.first)}, {"pass", orNull(table.second)}, {"differ", count}});
    }
    Json object = {
        {"a", report.files[0]},
        {"b", report.files[1]},
        {"equal", !comparison.first.has_value()},
        {"blocks", comparison.blocks},
        {"passes", comparison.passes},
        {"values", comparison.values},
        {"differ", comparison.differing()},
        {"by_signal", bySignal},
        {"by_pass", byPass},
        {"termination_values", comparison.termination},
        {"termination_only", comparison.termination > 0 && !comparison.elsewhere},
    };
    if (const auto& first = comparison.first) {
        if (first->isValue) {
            addFirstValue(object, *first);
            object["recomputed"] = report.cause;
        } else {
            object["next_a"] = placeOf(*first, 0);
            object["next_b"] = placeOf(*first, 1);
        }
    }
    // A file name need not be UTF-8; what is not becomes U+FFFD.
    stream << object.dump(-1, ' ', false, Json::error_handler_t::replace) << '\n';
}

}  // namespace quarzel::tool
