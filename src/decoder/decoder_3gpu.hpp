// SPDX-License-Identifier: MIT
#pragma once

#include "decoder/decoder_3g.hpp"
#include "decoder/segments.hpp"

/// The turbo decoder with parallel processing units.
///
/// A block is cut into equal thread segments. The forward recursion of a segment starts from the metrics that
/// its lower neighbour ended with in the previous pass of the same constituent code; the backward recursion
/// runs in windows, each started from the metrics that the window above ended with. These boundary metrics
/// are kept with their low 7 bits cleared, and are forgotten between blocks.
class TDecoder3GPU : public TDecoder3G {
  public:
    using ABSegment = quarzel::ABSegment;

    /// Threads of a processing unit, unless others are asked for.
    static constexpr unsigned defaultThreads = 4;

    /// @param is3GPP2     see TDecoder3G
    /// @param properties  "", units, or units "," threads per unit, in decimal; 4 and 4 when not given
    /// @return a new decoder that the caller deletes, or null after a line on the standard error stream
    static TDecoder3GPU* create(bool is3GPP2, const std::string& properties);

    TDecoder3GPU(bool is3GPP2, unsigned numPU, unsigned numThreads);

    /// Cut the block as well, and clear all boundary metrics.
    /// @return false, after a line on the standard error stream, when the segments would not be equal
    bool allocate(unsigned blockSize) override;

    /// "3GPPPU:" ("3GPP2PU:" in that layout), the units, and "," and the threads unless these are 4.
    std::string getProperties() const override;

    /// Of the information steps only; the tail enters through the last window's start.
    bool calcGamma(unsigned siso) override;
    bool calcAlpha(unsigned siso) override;
    bool calcBeta(unsigned siso) override;

    /// Thread segments of the block last allocated.
    unsigned threadCount() const { return itsNT; }
    const std::vector<ABSegment>& alphaSegments() const { return itsAlphaSegment; }
    const std::vector<ABSegment>& betaSegments() const { return itsBetaSegment; }

    /// All threads of all processing units.
    unsigned threads() const { return itsNumPU * itsNumThreads; }
    bool is3GPP2() const { return its3GPP2; }

  protected:
    using TDecoder3G::calcAlpha;
    using TDecoder3G::calcBeta;
    using TDecoder3G::calcGamma;

    /// Start of a forward segment, or of a backward window, in the first iteration.
    static bool preCalcAlpha(unsigned siso, unsigned step, T8* out);
    static bool preCalcBeta(unsigned siso, unsigned step, T8* out);

    /// Start of the block's last window: the backward metrics that the three termination steps give.
    bool preCalcBetaTail(unsigned siso, T8* out) const;

    const std::uint32_t itsNumPU;
    const std::uint32_t itsNumThreads;
    std::uint32_t itsNT = 0;                      ///< thread segments of the block
    std::array<std::vector<T8>, 2> itsAlphaInit;  ///< per input set, the start of each forward segment
    std::vector<ABSegment> itsAlphaSegment;       ///< the thread segments
    std::array<std::vector<T8>, 2> itsBetaInit;   ///< per input set, the start of each backward window
    std::vector<ABSegment> itsBetaSegment;        ///< the windows: the first of all threads, the second ...

  private:
    std::uint32_t itsCutSize =
        0;                        ///< trellis steps that the segments were cut for; 0 when they are of no use
    std::vector<T8> itsBetaWork;  ///< per thread, the start of its next window
};
