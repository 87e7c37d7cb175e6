// SPDX-License-Identifier: MIT
#include "decoder/segment_trace.hpp"

#include <string>

namespace quarzel {

namespace {

/// Eight metrics in decimal, separated by a blank.
std::string metricsText(const T8& metrics) {
    std::string text;
    for (const std::int16_t metric : metrics.element) {
        text += (text.empty() ? "" : " ") + std::to_string(metric);
    }
    return text;
}

std::string rangeText(const ABSegment& range) {
    return "from=" + std::to_string(range.from) + " to=" + std::to_string(range.to);
}

std::string listText(const std::vector<ABSegment>& ranges) {
    std::string text;
    for (const ABSegment& range : ranges) {
        text += (text.empty() ? "" : " ") + toText(range);
    }
    return text;
}

}  // namespace

void traceSegments(const Messages& messages, const std::vector<ABSegment>& alpha,
                   const std::vector<ABSegment>& beta) {
    messages.trace({"itsAlphaSegment=", listText(alpha)});
    messages.trace({"itsBetaSegment =", listText(beta)});
}

void traceAlphaSegment(const Messages& messages, const ABSegment& segment, const T8& start, const T8& next) {
    messages.trace(
        {rangeText(segment), " init=[", metricsText(start), "] newinit=[", metricsText(next), "]"});
}

void traceBetaWindow(const Messages& messages, const ABSegment& window, const T8& from, const T8& to,
                     std::optional<std::size_t> entry) {
    const std::string store = entry ? " init[" + std::to_string(*entry) + "]=" + metricsText(to) : "";
    messages.trace(
        {rangeText(window), " beta[from]=[", metricsText(from), "] beta[to]=[", metricsText(to), "]", store});
}

void traceBoundaries(const Messages& messages, std::string_view name, unsigned set,
                     const std::vector<T8>& boundaries) {
    std::string text;
    for (const T8& metrics : boundaries) {
        text += "[" + metricsText(metrics) + "] ";
    }
    messages.trace({name, "[", Decimal(set), "]=", text});
}

}  // namespace quarzel
