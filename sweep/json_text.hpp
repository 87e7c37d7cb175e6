// SPDX-License-Identifier: MIT
#pragma once

#include <concepts>
#include <cstdint>
#include <limits>
#include <nlohmann/json.hpp>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace quarzel::sweep {

/// Read JSON that somebody else may have written.
/// @return a discarded value when it is not well-formed or nested so deep that to work on it could exhaust
/// the
///         stack
nlohmann::ordered_json parseJson(std::string_view text);

/// A whole number that JSON holds.
/// @throws std::invalid_argument when it is anything else or does not fit
template <std::integral Value>
Value wholeNumber(const nlohmann::ordered_json& json) {
    if (json.is_number_unsigned()
            ? std::in_range<Value>(json.get<std::uint64_t>())
            : json.is_number_integer() && std::in_range<Value>(json.get<std::int64_t>())) {
        return json.get<Value>();
    }
    using Limits = std::numeric_limits<Value>;
    throw std::invalid_argument(json.dump() + " is not a whole number from " + std::to_string(Limits::min()) +
                                " to " + std::to_string(Limits::max()));
}

/// The whole numbers of an array.
template <std::integral Value>
std::vector<Value> wholeNumbers(const nlohmann::ordered_json& json) {
    std::vector<Value> numbers;
    for (const nlohmann::ordered_json& number : json) {
        numbers.push_back(wholeNumber<Value>(number));
    }
    return numbers;
}

}  // namespace quarzel::sweep
