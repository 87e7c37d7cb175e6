// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

#include "engine/t8.hpp"
#include "fixed/messages.hpp"
#include "fixed/number_format.hpp"

/// The trellis arithmetic of a constituent decoder: branch metrics, forward and backward recursion, and
/// log-likelihood ratios over a range of trellis steps.
///
/// All values are left-aligned 16-bit words of the state format. State metrics are never normalised: they
/// wrap modulo 2^16. The kernels read the engine and keep everything else in locals, so that calls on
/// disjoint arrays may run at the same time once `initialise` is done.
class TCalculationEngine {
  public:
    /// Make an engine from its property string: "MOD", or "MOD#" with an optional ":" number of table points.
    /// @return a new engine that the caller deletes, or null after a line on the standard error stream
    static TCalculationEngine* create(const std::string& properties);

    /// The type names on offer. "MOD#" can be created all the same.
    static std::vector<std::string> getNames();

    virtual ~TCalculationEngine() = default;
    TCalculationEngine(const TCalculationEngine&) = delete;
    TCalculationEngine& operator=(const TCalculationEngine&) = delete;

    /// A property string from which an equal engine can be created.
    virtual std::string getProperties() const = 0;

    /// Make the engine ready for its formats; call once, after `setFormats`.
    /// @return false when the engine cannot be used, after a line on the standard error stream. The base only
    ///         warns, on the standard output stream, when the state format has no bits in a 16-bit word.
    virtual bool initialise();

    /// Branch metrics of n steps: record k of `out` receives those of step k in elements 0 to 3, elements 4
    /// to 7 stay as they are.
    /// @return out + n
    virtual T8* gamma(unsigned n, const short* intrinsic, const short* parity0, const short* parity1,
                      T8* out) = 0;

    /// Forward recursion over n - 1 steps, n >= 1: alpha[k + 1] from alpha[k] and gamma[k], alpha[0] given.
    /// @return alpha + n, or null when the engine's algorithm type is unknown
    virtual T8* alpha(unsigned n, const T8* gamma, T8* alpha) = 0;

    /// Backward recursion over n - 1 steps, n >= 1. Both pointers are those of the LAST step: beta[-k - 1]
    /// from beta[-k] and gamma[-k], beta[0] given.
    /// @return beta - n, or null when the engine's algorithm type is unknown
    virtual T8* beta(unsigned n, const T8* gamma, T8* beta) = 0;

    /// Log-likelihood ratios of n steps, alpha[k] being the metrics before and beta[k] those after step k. A
    /// positive one decides for bit 1.
    /// @return out + n, or null when the engine's algorithm type is unknown
    virtual short* llr(unsigned n, const T8* alpha, const T8* beta, const T8* gamma, short* out) = 0;

    /// Hand the engine its formats. They are not owned and must outlive it.
    void setFormats(const TNumberFormat* input, const TNumberFormat* state, const TNumberFormat* gamma) {
        itsInputFormat = input;
        itsStateFormat = state;
        itsGammaFormat = gamma;
    }

    /// Where the engine's lines go: the standard streams until set.
    void setMessages(const quarzel::Messages& messages) { itsMessages = messages; }
    const quarzel::Messages& messages() const { return itsMessages; }

    const TNumberFormat* stateFormat() const { return itsStateFormat; }
    const TNumberFormat* gammaFormat() const { return itsGammaFormat; }

  protected:
    TCalculationEngine();

    bool itsSSE2;                                   ///< whether the sse2_ entry points are called
    const TNumberFormat* itsInputFormat = nullptr;  ///< format of the soft inputs; nothing reads it
    const TNumberFormat* itsStateFormat = nullptr;  ///< format of the state metrics
    const TNumberFormat* itsGammaFormat = nullptr;  ///< format that branch metrics are clamped to
    quarzel::Messages itsMessages;
};
