// SPDX-License-Identifier: MIT
#pragma once

#include <nlohmann/json_fwd.hpp>
#include <string>
#include <vector>

#include "vectors/manifest.hpp"
#include "vectors/vector_plan.hpp"

namespace quarzel::tool {

/// What the manifest says about a request.
nlohmann::ordered_json configurationJson(const VectorRequest& request);

/// The command that makes the set, with DIRECTORY for where.
std::string commandOf(const VectorRequest& request);

/// The README in the directory of a set.
std::string readmeText(const VectorRequest& request, const std::vector<VectorCore>& cores);

}  // namespace quarzel::tool
