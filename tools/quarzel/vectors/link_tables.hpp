// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <string>

#include "link/chain/coded_link.hpp"

/// The small files of a link that tell where everything is in its memories.
namespace quarzel::tool {

/// For each code block its sizes, and where it begins among those of a transport block: eight words a line.
std::string linkLayoutText(const link::CodedLink& link);

/// The redundancy version of each transmission, one a line.
std::string linkVersionText(const link::CodedLink& link);

/// The sizes of all memories as a Verilog header.
/// @param blocks  transport blocks, or code blocks alone
std::string linkHeaderText(const link::CodedLink& link, std::size_t blocks);

}  // namespace quarzel::tool
