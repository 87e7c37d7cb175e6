// SPDX-License-Identifier: MIT
#include "link/channel/channel.hpp"

#include "link/channel/fading_channel.hpp"
#include "link/channel/pam_channel.hpp"
#include "link/choice.hpp"
#include "link/quantised_channel.hpp"

namespace quarzel::link {

Fading fadingOf(std::string_view name) {
    return static_cast<Fading>(placeOf(channelNames, name, "channel"));
}

bool isMemoryless(const ChannelSetup& setup) {
    return setup.fading == Fading::none && amplitudes(setup.modulation).size() == 2;
}

void Channel::transmitOctet(const RandomSource& source, const std::uint8_t* codedBits, std::size_t count,
                            std::int8_t* soft) const {
    for (unsigned lane = 0; lane < blocksPerOctet; ++lane) {
        transmit(source.ofLane(lane), codedBits, lane, count, soft + lane * count);
    }
}

std::unique_ptr<const Channel> makeChannel(const ChannelSetup& setup, Decibels ebN0, CodeRate rate) {
    if (isMemoryless(setup)) {
        return std::make_unique<QuantisedChannel>(setup.quantiser, ebN0, rate);
    }
    if (setup.fading == Fading::none) {
        return std::make_unique<PamChannel>(setup, ebN0, rate);
    }
    return std::make_unique<FadingChannel>(setup, ebN0, rate);
}

}  // namespace quarzel::link
