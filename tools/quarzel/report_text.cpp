// SPDX-License-Identifier: MIT
#include "report_text.hpp"

#include <fmt/format.h>

#include <cstdint>
#include <utility>

namespace quarzel::tool {

void reportLine(std::string& text, std::string_view label, std::string_view content) {
    text += fmt::format("{:14}{}\n", label, content);
}

std::string counted(std::size_t number, std::string_view noun, std::string_view plural) {
    return fmt::format("{} {}", number, number == 1 ? noun : plural);
}

std::string listText(std::vector<std::string> items, std::size_t most) {
    if (items.size() > most) {
        const std::size_t more = items.size() - most;
        items.resize(most);
        items.push_back(fmt::format("and {} more", more));
    }
    return fmt::format("{}", fmt::join(items, ", "));
}

std::string shellWord(const std::string& text) {
    const bool isPlain = text.find_first_not_of(
                             "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789"
                             "_-./=,:@%+") == std::string::npos;
    if (isPlain && !text.empty()) {
        return text;
    }
    std::string word = "'";
    for (const char c : text) {
        word += c == '\'' ? "'\\''" : std::string(1, c);
    }
    return word + '\'';
}

std::string durationText(double seconds) {
    const auto whole = static_cast<std::uint64_t>(seconds);
    return fmt::format("{}:{:02}:{:02}", whole / 3600, whole / 60 % 60, whole % 60);
}

}  // namespace quarzel::tool
