// SPDX-License-Identifier: MIT
// The arithmetic of lanes on whole domains, against the literal decoder's definitions.
#include <gtest/gtest.h>

#include <algorithm>
#include <memory>
#include <numeric>
#include <string>
#include <utility>
#include <vector>

#include "engine/engine_mod_base.hpp"
#include "fixed/wrap16.hpp"
#include "interface/soft_input.hpp"
#include "lanes/lane_probe.hpp"
#include "lanes/lane_setup.hpp"

namespace quarzel::test {

extern const LaneProbe baselineProbe;
#if defined(__x86_64__)
extern const LaneProbe sse41Probe;
extern const LaneProbe avx2Probe;
extern const LaneProbe avx512bwProbe;
#endif

namespace {

using Words = std::vector<std::int16_t>;

/// Calls `check` with the operations of every candidate that the machine supports.
template <class Check>
void forEachProbe(Check check) {
    const struct {
        const char* name;
        const LaneProbe& probe;
    } probes[] = {
#if defined(__x86_64__)
        {"avx512bw", avx512bwProbe},
        {"avx2", avx2Probe},
        {"sse4.1", sse41Probe},
#endif
        {lanes::candidates().end()[-1].name, baselineProbe},
    };
    for (const lanes::Candidate& candidate : supportedCandidates()) {
        const auto* found = std::find_if(std::begin(probes), std::end(probes), [&](const auto& known) {
            return candidate.name == std::string(known.name);
        });
        ASSERT_NE(found, std::end(probes)) << candidate.name << " has no probe";
        SCOPED_TRACE(candidate.name);
        check(found->probe);
    }
}

Words everyWord() {
    Words words(65536);
    for (int i = 0; i < 65536; ++i) {
        words[static_cast<std::size_t>(i)] = wrap16(i);
    }
    return words;
}

TEST(LaneArithmetic, TheStaircaseIsTheCorrectionTableForEveryDifference) {
    const TNumberFormat state(12, 3);
    const std::vector<unsigned char> table = TCalculationEngineModBase::createLUT(16, &state);
    ASSERT_EQ(table.size(), 65536U);
    const Words differences = everyWord();
    forEachProbe([&](const LaneProbe& probe) {
        Words corrections(differences.size());
        probe.staircase(differences.data(), corrections.data(), differences.size());
        for (std::size_t i = 0; i < differences.size(); ++i) {
            ASSERT_EQ(corrections[i], table[static_cast<std::size_t>(differences[i] + 32768)])
                << differences[i];
        }
    });
}

/// The literal decoder: the extrinsic value of a pass, then what the next one makes of it.
std::int16_t literalHalf(int llr, int channel, bool scaled) {
    const int intrinsic = channel / 2;
    const int extrinsic = llr - 4 * intrinsic;
    const int value = std::clamp(scaled ? 3 * extrinsic / 4 : extrinsic, -2048, 2032) & (scaled ? -16 : -1);
    return static_cast<std::int16_t>((value / 2) & -16);
}

TEST(LaneArithmetic, HalfTheExtrinsicValueIsTheDefinitionsForEveryRatioAndChannelValue) {
    forEachProbe([&](const LaneProbe& probe) {
        // A channel value is a soft value and half an extrinsic one.
        for (int channel = -2048 - 1024; channel <= 2032 + 1008; channel += 16) {
            Words llrs;
            for (int llr = -32768; llr < 32768; llr += 16) {
                llrs.push_back(static_cast<std::int16_t>(llr));
            }
            const Words channels(llrs.size(), static_cast<std::int16_t>(channel));
            Words halves(llrs.size());
            for (const bool scaled : {false, true}) {
                probe.halfExtrinsic[scaled](llrs.data(), channels.data(), halves.data(), llrs.size());
                for (std::size_t i = 0; i < llrs.size(); ++i) {
                    ASSERT_EQ(halves[i], literalHalf(llrs[i], channel, scaled))
                        << "LLR " << llrs[i] << ", channel value " << channel << ", scaled " << scaled;
                }
            }
        }
    });
}

// All pairs and all integers in the long run. Else every 251st x with every y, and every 61st value of an
// integer's high half with every value of its low one.
TEST(LaneArithmetic, TheModuloMaximumIsTheScalarOneForEveryPair) {
    const Words y = everyWord();
    forEachProbe([&](const LaneProbe& probe) {
        Words larger(y.size());
        for (int first = -32768; first < 32768; first += exhaustive() ? 1 : 251) {
            const auto x = static_cast<std::int16_t>(first);
            const Words same(y.size(), x);
            probe.moduloMax(same.data(), y.data(), larger.data(), y.size());
            for (std::size_t i = 0; i < y.size(); ++i) {
                if (larger[i] != moduloMax(x, y[i])) {
                    FAIL() << x << ' ' << y[i];
                }
            }
        }
    });
}

/// Compare the conversion of some values, which fill whole groups, with the literal one.
template <class Value>
void expectConverted(const Conversions& conversions, Conversions::Convert<Value> convert,
                     const std::vector<Value>& values) {
    const TNumberFormat input(8, 3);
    const TNumberFormat state(12, 3);
    Words converted(values.size());
    const auto saturated = std::make_unique<bool[]>(values.size() / conversions.width);
    convert(values.data(), converted.data(), saturated.get(), values.size());
    bool anyOfGroup = false;
    for (std::size_t i = 0; i < values.size(); ++i) {
        int how = 0;
        if (converted[i] != toSoftValue(values[i], input, state, how)) {
            FAIL() << values[i];
        }
        anyOfGroup = anyOfGroup || how != 0;
        if ((i + 1) % conversions.width == 0 &&
            saturated[i / conversions.width] != std::exchange(anyOfGroup, false)) {
            FAIL() << "saturation of one of the " << conversions.width << " up to " << values[i];
        }
    }
}

/// Calls `check` with the conversions of every candidate that the machine supports.
template <class Check>
void forEachConversion(Check check) {
    forEachProbe([&](const LaneProbe& probe) {
        for (const Conversions& conversions : probe.toWords) {
            SCOPED_TRACE(conversions.width);
            ASSERT_NO_FATAL_FAILURE(check(conversions));
        }
    });
}

TEST(LaneArithmetic, SoftInputsAreConvertedAsInTheLiteralRoadForEveryInteger) {
#if defined(NDEBUG)
    const std::uint64_t stride = exhaustive() ? 1 : 61;
#else
    const std::uint64_t stride = 1021;
#endif
    std::vector<std::int32_t> values(65536);
    forEachConversion([&](const Conversions& conversions) {
        for (std::uint64_t high = 0; high < 65536; high += stride) {
            for (std::uint64_t low = 0; low < values.size(); ++low) {
                values[low] = static_cast<std::int32_t>(static_cast<std::uint32_t>(high * 65536 + low));
            }
            ASSERT_NO_FATAL_FAILURE(expectConverted(conversions, conversions.fromInt32, values));
        }
    });
}

TEST(LaneArithmetic, ShorterSoftInputsAreConvertedAsInTheLiteralRoadForEveryInteger) {
    const Words words = everyWord();
    std::vector<std::int8_t> bytes(256);
    std::iota(bytes.begin(), bytes.end(), std::int8_t{-128});
    forEachConversion([&](const Conversions& conversions) {
        ASSERT_NO_FATAL_FAILURE(expectConverted(conversions, conversions.fromInt16, words));
        ASSERT_NO_FATAL_FAILURE(expectConverted(conversions, conversions.fromInt8, bytes));
    });
}

TEST(LaneArithmetic, OneSaturatedValueAmongOthersIsSeen) {
    forEachConversion([&](const Conversions& conversions) {
        for (const int value : {-129, -128, 127, 128, 1 << 23, 1 << 24}) {
            for (std::size_t lane = 0; lane < conversions.width; ++lane) {
                std::vector<std::int32_t> values(4 * conversions.width);
                values[conversions.width + lane] = value;
                Words converted(values.size());
                bool saturated[4] = {};
                conversions.fromInt32(values.data(), converted.data(), saturated, values.size());
                // 2^24 is shifted out whole.
                const bool expected = value < -128 || (value > 127 && value != 1 << 24);
                EXPECT_EQ(saturated[1], expected) << value << " in lane " << lane;
                EXPECT_FALSE(saturated[0] || saturated[2] || saturated[3]);
            }
        }
    });
}

}  // namespace
}  // namespace quarzel::test
