// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <tuple>

#include "fixed/number_format.hpp"

namespace quarzel::test {

/// The nine fields of a format, in their order, in a form that the test framework compares and prints.
using FormatFields = std::tuple<std::uint32_t, std::uint32_t, std::uint32_t, std::uint32_t, std::int16_t,
                                std::int16_t, std::int32_t, std::int32_t, std::int16_t>;

inline FormatFields fields(const TNumberFormat& f) {
    return {f.nbits, f.binpt, f.shift, f.scale, f.min, f.max, f.minQ, f.maxQ, f.mask};
}

}  // namespace quarzel::test
