// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>

namespace quarzel::sweep {

/// Where a point ends: at whichever comes first. The rule looks at blocks in order, so that a point ends at
/// the same block whoever simulates it. A point that has been taken further keeps all its blocks.
struct StopRule {
    std::uint64_t maxBlocks = 10000;
    std::uint64_t maxBlockErrors = 100;  ///< 0: no limit
    std::uint64_t maxSeconds = 0;        ///< 0: no limit
};

}  // namespace quarzel::sweep
