// SPDX-License-Identifier: MIT
// Faults of the values that passes exchange.
#include "oracle/fault.hpp"

namespace quarzel::oracle {
namespace {

constexpr Fault faults[] = {
    {"code1-first", "an iteration begins with code 1", [](Design& d) { d.exchange.firstCode = 0; }},
    {"apriori-whole", "a-priori values are not halved", [](Design& d) { d.exchange.aPrioriBits = 0; }},
    {"apriori-quartered", "a-priori values are quartered", [](Design& d) { d.exchange.aPrioriBits = 2; }},
    {"apriori-toward-zero", "a-priori values are halved toward zero",
     [](Design& d) { d.exchange.aPrioriRounding = Rounding::towardZero; }},
    {"apriori-to-nearest", "halved a-priori values are rounded up",
     [](Design& d) { d.exchange.aPrioriRounding = Rounding::nearest; }},
    {"apriori-negated", "a-priori values have the other sign",
     [](Design& d) { d.exchange.aPrioriSign = -1; }},
    {"apriori-stale", "the first pass takes the extrinsic values of the block before",
     [](Design& d) { d.exchange.firstIsZero = false; }, allTypes, true},
    {"intrinsic-8-bits", "intrinsic values saturate at 8 bits",
     [](Design& d) {
         d.exchange.intrinsicLeast = -128;
         d.exchange.intrinsicGreatest = 127;
     }},
    {"gamma-wraps", "branch metrics wrap around", [](Design& d) { d.exchange.gamma.saturates = false; }},
    {"gamma-9-bits", "branch metrics have 9 bits",
     [](Design& d) {
         d.exchange.gamma.bits = 9;
         d.exchange.gammaLeast = -256;
         d.exchange.gammaGreatest = 255;
     }},
    {"gamma-7-bits", "branch metrics saturate at 7 bits", [](Design& d) { d.exchange.gamma.bits = 7; }},
    {"gamma-least-127", "branch metrics saturate at -127", [](Design& d) { d.exchange.gammaLeast = -127; }},
    {"gamma-greatest-126", "branch metrics saturate at 126",
     [](Design& d) { d.exchange.gammaGreatest = 126; }},
    {"gamma-no-sign", "negative branch metrics saturate at 0", [](Design& d) { d.exchange.gammaLeast = 0; }},
    {"parity-halved", "parity values are halved in branch metrics",
     [](Design& d) { d.exchange.parityShift = 1; }},
    {"gamma0-parity-negated", "the parity has the other sign in branch metric 0",
     [](Design& d) { d.exchange.paritySign[0] *= -1; }},
    {"gamma1-parity-negated", "the parity has the other sign in branch metric 1",
     [](Design& d) { d.exchange.paritySign[1] *= -1; }},
    {"gamma2-parity-negated", "the parity has the other sign in branch metric 2",
     [](Design& d) { d.exchange.paritySign[2] *= -1; }},
    {"gamma3-parity-negated", "the parity has the other sign in branch metric 3",
     [](Design& d) { d.exchange.paritySign[3] *= -1; }},
    {"gamma1-no-parity", "branch metric 1 misses the parity",
     [](Design& d) { d.exchange.paritySign[1] = 0; }},
    {"gamma3-no-parity", "branch metric 3 misses the parity",
     [](Design& d) { d.exchange.paritySign[3] = 0; }},
    {"gammas-exchanged", "sum and difference of intrinsic value and parity are exchanged",
     [](Design& d) {
         d.exchange.paritySign = {-1, 1, 1, -1};
     }},
    {"channel-kept", "the channel part is not taken from the log-likelihood ratio",
     [](Design& d) { d.exchange.channelPart = 0; }},
    {"apriori-kept", "the a-priori part is not taken from the log-likelihood ratio",
     [](Design& d) { d.exchange.aPrioriPart = 0; }},
    {"channel-half-kept", "half of the channel part is taken from the log-likelihood ratio",
     [](Design& d) { d.exchange.channelPart = 1; }},
    {"apriori-half-kept", "half of the a-priori part is taken from the log-likelihood ratio",
     [](Design& d) { d.exchange.aPrioriPart = 1; }},
    {"intrinsic-doubled", "twice the intrinsic value is taken from the log-likelihood ratio",
     [](Design& d) { d.exchange.channelPart = d.exchange.aPrioriPart = 4; }},
    {"extrinsic-least-127", "extrinsic values saturate at -127",
     [](Design& d) { d.exchange.leastExtrinsic = -127; }},
    {"extrinsic-greatest-126", "extrinsic values saturate at 126",
     [](Design& d) { d.exchange.greatestExtrinsic = 126; }},
    {"extrinsic-7-bits", "extrinsic values saturate at 7 bits",
     [](Design& d) {
         d.exchange.leastExtrinsic = -64;
         d.exchange.greatestExtrinsic = 63;
     }},
    {"extrinsic-9-bits", "extrinsic values saturate at 9 bits",
     [](Design& d) {
         d.exchange.leastExtrinsic = -256;
         d.exchange.greatestExtrinsic = 255;
     }},
    {"extrinsic-wraps", "extrinsic values wrap around", [](Design& d) { d.exchange.extrinsicWraps = true; }},
    {"scale-missing", "extrinsic values are not scaled", [](Design& d) { d.exchange.numerator = 4; },
     scaledType},
    {"scale-half", "extrinsic values are scaled by 1/2", [](Design& d) { d.exchange.numerator = 2; },
     scaledType},
    {"scale-7-8", "extrinsic values are scaled by 7/8",
     [](Design& d) {
         d.exchange.numerator = 7;
         d.exchange.denominatorBits = 3;
     },
     scaledType},
    {"scale-5-8", "extrinsic values are scaled by 5/8",
     [](Design& d) {
         d.exchange.numerator = 5;
         d.exchange.denominatorBits = 3;
     },
     scaledType},
    {"scale-toward-zero", "scaled values are cut toward zero",
     [](Design& d) { d.exchange.scaleRounding = Rounding::towardZero; }, scaledType},
    {"scale-to-nearest", "scaled values are rounded",
     [](Design& d) { d.exchange.scaleRounding = Rounding::nearest; }, scaledType},
    {"scale-after-saturation", "extrinsic values saturate before they are scaled",
     [](Design& d) { d.exchange.saturatesFirst = true; }, scaledType},
    {"scale-first-pass", "the first pass alone is scaled", [](Design& d) { d.exchange.scaledPasses = 1; },
     scaledType},
    {"scale-first-iteration", "the first iteration alone is scaled",
     [](Design& d) { d.exchange.scaledPasses = 2; }, scaledType},
    {"scale-uncalled", "extrinsic values are scaled by 3/4 where they should not be",
     [](Design& d) { d.exchange.numerator = 3; }, unscaledTypes},
};

}  // namespace

std::span<const Fault> exchangeFaults() {
    return faults;
}

}  // namespace quarzel::oracle
