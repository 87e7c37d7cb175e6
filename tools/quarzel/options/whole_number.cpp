// SPDX-License-Identifier: MIT
#include "options/whole_number.hpp"

#include <fmt/format.h>

#include <charconv>
#include <utility>

namespace quarzel::tool {

std::optional<std::uint64_t> readWholeNumber(std::string_view text) {
    std::uint64_t number = 0;
    const char* const end = text.data() + text.size();
    const auto [stop, error] = std::from_chars(text.data(), end, number);
    return error == std::errc() && stop == end ? std::optional(number) : std::nullopt;
}

CLI::Validator wholeNumber(std::function<bool(std::uint64_t)> isWanted, std::string wanted) {
    const auto check = [isWanted = std::move(isWanted), wanted = std::move(wanted)](std::string& text) {
        const std::optional<std::uint64_t> number = readWholeNumber(text);
        if (!number || !isWanted(*number)) {
            return fmt::format("'{}' is not {}", text, wanted);
        }
        text = std::to_string(*number);  // without leading zeros
        return std::string();
    };
    return {check, ""};
}

}  // namespace quarzel::tool
