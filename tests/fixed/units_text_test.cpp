// SPDX-License-Identifier: MIT
#include "fixed/units_text.hpp"

#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <limits>
#include <locale>
#include <string>

namespace quarzel::test {
namespace {

constexpr double infinity = std::numeric_limits<double>::infinity();
constexpr double notANumber = std::numeric_limits<double>::quiet_NaN();

/// While it lives, the global locale writes numbers as in "1.234,5".
class CommaLocale {
  public:
    CommaLocale() : itsPrevious(std::locale::global(std::locale(std::locale::classic(), new Comma))) {}
    ~CommaLocale() { std::locale::global(itsPrevious); }
    CommaLocale(const CommaLocale&) = delete;
    CommaLocale& operator=(const CommaLocale&) = delete;

  private:
    struct Comma : std::numpunct<char> {
        char do_decimal_point() const override { return ','; }
        char do_thousands_sep() const override { return '.'; }
        std::string do_grouping() const override { return "\3"; }
    };

    std::locale itsPrevious;
};

TEST(SiText, ScalesByThePrefixAndKeepsThePrecision) {
    EXPECT_EQ(toSIString(1500.0, 2), "1.50 k");
    EXPECT_EQ(toSIString(-0.002, 1), "-2.0 m");
    EXPECT_EQ(toSIString(1.0, 3), "1.000 ");
    EXPECT_EQ(toSIString(2.25e6, 1), "2.2 M");
    EXPECT_EQ(toSIString(123456.0, 0), "123 k");
    EXPECT_EQ(toSIString(3.0e-6, 1), "3.0 u");
    EXPECT_EQ(toSIString(2.0e-14, 2), "0.02 p");
}

TEST(SiText, WritesZeroWithoutPrefix) {
    EXPECT_EQ(toSIString(0.0, 3), "0.000 ");
    EXPECT_EQ(toSIString(0U, 0), "0 ");
}

TEST(SiText, KeepsTheSignOfANegativeZero) {
    EXPECT_EQ(toSIString(-0.0, 3), "-0.000 ");
    EXPECT_EQ(toSIString(-0.0L, 0), "-0 ");
}

struct Limit {
    double value;
    const char* below;  ///< just below it
    const char* at;
    const char* above;  ///< just above it
};

/// All texts with a precision of 4.
constexpr Limit limits[] = {
    {5e14, "500.0000 T", "500.0000 T", "0.5000 P"},    //
    {5e11, "500.0000 G", "500.0000 G", "0.5000 T"},    //
    {5e8, "500.0000 M", "500.0000 M", "0.5000 G"},     //
    {5e5, "500.0000 k", "500.0000 k", "0.5000 M"},     //
    {500, "500.0000 ", "500.0000 ", "0.5000 k"},       //
    {0.5, "500.0000 m", "500.0000 m", "0.5000 "},      //
    {0.0005, "500.0000 u", "500.0000 u", "0.5000 m"},  //
    {5e-10, "0.5000 n", "0.5000 n", "0.0005 u"},       //
    {5e-13, "0.5000 p", "0.5000 p", "0.0005 n"},       //
    {1e-15, "0.0000 ", "0.0010 p", "0.0010 p"},        //
};

TEST(SiText, ChangesThePrefixExactlyAtItsLimits) {
    for (const Limit& limit : limits) {
        EXPECT_EQ(toSIString(std::nextafter(limit.value, 0.0), 4), limit.below);
        EXPECT_EQ(toSIString(limit.value, 4), limit.at);
        EXPECT_EQ(toSIString(std::nextafter(limit.value, infinity), 4), limit.above);
    }
}

TEST(SiText, ChangesThePrefixOfALongDoubleAtTheSameLimits) {
    for (const Limit& limit : limits) {
        const long double value = limit.value;
        EXPECT_EQ(toSIString(std::nextafter(value, 0.0L), 4), limit.below);
        EXPECT_EQ(toSIString(value, 4), limit.at);
        EXPECT_EQ(toSIString(std::nextafter(value, static_cast<long double>(infinity)), 4), limit.above);
    }
}

TEST(SiText, ChoosesThePrefixOfANegativeNumberByItsMagnitude) {
    for (const Limit& limit : limits) {
        const std::string sign = "-";
        EXPECT_EQ(toSIString(-std::nextafter(limit.value, 0.0), 4), sign + limit.below);
        EXPECT_EQ(toSIString(-limit.value, 4), sign + limit.at);
        EXPECT_EQ(toSIString(-std::nextafter(limit.value, infinity), 4), sign + limit.above);
    }
}

TEST(SiText, WritesIntegers) {
    EXPECT_EQ(toSIString(std::uint32_t{500}, 0), "500 ");
    EXPECT_EQ(toSIString(std::uint32_t{501}, 3), "0.501 k");
    EXPECT_EQ(toSIString(std::numeric_limits<std::uint32_t>::max(), 9), "4.294967295 G");
    EXPECT_EQ(toSIString(std::numeric_limits<std::uint64_t>::max(), 3), "18446.744 P");
}

TEST(SiText, WritesIntegersOfEveryType) {
    EXPECT_EQ(toSIString(1500, 2), "1.50 k");
    EXPECT_EQ(toSIString(0, 0), "0 ");
    EXPECT_EQ(toSIString(short{-501}, 3), "-0.501 k");
    EXPECT_EQ(toSIString(std::numeric_limits<int>::min(), 9), "-2.147483648 G");
    EXPECT_EQ(toSIString(-500L, 0), "-500 ");
    EXPECT_EQ(toSIString(501UL, 3), "0.501 k");
    EXPECT_EQ(toSIString(-1500LL, 1), "-1.5 k");
    EXPECT_EQ(toSIString(std::numeric_limits<unsigned long long>::max(), 3), "18446.744 P");
}

TEST(SiText, KeepsAllDigitsOfA64BitInteger) {
    EXPECT_EQ(toSIString(std::uint64_t{9007199254740993}, 15), "9.007199254740993 P");
    EXPECT_EQ(toSIString(9007199254740993ULL, 15), "9.007199254740993 P");
    EXPECT_EQ(toSIString(-9007199254740993LL, 15), "-9.007199254740993 P");
}

TEST(SiText, WritesInfinityAndWhatIsNoNumber) {
    EXPECT_EQ(toSIString(infinity, 3), "inf P");
    EXPECT_EQ(toSIString(-infinity, 3), "-inf P");
    EXPECT_EQ(toSIString(notANumber, 3), "nan p");
    EXPECT_EQ(toSIString(-notANumber, 3), "nan p");
}

TEST(SiText, WritesTheLargestAndTheSmallestNumbers) {
    const std::string largest = toSIString(std::numeric_limits<double>::max(), 0);
    EXPECT_EQ(largest.substr(0, 15), "179769313486231");
    EXPECT_EQ(largest.size(), 309 - 15 + 2);
    EXPECT_EQ(largest.substr(largest.size() - 2), " P");
    EXPECT_EQ(toSIString(std::numeric_limits<double>::denorm_min(), 3), "0.000 ");
    const std::string longest = toSIString(-std::numeric_limits<long double>::max(), 2);
    EXPECT_EQ(longest[0], '-');
    EXPECT_EQ(longest.substr(longest.size() - 2), " P");
}

TEST(SiText, WritesNoMoreDecimalsThanTheSmallestNumberHas) {
    // The smallest number is a power of two, 2^-16445 where a long double has 80 bits: as many decimals.
    using Limits = std::numeric_limits<long double>;
    constexpr std::size_t decimals = Limits::digits - Limits::min_exponent;
    const std::string smallest = toSIString(std::numeric_limits<long double>::denorm_min(), decimals);
    EXPECT_EQ(smallest.size(), 2 + decimals + 1);
    EXPECT_EQ(smallest.substr(smallest.size() - 2), "5 ");
    EXPECT_EQ(toSIString(2.0, decimals), "2." + std::string(decimals, '0') + " ");
    EXPECT_EQ(toSIString(2.0, decimals - 1), "2." + std::string(decimals - 1, '0') + " ");
    for (const unsigned precision :
         {static_cast<unsigned>(decimals) + 1, 0x7FFFFFFFU, 0x80000000U, 0xFFFFFFFFU}) {
        EXPECT_EQ(toSIString(2.0, precision), toSIString(2.0, decimals)) << precision;
    }
}

TEST(SiText, DoesNotDependOnTheGlobalLocale) {
    const CommaLocale comma;
    EXPECT_EQ(toSIString(1500.0, 2), "1.50 k");
    EXPECT_EQ(toSIString(std::numeric_limits<std::uint64_t>::max(), 3), "18446.744 P");
}

TEST(TimeText, ChoosesTheUnitAtItsLimits) {
    EXPECT_EQ(timeToString(0U), "0s");
    EXPECT_EQ(timeToString(1U), "1s");
    EXPECT_EQ(timeToString(59U), "59s");
    EXPECT_EQ(timeToString(60U), "1min");
    EXPECT_EQ(timeToString(61U), "1.01667min");
    EXPECT_EQ(timeToString(90U), "1.5min");
    EXPECT_EQ(timeToString(3599U), "59.9833min");
    EXPECT_EQ(timeToString(3600U), "1hr");
    EXPECT_EQ(timeToString(3601U), "1.00028hr");
    EXPECT_EQ(timeToString(86400U), "24hr");
    EXPECT_EQ(timeToString(259199U), "71.9997hr");
    EXPECT_EQ(timeToString(259200U), "1days");
    EXPECT_EQ(timeToString(259201U), "1days");
    EXPECT_EQ(timeToString(604800U), "2.33333days");
    EXPECT_EQ(timeToString(0xFFFFFFFFU), "16570.1days");
}

TEST(TimeText, TruncatesANumberTowardZero) {
    EXPECT_EQ(timeToString(59.999), "59s");
    EXPECT_EQ(timeToString(60.0), "1min");
    EXPECT_EQ(timeToString(0.999), "0s");
    EXPECT_EQ(timeToString(-0.999), "0s");
}

TEST(TimeText, KeepsTheLow32BitsOfANumber) {
    EXPECT_EQ(timeToString(4294967295.0), "16570.1days");
    EXPECT_EQ(timeToString(4294967296.0), "0s");
    EXPECT_EQ(timeToString(4294967355.5), "59s");
    EXPECT_EQ(timeToString(-1.0), "16570.1days");
    EXPECT_EQ(timeToString(-4294967295.0), "1s");
    EXPECT_EQ(timeToString(std::nextafter(0x1p63, 0.0)), "16570.1days");
    EXPECT_EQ(timeToString(std::nextafter(-0x1p63, 0.0)), "17.0667min");
}

TEST(TimeText, TakesWhatDoesNotFitInto64BitsAs0) {
    for (const double seconds : {0x1p63, -0x1p63, 1e300, -1e300, infinity, -infinity, notANumber}) {
        EXPECT_EQ(timeToString(seconds), "0s") << seconds;
    }
}

TEST(TimeText, KeepsTheLow32BitsOfAWiderInteger) {
    EXPECT_EQ(timeToString(59L), "59s");
    EXPECT_EQ(timeToString(4294967296L + 60), "1min");
    EXPECT_EQ(timeToString(-4294967295L), "1s");
    EXPECT_EQ(timeToString(-1L), "16570.1days");
    EXPECT_EQ(timeToString(-9223372036854775807L - 1), "0s");
}

TEST(TimeText, KeepsTheLow32BitsOfAnIntegerOfAnyType) {
    EXPECT_EQ(timeToString(90), "1.5min");
    EXPECT_EQ(timeToString(-1), "16570.1days");
    EXPECT_EQ(timeToString(4294967295UL), "16570.1days");
    EXPECT_EQ(timeToString(4294967296ULL + 60), "1min");
    EXPECT_EQ(timeToString(std::numeric_limits<unsigned long long>::max()), "16570.1days");
    EXPECT_EQ(timeToString(-4294967295LL), "1s");
}

TEST(TimeText, DoesNotDependOnTheGlobalLocale) {
    const CommaLocale comma;
    EXPECT_EQ(timeToString(61U), "1.01667min");
    EXPECT_EQ(timeToString(0xFFFFFFFFU), "16570.1days");
}

TEST(TimeFromText, MultipliesByTheUnit) {
    EXPECT_EQ(stringToTime("2 d"), 518400U);
    EXPECT_EQ(stringToTime("1.5m"), 90U);
    EXPECT_EQ(stringToTime("3h"), 10800U);
    EXPECT_EQ(stringToTime("12s"), 12U);
    EXPECT_EQ(stringToTime("12"), 12U);
}

TEST(TimeFromText, LooksAtOneCharacterOfTheUnitInEitherCase) {
    EXPECT_EQ(stringToTime("2M"), 120U);
    EXPECT_EQ(stringToTime("2H"), 7200U);
    EXPECT_EQ(stringToTime("1D"), 259200U);
    EXPECT_EQ(stringToTime("2 minutes"), 120U);
    EXPECT_EQ(stringToTime("2 hm"), 7200U);
    EXPECT_EQ(stringToTime("2 weeks"), 2U);
    EXPECT_EQ(stringToTime("2,5m"), 2U);
    EXPECT_EQ(stringToTime("2\xE4m"), 2U);
    EXPECT_EQ(stringToTime(std::string("2\0m", 3)), 2U);
}

TEST(TimeFromText, SkipsWhiteSpaceBeforeNumberAndUnit) {
    EXPECT_EQ(stringToTime(" \t\n2 \r\n\v\f m"), 120U);
    EXPECT_EQ(stringToTime(" 7 "), 7U);
}

TEST(TimeFromText, TakesNumbersWithSignFractionAndExponent) {
    EXPECT_EQ(stringToTime("+3m"), 180U);
    EXPECT_EQ(stringToTime(".5m"), 30U);
    EXPECT_EQ(stringToTime("1e3"), 1000U);
    EXPECT_EQ(stringToTime("2.5e1h"), 90000U);
    EXPECT_EQ(stringToTime(std::string(100000, '0') + "2m"), 120U);
}

TEST(TimeFromText, TruncatesTheSecondsTowardZero) {
    EXPECT_EQ(stringToTime("2.999"), 2U);
    EXPECT_EQ(stringToTime("0.999m"), 59U);
    EXPECT_EQ(stringToTime("-0.999"), 0U);
}

TEST(TimeFromText, KeepsTheLow32BitsOfTheSeconds) {
    EXPECT_EQ(stringToTime("4294967295"), 4294967295U);
    EXPECT_EQ(stringToTime("4294967297"), 1U);
    EXPECT_EQ(stringToTime("-1"), 4294967295U);
    EXPECT_EQ(stringToTime("-1m"), 4294967236U);
    EXPECT_EQ(stringToTime("100000d"), 150196224U);
}

TEST(TimeFromText, GivesZeroForWhatDoesNotFitInto64Bits) {
    for (const std::string text :
         {"9223372036854775808", "-9223372036854775808", "1e300", "-1e300d", "1e308d", "1e999", "-1e999m"}) {
        EXPECT_EQ(stringToTime(text), 0U) << text;
    }
    EXPECT_EQ(stringToTime(std::string(100000, '9')), 0U);
}

TEST(TimeFromText, GivesZeroForATextThatBeginsWithNoNumber) {
    for (const std::string text : {"", " ", "m", "d", "abc", "-", ".", "nan", "inf", "infd", "\xFF"}) {
        EXPECT_EQ(stringToTime(text), 0U) << text;
    }
}

TEST(TimeFromText, ReadsBackWhatStandsForWholeUnits) {
    for (std::uint32_t count = 1; count < 60; ++count) {
        for (const std::uint32_t unit : {1U, 60U, 3600U, 259200U}) {
            EXPECT_EQ(stringToTime(timeToString(count * unit)), count * unit);
        }
    }
}

TEST(TimeFromText, DoesNotDependOnTheGlobalLocale) {
    const CommaLocale comma;
    EXPECT_EQ(stringToTime("1.5m"), 90U);
    EXPECT_EQ(stringToTime("1,5m"), 1U);
    EXPECT_EQ(stringToTime("1.234"), 1U);
}

}  // namespace
}  // namespace quarzel::test
