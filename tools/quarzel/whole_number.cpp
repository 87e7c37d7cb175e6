// SPDX-License-Identifier: MIT
#include "whole_number.hpp"

#include <fmt/format.h>

#include <charconv>
#include <utility>

namespace quarzel::tool {

CLI::Validator wholeNumber(std::function<bool(std::uint64_t)> isWanted, std::string wanted) {
    const auto check = [isWanted = std::move(isWanted), wanted = std::move(wanted)](std::string& text) {
        std::uint64_t number = 0;
        const char* const end = text.data() + text.size();
        const auto [stop, error] = std::from_chars(text.data(), end, number);
        if (error != std::errc() || stop != end || !isWanted(number)) {
            return fmt::format("'{}' is not {}", text, wanted);
        }
        text = std::to_string(number);  // without leading zeros
        return std::string();
    };
    return {check, ""};
}

}  // namespace quarzel::tool
