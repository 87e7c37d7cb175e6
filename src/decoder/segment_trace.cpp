// SPDX-License-Identifier: MIT
#include "decoder/segment_trace.hpp"

#include "fixed/text_output.hpp"

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

void traceSegments(const Segments& segments) {
    outputLine("itsAlphaSegment=" + listText(segments.alpha));
    outputLine("itsBetaSegment =" + listText(segments.beta));
}

void traceAlphaSegment(const ABSegment& segment, const T8& start, const T8& next) {
    outputLine(rangeText(segment) + " init=[" + metricsText(start) + "] newinit=[" + metricsText(next) + "]");
}

void traceBetaWindow(const ABSegment& window, const T8& from, const T8& to,
                     std::optional<std::size_t> entry) {
    std::string line =
        rangeText(window) + " beta[from]=[" + metricsText(from) + "] beta[to]=[" + metricsText(to) + "]";
    if (entry) {
        line += " init[" + std::to_string(*entry) + "]=" + metricsText(to);
    }
    outputLine(line);
}

void traceBoundaries(const std::string& name, unsigned set, const std::vector<T8>& boundaries) {
    std::string line = name + "[" + std::to_string(set) + "]=";
    for (const T8& metrics : boundaries) {
        line += "[" + metricsText(metrics) + "] ";
    }
    outputLine(line);
}

}  // namespace quarzel
