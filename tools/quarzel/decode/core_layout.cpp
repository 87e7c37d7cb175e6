// SPDX-License-Identifier: MIT
#include "decode/core_layout.hpp"

#include "decoder/segments.hpp"

namespace quarzel::tool {

namespace {

constexpr std::uint32_t threadsPerUnit = 4;

}  // namespace

CoreLayout coreLayout(std::uint32_t K, std::uint32_t units) {
    const std::uint32_t threads = threadsPerUnit * units;
    const std::uint32_t segments = threadSegments(K, threads);
    CoreLayout layout{units, threads, segments, K / segments, {}};
    for (std::uint32_t rest = layout.steps; rest > 0; rest -= layout.windows.back()) {
        layout.windows.push_back(windowLength(rest));
    }
    return layout;
}

}  // namespace quarzel::tool
