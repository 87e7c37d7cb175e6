// SPDX-License-Identifier: MIT
#include "decoder/decoder_3g.hpp"
#include "interleaver/interleaver.hpp"

bool TDecoder3G::extract(const std::vector<short>& soft) {
    const std::size_t rate = its3GPP2 ? 5 : 3;
    const std::size_t tail = its3GPP2 ? 18 : 12;
    if (soft.size() < tail || (soft.size() - tail) % rate != 0) {
        itsMessages.error(
            {"ERROR:TDecoder3G:Number of soft inputs does not match rate and number of tail bits"});
        return false;
    }
    const auto K = static_cast<unsigned>((soft.size() - tail) / rate);
    if (!allocate(K + tailSteps)) {
        return false;
    }
    // Without information bits there is nothing to permute, and no table to be had. A size that the
    // interleaver refuses is not asked for: it would reserve memory for it first.
    std::vector<std::uint32_t>& permutation = itsInterleaver->itsPermutation;
    if (permutation.size() != K) {
        const bool computed = (K == 0 || itsInterleaver->valid(K)) &&
                              itsInterleaver->calcInterleaver(permutation, K) && permutation.size() >= K;
        if (!computed && K != 0) {
            itsMessages.error(
                {"ERROR:TDecoder3G:The interleaver has no block size of ", quarzel::Decimal(K), " bits"});
            return false;
        }
    }

    if (!its3GPP2) {
        itsPar1[0].assign(K + tailSteps, 0);
        itsPar1[1].assign(K + tailSteps, 0);
    }
    auto next = soft.begin();
    for (unsigned bit = 0; bit < K; ++bit) {
        itsSys[0].push_back(*next++);
        for (unsigned code = 0; code < 2; ++code) {
            itsPar0[code].push_back(*next++);
            if (its3GPP2) {
                itsPar1[code].push_back(*next++);
            }
        }
    }
    for (unsigned bit = 0; bit < K; ++bit) {
        itsSys[1].push_back(itsSys[0][permutation[bit]]);
    }
    for (unsigned code = 0; code < 2; ++code) {
        for (unsigned step = 0; step < tailSteps; ++step) {
            itsSys[code].push_back(*next++);
            itsPar0[code].push_back(*next++);
            if (its3GPP2) {
                itsPar1[code].push_back(*next++);
            }
        }
    }
    if (itsDumpCount != 0) {
        itsMessages.traceText([this](std::ostream& stream) { dumpInput(stream); });
    }
    return true;
}
