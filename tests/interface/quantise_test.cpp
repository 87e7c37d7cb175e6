// SPDX-License-Identifier: MIT
// Soft values of real numbers.
#include "quarzel/quantise.hpp"

#include <gtest/gtest.h>

#include <cfenv>
#include <limits>
#include <random>
#include <vector>

#include "support/random.hpp"

namespace quarzel::test {
namespace {

constexpr double infinity = std::numeric_limits<double>::infinity();
constexpr double nan = std::numeric_limits<double>::quiet_NaN();

template <class Real>
std::vector<int> quantised(const std::vector<Real>& values, double scale = llrScale) {
    std::vector<std::int8_t> soft(values.size());
    quantise(values, soft, scale);
    return {soft.begin(), soft.end()};
}

/// What the function throws; empty when it throws nothing.
std::string refusalOf(const std::vector<double>& values, std::vector<std::int8_t>& soft, double scale) {
    try {
        quantise(values, soft, scale);
    } catch (const std::invalid_argument& error) {
        return error.what();
    }
    return "";
}

TEST(Quantise, MultipliesRoundsAndSaturates) {
    EXPECT_EQ(quantised<double>({-0.6, 0, 2.5, 1000, -1000}), (std::vector{-2, 0, 10, 127, -128}));
    EXPECT_EQ(quantised<double>({-0.6, 0, 2.5}, 8), (std::vector{-5, 0, 20}));
    EXPECT_EQ(quantised<double>({31.87, 31.88, -32.12, -32.13}), (std::vector{127, 127, -128, -128}));
    EXPECT_EQ(quantised<double>({infinity, -infinity, -0.0, 1e-320}), (std::vector{127, -128, 0, 0}));
    EXPECT_EQ(quantised<double>({1e300, -1e300}, 1e300), (std::vector{127, -128}));
}

TEST(Quantise, RoundsHalvesToTheEvenNumberAndNothingElse) {
    EXPECT_EQ(quantised<double>({0.5, 1.5, 2.5, -0.5, -1.5, -2.5, 126.5, -127.5}, 1),
              (std::vector{0, 2, 2, 0, -2, -2, 126, -128}));
    const double half = 0.5;
    EXPECT_EQ(quantised<double>({std::nextafter(half, 0), std::nextafter(half, 1)}, 1), (std::vector{0, 1}));
}

TEST(Quantise, IsTheSameWhateverRoundingTheProgramHasChosen) {
    std::mt19937 random = seededRandom();
    std::normal_distribution<double> distribution(0, 20);
    std::vector<double> values(10000);
    for (double& value : values) {
        value = distribution(random);
    }
    std::vector<int> expected;
    for (const double value : values) {
        expected.push_back(static_cast<int>(std::clamp(std::nearbyint(4 * value), -128.0, 127.0)));
    }
    for (const int rounding : {FE_TONEAREST, FE_UPWARD, FE_DOWNWARD, FE_TOWARDZERO}) {
        std::fesetround(rounding);
        const std::vector<int> soft = quantised(values);
        std::fesetround(FE_TONEAREST);
        EXPECT_EQ(soft, expected) << "rounding " << rounding;
    }
}

TEST(Quantise, TakesFloatsAsTheDoublesOfTheSameValue) {
    std::vector<float> floats;
    std::vector<double> doubles;
    for (int i = -400; i <= 400; ++i) {
        floats.push_back(static_cast<float>(i) * 0.0999F);
        doubles.push_back(floats.back());
    }
    EXPECT_EQ(quantised(floats, 3.3), quantised(doubles, 3.3));
    EXPECT_THROW(quantised<float>({1, std::numeric_limits<float>::quiet_NaN()}), std::invalid_argument);
}

TEST(Quantise, RefusesWhatHasNoSoftValueAndWritesNothing) {
    std::vector<std::int8_t> soft = {5, 6};
    const std::string scale = "the scale must be above 0 and finite";
    for (const double wrong : {0.0, -4.0, infinity, nan}) {
        EXPECT_EQ(refusalOf({1, 2}, soft, wrong), scale);
        const double value = 1;
        EXPECT_EQ(vardel_ip_quarzel_bitacc_quantise(&value, 1, wrong, soft.data()), 1);
    }
    EXPECT_EQ(refusalOf({1, nan}, soft, 4),
              "1 of 2 values are not a number (NaN); 0 says that a bit is unknown");
    EXPECT_EQ(refusalOf({1, 2, 3}, soft, 4), "there must be room for 3 soft values, not 2");
    EXPECT_EQ(soft, (std::vector<std::int8_t>{5, 6}));
}

TEST(Quantise, TakesNoValuesAtAll) {
    EXPECT_EQ(vardel_ip_quarzel_bitacc_quantise(nullptr, 0, 4, nullptr), 0);
    EXPECT_EQ(quantised<double>({}), std::vector<int>());
}

}  // namespace
}  // namespace quarzel::test
