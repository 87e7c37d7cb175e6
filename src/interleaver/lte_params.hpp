// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstdint>

/// One row of the parameter table of the turbo code internal interleaver.
struct LteParams {
    std::uint32_t K;   ///< block size in information bits
    std::uint32_t f1;  ///< linear coefficient of the permutation polynomial
    std::uint32_t f2;  ///< quadratic coefficient
};

/// The 188 block sizes of LTE in ascending order with their parameters (3GPP TS 36.212, Table 5.1.3-3).
extern const std::array<LteParams, 188> lteParams;
