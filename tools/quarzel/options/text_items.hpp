// SPDX-License-Identifier: MIT
#pragma once

#include <string_view>
#include <vector>

namespace quarzel::tool {

/// The items of a text that a separator divides; there is always one, which may be empty.
std::vector<std::string_view> itemsOf(std::string_view text, char separator);

}  // namespace quarzel::tool
