// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <tuple>

#include "link/chain/coded_link.hpp"
#include "sweep/setup.hpp"

namespace quarzel::sweep {

/// What a coded link is made of.
link::LinkSetup linkSetupOf(const Setup& setup);

/// The channels and coded links of a sweep, each made when it is first needed.
///
/// Thread rule: `of` and `linkOf` may be called from several threads at once.
class Channels {
  public:
    std::shared_ptr<const link::Channel> of(const Setup& setup);

    /// It lives as long as this.
    /// @throws std::invalid_argument when the sizes do not fit one another
    const link::CodedLink& linkOf(const Setup& setup);

  private:
    using Key = std::tuple<link::Modulation, link::Fading, link::Demapping, link::Quantiser, link::Decibels,
                           std::uint32_t, std::uint32_t>;

    std::mutex itsMutex;
    std::map<Key, std::shared_ptr<const link::Channel>> itsChannels;  ///< the last two: the code rate
    std::map<Setup, link::CodedLink> itsLinks;                        ///< by what they depend on
};

}  // namespace quarzel::sweep
