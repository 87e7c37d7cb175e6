// SPDX-License-Identifier: MIT
#include "plot/figure_text.hpp"

#include <fmt/format.h>

#include <string_view>

#include "valid_text.hpp"

namespace quarzel::tool {

namespace {

/// A character of UTF-8 at the start of a text.
std::string_view firstOf(std::string_view text) {
    std::size_t size = 1;
    while (size < text.size() && (static_cast<unsigned char>(text[size]) & 0xC0U) == 0x80) {
        ++size;
    }
    return text.substr(0, size);
}

double widthOfCharacter(std::string_view character) {
    if (character.size() > 2) {
        return 1.0;  // among them the characters of East Asia, which are square
    }
    constexpr std::string_view narrow = " !'(),-./:;I[]fijlrt|";
    constexpr std::string_view wide = "%&@MWmw";
    const auto isAmong = [&](std::string_view set) { return set.find(character) != std::string_view::npos; };
    return isAmong(narrow) ? 0.4 : isAmong(wide) ? 0.97 : 0.64;
}

/// Take from the start of a text what fits in a line.
std::string takeLine(std::string_view& text, double width) {
    double used = 0;
    std::size_t fits = 0;
    std::size_t blank = std::string_view::npos;
    while (fits < text.size()) {
        const std::string_view character = firstOf(text.substr(fits));
        used += widthOfCharacter(character);
        if (used > width && fits > 0) {
            break;
        }
        if (character == " ") {
            blank = fits;
        }
        fits += character.size();
    }
    const std::size_t end = fits < text.size() && blank != std::string_view::npos ? blank : fits;
    std::string line(text.substr(0, end));
    text.remove_prefix(end < text.size() && text[end] == ' ' ? end + 1 : end);
    return line;
}

}  // namespace

std::string mendedText(const std::string& text) {
    std::string mended = validText(text);
    for (char& c : mended) {
        if (static_cast<unsigned char>(c) < ' ' || c == '\x7f') {
            c = ' ';
        }
    }
    return mended;
}

double widthOf(const std::string& text) {
    double width = 0;
    for (std::string_view rest = text; !rest.empty();) {
        const std::string_view character = firstOf(rest);
        width += widthOfCharacter(character);
        rest.remove_prefix(character.size());
    }
    return width;
}

std::vector<std::string> wrapped(const std::string& text, double width) {
    std::vector<std::string> lines;
    for (std::string_view rest = text; !rest.empty();) {
        lines.push_back(takeLine(rest, width));
    }
    return lines;
}

std::string scriptText(const std::string& text) {
    std::string result = "\"";
    for (const char c : text) {
        constexpr std::string_view special = "\"'\\`$@";
        result += special.find(c) == std::string_view::npos ? std::string(1, c)
                                                            : fmt::format("\\{:03o}", static_cast<int>(c));
    }
    return result + '"';
}

}  // namespace quarzel::tool
