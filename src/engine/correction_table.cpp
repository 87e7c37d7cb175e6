// SPDX-License-Identifier: MIT
#include <algorithm>
#include <bit>
#include <cmath>

#include "engine/engine_mod_base.hpp"

namespace {

/// Round a correction, which is never negative, half up to the integer of the format, saturate, and keep the
/// low byte of the word.
unsigned char toTableByte(double y, const TNumberFormat& format) {
    const double halfMore = y * format.scale + 0.5;
    const auto q = static_cast<std::int32_t>(halfMore);
    if (q < format.minQ) {
        return static_cast<unsigned char>(format.min);
    }
    if (q > format.maxQ) {
        return static_cast<unsigned char>(format.max);
    }
    return static_cast<unsigned char>(format.toWord(q));
}

}  // namespace

std::vector<unsigned char> TCalculationEngineModBase::createLUT(unsigned points, const TNumberFormat* format,
                                                                const quarzel::Messages& messages) {
    if (points == 0) {
        points = 65536;
    }
    if (format->binpt + format->shift > 8) {
        messages.error(
            {"ERROR:TCalculationEngineModBase::createLUT:Binary point of state metrics is incompatible with "
             "8 bit lookup tables"});
        return {};
    }
    if (!std::has_single_bit(points)) {
        messages.error(
            {"ERROR:TCalculationEngineModBase::createLUT:Number of points must be a binary number"});
        return {};
    }
    // The table ignores the low bits of a difference: its step is 8 / points, no finer than the metrics are.
    const auto exponent = static_cast<std::uint32_t>(std::countr_zero(points));
    const std::uint32_t drop = exponent <= 2 ? 0 : std::min(exponent - 3, format->binpt);
    const auto ignored = static_cast<std::int32_t>(format->binpt + format->shift - drop);
    const std::int32_t keep = ignored > 0 ? -(std::int32_t{1} << ignored) : -1;

    std::vector<unsigned char> table(65536, toTableByte(0.0, *format));
    unsigned char* const zero = &table[32768];
    for (std::int32_t difference = 0; difference <= 32767; ++difference) {
        const double x = format->toReal(static_cast<std::int16_t>(difference & keep));
        // The cut-off is the number of points, not the difference that they reach.
        if (!(x < points)) {
            break;
        }
        // The complement, not the magnitude: -1 shares the entry of 0.
        zero[difference] = zero[-1 - difference] = toTableByte(std::log(std::exp(-x) + 1.0), *format);
    }
    return table;
}
