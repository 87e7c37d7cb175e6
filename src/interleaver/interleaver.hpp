// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "fixed/messages.hpp"

/// The permutation between the two constituent codes of a turbo code, for any block size of its family.
///
/// The two tables are a cache that the decoder fills and reads: a table whose size is K is the one of K.
class TInterleaver {
  public:
    /// Make an interleaver from its property string; the one type is "3GPPLTE".
    /// @return a new interleaver that the caller deletes, or null after a line on the standard error stream
    static TInterleaver* create(const std::string& properties);

    /// The type names on offer.
    static std::vector<std::string> getNames();

    /// Compute the permutation of block size K: entry i is the natural-order position that is read at
    /// interleaved position i. Room for K entries is reserved first, also for a K that is then refused: ask
    /// `valid` about one that may be huge.
    /// @return false, with `out` empty, when the family has no such K
    virtual bool calcInterleaver(std::vector<std::uint32_t>& out, unsigned K) const = 0;

    /// Compute the inverse permutation of block size K from `itsPermutation`, which is computed first when it
    /// is not the one of K. `out` is resized to it; the inverse itself is written to
    /// `itsInversePermutation` even if `out` is another vector; pass that table.
    /// @return true; both tables are empty when the family has no such K
    virtual bool calcDeinterleaver(std::vector<std::uint32_t>& out, unsigned K) const;

    virtual ~TInterleaver() = default;
    TInterleaver(const TInterleaver&) = delete;
    TInterleaver& operator=(const TInterleaver&) = delete;

    /// A property string from which an equal interleaver can be created.
    virtual std::string getProperties() const = 0;

    /// Whether the family has block size K. The base takes every K but 0.
    virtual bool valid(unsigned K) const;

    /// Print the permutations of all valid block sizes from `first` to `last` to the standard output stream,
    /// one a line, entries separated by a blank; with `showK` each line begins with K and ": ".
    void dumpAll(unsigned first, unsigned last, bool showK) const;

    mutable std::vector<std::uint32_t> itsPermutation;         ///< permutation of the K last computed
    mutable std::vector<std::uint32_t> itsInversePermutation;  ///< entry itsPermutation[i] is i

    /// Where `dumpAll` prints: the standard streams until set.
    void setMessages(const quarzel::Messages& messages) { itsMessages = messages; }
    const quarzel::Messages& messages() const { return itsMessages; }

  protected:
    TInterleaver() = default;

  private:
    quarzel::Messages itsMessages;
};
