// SPDX-License-Identifier: MIT
#pragma once

#include <vector>

#include "link/channel/channel.hpp"
#include "link/channel/draw_table.hpp"
#include "link/channel/pam_table.hpp"

namespace quarzel::link {

/// A modulation with several bits in a component over additive white Gaussian noise, as one discrete channel
/// for each amplitude: it is drawn from the exact distribution, to 2^-48, which of the pieces of PamTable the
/// component is received in.
class PamChannel : public Channel {
  public:
    PamChannel(const ChannelSetup& setup, Decibels ebN0, CodeRate rate);

    void transmit(const RandomSource& source, const std::uint8_t* codedBits, unsigned lane, std::size_t count,
                  std::int8_t* soft) const override;

  private:
    std::size_t itsBits;  ///< of a component
    std::vector<PamSoft> itsSoft;
    std::vector<DrawTable> itsPieces;  ///< for each amplitude
};

}  // namespace quarzel::link
