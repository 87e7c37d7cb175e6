// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <iosfwd>
#include <vector>

#include "engine/engine.hpp"

/// What the engines in modulo arithmetic share: the kernels of the three algorithm types and the choice
/// between them.
///
/// The sse2_ entry points give the same bits as the plain kernels; each forwards to the one of its name.
class TCalculationEngineModBase : public TCalculationEngine {
  public:
    /// How a recursion chooses between two candidates.
    enum class AlgorithmType : int {
        Mod = 1,      ///< "MOD": max-log
        ModStar = 2,  ///< "MOD*": max-star, correction applied at once
        ModHash = 3,  ///< "MOD#": max-star, correction applied one level later
    };

    T8* gamma(unsigned n, const short* intrinsic, const short* parity0, const short* parity1,
              T8* out) override;
    T8* alpha(unsigned n, const T8* gamma, T8* alpha) override;
    T8* beta(unsigned n, const T8* gamma, T8* beta) override;
    short* llr(unsigned n, const T8* alpha, const T8* beta, const T8* gamma, short* out) override;

    /// Build a table of the max-star correction ln(1 + e^-|d|).
    ///
    /// @param points  resolution: how many steps cover the differences from 0 to 8; a power of two, or 0 for
    /// 65536
    /// @param format  the state format
    /// @return 65536 bytes, entry j belonging to the difference j - 32768, each left-aligned as the metrics
    /// are;
    ///         empty after a line on the standard error stream when points or format do not fit
    /// @param messages  where the line goes
    static std::vector<unsigned char> createLUT(unsigned points, const TNumberFormat* format,
                                                const quarzel::Messages& messages = quarzel::standardStreams);

    /// The entry of a correction table that belongs to difference 0.
    static constexpr std::size_t lutCentre = 32768;

    T8* mod_gamma(unsigned n, const short* intrinsic, const short* parity0, const short* parity1,
                  T8* out) const;
    T8* mod_alpha(unsigned n, const T8* gamma, T8* alpha) const;
    T8* mod_beta(unsigned n, const T8* gamma, T8* beta) const;
    short* mod_llr(unsigned n, const T8* alpha, const T8* beta, const T8* gamma, short* out) const;
    T8* modstar_alpha(unsigned n, const T8* gamma, T8* alpha) const;
    T8* modstar_beta(unsigned n, const T8* gamma, T8* beta) const;
    short* modstar_llr(unsigned n, const T8* alpha, const T8* beta, const T8* gamma, short* out) const;
    T8* modhash_alpha(unsigned n, const T8* gamma, T8* alpha) const;
    T8* modhash_beta(unsigned n, const T8* gamma, T8* beta) const;
    short* modhash_llr(unsigned n, const T8* alpha, const T8* beta, const T8* gamma, short* out) const;

    T8* sse2_mod_gamma(unsigned n, const short* intrinsic, const short* parity0, const short* parity1,
                       T8* out) const;
    T8* sse2_mod_alpha(unsigned n, const T8* gamma, T8* alpha) const;
    T8* sse2_mod_beta(unsigned n, const T8* gamma, T8* beta) const;
    short* sse2_mod_llr(unsigned n, const T8* alpha, const T8* beta, const T8* gamma, short* out) const;
    T8* sse2_modstar_alpha(unsigned n, const T8* gamma, T8* alpha) const;
    T8* sse2_modstar_beta(unsigned n, const T8* gamma, T8* beta) const;
    short* sse2_modstar_llr(unsigned n, const T8* alpha, const T8* beta, const T8* gamma, short* out) const;
    T8* sse2_modhash_alpha(unsigned n, const T8* gamma, T8* alpha) const;
    T8* sse2_modhash_beta(unsigned n, const T8* gamma, T8* beta) const;
    short* sse2_modhash_llr(unsigned n, const T8* alpha, const T8* beta, const T8* gamma, short* out) const;

  protected:
    /// All recursions by one algorithm type, with the centre entry of one correction table (null for
    /// max-log).
    void select(AlgorithmType type, const unsigned char* lut);

    AlgorithmType itsAlphaAlgorithm = AlgorithmType::Mod;
    AlgorithmType itsBetaAlgorithm = AlgorithmType::Mod;
    AlgorithmType itsLLRAlgorithm = AlgorithmType::Mod;
    const unsigned char* itsAlphaLUT = nullptr;  ///< centre entry of a correction table; not owned
    const unsigned char* itsBetaLUT = nullptr;
    const unsigned char* itsLLRLUT = nullptr;
};

/// "MOD", "MOD*" or "MOD#"; "<unknown>" for any other value.
std::ostream& operator<<(std::ostream& stream, TCalculationEngineModBase::AlgorithmType type);

/// Read "MOD", "MOD*" or "MOD#" in any case. Takes no more than what it understood; a text that is none of
/// them gives the value 0 and does not fail the stream.
std::istream& operator>>(std::istream& stream, TCalculationEngineModBase::AlgorithmType& type);
