// SPDX-License-Identifier: MIT
// Thirty faults beside the catalogue.
#include <utility>

#include "oracle/fault.hpp"

namespace quarzel::oracle {
namespace {

constexpr Fault faults[] = {
    {"tag-none", "tags come back as 0", [](Design& d) { d.outcome.tagBits = 0; }},
    {"tag-bit3-high", "bit 3 of tags is stuck at 1", [](Design& d) { d.outcome.tagStuckAt1 = 8; }},
    {"alpha1-bit7-high", "bit 7 of forward state 1 is stuck at 1",
     [](Design& d) { d.alpha.stuckAt1[1] = 128; }},
    {"alpha6-bit2-low", "bit 2 of forward state 6 is stuck at 0", [](Design& d) { d.alpha.stuckAt0[6] = 4; }},
    {"beta1-bit9-low", "bit 9 of backward state 1 is stuck at 0",
     [](Design& d) { d.beta.stuckAt0[1] = 512; }},
    {"beta5-bit4-high", "bit 4 of backward state 5 is stuck at 1",
     [](Design& d) { d.beta.stuckAt1[5] = 16; }},
    {"input-bit5-high", "bit 5 of the soft values is stuck at 1", [](Design& d) { d.inputs.stuckAt1 = 32; }},
    {"tails-second-step-swapped", "the codes take the second tail step of each other",
     [](Design& d) { std::swap(d.inputs.tail[0][1], d.inputs.tail[1][1]); }},
    {"tail2-last-parity-lost", "the last parity value of tail 2 is its systematic value",
     [](Design& d) { d.inputs.tail[1][2][1] = d.inputs.tail[1][2][0]; }},
    {"tail-state5-as-4", "state 5 before the tail has the metric of state 4",
     [](Design& d) { d.termination.sign[5] = d.termination.sign[4]; }},
    {"f1-two-more", "f1 is two more", [](Design& d) { d.permutation.f1Added = 2; }},
    {"bank-lost", "extrinsic values of one of eight banks are not written",
     [](Design& d) { d.exchange.lostBank = 5; }},
    {"gamma2-no-parity", "branch metric 2 misses the parity",
     [](Design& d) { d.exchange.paritySign[2] = 0; }},
    {"gamma-least-64", "branch metrics saturate at -64", [](Design& d) { d.exchange.gammaLeast = -64; }},
    {"scale-11-16", "extrinsic values are scaled by 11/16",
     [](Design& d) {
         d.exchange.numerator = 11;
         d.exchange.denominatorBits = 4;
     },
     scaledType},
    {"intrinsic-160", "intrinsic values saturate at -160 and 159",
     [](Design& d) {
         d.exchange.intrinsicLeast = -160;
         d.exchange.intrinsicGreatest = 159;
     }},
    {"alpha3-states", "the states of the branches of forward state 3 are exchanged",
     [](Design& d) { std::swap(d.alpha.branches[3][0].state, d.alpha.branches[3][1].state); }},
    {"beta0-metric", "the second branch of backward state 0 takes the other branch metric",
     [](Design& d) { d.beta.branches[0][1].metric = 2; }},
    {"tree-one3-edge", "a branch of bit 1 ends in state 7 instead of 3",
     [](Design& d) { d.likelihood.edges[1][3][1].to = 7; }},
    {"tree-zero1-lost", "one of the branches of bit 0 with metric 1 is missing",
     [](Design& d) { d.likelihood.edges[0][1][0] = d.likelihood.edges[0][1][1]; }},
    {"level1-entries-swapped",
     "level 1 of the likelihood tree has entries 2 and 3 of its correction table swapped",
     [](Design& d) { std::swap(d.likelihood.correction[0].table[2], d.likelihood.correction[0].table[3]); },
     starType},
    {"alpha-entry0-4", "entry 0 of the table of the forward recursion is 4, not 6",
     [](Design& d) { d.alpha.correction.table[0] = 4; }, starType},
    {"level3-difference-10-bits", "level 3 of the likelihood tree compares 10 bits",
     [](Design& d) { d.likelihood.comparison[2].difference.bits = 10; }},
    {"segments-most-2", "a block has 2 segments at most", [](Design& d) { d.cut.most = 2; }},
    {"window-48", "windows have 48 steps",
     [](Design& d) {
         d.cut.window = 48;
         d.cut.halvedBelow = 96;
     }},
    {"rest-halved-below-112", "a rest of 112 steps and more is not halved",
     [](Design& d) { d.cut.halvedBelow = 112; }},
    {"alpha-store-5-bits", "stored forward metrics lose 5 bits, not 3",
     [](Design& d) { d.alpha.truncatedBits = 5; }},
    {"iterations-most-12", "12 iterations are run at most", [](Design& d) { d.outcome.mostIterations = 12; }},
    {"alpha-last-frozen",
     "the last segment of the forward recursion starts with the metrics of the first iteration",
     [](Design& d) { d.alpha.start[atLast] = Start::frozen; }},
    {"last-decision-lost", "the last decision is 0", [](Design& d) { d.outcome.lost = 1; }},
};

}  // namespace

std::span<const Fault> heldOutFaults() {
    return faults;
}

}  // namespace quarzel::oracle
