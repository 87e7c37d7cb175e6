// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "options/cli_fwd.hpp"
#include "options/link_options.hpp"
#include "options/threads_option.hpp"
#include "vectors/vector_plan.hpp"

namespace quarzel::tool {

/// What the user gives to `quarzel vectors`.
struct VectorsOptions {
    std::string directory;
    std::vector<std::string> blockSizes;
    std::vector<std::string> stimuli;
    std::optional<std::size_t> blocks;
    std::optional<std::string> capture;
    double ebN0 = 1.0;
    unsigned threads = allCores();
    bool replace = false;
    bool json = false;
    LinkOptions link;
    std::vector<const CLI::Option*> blockOptions;  ///< those that tell what the blocks are, given or not
    std::vector<const CLI::Option*> linkOptions;   ///< those of the link among them
    bool coverFaults = false;
    bool coverSizes = false;
    VectorRequest request;
};

/// Add the options of `quarzel vectors`.
/// @param options  holds the defaults and receives the choice; must outlive the parse
void addVectorsOptions(CLI::App& command, VectorsOptions& options);

/// The set that the user wants.
/// @throws ToolError when options do not go together or sizes do not fit one another
VectorRequest requestOf(const VectorsOptions& options);

}  // namespace quarzel::tool
