// SPDX-License-Identifier: MIT
#include "decoder/segments.hpp"

#include <ostream>

namespace quarzel {

std::string toText(const ABSegment& segment) {
    return "[" + std::to_string(segment.from) + "," + std::to_string(segment.to) + ")";
}

std::ostream& operator<<(std::ostream& stream, const ABSegment& segment) {
    return stream << toText(segment);
}

std::vector<std::uint16_t> windowLengths(std::uint32_t steps) {
    std::vector<std::uint16_t> lengths;
    for (; steps != 0; steps -= lengths.back()) {
        lengths.push_back(static_cast<std::uint16_t>(windowLength(steps)));
    }
    return lengths;
}

void cutSegments(std::uint32_t K, std::uint32_t count, std::vector<ABSegment>& alpha,
                 std::vector<ABSegment>& beta) {
    const std::uint32_t length = K / count;
    alpha.clear();
    beta.clear();
    for (std::uint32_t thread = 0; thread < count; ++thread) {
        alpha.push_back({thread * length, (thread + 1) * length});
    }
    std::uint32_t offset = 0;
    while (offset < length) {
        const std::uint32_t window = windowLength(length - offset);
        for (const ABSegment& thread : alpha) {
            const std::uint32_t bottom = thread.from + offset;
            beta.push_back({bottom + window - 1, bottom == 0 ? 0 : bottom - 1});
        }
        offset += window;
    }
}

}  // namespace quarzel
