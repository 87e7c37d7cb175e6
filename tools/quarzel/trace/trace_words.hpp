// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <charconv>
#include <string_view>
#include <system_error>

namespace quarzel::tool {

/// Take the next word, up to a blank, off the front of a text.
inline std::string_view takeWord(std::string_view& text) {
    text.remove_prefix(std::min(text.find_first_not_of(" \t"), text.size()));
    const std::string_view word = text.substr(0, text.find_first_of(" \t"));
    text.remove_prefix(word.size());
    return word;
}

/// Take `front` off a text.
/// @return whether the text begins with it
inline bool takeFront(std::string_view& text, std::string_view front) {
    const bool found = text.starts_with(front);
    text.remove_prefix(found ? front.size() : 0);
    return found;
}

/// Take a number off the front of a text.
/// @return whether there is one that the type holds
template <class Number>
bool takeNumber(std::string_view& text, Number& number) {
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    text.remove_prefix(static_cast<std::size_t>(end - text.data()));
    return error == std::errc();
}

/// A text without the blanks around it.
inline std::string_view trimmed(std::string_view text) {
    text.remove_prefix(std::min(text.find_first_not_of(" \t"), text.size()));
    return text.substr(0, text.find_last_not_of(" \t") + 1);
}

}  // namespace quarzel::tool
