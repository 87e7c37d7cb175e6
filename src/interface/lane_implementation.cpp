// SPDX-License-Identifier: MIT
#include "interface/lane_implementation.hpp"

#include <typeinfo>
#include <utility>
#include <vector>

#include "decoder/decoder_3gpu.hpp"
#include "engine/engine_mod.hpp"
#include "engine/engine_mod_hash.hpp"
#include "interface/pass_port.hpp"
#include "interface/wiring.hpp"
#include "interleaver/interleaver_3gpplte.hpp"

namespace quarzel {

namespace {

/// A component as the class that it was created as; null when it is of another one, derived ones included.
template <class Class, class Base>
Class* exactly(Base* component) {
    return component != nullptr && typeid(*component) == typeid(Class) ? static_cast<Class*>(component)
                                                                       : nullptr;
}

bool isEqual(const TNumberFormat* format, const TNumberFormat& wanted) {
    return format != nullptr && *format == wanted;
}

/// Give an interleaver the tables of the block size that lanes decoded last, unless it has others.
void restoreTables(TInterleaver* interleaver, std::uint32_t K) {
    if (K == 0 || exactly<TInterleaver3GPPLTE>(interleaver) == nullptr) {
        return;
    }
    const TInterleaver3GPPLTE fresh;
    fresh.calcDeinterleaver(fresh.itsInversePermutation, K);
    if (interleaver->itsPermutation.empty()) {
        interleaver->itsPermutation = fresh.itsPermutation;
    }
    if (interleaver->itsInversePermutation.empty()) {
        interleaver->itsInversePermutation = fresh.itsInversePermutation;
    }
}

}  // namespace

void LaneImplementation::choose(const lanes::Candidate* candidate) {
    itsOn = candidate != nullptr;
    if (itsOn) {
        itsDecoder.choose(*candidate);
    }
}

bool LaneImplementation::fits(const vardel_ip_quarzel_state& state) const {
    const auto* const decoder = exactly<const TDecoder3GPU>(std::as_const(state.decoder));
    if (!itsOn || decoder == nullptr || decoder->is3GPP2() || decoder->threads() != itsThreads ||
        decoder->extrinsicScale() != extrinsicScale(itsAlgorithm)) {
        return false;
    }
    // Whoever could see a pass, or change what one does, wants a literal decode.
    if (decoder->dumpCount() != 0 || decoder->verbosity() != 0 || !decoder->extrinsicIn().empty() ||
        (state.passes != nullptr && state.passes->pending())) {
        return false;
    }
    const TCalculationEngine* const engine = decoder->engine();
    if (itsAlgorithm == 2) {
        const auto* const hash = exactly<const TCalculationEngineModHash>(engine);
        if (hash == nullptr || hash->points() != 16 || hash->tableFormat() != itsStateFormat) {
            return false;
        }
    } else if (exactly<const TCalculationEngineMod>(engine) == nullptr) {
        return false;
    }
    return isEqual(engine->stateFormat(), itsStateFormat) &&
           isEqual(engine->gammaFormat(), itsBranchFormat) && isEqual(state.state_format, itsStateFormat) &&
           isEqual(state.input_format, itsBranchFormat) &&
           exactly<const TInterleaver3GPPLTE>(std::as_const(*decoder).interleaver()) != nullptr;
}

bool LaneImplementation::fitsSize(const vardel_ip_quarzel_state& state, std::uint32_t K) {
    const TInterleaver& interleaver = *state.decoder->interleaver();
    const bool hasTable = interleaver.itsPermutation.size() == K;
    const bool hasInverse = interleaver.itsInversePermutation.size() == K;
    if (itsDecoder.knows(K) && !hasTable && !hasInverse) {
        return true;
    }
    std::vector<std::uint32_t> permutation;
    if (!interleaver.valid(K) || !interleaver.calcInterleaver(permutation, K)) {
        return false;
    }
    if (hasTable && interleaver.itsPermutation != permutation) {
        return false;
    }
    for (std::uint32_t i = 0; hasInverse && i < K; ++i) {
        if (interleaver.itsInversePermutation[permutation[i]] != i) {
            return false;
        }
    }
    if (itsDecoder.knows(K)) {
        return true;
    }
    const std::uint32_t segments = threadSegments(K, itsThreads);
    LaneSchedule schedule;
    schedule.permutation = std::move(permutation);
    schedule.segments = segments;
    schedule.windowLength = windowLengths(K / segments);
    return K % segments == 0 && itsDecoder.add(schedule);
}

bool LaneImplementation::decode(vardel_ip_quarzel_state& state, std::uint32_t K, const LaneCall& call) {
    TDecoder& decoder = *state.decoder;
    if (itsServed != &decoder || itsServedCount != decoder.decodeCount()) {
        // Another decoder, or one that has decoded literally since.
        itsHistory.forget();
        itsDecoder.forgetLast();
    }
    itsHistory.keep(itsDecoder, K);
    const bool saturated = itsDecoder.decode(K, call);
    // A literal decode would leave the tables of this size: `settle` computes them where they are missed.
    decoder.interleaver()->itsPermutation.clear();
    decoder.interleaver()->itsInversePermutation.clear();
    const std::uint64_t blocks = call.blocks.size();
    decoder.setCounts(decoder.decodeCount() + blocks, decoder.sisoCount() + 2ULL * call.iterations * blocks);
    itsServed = &decoder;
    itsServedCount = decoder.decodeCount();
    return saturated;
}

void LaneImplementation::settle(TDecoder& decoder) {
    if (itsServed == &decoder && itsServedCount == decoder.decodeCount()) {
        restoreTables(decoder.interleaver(), itsDecoder.lastSize());
        itsHistory.keep(itsDecoder, 0);
        itsDecoder.forgetLast();
        itsHistory.replay(static_cast<TDecoder3GPU&>(decoder), itsDecoder, itsAlgorithm);
    }
}

bool takesLanes(const vardel_ip_quarzel_state& state, std::uint32_t K) {
    return state.lanes != nullptr && state.lanes->fits(state) && state.lanes->fitsSize(state, K);
}

}  // namespace quarzel
