// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <iosfwd>
#include <string>

/// A fixed-point format: `nbits` two's-complement bits, `binpt` of them fractional.
///
/// A value of the format is an integer q of nbits bits, held left-aligned in a signed 16-bit word: the word
/// is q * 2^shift, its low `shift` bits are zero, and the real number is q / scale. With every format in the
/// top bits of a word, the wrap of 16-bit arithmetic is the wrap of a register of nbits bits.
class TNumberFormat {
  public:
    /// Derive all constants. Checks nothing: shift counts are taken modulo 32, so that every pair of
    /// arguments gives some format; `create` refuses those that mean nothing.
    TNumberFormat(std::uint32_t nbits, std::uint32_t binpt);

    /// Make a format from its property string, "Fix_" nbits "_" binpt with 1 <= binpt < nbits <= 16.
    /// @return a new format that the caller deletes, or null after a line on the standard error stream
    static TNumberFormat* create(const std::string& properties);

    /// "Fix_" nbits "_" binpt.
    std::string getProperties() const;

    std::uint32_t nbits;  ///< significant bits
    std::uint32_t binpt;  ///< fractional bits
    std::uint32_t shift;  ///< left shift from the integer q to the word: 16 - nbits
    std::uint32_t scale;  ///< weight of the integer unit, 2^binpt: real = q / scale
    std::int16_t min;     ///< smallest value, as a word
    std::int16_t max;     ///< largest value, as a word
    std::int32_t minQ;    ///< smallest value, as the integer q
    std::int32_t maxQ;    ///< largest value, as the integer q
    std::int16_t mask;    ///< the bits of a word that the format has

    bool operator==(const TNumberFormat&) const = default;

    /// The integer q that a word of this format holds.
    std::int32_t toInteger(std::int16_t word) const { return word >> (shift & 31U); }

    /// The real number that a word of this format stands for.
    double toReal(std::int16_t word) const { return static_cast<double>(toInteger(word)) / scale; }

    /// The integer q as a word of this format, kept to 16 bits.
    std::int16_t toWord(std::int32_t q) const {
        return static_cast<std::int16_t>(static_cast<std::uint32_t>(q) << (shift & 31U));
    }
};

/// All fields on one line, "NBITS=6 BINPT=2 Shift=10 ...", in the stream's own number formatting.
std::ostream& operator<<(std::ostream& stream, const TNumberFormat& format);
