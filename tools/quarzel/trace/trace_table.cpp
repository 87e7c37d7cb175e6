// SPDX-License-Identifier: MIT
#include "trace/trace_table.hpp"

namespace quarzel::tool {

const std::vector<TraceColumn>& passColumns() {
    static const std::vector<TraceColumn> columns = [] {
        std::vector<TraceColumn> list;
        for (const Signal& signal : signals()) {
            for (unsigned i = 0; i < signal.width; ++i) {
                const auto number = signal.width == 1 ? std::nullopt : std::optional(signal.first + i);
                list.push_back({signal.name, signal.description, number});
            }
        }
        return list;
    }();
    return columns;
}

}  // namespace quarzel::tool
