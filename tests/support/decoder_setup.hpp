// SPDX-License-Identifier: MIT
#pragma once

#include <memory>
#include <random>
#include <string>
#include <utility>
#include <vector>

#include "interleaver/interleaver.hpp"
#include "support/engine_setup.hpp"

namespace quarzel::test {

/// A decoder that shows its work storage, with interleaver and engine of its own.
template <class Decoder>
struct OpenDecoder : Decoder {
    EngineSetup engine;
    std::unique_ptr<TInterleaver> interleaver{TInterleaver::create("3GPPLTE")};

    template <class... Arguments>
    explicit OpenDecoder(const std::string& engineProperties, Arguments... arguments)
        : Decoder(arguments...), engine(engineProperties) {
        this->connect(interleaver.get(), engine.engine.get());
    }

    using Decoder::its3GPP2;
    using Decoder::itsAlpha;
    using Decoder::itsBeta;
    using Decoder::itsBlockSize;
    using Decoder::itsDecodeCount;
    using Decoder::itsDumpCount;
    using Decoder::itsExtrinsic;
    using Decoder::itsGamma;
    using Decoder::itsIntrinsic;
    using Decoder::itsLLR;
    using Decoder::itsPar0;
    using Decoder::itsPar1;
    using Decoder::itsSISOCount;
    using Decoder::itsSys;
    using Decoder::setInitialState;
    using Decoder::setUnknownState;
};

/// Soft values of `size` positions as the fixed formats have them: multiples of 16 within an 8-bit range.
inline std::vector<short> randomSoft(std::size_t size, unsigned seed, int magnitude = 40) {
    std::mt19937 random(seed);
    std::uniform_int_distribution<int> value(-magnitude, magnitude);
    std::vector<short> soft(size);
    for (short& s : soft) {
        s = static_cast<short>(16 * value(random));
    }
    return soft;
}

}  // namespace quarzel::test
