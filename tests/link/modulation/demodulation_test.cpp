// SPDX-License-Identifier: MIT
#include "link/modulation/demodulation.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <limits>
#include <stdexcept>

#include "link/coding/coding_setup.hpp"
#include "link/coding/transport_block.hpp"
#include "link/modulation/standard_modulation.hpp"
#include "support/random.hpp"

namespace {

using namespace quarzel::link;
using quarzel::test::randomBits;
using quarzel::test::standard::bitsOf;
using quarzel::test::standard::Symbol;
using quarzel::test::standard::symbolOf;
using testing::ThrowsMessage;

constexpr std::array schemes = {Modulation::bpsk, Modulation::qpsk, Modulation::qam16, Modulation::qam64,
                                Modulation::qam256};

/// A ratio as it is defined: over all symbols of the constellation.
double expectedRatio(Symbol received, unsigned Qm, std::size_t bit, double variance, Demapping demapping) {
    std::array<long double, 2> sums{};
    std::array<double, 2> nearest;
    nearest.fill(std::numeric_limits<double>::infinity());
    for (unsigned number = 0; number < 1U << Qm; ++number) {
        const auto bits = bitsOf(number, Qm);
        const double distance = std::norm(received - symbolOf(bits)) / variance;
        sums[bits[bit]] += std::exp(-static_cast<long double>(distance));
        nearest[bits[bit]] = std::min(nearest[bits[bit]], distance);
    }
    return demapping == Demapping::exact ? static_cast<double>(std::log(sums[1] / sums[0]))
                                         : nearest[0] - nearest[1];
}

std::vector<Symbol> randomSymbols(std::mt19937& random, std::size_t size) {
    std::uniform_real_distribution<double> component(-2, 2);
    std::vector<Symbol> symbols;
    for (std::size_t i = 0; i < size; ++i) {
        const double real = component(random);
        symbols.emplace_back(real, component(random));
    }
    return symbols;
}

TEST(Demodulation, GivesTheRatiosOfTheirDefinition) {
    std::mt19937 random = quarzel::test::seededRandom();
    for (const Modulation scheme : schemes) {
        const unsigned Qm = bitsOfSymbol(scheme);
        const std::vector<Symbol> symbols = randomSymbols(random, 100);
        for (const double variance : {0.01, 0.3, 1.0, 20.0}) {
            for (const Demapping demapping : {Demapping::exact, Demapping::maxLog}) {
                std::vector<double> ratios(Qm * symbols.size());
                demodulate(symbols, scheme, std::vector{variance}, ratios, demapping);
                for (std::size_t i = 0; i < ratios.size(); ++i) {
                    const double expected = expectedRatio(symbols[i / Qm], Qm, i % Qm, variance, demapping);
                    ASSERT_NEAR(ratios[i], expected, 1e-10 * (1 + std::abs(expected)))
                        << Qm << " bits, variance " << variance << ", ratio " << i;
                }
            }
        }
    }
}

TEST(Demodulation, GivesTheBitsBackWithoutNoiseHoweverSmallTheVariance) {
    std::mt19937 random = quarzel::test::seededRandom();
    for (const Modulation scheme : schemes) {
        const auto bits = randomBits(random, bitsOfSymbol(scheme) * 1000);
        std::vector<Symbol> symbols(1000);
        modulate(bits, scheme, symbols);
        for (const double variance : {1e-200, 0.01}) {
            for (const Demapping demapping : {Demapping::exact, Demapping::maxLog}) {
                std::vector<double> ratios(bits.size());
                demodulate(symbols, scheme, std::vector{variance}, ratios, demapping);
                for (std::size_t i = 0; i < bits.size(); ++i) {
                    ASSERT_TRUE(std::isfinite(ratios[i]));
                    ASSERT_EQ(ratios[i] > 0, bits[i] == 1);
                }
            }
        }
    }
}

TEST(Demodulation, TakesAVarianceForEachSymbol) {
    std::mt19937 random = quarzel::test::seededRandom();
    const std::vector<double> variances = {0.1, 1, 0.02, 5};
    const std::vector<Symbol> symbols = randomSymbols(random, variances.size());
    for (const Modulation scheme : schemes) {
        const std::size_t Qm = bitsOfSymbol(scheme);
        std::vector<double> ratios(Qm * symbols.size());
        demodulate(symbols, scheme, variances, ratios);
        for (std::size_t n = 0; n < symbols.size(); ++n) {
            std::vector<double> alone(Qm);
            demodulate(std::span(symbols).subspan(n, 1), scheme, std::vector{variances[n]}, alone);
            EXPECT_EQ(alone, std::vector<double>(ratios.begin() + static_cast<std::ptrdiff_t>(n * Qm),
                                                 ratios.begin() + static_cast<std::ptrdiff_t>((n + 1) * Qm)));
        }
    }
}

// Far above the signal to noise ratio that a rate of 1/2 needs.
TEST(Demodulation, LetsACoreDecodeATransportBlock) {
    std::mt19937 random = quarzel::test::seededRandom();
    std::normal_distribution<double> noise;
    constexpr double unitsOfRatio = 2;
    for (const Modulation scheme : schemes) {
        const auto bits = randomBits(random, 10000);
        const Transmission transmission{20400, bitsOfSymbol(scheme)};
        std::vector<Symbol> symbols(transmission.G / transmission.Qm);
        modulate(encodeTransportBlock(bits, transmission), scheme, symbols);
        const double variance = 0.4 / std::pow(1.8, bitsOfSymbol(scheme));
        for (Symbol& symbol : symbols) {
            symbol += std::sqrt(variance / 2) * Symbol(noise(random), noise(random));
        }
        for (const Demapping demapping : {Demapping::exact, Demapping::maxLog}) {
            std::vector<double> ratios(transmission.G);
            demodulate(symbols, scheme, std::vector{variance}, ratios, demapping);
            std::vector<std::int16_t> soft;
            for (const double ratio : ratios) {
                soft.push_back(static_cast<std::int16_t>(std::clamp(unitsOfRatio * ratio, -128.0, 127.0)));
            }
            quarzel::Core core;
            SoftBuffers buffers;
            const auto decisions = decodeTransportBlock(soft, bits.size(), transmission, core, 8, buffers);
            EXPECT_TRUE(decisions.ok) << bitsOfSymbol(scheme);
            EXPECT_EQ(decisions.bits, bits);
        }
    }
}

TEST(Demodulation, NamesWhatFits) {
    const std::vector<Symbol> symbols(3);
    std::vector<double> ratios(12);
    const auto expect = [](auto call, const char* message) {
        EXPECT_THAT(call, ThrowsMessage<std::invalid_argument>(message));
    };
    expect([&] { demodulate(symbols, Modulation::qam64, std::vector{1.0}, ratios); },
           "there must be 18 ratios, not 12");
    expect(
        [&] {
            demodulate(symbols, Modulation::qam16, std::vector{1.0, 1.0}, ratios);
        },
        "there must be 3 noise variances, or 1, not 2");
    expect([&] { demodulate(symbols, Modulation::qam16, std::vector{0.0}, ratios); },
           "a noise variance must be above 0, not 0.000000");
    expect([&] { demodulate(symbols, Modulation::qam16, std::vector{std::nan("")}, ratios); },
           "a noise variance must be above 0, not nan");
}

}  // namespace
