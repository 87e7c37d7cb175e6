// SPDX-License-Identifier: MIT
#include "interface/overlap.hpp"

#include <algorithm>
#include <array>
#include <cstdint>
#include <vector>

namespace quarzel {

namespace {

/// Bytes of the caller's, by their addresses.
struct Range {
    std::uintptr_t first;
    std::uintptr_t end;
    bool written;

    Range(const void* start, std::size_t bytes, bool isWritten)
        : first(reinterpret_cast<std::uintptr_t>(start)), end(first + bytes), written(isWritten) {}

    bool empty() const { return first == 0 || first == end; }
};

/// The arrays of a block, the decisions last. It has 4 of them fewer than soft values.
std::array<Range, 4> arraysOf(const vardel_ip_quarzel_outputs& outputs,
                              const vardel_ip_quarzel_inputs& inputs) {
    const auto size = static_cast<std::size_t>(std::max(inputs.din_size, 4));
    const std::size_t bytes = size * sizeof(int);
    return {Range(inputs.rsc1_sys, bytes, false), Range(inputs.rsc1_par, bytes, false),
            Range(inputs.rsc2_par, bytes, false), Range(outputs.dout, size - 4, true)};
}

}  // namespace

bool overwritesInputs(const vardel_ip_quarzel_outputs& outputs, const vardel_ip_quarzel_inputs& inputs) {
    const std::array<Range, 4> arrays = arraysOf(outputs, inputs);
    const Range& decisions = arrays.back();
    return std::any_of(arrays.begin(), arrays.end() - 1, [&](const Range& softValues) {
        return softValues.first < decisions.end && decisions.first < softValues.end;
    });
}

bool outputsOverlap(const vardel_ip_quarzel_outputs* outputs, const vardel_ip_quarzel_inputs* inputs,
                    int count) {
    const auto forEachRange = [&](auto visit) {
        for (int i = 0; i < count; ++i) {
            for (const Range& range : arraysOf(outputs[i], inputs[i])) {
                if (!range.empty()) {
                    visit(range);
                }
            }
        }
    };
    // Most callers keep decisions and soft values apart, and the buffers in their order.
    std::uintptr_t readFirst = UINTPTR_MAX;
    std::uintptr_t readEnd = 0;
    std::uintptr_t writtenFirst = UINTPTR_MAX;
    std::uintptr_t writtenEnd = 0;
    bool ascending = true;
    forEachRange([&](const Range& range) {
        ascending = ascending && (!range.written || range.first >= writtenEnd);
        std::uintptr_t& first = range.written ? writtenFirst : readFirst;
        std::uintptr_t& end = range.written ? writtenEnd : readEnd;
        first = std::min(first, range.first);
        end = std::max(end, range.end);
    });
    if (ascending && (readEnd <= writtenFirst || writtenEnd <= readFirst)) {
        return false;
    }
    std::vector<Range> ranges;
    forEachRange([&](const Range& range) { ranges.push_back(range); });
    std::sort(ranges.begin(), ranges.end(), [](const Range& x, const Range& y) { return x.first < y.first; });
    readEnd = writtenEnd = 0;
    return std::any_of(ranges.begin(), ranges.end(), [&](const Range& range) {
        const bool overlaps = range.first < writtenEnd || (range.written && range.first < readEnd);
        std::uintptr_t& end = range.written ? writtenEnd : readEnd;
        end = std::max(end, range.end);
        return overlaps;
    });
}

}  // namespace quarzel
