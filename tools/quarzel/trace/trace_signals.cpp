// SPDX-License-Identifier: MIT
#include "trace/trace_signals.hpp"

#include <algorithm>
#include <functional>
#include <map>

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

const std::vector<TraceColumn>& traceColumns() {
    static const std::vector<TraceColumn> columns = [] {
        std::vector<TraceColumn> list = passColumns();
        for (const TraceStream& stream : traceStreams) {
            list.push_back({stream.signal, stream.description, std::nullopt});
        }
        return list;
    }();
    return columns;
}

bool isInput(unsigned column) {
    return column >= passColumns().size();
}

std::optional<unsigned> findColumn(std::string_view signal, std::optional<unsigned> number) {
    for (unsigned column = 0; column < traceColumns().size(); ++column) {
        if (signal == traceColumns()[column].signal && number == traceColumns()[column].number) {
            return column;
        }
    }
    return std::nullopt;
}

std::optional<unsigned> columnUnder(std::string_view heading) {
    static const auto columns = [] {
        std::map<std::string, unsigned, std::less<>> map;
        for (unsigned column = 0; column < traceColumns().size(); ++column) {
            map[traceColumns()[column].heading()] = column;
        }
        return map;
    }();
    const auto found = columns.find(heading);
    return found == columns.end() ? std::nullopt : std::optional(found->second);
}

TraceColumnSet columnsNamed(std::string_view name) {
    TraceColumnSet set;
    for (unsigned column = 0; column < traceColumns().size(); ++column) {
        set[column] = name == traceColumns()[column].signal;
    }
    if (const std::optional<unsigned> column = columnUnder(name)) {
        set[*column] = true;
    }
    return set;
}

const std::vector<unsigned>& columnsAsComputed() {
    static const std::vector<unsigned> order = [] {
        std::vector<unsigned> list;
        const auto append = [&list](std::string_view signal) {
            for (unsigned column = 0; column < traceColumns().size(); ++column) {
                if (signal == traceColumns()[column].signal) {
                    list.push_back(column);
                }
            }
        };
        std::ranges::for_each(traceStreams, append, &TraceStream::signal);
        std::ranges::for_each(std::array{"int", "g", "a", "b", "llr", "ext"}, append);
        return list;
    }();
    return order;
}

bool isComputedDownwards(unsigned column) {
    return std::string_view(traceColumns()[column].signal) == "b";
}

}  // namespace quarzel::tool
