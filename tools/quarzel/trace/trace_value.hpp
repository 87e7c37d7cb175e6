// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace quarzel::tool {

/// How a trace says a number: as the integer of 12 bits, or as the real number that it stands for.
enum class TraceUnits { raw, real };

/// A value of a trace: a number of 12 bits in units of 1/8, an unknown value of a simulation, or none.
class TraceValue {
  public:
    static constexpr int lowest = -2048;
    static constexpr int highest = 2047;

    /// None: the trace does not tell it.
    constexpr TraceValue() = default;

    /// @param raw  in units of 1/8, from `lowest` to `highest`
    static constexpr TraceValue ofRaw(int raw) { return TraceValue(static_cast<std::int16_t>(raw)); }
    static constexpr TraceValue unknown() { return TraceValue(unknownCode); }
    static constexpr TraceValue highImpedance() { return TraceValue(highImpedanceCode); }

    /// Read a value. x and z may stand for any of the digits of a decimal, binary or hexadecimal number, with
    /// or without the base of a Verilog literal; such a number is unknown as a whole.
    /// @return none when the text is neither that nor a number of the format
    static std::optional<TraceValue> read(std::string_view text, TraceUnits units);

    /// The value of a number, where the format has it.
    static std::optional<TraceValue> ofNumber(double number, TraceUnits units);

    constexpr bool isThere() const { return itsCode != noneCode; }
    constexpr bool isNumber() const { return itsCode >= lowest; }
    constexpr int raw() const { return itsCode; }
    constexpr double real() const { return itsCode / 8.0; }

    /// The number in units of 1/8, "x", "z", or "-" for none.
    std::string text() const;

    constexpr bool operator==(const TraceValue&) const = default;

  private:
    static constexpr std::int16_t noneCode = INT16_MIN;
    static constexpr std::int16_t unknownCode = INT16_MIN + 1;
    static constexpr std::int16_t highImpedanceCode = INT16_MIN + 2;

    explicit constexpr TraceValue(std::int16_t code) : itsCode(code) {}

    std::int16_t itsCode = noneCode;
};

/// What a text of a value was expected to be, for error messages.
std::string_view expectedValue(TraceUnits units);

}  // namespace quarzel::tool
