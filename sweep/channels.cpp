// SPDX-License-Identifier: MIT
#include "sweep/channels.hpp"

namespace quarzel::sweep {

link::LinkSetup linkSetupOf(const Setup& setup) {
    const Sending& sending = setup.sending;
    return {sending.transportBlock == 0 ? setup.blockSize : 0,
            sending.transportBlock,
            sending.codedBits,
            1,
            sending.redundancyVersions,
            {sending.modulation, sending.fading, sending.demapping, setup.quantiser}};
}

std::shared_ptr<const link::Channel> Channels::of(const Setup& setup) {
    const link::CodeRate rate = setup.sending.isPlain() ? link::CodeRate{} : linkOf(setup).rate();
    const link::ChannelSetup channelSetup = linkSetupOf(setup).channel;
    const std::lock_guard lock(itsMutex);
    auto& channel = itsChannels[{channelSetup.modulation, channelSetup.fading, channelSetup.demapping,
                                 setup.quantiser, setup.ebN0, rate.informationBits, rate.codedBits}];
    if (channel == nullptr) {
        channel = link::makeChannel(channelSetup, setup.ebN0, rate);
    }
    return channel;
}

const link::CodedLink& Channels::linkOf(const Setup& setup) {
    Setup key;
    key.blockSize = setup.blockSize;
    key.sending = setup.sending;
    key.sending.stop = Stop::none;
    const std::lock_guard lock(itsMutex);
    return itsLinks.try_emplace(key, linkSetupOf(setup)).first->second;
}

}  // namespace quarzel::sweep
