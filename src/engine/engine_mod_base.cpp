// SPDX-License-Identifier: MIT
#include "engine/engine_mod_base.hpp"

void TCalculationEngineModBase::select(AlgorithmType type, const unsigned char* lut) {
    itsAlphaAlgorithm = itsBetaAlgorithm = itsLLRAlgorithm = type;
    itsAlphaLUT = itsBetaLUT = itsLLRLUT = lut;
}

T8* TCalculationEngineModBase::gamma(unsigned n, const short* intrinsic, const short* parity0,
                                     const short* parity1, T8* out) {
    return itsSSE2 ? sse2_mod_gamma(n, intrinsic, parity0, parity1, out)
                   : mod_gamma(n, intrinsic, parity0, parity1, out);
}

T8* TCalculationEngineModBase::alpha(unsigned n, const T8* gamma, T8* alpha) {
    switch (itsAlphaAlgorithm) {
        case AlgorithmType::Mod:
            return itsSSE2 ? sse2_mod_alpha(n, gamma, alpha) : mod_alpha(n, gamma, alpha);
        case AlgorithmType::ModStar:
            return itsSSE2 ? sse2_modstar_alpha(n, gamma, alpha) : modstar_alpha(n, gamma, alpha);
        case AlgorithmType::ModHash:
            return itsSSE2 ? sse2_modhash_alpha(n, gamma, alpha) : modhash_alpha(n, gamma, alpha);
    }
    itsMessages.error({"ERROR:TCalculationEngineModBase::alpha:Illegal algorithm type"});
    return nullptr;
}

T8* TCalculationEngineModBase::beta(unsigned n, const T8* gamma, T8* beta) {
    switch (itsBetaAlgorithm) {
        case AlgorithmType::Mod:
            return itsSSE2 ? sse2_mod_beta(n, gamma, beta) : mod_beta(n, gamma, beta);
        case AlgorithmType::ModStar:
            return itsSSE2 ? sse2_modstar_beta(n, gamma, beta) : modstar_beta(n, gamma, beta);
        case AlgorithmType::ModHash:
            return itsSSE2 ? sse2_modhash_beta(n, gamma, beta) : modhash_beta(n, gamma, beta);
    }
    itsMessages.error({"ERROR:TCalculationEngineModBase::beta:Illegal algorithm type"});
    return nullptr;
}

short* TCalculationEngineModBase::llr(unsigned n, const T8* alpha, const T8* beta, const T8* gamma,
                                      short* out) {
    switch (itsLLRAlgorithm) {
        case AlgorithmType::Mod:
            return itsSSE2 ? sse2_mod_llr(n, alpha, beta, gamma, out) : mod_llr(n, alpha, beta, gamma, out);
        case AlgorithmType::ModStar:
            return itsSSE2 ? sse2_modstar_llr(n, alpha, beta, gamma, out)
                           : modstar_llr(n, alpha, beta, gamma, out);
        case AlgorithmType::ModHash:
            return itsSSE2 ? sse2_modhash_llr(n, alpha, beta, gamma, out)
                           : modhash_llr(n, alpha, beta, gamma, out);
    }
    itsMessages.error({"ERROR:TCalculationEngineModBase::llr:Illegal algorithm type"});
    return nullptr;
}
