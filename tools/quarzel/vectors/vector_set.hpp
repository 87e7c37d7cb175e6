// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <functional>
#include <string>

#include "vectors/vector_plan.hpp"

namespace quarzel::tool {

/// How much there is in a set.
struct VectorSetSummary {
    std::size_t cores = 0;
    std::size_t blocks = 0;
    std::size_t bits = 0;  ///< decisions
    std::size_t files = 0;
    std::size_t bytes = 0;
};

/// Told how many of how many blocks are made. What it throws ends the work, and nothing is left of it.
using VectorProgress = std::function<void(std::size_t done, std::size_t total)>;

/// Make a vector set. The bytes of every file depend on the request alone.
/// @param directory   where; see OutputDirectory
/// @param isReplaced  an older set may be there
/// @param threads     how many threads decode
/// @throws ToolError when a file cannot be written, a block cannot be decoded, or a set that is to cover
///                   everything does not
VectorSetSummary makeVectorSet(const VectorRequest& request, const std::string& directory, bool isReplaced,
                               unsigned threads, const VectorProgress& progress);

}  // namespace quarzel::tool
