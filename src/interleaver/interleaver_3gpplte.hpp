// SPDX-License-Identifier: MIT
#pragma once

#include "interleaver/interleaver.hpp"

/// The quadratic permutation polynomial interleaver of LTE: position i reads (f1 i + f2 i^2) mod K
/// (3GPP TS 36.212, section 5.1.3.2.3).
class TInterleaver3GPPLTE : public TInterleaver {
  public:
    /// @param properties  what follows "3GPPLTE:"; must be empty
    /// @return a new interleaver that the caller deletes, or null after a line on the standard error stream
    static TInterleaver3GPPLTE* create(const std::string& properties);

    bool calcInterleaver(std::vector<std::uint32_t>& out, unsigned K) const override;
    std::string getProperties() const override;
    bool valid(unsigned K) const override;
};
