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

Json placeOf(const TraceTable& table) {
    return {{"block", blockNumber(table)},
            {"pass", orNull(table.siso)},
            {"steps", table.steps},
            {"line", table.firstLine}};
}

Json valueOf(const TraceTable& table, std::size_t index) {
    return {{"raw", table.raw(index)}, {"real", table.real(index)}, {"line", table.lineOf(index)}};
}

void addFirstValue(Json& object, const TraceDifference& first) {
    const TraceTable& table = *first.a;
    const TraceColumn column = table.column(table.columnOf(*first.index));
    object["block"] = blockNumber(table);
    object["pass"] = orNull(table.siso);
    object["code"] = table.siso ? Json(constituentCode(*table.siso)) : Json();
    object["step"] = table.stepOf(*first.index);
    object["signal"] = column.signal;
    object["state"] = orNull(column.number);
    object["value_a"] = valueOf(*first.a, *first.index);
    object["value_b"] = valueOf(*first.b, *first.index);
    object["further"] = first.values - 1;
}

}  // namespace

void printJson(std::ostream& stream, const TraceDiffReport& report) {
    const TraceComparison& comparison = report.comparison;
    Json object = {
        {"a", report.fileA},
        {"b", report.fileB},
        {"equal", !comparison.first.has_value()},
        {"blocks", comparison.blocks},
        {"passes", comparison.passes},
        {"termination_values", comparison.termination},
        {"termination_only", comparison.termination > 0 && !comparison.elsewhere},
    };
    if (const auto& first = comparison.first) {
        if (first->index) {
            addFirstValue(object, *first);
        } else {
            object["next_a"] = first->a ? placeOf(*first->a) : Json();
            object["next_b"] = first->b ? placeOf(*first->b) : Json();
        }
    }
    // A file name need not be UTF-8; what is not becomes U+FFFD.
    stream << object.dump(-1, ' ', false, Json::error_handler_t::replace) << '\n';
}

}  // namespace quarzel::tool
