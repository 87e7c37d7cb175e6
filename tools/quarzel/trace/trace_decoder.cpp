// SPDX-License-Identifier: MIT
#include "trace/trace_decoder.hpp"

#include <array>
#include <memory>

#include "engine/engine.hpp"
#include "interface/state.hpp"
#include "trace/trace_writer.hpp"

namespace quarzel::tool {

namespace {

constexpr unsigned threadsPerUnit = 4;

}  // namespace

TraceDecoder::TraceDecoder(unsigned units, TraceWriter& writer)
    : TDecoder3GPU(false, units, threadsPerUnit), itsWriter(writer) {}

void TraceDecoder::dumpInput(std::ostream& /*ignored*/) const {
    itsWriter.writeInputs(*this);
}

void TraceDecoder::dumpFull(std::ostream& /*ignored*/, unsigned siso) {
    itsWriter.writePass(*this, siso);
}

const std::vector<short>& TraceDecoder::stream(std::size_t number) const {
    const std::array<const std::vector<short>*, 6> streams = {&itsSys[0], &itsPar0[0], &itsPar1[0],
                                                              &itsSys[1], &itsPar0[1], &itsPar1[1]};
    return *streams.at(number);
}

const TNumberFormat& TraceDecoder::format() const {
    return *itsEngine->stateFormat();
}

void traceTo(TraceWriter& writer, vardel_ip_quarzel_state& model) {
    auto decoder = std::make_unique<TraceDecoder>(static_cast<unsigned>(model.generics.C_NUM_PU), writer);
    decoder->connect(model.interleaver, model.engine);
    decoder->setExtrinsicScale(model.decoder->extrinsicScale());
    delete model.decoder;
    model.decoder = decoder.release();
}

}  // namespace quarzel::tool
