// SPDX-License-Identifier: MIT
#include "fixed/units_text.hpp"

#include <algorithm>
#include <cmath>
#include <iomanip>
#include <limits>
#include <locale>
#include <sstream>

#include "fixed/string_utilities.hpp"

namespace {

constexpr double minute = 60;
constexpr double hour = 3600;
constexpr double day = 259200;

/// The decimals of the smallest long double. Every digit behind them is zero, for any number.
constexpr unsigned maxDecimals =
    std::numeric_limits<long double>::digits - std::numeric_limits<long double>::min_exponent;

std::string fixedText(long double value, unsigned precision) {
    std::ostringstream text;
    text.imbue(std::locale::classic());
    text << std::fixed << std::setprecision(static_cast<int>(std::min(precision, maxDecimals))) << value;
    return text.str();
}

struct Prefix {
    double limit;  ///< the prefix is for what is larger
    long double divisor;
    long double factor;
    const char* suffix;
};

constexpr Prefix prefixes[] = {
    {5e14, 1e15L, 1, " P"},  {5e11, 1e12L, 1, " T"}, {5e8, 1e9L, 1, " G"},
    {5e5, 1e6L, 1, " M"},    {500, 1e3L, 1, " k"},   {0.5, 1, 1, " "},
    {0.0005, 1, 1e3L, " m"}, {5e-10, 1, 1e6L, " u"}, {5e-13, 1, 1e9L, " n"},
};

std::string magnitudeText(long double magnitude, unsigned precision) {
    if (magnitude < 1e-15) {
        return fixedText(magnitude, precision) + " ";
    }
    for (const Prefix& prefix : prefixes) {
        if (magnitude > prefix.limit) {
            return fixedText(magnitude / prefix.divisor * prefix.factor, precision) + prefix.suffix;
        }
    }
    return fixedText(magnitude * 1e12L, precision) + " p";
}

std::string quotientText(std::uint32_t seconds, double unit) {
    std::ostringstream text;
    text.imbue(std::locale::classic());
    text << seconds / unit;
    return text.str();
}

/// Seconds truncated toward zero, modulo 2^32; 0 for what no 64-bit integer holds.
std::uint32_t wholeSeconds(double seconds) {
    if (!(std::fabs(seconds) < 0x1p63)) {
        return 0;
    }
    return static_cast<std::uint32_t>(static_cast<std::int64_t>(seconds));
}

}  // namespace

std::string toSIString(long double value, unsigned precision) {
    const bool negative = std::signbit(value) && !std::isnan(value);
    return (negative ? "-" : "") + magnitudeText(std::fabs(value), precision);
}

std::string toSIString(double value, unsigned precision) {
    return toSIString(static_cast<long double>(value), precision);
}

std::string toSIString(std::uint64_t value, unsigned precision) {
    return toSIString(static_cast<long double>(value), precision);
}

std::string toSIString(std::uint32_t value, unsigned precision) {
    return toSIString(static_cast<long double>(value), precision);
}

std::string timeToString(std::uint32_t seconds) {
    if (seconds < minute) {
        return std::to_string(seconds) + "s";
    }
    if (seconds < hour) {
        return quotientText(seconds, minute) + "min";
    }
    if (seconds < day) {
        return quotientText(seconds, hour) + "hr";
    }
    return quotientText(seconds, day) + "days";
}

std::string timeToString(double seconds) {
    return timeToString(wholeSeconds(seconds));
}

std::string timeToString(long seconds) {
    return timeToString(static_cast<std::uint32_t>(seconds));
}

std::uint32_t stringToTime(const std::string& text) {
    std::istringstream stream(text);
    stream.imbue(std::locale::classic());
    double number = 0;
    char unit = '\0';
    stream >> number >> unit;
    if (nocase_compare(unit, 'm')) {
        return wholeSeconds(number * minute);
    }
    if (nocase_compare(unit, 'h')) {
        return wholeSeconds(number * hour);
    }
    if (nocase_compare(unit, 'd')) {
        return wholeSeconds(number * day);
    }
    return wholeSeconds(number);
}
