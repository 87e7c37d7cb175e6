// SPDX-License-Identifier: MIT
#include "interleaver/interleaver.hpp"

#include "fixed/properties.hpp"
#include "interleaver/interleaver_3gpplte.hpp"

TInterleaver* TInterleaver::create(const std::string& properties) {
    const auto [type, rest] = splitString(properties, ":");
    if (type == "3GPPLTE") {
        return TInterleaver3GPPLTE::create(rest);
    }
    quarzel::standardStreams.error({"ERROR:TInterleaver:Unrecognised type:", type});
    return nullptr;
}

std::vector<std::string> TInterleaver::getNames() {
    return {"3GPPLTE"};
}

bool TInterleaver::calcDeinterleaver(std::vector<std::uint32_t>& out, unsigned K) const {
    if (itsPermutation.size() != K) {
        calcInterleaver(itsPermutation, K);
    }
    const std::size_t size = itsPermutation.size();
    out.resize(size);
    itsInversePermutation.resize(size);
    for (std::uint32_t i = 0; i < size; ++i) {
        itsInversePermutation[itsPermutation[i]] = i;
    }
    return true;
}

bool TInterleaver::valid(unsigned K) const {
    return K != 0;
}

void TInterleaver::dumpAll(unsigned first, unsigned last, bool showK) const {
    for (std::uint64_t size = first; size <= last; ++size) {
        const auto K = static_cast<unsigned>(size);
        if (!valid(K)) {
            continue;
        }
        if (itsPermutation.size() != K) {
            calcInterleaver(itsPermutation, K);
        }
        std::string line = showK ? std::to_string(K) + ": " : "";
        const char* separator = "";
        for (const std::uint32_t entry : itsPermutation) {
            line.append(separator).append(std::to_string(entry));
            separator = " ";
        }
        itsMessages.trace({line});
    }
}
