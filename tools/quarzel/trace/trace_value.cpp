// SPDX-License-Identifier: MIT
#include "trace/trace_value.hpp"

#include <charconv>

namespace quarzel::tool {

namespace {

/// The digits of a Verilog literal such as 12'hxxx; the text itself when it is none.
std::string_view digitsOf(std::string_view text) {
    const std::size_t quote = text.find('\'');
    if (quote == std::string_view::npos ||
        text.substr(0, quote).find_first_not_of("0123456789") != std::string_view::npos) {
        return text;
    }
    text.remove_prefix(quote + 1);
    for (const std::string_view letters : {"sS", "bBoOdDhH"}) {
        if (!text.empty() && letters.find(text.front()) != std::string_view::npos) {
            text.remove_prefix(1);
        }
    }
    return text;
}

/// A number some of whose digits a simulation does not know. "0x1f" is none: there x is not a digit.
std::optional<TraceValue> unknownValue(std::string_view text) {
    const std::string_view digits = digitsOf(text);
    const bool isBinary = digits.find_first_not_of("01xXzZ_") == std::string_view::npos;
    const bool isHexadecimal =
        digits.find_first_not_of("0123456789abcdefABCDEFxXzZ_") == std::string_view::npos &&
        !digits.starts_with("0x");
    if (!isBinary && !isHexadecimal) {
        return std::nullopt;
    }
    if (digits.find_first_of("xX") != std::string_view::npos) {
        return TraceValue::unknown();
    }
    return digits.find_first_of("zZ") != std::string_view::npos ? std::optional(TraceValue::highImpedance())
                                                                : std::nullopt;
}

}  // namespace

std::optional<TraceValue> TraceValue::ofNumber(double number, TraceUnits units) {
    const double raw = units == TraceUnits::real ? number * 8 : number;
    // What is not a number fails the first comparison.
    if (!(raw >= lowest && raw <= highest) || raw != static_cast<int>(raw)) {
        return std::nullopt;
    }
    return ofRaw(static_cast<int>(raw));
}

std::optional<TraceValue> TraceValue::read(std::string_view text, TraceUnits units) {
    std::string_view number = text;
    if (number.starts_with('+') && !number.starts_with("+-")) {
        number.remove_prefix(1);
    }
    double value = 0;
    const auto [end, error] = std::from_chars(number.data(), number.data() + number.size(), value);
    if (error == std::errc() && end == number.data() + number.size()) {
        return ofNumber(value, units);
    }
    return unknownValue(text);
}

std::string TraceValue::text() const {
    if (isNumber()) {
        return std::to_string(itsCode);
    }
    return itsCode == unknownCode ? "x" : itsCode == highImpedanceCode ? "z" : "-";
}

std::string_view expectedValue(TraceUnits units) {
    return units == TraceUnits::real ? "a multiple of 0.125 from -256 to 255.875, x or z"
                                     : "a whole number from -2048 to 2047, x or z";
}

}  // namespace quarzel::tool
