// SPDX-License-Identifier: MIT
#include "decoder/decoder_3g.hpp"

#include <algorithm>
#include <limits>

#include "decoder/error_count.hpp"
#include "engine/engine.hpp"
#include "interleaver/interleaver.hpp"

TDecoder3G* TDecoder3G::create(bool is3GPP2, const std::string& properties) {
    if (!properties.empty()) {
        quarzel::standardStreams.error({"ERROR:TDecoder3G:Unexpected properties ", properties});
        return nullptr;
    }
    return new TDecoder3G(is3GPP2);
}

std::string TDecoder3G::getProperties() const {
    return its3GPP2 ? "3GPP2" : "3GPP";
}

bool TDecoder3G::allocate(unsigned blockSize) {
    if (!TDecoder::allocate(blockSize)) {
        return false;
    }
    for (unsigned code = 0; code < 2; ++code) {
        for (std::vector<short>* stream : {&itsSys[code], &itsPar0[code], &itsPar1[code]}) {
            stream->clear();
            stream->reserve(blockSize);
        }
    }
    return true;
}

bool TDecoder3G::decode(const std::vector<short>& soft, std::vector<unsigned char>& hard,
                        unsigned iterations) {
    if (!extract(soft)) {
        return false;
    }
    for (unsigned iteration = 0; iteration < iterations; ++iteration) {
        if (!calcIteration(iteration)) {
            return false;
        }
    }
    hard.resize(itsLLR.size());
    itsSISOCount += 2ULL * iterations;
    ++itsDecodeCount;
    std::transform(itsLLR.begin(), itsLLR.end(), hard.begin(), decide);
    hard.resize(itsBlockSize - tailSteps);
    return true;
}

bool TDecoder3G::decode(const std::vector<short>& soft, const std::vector<unsigned char>& reference,
                        std::vector<unsigned long long>& bitErrors,
                        std::vector<unsigned long long>& blockErrors) {
    if (!extract(soft)) {
        return false;
    }
    for (unsigned iteration = 0; iteration < bitErrors.size(); ++iteration) {
        if (!calcIteration(iteration)) {
            return false;
        }
        itsLLR.resize(itsBlockSize - tailSteps);
        const unsigned long long errors =
            quarzel::countErrors(reference, itsLLR, [](short llr) { return decide(llr) != 0; });
        itsLLR.resize(itsBlockSize);
        bitErrors[iteration] += errors;
        blockErrors[iteration] += errors != 0 ? 1 : 0;
    }
    itsSISOCount += 2ULL * bitErrors.size();
    ++itsDecodeCount;
    return true;
}

bool TDecoder3G::calcIteration(unsigned iteration) {
    return calcSISO(2 * iteration) && calcSISO(2 * iteration + 1);
}

bool TDecoder3G::calcSISO(unsigned siso) {
    if (siso == 0 && !startExtrinsic()) {
        return false;
    }
    if (!calcIntrinsic(siso) || !calcGamma(siso) || !calcAlpha(siso) || !calcBeta(siso) || !calcLLR(siso) ||
        !calcExtrinsic(siso)) {
        return false;
    }
    if (itsPassListener != nullptr) {
        itsPassListener->passEnded(*this, siso);
    }
    return checkDump(siso);
}

/// The a-priori values of the first pass: the caller's, used once, or none.
bool TDecoder3G::startExtrinsic() {
    if (itsExtrinsicIn.empty()) {
        std::fill(itsExtrinsic.begin(), itsExtrinsic.end(), short{0});
        return true;
    }
    if (itsExtrinsicIn.size() != itsBlockSize) {
        itsMessages.error({"ERROR:TDecoder3G:Number of soft extrinsic inputs does not match block size"});
        return false;
    }
    const std::int16_t mask = itsEngine->stateFormat()->mask;
    std::transform(itsExtrinsicIn.begin(), itsExtrinsicIn.end(), itsExtrinsic.begin(),
                   [mask](short value) { return static_cast<short>(value & mask); });
    itsExtrinsicIn.clear();
    return true;
}

bool TDecoder3G::calcIntrinsic(unsigned siso) {
    const unsigned set = inputSet(siso);
    const unsigned K = itsBlockSize - tailSteps;
    if (set == 0 && itsInterleaver->itsInversePermutation.size() != K) {
        itsInterleaver->calcDeinterleaver(itsInterleaver->itsInversePermutation, K);
    } else if (set == 1 && itsInterleaver->itsPermutation.size() != K) {
        itsInterleaver->calcInterleaver(itsInterleaver->itsPermutation, K);
    }
    const auto& permutation =
        set == 0 ? itsInterleaver->itsInversePermutation : itsInterleaver->itsPermutation;
    const std::int32_t mask = itsEngine->stateFormat()->mask;
    // Both divisions truncate toward zero; the result is the channel and a-priori value at half scale.
    const auto intrinsic = [mask](std::int32_t systematic, std::int32_t extrinsic) {
        return static_cast<short>((systematic + ((extrinsic / 2) & mask)) / 2);
    };
    for (unsigned step = 0; step < K; ++step) {
        itsIntrinsic[step] = intrinsic(itsSys[set][step], itsExtrinsic[permutation[step]]);
    }
    for (unsigned step = K; step < itsBlockSize; ++step) {
        itsIntrinsic[step] = intrinsic(itsSys[set][step], 0);
    }
    return true;
}

bool TDecoder3G::calcGamma(unsigned siso) {
    return calcGamma(siso, 0, itsBlockSize - 1);
}

bool TDecoder3G::calcGamma(unsigned siso, unsigned first, unsigned last) {
    const unsigned set = inputSet(siso);
    return itsEngine->gamma(last - first + 1, &itsIntrinsic[first], &itsPar0[set][first],
                            &itsPar1[set][first], &itsGamma[first]) != nullptr;
}

bool TDecoder3G::calcAlpha(unsigned siso) {
    setInitialState(&itsAlpha[0]);
    return calcAlpha(siso, 0, itsBlockSize - 1);
}

bool TDecoder3G::calcAlpha(unsigned /*siso*/, unsigned first, unsigned last) {
    return itsEngine->alpha(last - first + 1, &itsGamma[first], &itsAlpha[first]) != nullptr;
}

bool TDecoder3G::calcBeta(unsigned siso) {
    setInitialState(&itsBeta[itsBlockSize - 1]);
    return calcBeta(siso, itsBlockSize - 1, 0);
}

bool TDecoder3G::calcBeta(unsigned /*siso*/, unsigned first, unsigned last) {
    return itsEngine->beta(first - last + 1, &itsGamma[first], &itsBeta[first]) != nullptr;
}

bool TDecoder3G::calcLLR(unsigned siso) {
    return calcLLR(siso, 0, itsBlockSize - 1);
}

bool TDecoder3G::calcLLR(unsigned /*siso*/, unsigned first, unsigned last) {
    return itsEngine->llr(last - first + 1, &itsAlpha[first], &itsBeta[first], &itsGamma[first],
                          &itsLLR[first]) != nullptr;
}

namespace {

/// A real factor, truncated toward zero; a product that is no 32-bit integer gives the nearest one.
std::int32_t scaled(std::int32_t value, double factor) {
    const double product = value * factor;
    constexpr double limit = std::numeric_limits<std::int32_t>::max();
    if (product >= limit) {
        return std::numeric_limits<std::int32_t>::max();
    }
    return product > -limit ? static_cast<std::int32_t>(product) : std::numeric_limits<std::int32_t>::min();
}

}  // namespace

bool TDecoder3G::calcExtrinsic(unsigned /*siso*/) {
    const TNumberFormat& state = *itsEngine->stateFormat();
    const TNumberFormat& branch = *itsEngine->gammaFormat();
    // The range of the branch metrics, at the alignment of the state metrics.
    const std::uint32_t narrower = (state.nbits - branch.nbits) & 31U;
    const std::int32_t lo = branch.min >> narrower;
    const std::int32_t hi = branch.max >> narrower;
    // The unscaled values keep bits below the state format's precision, as the core does.
    const std::int32_t mask = itsExtrinsicScale == 1.0 ? -1 : state.mask;
    const auto scale = [factor = itsExtrinsicScale](std::int32_t value) {
        if (factor == 1.0) {
            return value;
        }
        return factor == 0.75 ? 3 * value / 4 : scaled(value, factor);
    };
    for (unsigned step = 0; step < itsBlockSize; ++step) {
        const std::int32_t extrinsic = scale(itsLLR[step] - 4 * itsIntrinsic[step]);
        const std::int32_t saturated = extrinsic > hi ? hi : std::max(extrinsic, lo);
        itsExtrinsic[step] = static_cast<short>(saturated & mask);
    }
    return true;
}

void TDecoder3G::setInitialState(T8* metrics) const {
    std::fill(std::begin(metrics->element), std::end(metrics->element),
              static_cast<short>(itsEngine->stateFormat()->min / 2));
    (*metrics)[0] = 0;
}

void TDecoder3G::setUnknownState(T8* metrics) {
    *metrics = T8{};
}
