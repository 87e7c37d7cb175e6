// SPDX-License-Identifier: MIT
#include "link/coding/coded_sizes.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <numeric>
#include <stdexcept>

#include "link/coding/standard_coding.hpp"

namespace {

using namespace quarzel::link;
using testing::ThrowsMessage;
namespace standard = quarzel::test::standard;

TEST(CodedSizes, AreThoseOfTheStandard) {
    for (int C = 1; C <= 13; ++C) {
        for (const int layers : {1, 2, 3, 4}) {
            for (const int Qm : {1, 2, 4, 6, 8}) {
                const int unit = layers * Qm;
                for (int G = C * unit; G <= 4 * C * unit; G += unit) {
                    const auto sizes = codedSizes(static_cast<std::size_t>(C), static_cast<std::size_t>(G),
                                                  static_cast<unsigned>(layers), static_cast<unsigned>(Qm));
                    ASSERT_EQ(static_cast<int>(sizes.size()), C);
                    ASSERT_EQ(std::accumulate(sizes.begin(), sizes.end(), 0U), static_cast<unsigned>(G));
                    for (int r = 0; r < C; ++r) {
                        ASSERT_EQ(static_cast<int>(sizes[static_cast<std::size_t>(r)]),
                                  standard::codedSize(r, C, G, layers, Qm));
                    }
                }
            }
        }
    }
}

TEST(CodedSizes, NameTheSizesThatFit) {
    EXPECT_THAT([] { codedSizes(3, 16, 1, 6); },
                ThrowsMessage<std::invalid_argument>("the code blocks need at least 18 coded bits, not 16"));
    EXPECT_THAT([] { codedSizes(1, 0, 1, 2); },
                ThrowsMessage<std::invalid_argument>("the code blocks need at least 2 coded bits, not 0"));
    EXPECT_THAT([] { codedSizes(1, 15, 2, 2); },
                ThrowsMessage<std::invalid_argument>(
                    "coded bits must be a multiple of 4, not 15; the nearest: 12, 16"));
    EXPECT_THAT(
        [] { codedSizes(1, 15, 0, 2); },
        ThrowsMessage<std::invalid_argument>("code blocks, layers and bits of a symbol must be at least 1"));
}

// Categories 1, 3 and 5 of TS 36.306, table 4.1-1, with 8 processes; and one that shares it among carriers.
TEST(SoftBits, AreTheMemoryOverItsShares) {
    EXPECT_EQ(softBits({.Nsoft = 250368}), 31296);
    EXPECT_EQ(softBits({.Nsoft = 1237248, .KMIMO = 2}), 77328);
    EXPECT_EQ(softBits({.Nsoft = 3667200, .KMIMO = 2, .Mdlharq = 15}), 229200);
    EXPECT_EQ(softBits({.Nsoft = 35982720, .KC = 5, .KMIMO = 2, .Mdlharq = 4}), 899568);
    EXPECT_THAT([] { softBits({.Nsoft = 0}); },
                ThrowsMessage<std::invalid_argument>(
                    "N_soft, K_C, K_MIMO, M_DL_HARQ and M_limit must be at least 1"));
}

TEST(BufferSize, IsTheShareOfACodeBlockOrAllOfW) {
    EXPECT_EQ(wholeBufferSize(40), 192);
    EXPECT_EQ(wholeBufferSize(6144), 18528);
    EXPECT_EQ(bufferSize(6144, 2, 31296), 15648);
    EXPECT_EQ(bufferSize(6144, 1, 31296), 18528);
    EXPECT_THAT([] { bufferSize(40, 0, 1000); },
                ThrowsMessage<std::invalid_argument>("there must be at least 1 code block, not 0"));
}

}  // namespace
