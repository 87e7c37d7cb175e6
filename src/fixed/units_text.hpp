// SPDX-License-Identifier: MIT
#pragma once

#include <concepts>
#include <cstdint>
#include <string>

#pragma GCC visibility push(default)  // the shared library offers these functions

/// Numbers and durations as text with a unit. No locale is asked: the decimal point is a point and digits are
/// never grouped. `toSIString` and `timeToString` take integers of any type, by the templates at the end.

/// A number with an SI prefix: 1500 with precision 2 is "1.50 k".
///
/// The magnitude chooses the prefix, each limit belonging to the range below it:
///
///   above 5e14   " P"      above 500     " k"      above 5e-10       " u"
///   above 5e11   " T"      above 0.5     " "       above 5e-13       " n"
///   above 5e8    " G"      above 0.0005  " m"      from 1e-15 on     " p"
///   above 5e5    " M"                              below, and zero   " "
///
/// The last range is written unscaled. The limits are those of type double. Infinity is "inf P" and what is
/// no number "nan p".
///
/// @param value      the number; a "-" stands before the text of a negative one, -0.0 included
/// @param precision  digits after the point. Above 16445, the decimals that the smallest long double has, it
///                   counts as that
std::string toSIString(long double value, unsigned precision);
std::string toSIString(double value, unsigned precision);
std::string toSIString(std::uint64_t value, unsigned precision);
std::string toSIString(std::uint32_t value, unsigned precision);

/// A duration in the unit that suits it, with at most six significant digits: 5400 is "1.5hr".
///
///   below 60        "s"
///   below 3600      "min"
///   below 259200    "hr"
///   from there on   "days", of 259200 seconds each, as for `stringToTime`
///
/// @param seconds  whole seconds
std::string timeToString(std::uint32_t seconds);

/// The same for a number, truncated toward zero and kept to its low 32 bits. What does not fit into 64 bits,
/// and what is not a number, counts as 0.
std::string timeToString(double seconds);

/// The same for a wider integer, kept to its low 32 bits.
std::string timeToString(long seconds);

/// A duration in seconds from its text: "1.5m" is 90.
///
/// @param text  a decimal number, and the first character of its unit in either case: "m" for minutes, "h"
///              for hours, "d" for days of 259200 seconds. With any other character, or none, the number is
///              seconds. White space may stand before each, and what follows is ignored
/// @return      the seconds, truncated toward zero and kept to their low 32 bits. 0 when they do not fit into
///              64 bits or the text begins with no number
std::uint32_t stringToTime(const std::string& text);

#pragma GCC visibility pop

/// A number with an SI prefix, from an integer of any other type.
template <std::integral Integer>
std::string toSIString(Integer value, unsigned precision) {
    return toSIString(static_cast<long double>(value), precision);
}

/// A duration from an integer of any other type, kept to its low 32 bits.
template <std::integral Integer>
std::string timeToString(Integer seconds) {
    return timeToString(static_cast<std::uint32_t>(seconds));
}
