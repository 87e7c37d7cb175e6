// SPDX-License-Identifier: MIT
#pragma once

#include <nlohmann/json.hpp>
#include <string_view>

namespace quarzel::sweep {

/// Read JSON that somebody else may have written.
/// @return a discarded value when it is not well-formed or nested so deep that to work on it could exhaust
/// the
///         stack
nlohmann::ordered_json parseJson(std::string_view text);

}  // namespace quarzel::sweep
