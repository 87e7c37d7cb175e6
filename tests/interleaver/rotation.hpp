// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "interleaver/interleaver.hpp"

namespace quarzel::test {

/// An interleaver of another family, to show what the base class does by itself: position i reads i + 1
/// around the block, for every block size up to 1000. It counts how often it is asked.
class Rotation : public TInterleaver {
  public:
    bool calcInterleaver(std::vector<std::uint32_t>& out, unsigned K) const override {
        ++calls;
        out.clear();
        for (unsigned i = 0; K <= 1000 && i < K; ++i) {
            out.push_back((i + 1) % K);
        }
        return !out.empty();
    }
    std::string getProperties() const override { return "rotation"; }

    mutable unsigned calls = 0;
};

}  // namespace quarzel::test
