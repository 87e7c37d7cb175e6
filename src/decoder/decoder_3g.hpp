// SPDX-License-Identifier: MIT
#pragma once

#include <array>

#include "decoder/decoder.hpp"
#include "decoder/trace_columns.hpp"

class TDecoder3G;

namespace quarzel {

/// Told of each pass that has run.
class PassListener {
  public:
    virtual ~PassListener() = default;

    /// @param decoder  shows the pass in its work storage
    /// @param siso     number of the pass in its block
    virtual void passEnded(const TDecoder3G& decoder, unsigned siso) = 0;

  protected:
    PassListener() = default;
    PassListener(const PassListener&) = default;
    PassListener& operator=(const PassListener&) = default;
};

}  // namespace quarzel

/// The 3GPP turbo decoder with one processing unit: the literal course of a decode, one operation after the
/// other. Its pass structure is that of the parallel decoder too.
///
/// Passes are numbered from 0. An even pass decodes constituent code 2, in interleaved order, an odd one
/// constituent code 1, in natural order; two passes are an iteration.
class TDecoder3G : public TDecoder {
  public:
    /// Termination steps of a constituent code.
    static constexpr unsigned tailSteps = 3;

    /// The decision that a log-likelihood ratio gives.
    static constexpr unsigned char decide(short llr) { return llr >= 0 ? 1 : 0; }

    /// @param is3GPP2     take soft values in the 3GPP2 layout (rate 1/5, 18 tail values) rather than in that
    /// of
    ///                    3GPP (rate 1/3, 12 tail values)
    /// @param properties  must be empty
    /// @return a new decoder that the caller deletes, or null after a line on the standard error stream
    static TDecoder3G* create(bool is3GPP2, const std::string& properties);

    /// See `create`.
    explicit TDecoder3G(bool is3GPP2) : its3GPP2(is3GPP2) {}

    bool allocate(unsigned blockSize) override;

    /// "3GPP" or "3GPP2".
    std::string getProperties() const override;

    /// Counts after every iteration: entry i of the counts belongs to iteration i. Without entries no pass
    /// runs.
    bool decode(const std::vector<short>& soft, const std::vector<unsigned char>& reference,
                std::vector<unsigned long long>& bitErrors,
                std::vector<unsigned long long>& blockErrors) override;

    bool decode(const std::vector<short>& soft, std::vector<unsigned char>& hard,
                unsigned iterations) override;

    /// A table of every value of the pass, one row per trellis step, as real numbers.
    void dumpFull(std::ostream& stream, unsigned siso) override;

    /// The streams of the block that `extract` has just taken apart, one line each. `extract` calls it for
    /// the standard output stream while dumps are pending.
    virtual void dumpInput(std::ostream& stream) const;

    /// Tell a listener of each pass, before its trace is written; null ends it.
    /// @param listener  not owned
    void setPassListener(quarzel::PassListener* listener) { itsPassListener = listener; }

    /// @name The streams of the block last taken apart; code is 0 or 1 for constituent code 1 or 2
    /// @{
    const std::vector<short>& systematic(unsigned code) const { return itsSys.at(code); }
    const std::vector<short>& parity0(unsigned code) const { return itsPar0.at(code); }
    const std::vector<short>& parity1(unsigned code) const { return itsPar1.at(code); }
    /// @}

    /// What the trace shows of a step; trace_columns.hpp names the entries.
    quarzel::TraceRow traceRow(unsigned step) const;

    /// @name The operations of a pass, in their order. Each returns false to end the decode
    /// @{

    /// Take a block's soft values apart into the streams of both constituent codes.
    ///
    /// 3GPP layout, 3K + 12 values: systematic, parity 1, parity 2 for each bit; then systematic and parity
    /// tail of code 1 for each termination step; then those of code 2. 3GPP2 layout, 5K + 18 values:
    /// systematic and two parities of each code for each bit; then systematic and two parity tails of code 1
    /// for each termination step; then those of code 2.
    virtual bool extract(const std::vector<short>& soft);

    virtual bool calcIntrinsic(unsigned siso);
    virtual bool calcGamma(unsigned siso);
    virtual bool calcAlpha(unsigned siso);
    virtual bool calcBeta(unsigned siso);
    virtual bool calcLLR(unsigned siso);
    virtual bool calcExtrinsic(unsigned siso);

    /// One complete pass.
    virtual bool calcSISO(unsigned siso);
    /// @}

  protected:
    /// @name The engine's operations over a range of steps, `first` to `last` inclusive; beta runs downward
    /// @{
    bool calcGamma(unsigned siso, unsigned first, unsigned last);
    bool calcAlpha(unsigned siso, unsigned first, unsigned last);
    bool calcBeta(unsigned siso, unsigned first, unsigned last);
    bool calcLLR(unsigned siso, unsigned first, unsigned last);
    /// @}

    /// The metrics of a trellis that is known to be in state 0.
    void setInitialState(T8* metrics) const;

    /// The metrics of a trellis of which nothing is known.
    static void setUnknownState(T8* metrics);

    /// The streams that a pass uses: 1, those of constituent code 2, in an even pass, else 0.
    static constexpr unsigned inputSet(unsigned siso) { return siso % 2 == 0 ? 1 : 0; }

    std::array<std::vector<short>, 2> itsSys;  ///< systematic values of code 1 and, interleaved, 2; with tail
    std::array<std::vector<short>, 2> itsPar0;  ///< first parity of code 1 and 2, with tail
    std::array<std::vector<short>, 2>
        itsPar1;  ///< second parity of code 1 and 2, with tail; 0 in 3GPP layout
    const bool its3GPP2;

  private:
    bool calcIteration(unsigned iteration);
    bool startExtrinsic();

    quarzel::PassListener* itsPassListener = nullptr;
};
