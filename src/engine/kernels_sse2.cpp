// SPDX-License-Identifier: MIT
// The sse2_ entry points: same signatures and bits as the plain kernels.
#include "engine/engine_mod_base.hpp"

T8* TCalculationEngineModBase::sse2_mod_gamma(unsigned n, const short* intrinsic, const short* parity0,
                                              const short* parity1, T8* out) const {
    return mod_gamma(n, intrinsic, parity0, parity1, out);
}

T8* TCalculationEngineModBase::sse2_mod_alpha(unsigned n, const T8* gamma, T8* alpha) const {
    return mod_alpha(n, gamma, alpha);
}

T8* TCalculationEngineModBase::sse2_mod_beta(unsigned n, const T8* gamma, T8* beta) const {
    return mod_beta(n, gamma, beta);
}

short* TCalculationEngineModBase::sse2_mod_llr(unsigned n, const T8* alpha, const T8* beta, const T8* gamma,
                                               short* out) const {
    return mod_llr(n, alpha, beta, gamma, out);
}

T8* TCalculationEngineModBase::sse2_modstar_alpha(unsigned n, const T8* gamma, T8* alpha) const {
    return modstar_alpha(n, gamma, alpha);
}

T8* TCalculationEngineModBase::sse2_modstar_beta(unsigned n, const T8* gamma, T8* beta) const {
    return modstar_beta(n, gamma, beta);
}

short* TCalculationEngineModBase::sse2_modstar_llr(unsigned n, const T8* alpha, const T8* beta,
                                                   const T8* gamma, short* out) const {
    return modstar_llr(n, alpha, beta, gamma, out);
}

T8* TCalculationEngineModBase::sse2_modhash_alpha(unsigned n, const T8* gamma, T8* alpha) const {
    return modhash_alpha(n, gamma, alpha);
}

T8* TCalculationEngineModBase::sse2_modhash_beta(unsigned n, const T8* gamma, T8* beta) const {
    return modhash_beta(n, gamma, beta);
}

short* TCalculationEngineModBase::sse2_modhash_llr(unsigned n, const T8* alpha, const T8* beta,
                                                   const T8* gamma, short* out) const {
    return modhash_llr(n, alpha, beta, gamma, out);
}
