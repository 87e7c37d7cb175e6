// SPDX-License-Identifier: MIT
#include "interleaver/interleaver_3gpplte.hpp"

#include <algorithm>

#include "fixed/messages.hpp"
#include "interleaver/lte_params.hpp"

namespace {

/// The row of K, or null when there is none.
const LteParams* findParams(unsigned K) {
    const auto* const row =
        std::lower_bound(lteParams.begin(), lteParams.end(), K,
                         [](const LteParams& params, unsigned size) { return params.K < size; });
    return row != lteParams.end() && row->K == K ? row : nullptr;
}

}  // namespace

TInterleaver3GPPLTE* TInterleaver3GPPLTE::create(const std::string& properties) {
    if (!properties.empty()) {
        quarzel::standardStreams.error({"ERROR:TInterleaver3GPPLTE:Unexpected properties:", properties});
        return nullptr;
    }
    return new TInterleaver3GPPLTE;
}

bool TInterleaver3GPPLTE::calcInterleaver(std::vector<std::uint32_t>& out, unsigned K) const {
    out.clear();
    out.reserve(K);
    const LteParams* params = findParams(K);
    if (params == nullptr) {
        return false;
    }
    // Steps of the polynomial, as the hardware's address generator adds them up: nothing exceeds 2K, while
    // the product f2 i^2 of a large block would not fit 32 bits.
    const std::uint32_t increment = (2 * params->f2) % K;
    std::uint32_t step = (params->f1 + params->f2) % K;
    std::uint32_t position = 0;
    for (unsigned i = 0; i < K; ++i) {
        out.push_back(position);
        position += step;
        if (position >= K) {
            position -= K;
        }
        step += increment;
        if (step >= K) {
            step -= K;
        }
    }
    return true;
}

std::string TInterleaver3GPPLTE::getProperties() const {
    return "3GPPLTE";
}

bool TInterleaver3GPPLTE::valid(unsigned K) const {
    return findParams(K) != nullptr;
}
