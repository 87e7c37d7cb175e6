// SPDX-License-Identifier: MIT
#include "report_text.hpp"

#include <fmt/format.h>

#include <iterator>

namespace quarzel::tool {

void reportLine(std::string& text, std::string_view label, std::string_view content) {
    fmt::format_to(std::back_inserter(text), "{:14}{}\n", label, content);
}

std::string counted(std::size_t number, std::string_view noun, std::string_view plural) {
    return fmt::format("{} {}", number, number == 1 ? noun : plural);
}

}  // namespace quarzel::tool
