// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <vector>

#include "link/chain/coded_link.hpp"
#include "options/link_options.hpp"

namespace quarzel::tool {

/// The one link of a vector set; its number of coded bits is set.
/// @param blockSizes  K, as the user gave them; of a transport block there are none
/// @throws ToolError when the user names several links, or sizes that do not fit one another
link::LinkSetup linkSetupOf(const LinkOptions& options, const std::vector<std::uint32_t>& blockSizes,
                            const link::Quantiser& quantiser);

}  // namespace quarzel::tool
