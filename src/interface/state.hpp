// SPDX-License-Identifier: MIT
#pragma once

#include "fixed/messages.hpp"
#include "vardel_ip_quarzel.h"

class TCalculationEngine;
class TDecoder;
class TInterleaver;
class TNumberFormat;

namespace quarzel {
class LaneImplementation;
class PassPort;
}  // namespace quarzel

/// A model of one configured core. It owns its components; each pointer is null or the only one to its
/// object. The decoder refers to interleaver and engine, the engine to the formats.
struct vardel_ip_quarzel_state {
    vardel_ip_quarzel_generics generics;
    TDecoder* decoder;
    TInterleaver* interleaver;
    TCalculationEngine* engine;
    TNumberFormat* state_format;
    TNumberFormat* input_format;
    TNumberFormat* branch_format;
    unsigned char saturation_reported;      ///< the one warning of a saturated input has been given
    unsigned char tag_truncation_reported;  ///< the one warning of a truncated tag has been given
    unsigned int tag_mask;                  ///< the tag bits that come back

    quarzel::Messages messages;          ///< where all its lines go
    quarzel::PassPort* passes;           ///< null until somebody asks for passes
    quarzel::LaneImplementation* lanes;  ///< null: every block is decoded literally
};
