// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <ostream>
#include <vector>

#include "decoder/decoder_3gpu.hpp"
#include "fixed/number_format.hpp"
#include "vardel_ip_quarzel.h"

namespace quarzel::tool {

class TraceWriter;

/// The core's decoder, which hands its traces to a writer instead of the standard output stream.
class TraceDecoder : public TDecoder3GPU {
  public:
    /// @param units   processing units
    /// @param writer  not owned, must outlive the decoder
    TraceDecoder(unsigned units, TraceWriter& writer);

    void dumpInput(std::ostream& ignored) const override;
    void dumpFull(std::ostream& ignored, unsigned siso) override;

    /// A stream of the block's soft inputs, in the order of traceStreams.
    const std::vector<short>& stream(std::size_t number) const;

    /// The number format of every traced value.
    const TNumberFormat& format() const;

  private:
    TraceWriter& itsWriter;
};

/// Let a model hand its traces to a writer; vardel_ip_quarzel_bitacc_dump_config says how many there are to
/// be. For models that have decoded nothing yet. Such a model decodes every block step by step.
/// @param writer  not owned, must outlive the model
void traceTo(TraceWriter& writer, vardel_ip_quarzel_state& model);

}  // namespace quarzel::tool
