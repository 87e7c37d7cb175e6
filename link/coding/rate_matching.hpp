// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <vector>

#include "quarzel/code.hpp"

namespace quarzel::link {

/// The circular buffer of a code block as tables: bit collection, selection and transmission (3GPP TS 36.212,
/// section 5.1.4.1.2), with the sub-block interleaver before it.
///
/// What is <NULL> in the standard's buffer w, dummies and filler bits, is never sent, so the tables are of
/// the code bits alone, in the order of w. They serve both directions.
///
/// Thread rule: it does not change once it is made.
class RateMatching {
  public:
    /// @param K           one of the 188 block sizes
    /// @param filler      F, filler bits in front of the block
    /// @param bufferSize  N_cb, entries of w that are used; all, K_w, without
    /// @throws std::invalid_argument when there is no such block size, or the filler or the buffer does not
    /// fit
    ///         it
    explicit RateMatching(std::uint32_t K, std::size_t filler = 0,
                          std::optional<std::size_t> bufferSize = std::nullopt);

    std::uint32_t K() const { return itsK; }
    std::size_t filler() const { return itsFiller; }

    /// N_cb, the entries of w that are used.
    std::size_t bufferSize() const { return itsBufferSize; }

    /// K + 4, the positions of a stream.
    std::size_t positions() const { return itsK + quarzel::tailPositions; }

    /// The code bits of the buffer.
    std::size_t codeBits() const { return itsPlaces.size(); }

    /// Where each code bit is in the three streams, which lie after one another, K + 4 positions each.
    std::span<const std::uint16_t> places() const { return itsPlaces; }

    /// Where each code bit is in w.
    std::span<const std::uint16_t> entries() const { return itsEntries; }

    /// The code bit that a transmission begins with: the first one at or after k_0.
    /// @throws std::invalid_argument when the redundancy version is not 0 to 3
    std::size_t start(unsigned rv) const;

  private:
    void collect();
    std::size_t firstAtOrAfter(std::size_t entry) const;

    std::uint32_t itsK;
    std::size_t itsFiller;
    std::size_t itsBufferSize;
    std::vector<std::uint16_t> itsPlaces;
    std::vector<std::uint16_t> itsEntries;
    std::array<std::size_t, 4> itsStarts{};
};

/// Refuse to send nothing.
/// @throws std::invalid_argument when E is 0
void requireCodedBits(std::size_t E);

/// Show the pieces of the buffer that a transmission goes through, in order.
/// @param E      coded bits
/// @param visit  called as visit(from, first, count) for coded bits from `from` on, which are code bits from
///               `first` on
/// @throws std::invalid_argument when E is 0 or the redundancy version is not 0 to 3
template <class Visit>
void forEachPiece(const RateMatching& matching, unsigned rv, std::size_t E, Visit visit) {
    requireCodedBits(E);
    std::size_t first = matching.start(rv);
    for (std::size_t from = 0; from < E; first = 0) {
        const std::size_t count = std::min(E - from, matching.codeBits() - first);
        visit(from, first, count);
        from += count;
    }
}

/// Select the coded bits of a block.
/// @param rv       redundancy version
/// @param streams  3 (K + 4) code bits as the encoder gives them, of one block or of 8 side by side; those at
///                 filler bits are not read
/// @param coded    receives E bits of the same form
/// @throws std::invalid_argument when E is 0, the redundancy version is not 0 to 3, or a size does not fit
void rateMatch(const RateMatching& matching, unsigned rv, std::span<const std::uint8_t> streams,
               std::span<std::uint8_t> coded);

}  // namespace quarzel::link
