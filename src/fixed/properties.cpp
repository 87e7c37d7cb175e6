// SPDX-License-Identifier: MIT
#include "fixed/properties.hpp"

std::pair<std::string, std::string> splitString(const std::string& s, const char* delims) {
    const std::size_t position = s.find_first_of(delims);
    if (position == std::string::npos) {
        return {s, {}};
    }
    return {s.substr(0, position), s.substr(position + 1)};
}
