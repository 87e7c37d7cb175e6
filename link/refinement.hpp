// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

#include "link/random_source.hpp"

namespace quarzel::link {

/// The random bits that follow the first 16 of a number.
constexpr unsigned refinementBits = 32;

/// The further random bits of a block, for one undecided value after another.
class Refinement {
  public:
    /// @param source  not owned, must outlive it
    Refinement(const RandomSource& source, Purpose purpose) : itsSource(source), itsPurpose(purpose) {}

    std::uint32_t next() {
        const std::size_t place = itsUsed % wordsPerGroup;
        if (place == 0) {
            itsSource.words(itsPurpose, static_cast<std::uint32_t>(itsUsed / wordsPerGroup), 1,
                            itsWords.data());
        }
        ++itsUsed;
        return itsWords[place];
    }

  private:
    const RandomSource& itsSource;
    Purpose itsPurpose;
    std::array<std::uint32_t, wordsPerGroup> itsWords;  // drawn when the first is needed
    std::size_t itsUsed = 0;
};

}  // namespace quarzel::link
