// SPDX-License-Identifier: MIT
#include "interface/pass_port.hpp"

#include <new>

#include "decoder/decoder_3g.hpp"
#include "engine/dump_columns.hpp"
#include "interface/block_call.hpp"

namespace quarzel {

void PassPort::hand(const TDecoder3G& decoder, unsigned siso) {
    itsGamma.clear();
    for (const T8& metrics : decoder.gamma()) {
        for (const std::size_t element : branchColumns) {
            itsGamma.push_back(metrics[element]);
        }
    }
    const auto steps = static_cast<unsigned>(decoder.llr().size());
    vardel_ip_quarzel_pass pass{};
    pass.block = decoder.decodeCount();
    pass.pass = siso;
    pass.code = siso % 2 == 0 ? 2 : 1;
    pass.block_size = steps - TDecoder3G::tailSteps;
    pass.steps = steps;
    for (unsigned code = 0; code < 2; ++code) {
        pass.inputs[code][0] = decoder.systematic(code).data();
        pass.inputs[code][1] = decoder.parity0(code).data();
        pass.inputs[code][2] = decoder.parity1(code).data();
    }
    pass.intrinsic = decoder.intrinsic().data();
    pass.alpha = decoder.alpha().data()->element;
    pass.beta = decoder.beta().data()->element;
    pass.gamma = itsGamma.data();
    pass.llr = decoder.llr().data();
    pass.extrinsic = decoder.extrinsic().data();
    --itsCount;
    itsReceiver(itsCookie, &pass);
}

}  // namespace quarzel

int vardel_ip_quarzel_set_passes(vardel_ip_quarzel_state* state, unsigned int count,
                                 vardel_ip_quarzel_pass_receiver receiver, void* cookie) {
    if (state->passes == nullptr) {
        state->passes = new (std::nothrow) quarzel::PassPort;
        if (state->passes == nullptr) {
            quarzel::decoderError(state->messages, "Could not allocate memory for passes");
            return 1;
        }
    }
    state->passes->open(count, receiver, cookie);
    return 0;
}
