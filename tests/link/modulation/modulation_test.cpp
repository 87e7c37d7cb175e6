// SPDX-License-Identifier: MIT
#include "link/modulation/modulation.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <stdexcept>

#include "link/modulation/standard_modulation.hpp"

namespace {

using namespace quarzel::link;
using quarzel::test::standard::bitsOf;
using quarzel::test::standard::Symbol;
using quarzel::test::standard::symbolOf;

constexpr std::array schemes = {Modulation::bpsk, Modulation::qpsk, Modulation::qam16, Modulation::qam64,
                                Modulation::qam256};

TEST(Modulation, HasTheSymbolsOfTheStandard) {
    for (const Modulation scheme : schemes) {
        double energy = 0;
        for (unsigned number = 0; number < 1U << bitsOfSymbol(scheme); ++number) {
            const auto bits = bitsOf(number, bitsOfSymbol(scheme));
            std::vector<Symbol> symbols(1);
            modulate(bits, scheme, symbols);
            EXPECT_NEAR(std::abs(symbols[0] - symbolOf(bits)), 0, 1e-15) << bits.size() << ": " << number;
            energy += std::norm(symbols[0]);
        }
        EXPECT_NEAR(energy / static_cast<double>(1U << bitsOfSymbol(scheme)), 1, 1e-14);
    }
}

// Rows of tables 7.1.3-1 and 7.1.4-1.
TEST(Modulation, HasTheRowsOfTheTables) {
    std::vector<Symbol> symbols(4);
    modulate(std::vector<std::uint8_t>{0, 0, 0, 0, 0, 0, 1, 1, 1, 0, 0, 1, 1, 1, 1, 0}, Modulation::qam16,
             symbols);
    const std::vector<Symbol> expected16 = {{1, 1}, {3, 3}, {-1, 3}, {-3, -1}};
    for (std::size_t i = 0; i < symbols.size(); ++i) {
        EXPECT_NEAR(std::abs(symbols[i] * std::sqrt(10.0) - expected16[i]), 0, 1e-14) << i;
    }
    modulate(
        std::vector<std::uint8_t>{0, 0, 0, 0, 0, 0, 0, 0, 0, 1, 1, 1, 0, 0, 1, 0, 0, 0, 1, 1, 1, 1, 1, 1},
        Modulation::qam64, symbols);
    const std::vector<Symbol> expected64 = {{3, 3}, {1, 7}, {5, 3}, {-7, -7}};
    for (std::size_t i = 0; i < symbols.size(); ++i) {
        EXPECT_NEAR(std::abs(symbols[i] * std::sqrt(42.0) - expected64[i]), 0, 1e-14) << i;
    }
}

TEST(Modulation, NamesTheBitsThatFit) {
    std::vector<Symbol> symbols(2);
    EXPECT_THAT([&] { modulate(std::vector<std::uint8_t>(11), Modulation::qam64, symbols); },
                testing::ThrowsMessage<std::invalid_argument>("there must be 12 bits, not 11"));
}

TEST(Modulation, HasANameForEachScheme) {
    EXPECT_EQ(modulationOf("bpsk"), Modulation::bpsk);
    EXPECT_EQ(modulationOf("qpsk"), Modulation::qpsk);
    EXPECT_EQ(modulationOf("16qam"), Modulation::qam16);
    EXPECT_EQ(modulationOf("64qam"), Modulation::qam64);
    EXPECT_EQ(modulationOf("256qam"), Modulation::qam256);
    EXPECT_THAT([] { modulationOf("8psk"); },
                testing::ThrowsMessage<std::invalid_argument>(
                    "there is no modulation '8psk'; choose one of bpsk, qpsk, 16qam, 64qam, 256qam"));
}

}  // namespace
