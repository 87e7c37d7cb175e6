// SPDX-License-Identifier: MIT
#pragma once

#include <vector>

#include "vectors/manifest.hpp"
#include "vectors/output_directory.hpp"
#include "vectors/vector_blocks.hpp"

namespace quarzel::tool {

/// Write the files of a core: the memories for $readmemh, their sizes as a Verilog header, and the same
/// blocks as npy files for 'quarzel decode'.
/// @param core    its blocks are told where they are in the captures
/// @param blocks  the same as they were made
/// @return        the files written
/// @throws ToolError when one cannot be written
std::vector<VectorFile> writeCore(OutputDirectory& directory, VectorCore& core,
                                  const std::vector<StimulusAndResponse>& blocks);

}  // namespace quarzel::tool
