// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <vector>

#include "link/random_source.hpp"
#include "link/refinement.hpp"

namespace quarzel::link {

/// A distribution of whole numbers from 0, exact to 2^-48, as a table that 16 random bits look up.
class DrawTable {
  public:
    /// @param thresholds  entry i: 2^48 times the probability of a number up to i; ascending, fewer than
    /// 65535
    explicit DrawTable(std::vector<std::uint64_t> thresholds);

    /// The number for 16 random bits and, where these do not decide it, the next of the further ones.
    std::size_t at(std::uint32_t random, Refinement& refinement) const {
        const std::uint16_t number = itsNumbers[random];
        return number != undecided ? number : decide(random, refinement.next());
    }

    const std::vector<std::uint64_t>& thresholds() const { return itsThresholds; }

  private:
    static constexpr std::uint16_t undecided = 0xffff;

    std::size_t decide(std::uint32_t random, std::uint32_t further) const;

    std::vector<std::uint64_t> itsThresholds;
    std::vector<std::uint16_t> itsNumbers;
};

/// Draws from tables, one number after another.
class Draws {
  public:
    /// @param source  not owned, must outlive it
    Draws(const RandomSource& source, Purpose purpose, Purpose further)
        : itsSource(source), itsPurpose(purpose), itsRefinement(source, further) {}

    std::size_t next(const DrawTable& table) {
        const std::size_t place = itsUsed % (2 * itsWords.size());
        if (place == 0) {
            itsSource.words(itsPurpose, static_cast<std::uint32_t>(itsUsed / (2 * wordsPerGroup)),
                            groupsAtOnce, itsWords.data());
        }
        ++itsUsed;
        return table.at(itsWords[place / 2] >> 16 * (place % 2) & 0xffffU, itsRefinement);
    }

  private:
    static constexpr std::size_t groupsAtOnce = 4;

    const RandomSource& itsSource;
    Purpose itsPurpose;
    Refinement itsRefinement;
    std::array<std::uint32_t, groupsAtOnce * wordsPerGroup> itsWords;  // drawn when the first is needed
    std::size_t itsUsed = 0;
};

}  // namespace quarzel::link
