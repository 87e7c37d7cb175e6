// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <climits>
#include <cstddef>

#include "oracle/plain_arithmetic.hpp"

namespace quarzel::oracle {

/// A branch of the trellis, seen from one of its ends.
struct Branch {
    int state = 0;   ///< at the other end
    int metric = 0;  ///< which of the four branch metrics it carries
    int sign = 1;    ///< 1: the information bit is 1; -1: it is 0
};

/// A branch of the trellis from a state to another one.
struct Edge {
    int from = 0;
    int to = 0;
};

/// What a recursion starts a part of the trellis with.
enum class Start { stored, zero, known, notTruncated, frozen, neighbour, otherCode };

/// Parts of the trellis by their place. A part that is alone counts as the first one of the forward recursion
/// and the last one of the backward recursion.
enum Place { atFirst, inMiddle, atLast };

/// Forward or backward metrics.
struct Recursion {
    std::array<std::array<Branch, 2>, 8> branches{};  ///< the first and the second candidate of each state
    Comparison comparison;
    Correction correction;
    Register metric;
    std::array<int, 8> stuckAt1{};  ///< bits of each state's register
    std::array<int, 8> stuckAt0{};
    int truncatedBits = 3;  ///< of the metrics stored for the next iteration
    Rounding truncation = Rounding::down;
    int unknownPasses = 2;         ///< passes that start without stored metrics
    std::array<Start, 3> start{};  ///< by place
    int metricStep = 0;            ///< which branch metrics are read: this many steps on
    int storedStep = 0;            ///< which metrics are stored: this many steps before the end
    bool keepsPending = false;     ///< corrections go from a part of the trellis to the next one
    bool sharesCodes = false;      ///< both codes store in one place
};

/// The tree of maxima of a step, for bit 1 and for bit 0.
struct Likelihood {
    std::array<std::array<std::array<Edge, 2>, 4>, 2> edges{};  ///< [bit][branch metric][candidate]
    std::array<std::array<int, 4>, 2> branchMetric{
        {{0, 1, 2, 3}, {0, 1, 2, 3}}};  ///< added after the first level
    std::array<std::size_t, 4> order{0, 1, 2,
                                     3};  ///< in which results of the first level meet at the second one
    bool thirdSwapped = false;
    std::array<Comparison, 3> comparison;
    std::array<Correction, 3> correction;
    Register metric;
    Register result;
    int alphaStep = 0, betaStep = 0, gammaStep = 0;  ///< which metrics are read: this many steps on
    bool lastPending = true;                         ///< the last level adds its own correction
};

/// What happens at the end of the trellis.
struct Termination {
    std::array<std::array<std::array<int, 2>, 3>, 8> sign{};  ///< [state][step][systematic, parity]
    Register metric;
    int truncatedBits = 3;
    Start start = Start::stored;
};

/// How a block is cut.
struct Cut {
    int units = 2, threads = 4;
    int most = INT_MAX;      ///< segments
    int leastSegment = 128;  ///< a block of this many steps a segment is cut once more
    bool strictly = false;   ///< only a longer one is
    int window = 64;         ///< steps of a whole window
    int halvedBelow = 128;   ///< a rest below this is cut into two windows
    int halfRounding = 1;    ///< the first one of them is the longer one
    bool restFirst = false;  ///< the windows of a segment in reverse order
};

/// Where the backward recursion keeps its metrics.
struct WindowStore {
    bool windows = true, segments = true;   ///< what is stored below windows, and below segments
    int windowShift = 0, segmentShift = 0;  ///< of the place
    bool readsLate = false;  ///< reads a window's metrics when it starts, not one window before
    bool spills = false;     ///< the metrics below a window overwrite those of the window below
};

/// The permutation between the codes.
struct Permutation {
    int rowShift = 0, f1Added = 0, f2Added = 0, added = 0, modulusAdded = 0;
    int addressBits = 13;  ///< of the result
    int productBits = 62;  ///< of the polynomial before the remainder
    int squareBits = 62;   ///< of the square of the position
    bool systematicStraight = false, forwardStraight = false, backStraight = false;
    bool forwardInverse = false, backForward = false, systematicInverse = false;
};

/// The soft inputs, and where they come from.
struct Inputs {
    int least = -128, greatest = 127;
    bool wraps = false;
    std::array<int, 3> sign{1, 1, 1};  ///< of the streams
    std::array<int, 2> parity{1, 2};   ///< stream of each code
    std::array<std::array<std::array<int, 2>, 3>, 2>
        tail{};                  ///< [code][step][systematic, parity] in the tail's order
    std::array<int, 3> delay{};  ///< positions that a stream comes late
    int stuckAt1 = 0, stuckAt0 = 0;
};

/// The exchange of values between the passes.
struct Exchange {
    int firstCode = 1;    ///< which code the first pass of an iteration decodes: 0 or 1
    int aPrioriBits = 1;  ///< the a-priori value is halved
    Rounding aPrioriRounding = Rounding::down;
    int aPrioriSign = 1;
    int intrinsicLeast = INT_MIN, intrinsicGreatest = INT_MAX;
    std::array<int, 4> paritySign{1, -1, -1, 1};  ///< of the branch metrics
    Register gamma{8, true};
    int gammaLeast = -128, gammaGreatest = 127;
    int parityShift = 0;
    int channelPart = 2, aPrioriPart = 2;    ///< what is taken from the log-likelihood ratio, of each
    int numerator = 4, denominatorBits = 2;  ///< of the scale
    Rounding scaleRounding = Rounding::down;
    int leastExtrinsic = -128, greatestExtrinsic = 127;
    bool extrinsicWraps = false, saturatesFirst = false;
    int scaledPasses = INT_MAX;
    int lostBank = -1;        ///< extrinsic values of these positions modulo 8 are 0
    bool firstIsZero = true;  ///< a-priori values of the first pass
};

/// When the decoder stops, and what it gives back.
struct Outcome {
    int iterationsAdded = 0, iterationBits = 4, mostIterations = 15, passesAdded = 0;
    bool stopsWhenAgreed = false;
    int zeroDecides = 1;
    bool inverted = false, fromExtrinsic = false, interleaved = false;
    int delay = 0;
    int lost = 0;  ///< decisions at the end that are 0
    int tagBits = 8;
    unsigned tagStuckAt1 = 0, tagStuckAt0 = 0;
    bool previousTag = false;
};

/// The core, as its designer built it.
struct Design {
    int type = 0;
    Inputs inputs;
    Permutation permutation;
    Cut cut;
    Exchange exchange;
    int knownState = 0, knownMetric = 0, unlikelyMetric = -1024;
    Recursion alpha, beta;
    WindowStore windowStore;
    Termination termination;
    Likelihood likelihood;
    Outcome outcome;
};

/// The core as it must be: 2, 4 or 8 units, algorithm type 0 to 2.
Design soundDesign(int units, int type);

}  // namespace quarzel::oracle
