// SPDX-License-Identifier: MIT
#include "report_text.hpp"

#include <fmt/format.h>

#include <cstdint>
#include <iterator>
#include <nlohmann/json.hpp>
#include <utility>

namespace quarzel::tool {

void reportLine(std::string& text, std::string_view label, std::string_view content) {
    fmt::format_to(std::back_inserter(text), "{:14}{}\n", label, content);
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

std::string validText(const std::string& text) {
    using Json = nlohmann::json;
    constexpr std::string_view replacement = "\xef\xbf\xbd";
    std::string valid =
        Json::parse(Json(text).dump(-1, ' ', false, Json::error_handler_t::replace)).get<std::string>();
    for (const std::string_view none :
         {"\xef\xbf\xbe", "\xef\xbf\xbf"}) {  // U+FFFE and U+FFFF, which XML forbids
        for (std::size_t at = 0; (at = valid.find(none, at)) != std::string::npos;) {
            valid.replace(at, none.size(), replacement);
        }
    }
    return valid;
}

std::string durationText(double seconds) {
    const auto whole = static_cast<std::uint64_t>(seconds);
    return fmt::format("{}:{:02}:{:02}", whole / 3600, whole / 60 % 60, whole % 60);
}

}  // namespace quarzel::tool
