// SPDX-License-Identifier: MIT
#include <iostream>
#include <string>

#include "decoder/decoder_3g.hpp"
#include "fixed/text_output.hpp"
#include "interleaver/interleaver.hpp"

using quarzel::errorLine;

bool TDecoder3G::extract(const std::vector<short>& soft) {
    const std::size_t rate = its3GPP2 ? 5 : 3;
    const std::size_t tail = its3GPP2 ? 18 : 12;
    if (soft.size() < tail || (soft.size() - tail) % rate != 0) {
        errorLine("ERROR:TDecoder3G:Number of soft inputs does not match rate and number of tail bits");
        return false;
    }
    const auto K = static_cast<unsigned>((soft.size() - tail) / rate);
    if (!allocate(K + tailSteps)) {
        return false;
    }
    // Without information bits there is nothing to permute, and no table to be had.
    if (itsInterleaver->itsPermutation.size() != K &&
        !itsInterleaver->calcInterleaver(itsInterleaver->itsPermutation, K) && K != 0) {
        errorLine("ERROR:TDecoder3G:The interleaver has no block size of " + std::to_string(K) + " bits");
        return false;
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
    for (const std::uint32_t position : itsInterleaver->itsPermutation) {
        itsSys[1].push_back(itsSys[0][position]);
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
        dumpInput(std::cout);
    }
    return true;
}
