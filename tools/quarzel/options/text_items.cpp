// SPDX-License-Identifier: MIT
#include "options/text_items.hpp"

#include <algorithm>

namespace quarzel::tool {

std::vector<std::string_view> itemsOf(std::string_view text, char separator) {
    std::vector<std::string_view> items;
    for (std::size_t from = 0; from <= text.size();) {
        const std::size_t to = std::min(text.find(separator, from), text.size());
        items.push_back(text.substr(from, to - from));
        from = to + 1;
    }
    return items;
}

}  // namespace quarzel::tool
