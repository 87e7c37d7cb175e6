// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

#include "vectors/link_stages.hpp"
#include "vectors/manifest.hpp"
#include "vectors/output_directory.hpp"

namespace quarzel::tool {

/// "transport block 2", or "code block 2" where a link has code blocks alone.
std::string blockText(const link::CodedLink& link, std::size_t block);

/// Write the stages of blocks before a core, which are the same for all cores: a memory for each stage,
/// tables of code blocks and transmissions, and their sizes as a Verilog header.
/// @param content  receives the files and what they hold
/// @throws ToolError when one cannot be written
void writeLink(OutputDirectory& directory, const link::CodedLink& link, const std::vector<LinkStages>& blocks,
               VectorContent& content);

}  // namespace quarzel::tool
