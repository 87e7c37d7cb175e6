// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstdint>
#include <vector>

#include "oracle/plain_design.hpp"

namespace quarzel::oracle {

/// The metrics of the eight states.
using Metrics = std::array<int, 8>;

/// The soft values of a block as the core gets them: three streams of K + 4.
using Streams = std::array<std::vector<int>, 3>;

/// The signals of a pass, in units of 1/8 (intrinsic: 1/16), in the order of the code. No core computes
/// metrics at the three termination steps; what the vectors hold there has no meaning.
struct Signals {
    std::vector<int> intrinsic;
    std::vector<Metrics> alpha, beta;
    std::vector<std::array<int, 4>> gamma;
    std::vector<int> llr, extrinsic;
};

/// What the core gives back.
struct Answer {
    std::vector<std::uint8_t> decisions;
    unsigned tag = 0;
    friend bool operator==(const Answer&, const Answer&) = default;
};

/// The decoder, written plainly from the definition of its arithmetic: integers in units of 1/8, one step
/// after the other. What a design has wrong, it does wrong.
class PlainDecoder {
  public:
    explicit PlainDecoder(const Design& design) : itsDesign(design) {}

    /// Take a block of one of the 188 sizes.
    void load(const Streams& streams);

    /// Run a pass of the block; they come in their order, from 0.
    void runPass(int pass);

    const Signals& signals() const { return itsSignals; }

    /// Which code a pass decodes: 0 or 1.
    int codeOf(int pass) const {
        return pass % 2 == 0 ? itsDesign.exchange.firstCode : 1 - itsDesign.exchange.firstCode;
    }

    /// Decode a block.
    Answer decode(const Streams& streams, int iterations, unsigned tag);

  private:
    struct Segment {
        int from, to;
    };

    void setPermutation();
    void setCode(int code, const Streams& streams);
    void cut();
    int aPriori(int code, int j) const;
    void runIntrinsic(int code);
    void runAlpha(int pass, int code);
    void runAlphaSegment(int from, int to);
    Metrics alphaStart(const std::vector<Metrics>& starts, int code, int segment) const;
    void runBeta(int pass, int code);
    void runBetaWindow(int from, int to);
    Metrics betaStart(int pass, int code, int window, const Metrics& fetched) const;
    void storeBeta(int code, int group, int segment, const Metrics& metrics);
    Metrics terminated(int code) const;
    Metrics known() const;
    Metrics stored(const Recursion& recursion, const Metrics& metrics, Start start) const;
    void runLikelihood(int steps);
    Candidate likelihoodOf(std::size_t bit, int step) const;
    void runExtrinsic(int pass);
    std::vector<std::uint8_t> decisions() const;
    std::vector<Metrics>& startsOf(const Recursion& recursion, std::array<std::vector<Metrics>, 2>& starts,
                                   int code);

    Design itsDesign;
    int itsK = 0;
    std::vector<int> itsForward, itsBack;                      ///< the permutation and its inverse
    std::array<std::vector<int>, 2> itsSystematic, itsParity;  ///< of each code, in its order
    int itsSegments = 1, itsSegmentSteps = 0;
    std::vector<Segment>
        itsWindows;  ///< from their top down, all first ones of the segments, then all second ones
    std::array<std::vector<Metrics>, 2> itsAlphaStarts, itsBetaStarts;  ///< by code
    std::vector<Metrics> itsFetched;  ///< start of each segment's next window
    Signals itsSignals;
    std::array<int, 8> itsAlphaPending{}, itsBetaPending{};
    std::vector<std::uint8_t> itsBefore;  ///< decisions of the iteration before
    unsigned itsLastTag = 0;
};

}  // namespace quarzel::oracle
