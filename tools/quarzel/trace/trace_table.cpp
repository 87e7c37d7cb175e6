// SPDX-License-Identifier: MIT
#include "trace/trace_table.hpp"

namespace quarzel::tool {

const TNumberFormat& traceFormat() {
    static const TNumberFormat format(12, 3);
    return format;
}

std::string headingOf(const TraceColumn& column) {
    return column.index < 0 ? column.signal : column.signal + std::to_string(column.index);
}

}  // namespace quarzel::tool
