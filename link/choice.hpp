// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <cstddef>
#include <stdexcept>
#include <string>
#include <string_view>

namespace quarzel::link {

/// The place of a name in a list.
/// @param what  the names stand for
/// @throws std::invalid_argument listing the names when it is none of them
template <class Names>
std::size_t placeOf(const Names& names, std::string_view name, const char* what) {
    const auto found = std::find(names.begin(), names.end(), name);
    if (found != names.end()) {
        return static_cast<std::size_t>(found - names.begin());
    }
    std::string choices;
    for (const std::string_view choice : names) {
        choices.append(choices.empty() ? "" : ", ").append(choice);
    }
    throw std::invalid_argument("there is no " + std::string(what) + " '" + std::string(name) +
                                "'; choose one of " + choices);
}

}  // namespace quarzel::link
