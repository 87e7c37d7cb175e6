// SPDX-License-Identifier: MIT
#include "options/whole_number.hpp"

#include <fmt/format.h>
#include <CLI/CLI.hpp>

#include <algorithm>
#include <charconv>
#include <utility>

namespace quarzel::tool {

std::optional<std::uint64_t> readWholeNumber(std::string_view text) {
    std::uint64_t number = 0;
    const char* const end = text.data() + text.size();
    const auto [stop, error] = std::from_chars(text.data(), end, number);
    return error == std::errc() && stop == end ? std::optional(number) : std::nullopt;
}

namespace {

/// A whole number that may be written with a power of ten.
std::optional<std::uint64_t> readWithPower(std::string_view text) {
    const std::size_t e = text.find_first_of("eE");
    if (e == std::string_view::npos) {
        return readWholeNumber(text);
    }
    std::string digits(text.substr(0, e));
    const std::size_t point = std::min(digits.find('.'), digits.size());
    digits.erase(point, 1);
    const std::size_t fraction = digits.size() - point;
    const std::optional<std::uint64_t> exponent = readWholeNumber(text.substr(e + 1));
    constexpr std::uint64_t highestExponent = 19;
    if (point == 0 || !exponent || *exponent > highestExponent || *exponent < fraction) {
        return std::nullopt;
    }
    return readWholeNumber(digits.append(*exponent - fraction, '0'));
}

}  // namespace

CLI::Validator wholeNumber(std::function<bool(std::uint64_t)> isWanted, std::string wanted) {
    const auto check = [isWanted = std::move(isWanted), wanted = std::move(wanted)](std::string& text) {
        const std::optional<std::uint64_t> number = readWithPower(text);
        if (!number || !isWanted(*number)) {
            return fmt::format("'{}' is not {}", text, wanted);
        }
        text = std::to_string(*number);  // without leading zeros and powers
        return std::string();
    };
    return {check, ""};
}

}  // namespace quarzel::tool
