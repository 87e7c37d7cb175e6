// SPDX-License-Identifier: MIT
#include "interface/literal_call.hpp"

#include <algorithm>
#include <stdexcept>

#include "interface/lane_implementation.hpp"
#include "interface/pass_port.hpp"

namespace quarzel {

LiteralCall::LiteralCall(vardel_ip_quarzel_state& state, const BlockCall& call)
    : itsState(state),
      itsDecoder(dynamic_cast<TDecoder3G*>(state.decoder)),
      itsKeeps(call.iterationStride != 0),
      itsDecoderLines(*state.decoder, state.messages),
      itsInterleaverLines(*state.decoder->interleaver(), state.messages),
      itsEngineLines(*state.decoder->engine(), state.messages) {
    if (state.lanes != nullptr) {
        state.lanes->settle(*state.decoder);
    }
    if (itsKeeps && itsDecoder == nullptr) {
        throw std::logic_error("this decoder does not show its iterations");
    }
    if (itsDecoder != nullptr && (itsKeeps || (state.passes != nullptr && state.passes->pending()))) {
        itsDecoder->setPassListener(this);
    }
}

LiteralCall::~LiteralCall() {
    if (itsDecoder != nullptr) {
        itsDecoder->setPassListener(nullptr);
    }
}

void LiteralCall::passEnded(const TDecoder3G& decoder, unsigned siso) {
    if (itsState.passes != nullptr && itsState.passes->pending()) {
        itsState.passes->hand(decoder, siso);
    }
    if (itsKeeps && siso % 2 == 1) {
        const std::vector<short>& llr = decoder.llr();
        std::vector<unsigned char>& bits = itsDecisions.emplace_back(llr.size() - TDecoder3G::tailSteps);
        std::transform(llr.begin(), llr.end() - TDecoder3G::tailSteps, bits.begin(), TDecoder3G::decide);
    }
}

void LiteralCall::writeIterations(const BlockCall& call) const {
    unsigned char* to = call.dout;
    for (const std::vector<unsigned char>& bits : itsDecisions) {
        std::copy(bits.begin(), bits.end(), to);
        to += call.iterationStride;
    }
}

}  // namespace quarzel
