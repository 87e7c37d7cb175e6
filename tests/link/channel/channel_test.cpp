// SPDX-License-Identifier: MIT
#include "link/channel/channel.hpp"

#include <gtest/gtest.h>

#include <cmath>
#include <complex>

#include "link/channel/pam_table.hpp"
#include "link/soft_counts.hpp"
#include "support/random.hpp"

namespace {

using namespace quarzel::link;
using quarzel::test::Against;
using quarzel::test::Counts;
using quarzel::test::deviation;
using quarzel::test::placeOf;

struct Case {
    ChannelSetup setup;
    Decibels ebN0;
    CodeRate rate;
};

std::vector<Case> cases() {
    const Quantiser llr{Quantiser::Kind::llr, 4};
    const Quantiser amplitude{Quantiser::Kind::amplitude, 12};
    std::vector<Case> all;
    for (const Fading fading : {Fading::none, Fading::perSymbol}) {
        for (const Modulation modulation :
             {Modulation::bpsk, Modulation::qpsk, Modulation::qam16, Modulation::qam64, Modulation::qam256}) {
            for (const Demapping demapping : {Demapping::maxLog, Demapping::exact}) {
                all.push_back({{modulation, fading, demapping, llr}, {2000000}, {1, 2}});
                all.push_back({{modulation, fading, demapping, amplitude}, {7000000}, {3, 4}});
            }
        }
        all.push_back({{Modulation::qam64, fading, Demapping::exact, llr}, {-5000000}, {1, 3}});
        all.push_back({{Modulation::qam16, fading, Demapping::maxLog, {Quantiser::Kind::llr, 0.3}},
                       {12000000},
                       {8, 9}});
    }
    return all;
}

/// For each bit of a symbol and each value of it, how often soft values come.
using AllCounts = std::vector<std::array<Counts, 2>>;

void count(const std::vector<std::uint8_t>& bits, const std::vector<std::int8_t>& soft, AllCounts& counts) {
    for (std::size_t i = 0; i < bits.size(); ++i) {
        counts[i % counts.size()][bits[i]].at(placeOf(soft[i])) += 1;
    }
}

/// The channel in floating point: symbols, a fading amplitude, Gaussian noise, an equaliser, demodulation and
/// a rounding quantiser.
std::vector<std::int8_t> plain(const Case& one, const std::vector<std::uint8_t>& bits, std::mt19937& random) {
    const double Qm = bitsOfSymbol(one.setup.modulation);
    std::vector<std::complex<double>> symbols(bits.size() / bitsOfSymbol(one.setup.modulation));
    modulate(bits, one.setup.modulation, symbols);
    const double variance = one.rate.codedBits / (one.rate.informationBits * Qm) *
                            std::pow(10, -one.ebN0.value() / 10);  // of both components
    std::normal_distribution<double> noise(0, std::sqrt(variance / 2));
    std::exponential_distribution<double> power(1);
    std::vector<double> variances(symbols.size(), variance);
    for (std::size_t n = 0; n < symbols.size(); ++n) {
        const double amplitude = one.setup.fading == Fading::none ? 1 : std::sqrt(power(random));
        symbols[n] += std::complex<double>(noise(random), noise(random)) / amplitude;
        variances[n] /= amplitude * amplitude;
    }
    std::vector<double> ratios(bits.size());
    demodulate(symbols, one.setup.modulation, variances, ratios, one.setup.demapping);
    double units = one.setup.quantiser.scale;
    if (one.setup.quantiser.kind == Quantiser::Kind::amplitude) {
        // BPSK has its amplitude of 1 on the diagonal.
        const double least =
            one.setup.modulation == Modulation::bpsk ? 1 : amplitudeUnit(one.setup.modulation);
        units *= variance / 2 / (least * least) / 2;
    }
    std::vector<std::int8_t> soft(bits.size());
    for (std::size_t i = 0; i < soft.size(); ++i) {
        soft[i] = static_cast<std::int8_t>(std::clamp(std::round(units * ratios[i]), -128.0, 127.0));
    }
    return soft;
}

TEST(Channel, DrawsWhatFloatingPointGivesForEveryModulation) {
    std::mt19937 random = quarzel::test::seededRandom();
    constexpr std::size_t size = 12000;
    constexpr std::size_t blocks = 20;
    for (const Case& one : cases()) {
        const auto channel = makeChannel(one.setup, one.ebN0, one.rate);
        AllCounts drawn(bitsOfSymbol(one.setup.modulation));
        AllCounts expected(drawn.size());
        const std::uint64_t seed = random();
        std::vector<std::uint8_t> bits(size);
        std::vector<std::uint8_t> lanes(size);
        std::vector<std::int8_t> soft(size);
        for (std::uint64_t block = 0; block < blocks; ++block) {
            for (std::size_t i = 0; i < size; ++i) {
                lanes[i] = static_cast<std::uint8_t>(random());
                bits[i] = lanes[i] >> 5 & 1U;
            }
            channel->transmit(RandomSource({seed, 6144, one.ebN0, block}), lanes.data(), 5, size,
                              soft.data());
            count(bits, soft, drawn);
            count(bits, plain(one, bits, random), expected);
        }
        for (std::size_t bit = 0; bit < drawn.size(); ++bit) {
            for (const std::size_t value : {0U, 1U}) {
                EXPECT_LT(deviation(drawn[bit][value], expected[bit][value], Against::draw), 5)
                    << "Qm " << drawn.size() << " fading " << static_cast<int>(one.setup.fading)
                    << " demapping " << static_cast<int>(one.setup.demapping) << " scale "
                    << one.setup.quantiser.scale << " bit " << bit << " of " << value;
            }
        }
    }
}

// One bit of a component: the pieces are the outputs of the binary channel, seen from the other side.
TEST(PamTable, HasTheThresholdsOfTheBinaryChannel) {
    for (const Quantiser& quantiser :
         {Quantiser{Quantiser::Kind::llr, 4}, Quantiser{Quantiser::Kind::amplitude, 40}}) {
        const Decibels ebN0{600000};
        const PamTable table =
            makePamTable({Modulation::qpsk, Fading::none, Demapping::maxLog, quantiser}, ebN0, {});
        const ChannelThresholds thresholds = channelThresholds(quantiser, ebN0);
        const std::vector<std::uint64_t>& below = table.thresholds[1];  // of the negative amplitude, bit 1
        ASSERT_EQ(table.soft.size(), below.size() + 1);
        ASSERT_GT(below.size(), 60U);
        for (std::size_t i = 0; i < below.size(); ++i) {
            ASSERT_EQ(table.soft[i + 1][0], table.soft[i][0] - 1);
            const std::uint64_t above = thresholds[static_cast<std::size_t>(table.soft[i][0] + 127)];
            EXPECT_NEAR(static_cast<double>(below[i] + above), 0x1p48, 1) << i;
        }
    }
}

// Where one soft value changes by one, the others stay.
TEST(PamTable, CutsWhereASoftValueChanges) {
    for (const Demapping demapping : {Demapping::maxLog, Demapping::exact}) {
        for (const Decibels ebN0 : {Decibels{-10000000}, Decibels{5000000}, Decibels{15000000}}) {
            const PamTable table = makePamTable({Modulation::qam256, Fading::none, demapping, {}}, ebN0, {});
            ASSERT_EQ(table.thresholds.size(), 16U);
            for (std::size_t i = 1; i < table.soft.size(); ++i) {
                int changes = 0;
                for (std::size_t bit = 0; bit < 4; ++bit) {
                    changes += std::abs(table.soft[i][bit] - table.soft[i - 1][bit]);
                }
                ASSERT_EQ(changes, 1) << i;
            }
            for (const auto& thresholds : table.thresholds) {
                EXPECT_TRUE(std::is_sorted(thresholds.begin(), thresholds.end()));
            }
        }
    }
}

TEST(Channel, FadesABlockAsOneWhenAskedTo) {
    const Case one = {
        {Modulation::qpsk, Fading::perBlock, Demapping::maxLog, {Quantiser::Kind::amplitude, 20}},
        {60000000},
        {1, 3}};
    const auto channel = makeChannel(one.setup, one.ebN0, one.rate);
    const std::vector<std::uint8_t> bits(600, 1);
    std::vector<std::int8_t> soft(bits.size());
    double power = 0;
    constexpr int blocks = 2000;
    for (std::uint64_t block = 0; block < blocks; ++block) {
        BlockName name = {3, 0, one.ebN0, block};
        name.transportBlock = 8000;
        channel->transmit(RandomSource(name), bits.data(), 0, bits.size(), soft.data());
        const auto [least, greatest] = std::minmax_element(soft.begin(), soft.end());
        EXPECT_LE(*greatest - *least, 1) << "there is next to no noise";
        power += *least / 20.0;  // the amplitude times the one of the receiver
        const int first = *least;
        name.codeBlock = 1;
        channel->transmit(RandomSource(name), bits.data(), 0, bits.size(), soft.data());
        EXPECT_NEAR(soft[0], first, 1) << "the code blocks of a transmission fade alike";
    }
    EXPECT_NEAR(power / blocks, 1, 5 / std::sqrt(blocks) + 0.03);  // rounded to twentieths
}

}  // namespace
