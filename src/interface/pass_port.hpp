// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <vector>

#include "vardel_ip_quarzel.h"

class TDecoder3G;

namespace quarzel {

/// Hands passes to whoever asked for them.
class PassPort {
  public:
    /// Hand on the next `count` passes.
    void open(unsigned count, vardel_ip_quarzel_pass_receiver receiver, void* cookie) {
        itsCount = receiver == nullptr ? 0 : count;
        itsReceiver = receiver;
        itsCookie = cookie;
    }

    bool pending() const { return itsCount != 0; }

    /// Hand on the pass that a decoder has just run. To be called while passes are pending.
    void hand(const TDecoder3G& decoder, unsigned siso);

  private:
    unsigned itsCount = 0;
    vardel_ip_quarzel_pass_receiver itsReceiver = nullptr;
    void* itsCookie = nullptr;
    std::vector<std::int16_t> itsGamma;  ///< branch metrics in the order of a trace's columns
};

}  // namespace quarzel
