// SPDX-License-Identifier: MIT
// The choice between the two roads, and what keeps it invisible.
#include <algorithm>
#include <tuple>
#include <typeinfo>
#include <utility>

#include "decoder/decoder_3gpu.hpp"
#include "decoder/lane_decode.hpp"
#include "engine/engine_mod.hpp"
#include "engine/engine_mod_hash.hpp"
#include "interleaver/interleaver_3gpplte.hpp"

using quarzel::LaneBlock;

void TDecoder3GPU::enableLanes() {
    enableLanes(quarzel::lanes::bestCandidate());
}

void TDecoder3GPU::enableLanes(const quarzel::lanes::Candidate& candidate) {
    settleLaneBlocks();
    itsLanes = std::make_unique<quarzel::LaneDecoder>(itsNumPU * itsNumThreads, candidate);
}

void TDecoder3GPU::disableLanes() {
    settleLaneBlocks();
    itsLanes.reset();
}

/// The algorithm type that lanes have a kernel for, or -1 when the wiring is another than theirs.
int TDecoder3GPU::laneAlgorithm() const {
    const TCalculationEngine& engine = *itsEngine;
    const auto isFormat = [](const TNumberFormat* format, std::uint32_t nbits) {
        return format != nullptr && format->nbits == nbits && format->binpt == 3;
    };
    if (!isFormat(engine.stateFormat(), 12) || !isFormat(engine.gammaFormat(), 8)) {
        return -1;
    }
    if (typeid(engine) == typeid(TCalculationEngineMod)) {
        return itsExtrinsicScale == 1.0 ? 0 : itsExtrinsicScale == 0.75 ? 1 : -1;
    }
    if (typeid(engine) == typeid(TCalculationEngineModHash)) {
        const auto& hash = static_cast<const TCalculationEngineModHash&>(engine);
        return hash.points() == 16 && hash.initialised() && itsExtrinsicScale == 1.0 ? 2 : -1;
    }
    return -1;
}

bool TDecoder3GPU::takesLanes(unsigned K) {
    // Anything that could see a pass, or change what one does, wants the literal road.
    const bool watched = itsDumpCount != 0 || itsVerbosity != 0 || !itsExtrinsicIn.empty();
    const auto& self = *this;
    const TInterleaver& interleaver = *itsInterleaver;
    return itsLanes != nullptr && !watched && !its3GPP2 && typeid(self) == typeid(TDecoder3GPU) &&
           typeid(interleaver) == typeid(TInterleaver3GPPLTE) && laneAlgorithm() >= 0 &&
           itsLanes->prepare(K, interleaver);
}

bool TDecoder3GPU::decodeLanes(unsigned K, unsigned iterations, std::span<const LaneBlock> blocks) {
    growMetricStore(K + tailSteps);
    rememberLaneBlock(K);
    const bool saturated = itsLanes->decode(K, iterations, laneAlgorithm(), blocks);
    itsDecodeCount += blocks.size();
    itsSISOCount += 2ULL * iterations * blocks.size();
    return saturated;
}

/// Keep the last block of the fast road unless a block of `next` bits, which follows, covers it: it is
/// decoded again if somebody looks at the metrics it would have left. A block covers those of its size and
/// below before it.
void TDecoder3GPU::rememberLaneBlock(std::uint32_t next) {
    const std::uint32_t K = itsLanes->lastSize();
    if (K > next) {
        LaneRecord& record = itsLaneRecords[K];
        record.live = true;
        record.iterations = itsLanes->lastIterations();
        itsLanes->readLast(record.soft);
    }
    for (auto covered = itsLaneRecords.lower_bound(next); covered != itsLaneRecords.end(); ++covered) {
        covered->second.live = false;
    }
}

/// Bring the metric store to what literal decodes of all blocks would have left there. A trace shows it at
/// the termination steps, which no pass of the parallel decoder computes.
void TDecoder3GPU::settleLaneBlocks() {
    if (itsLanes == nullptr || itsLanes->lastSize() == 0) {
        return;
    }
    rememberLaneBlock(0);
    itsLanes->forgetLast();
    const auto settings = std::tuple(itsDumpCount, itsVerbosity, itsDecodeCount, itsSISOCount);
    std::vector<short> extrinsicIn = std::exchange(itsExtrinsicIn, {});
    itsDumpCount = itsVerbosity = 0;
    std::vector<unsigned char> ignored;
    for (auto& [K, record] : itsLaneRecords) {
        if (std::exchange(record.live, false)) {
            std::vector<short> soft(record.soft.size());
            std::transform(record.soft.begin(), record.soft.end(), soft.begin(),
                           [](std::int8_t value) { return static_cast<short>(16 * value); });
            TDecoder3G::decode(soft, ignored, record.iterations);
        }
    }
    std::tie(itsDumpCount, itsVerbosity, itsDecodeCount, itsSISOCount) = settings;
    itsExtrinsicIn = std::move(extrinsicIn);
}

bool TDecoder3GPU::extract(const std::vector<short>& soft) {
    settleLaneBlocks();
    return TDecoder3G::extract(soft);
}
