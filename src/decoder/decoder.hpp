// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <iosfwd>
#include <memory>
#include <span>
#include <string>
#include <vector>

#include "engine/t8.hpp"
#include "fixed/messages.hpp"

class TCalculationEngine;
class TInterleaver;

/// A turbo decoder: the work storage of a block, the counters and the trace settings, and two ways to decode.
///
/// Soft values are 16-bit words of the engine's state format, the units of LLRs and extrinsic values too.
/// Positive means bit 1. One thread at a time may use a decoder.
class TDecoder {
  public:
    /// Make a decoder from its property string, "3GPPPU" with an optional ":" number of processing units and
    /// "," threads a unit. It needs `connect` before it can decode.
    /// @return a new decoder that the caller deletes, or null after a line on the standard error stream
    static TDecoder* create(const std::string& properties);

    /// The type names on offer.
    static std::vector<std::string> getNames();

    /// Size the work storage for a block of `blockSize` trellis steps and clear the vectors in it. The metric
    /// store only grows, and is zero when it is new.
    virtual bool allocate(unsigned blockSize);

    virtual ~TDecoder();
    TDecoder(const TDecoder&) = delete;
    TDecoder& operator=(const TDecoder&) = delete;

    /// A property string that tells the decoder's configuration.
    virtual std::string getProperties() const = 0;

    /// Decode a block and count the errors against the bits that were sent.
    ///
    /// @param soft         the block's soft values
    /// @param reference    the bits, each 0 or not; surplus entries on either side count as errors
    /// @param bitErrors    as many entries as iterations are to run; errors are added
    /// @param blockErrors  at least as many entries; 1 is added where there was an error
    /// @return false when the block was refused or decoding was stopped
    ///
    /// The base adds to the last entries only, which must exist.
    virtual bool decode(const std::vector<short>& soft, const std::vector<unsigned char>& reference,
                        std::vector<unsigned long long>& bitErrors,
                        std::vector<unsigned long long>& blockErrors);

    /// Decode a block.
    ///
    /// @param soft        the block's soft values
    /// @param hard        receives one decision, 0 or 1, per information bit; untouched on failure
    /// @param iterations  iterations to run, two soft-in soft-out passes each
    /// @return false when the block was refused or decoding was stopped
    virtual bool decode(const std::vector<short>& soft, std::vector<unsigned char>& hard,
                        unsigned iterations) = 0;

    /// Write a short trace; no decoder has one.
    virtual void dump(std::ostream& stream);

    /// Write the trace table of the pass `siso` that has just run. The base has none.
    virtual void dumpFull(std::ostream& stream, unsigned siso);

    /// At the end of each pass: write its trace while dumps are pending.
    /// @return false when decoding is to stop because the last requested dump has been written
    bool checkDump(unsigned siso);

    /// Hand the decoder its interleaver and engine. They are not owned and must outlive it.
    void connect(TInterleaver* interleaver, TCalculationEngine* engine) {
        itsInterleaver = interleaver;
        itsEngine = engine;
    }

    TInterleaver* interleaver() const { return itsInterleaver; }
    TCalculationEngine* engine() const { return itsEngine; }

    /// Where the decoder's lines and traces go: the standard streams until set.
    void setMessages(const quarzel::Messages& messages) { itsMessages = messages; }
    const quarzel::Messages& messages() const { return itsMessages; }

    /// Factor for the extrinsic values: 1.0 until set.
    void setExtrinsicScale(double scale) { itsExtrinsicScale = scale; }

    /// Trace the next `count` passes, and with `stop` end decoding after the last.
    void setDump(unsigned count, bool stop = false) {
        itsDumpCount = count;
        itsDumpStop = stop;
    }
    std::uint32_t dumpCount() const { return itsDumpCount; }
    bool dumpStop() const { return itsDumpStop; }

    /// Trace level of the parallel decoder: from 1 its thread count, from 2 its segments, above 8 every
    /// recursion.
    void setVerbosity(unsigned verbosity) { itsVerbosity = verbosity; }
    std::uint32_t verbosity() const { return itsVerbosity; }

    /// A-priori extrinsic values of the information bits for the first pass of the next block, one per
    /// trellis step, the termination steps included. Empty means none. They are used once.
    void setExtrinsicIn(std::vector<short> extrinsic) { itsExtrinsicIn = std::move(extrinsic); }
    const std::vector<short>& extrinsicIn() const { return itsExtrinsicIn; }

    /// @name The work storage as the last pass left it, one entry per trellis step
    /// @{
    std::span<const T8> alpha() const { return {itsAlpha, itsBlockSize}; }
    std::span<const T8> beta() const { return {itsBeta, itsBlockSize}; }
    std::span<const T8> gamma() const { return {itsGamma, itsBlockSize}; }
    const std::vector<short>& intrinsic() const { return itsIntrinsic; }
    const std::vector<short>& llr() const { return itsLLR; }
    const std::vector<short>& extrinsic() const { return itsExtrinsic; }
    /// @}

    double extrinsicScale() const { return itsExtrinsicScale; }
    std::uint64_t decodeCount() const { return itsDecodeCount; }
    std::uint64_t sisoCount() const { return itsSISOCount; }

    /// Set both counters, for blocks that were decoded elsewhere in the decoder's stead.
    void setCounts(std::uint64_t decodes, std::uint64_t passes) {
        itsDecodeCount = decodes;
        itsSISOCount = passes;
    }

    std::uint32_t metricBufferSize() const { return itsMetricBufferSize; }

  protected:
    TDecoder();

    /// Have a metric store for so many trellis steps. A new one is zero; one that is large enough is kept.
    void growMetricStore(unsigned blockSize);

    TInterleaver* itsInterleaver = nullptr;
    TCalculationEngine* itsEngine = nullptr;
    std::uint32_t itsBlockSize = 0;  ///< trellis steps of the block: information bits and 3 termination steps
    std::unique_ptr<unsigned char[]> itsMetricBuffer;  ///< store of the three metric arrays
    std::uint32_t itsMetricBufferSize = 0;             ///< its size in bytes
    T8* itsAlpha = nullptr;                            ///< forward metrics before each step
    T8* itsBeta = nullptr;                             ///< backward metrics after each step
    T8* itsGamma = nullptr;                            ///< branch metrics of each step
    std::vector<short> itsIntrinsic;                   ///< intrinsic value of each step, at half scale
    std::vector<short> itsLLR;                         ///< log-likelihood ratio of each step
    std::vector<short> itsExtrinsic;                   ///< output of the last pass, in the order of its code
    std::vector<short> itsExtrinsicIn;                 ///< input of the first pass, emptied by it
    double itsExtrinsicScale = 1.0;
    std::uint64_t itsDecodeCount = 0;  ///< blocks decoded
    std::uint64_t itsSISOCount = 0;    ///< passes run
    std::uint32_t itsVerbosity = 0;
    std::uint32_t itsDumpCount = 0;  ///< passes still to be dumped
    bool itsDumpStop = false;        ///< stop when the last of them is written
    quarzel::Messages itsMessages;   ///< where lines and traces go
};
