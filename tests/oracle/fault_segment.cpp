// SPDX-License-Identifier: MIT
// Faults of the segments of the forward recursion.
#include "oracle/fault.hpp"

namespace quarzel::oracle {
namespace {

constexpr Fault faults[] = {
    {"alpha-first-zero", "the first segment of the forward recursion starts without metrics",
     [](Design& d) { d.alpha.start[atFirst] = Start::zero; }},
    {"alpha-first-neighbour",
     "the first segment of the forward recursion starts with the metrics of its neighbour",
     [](Design& d) { d.alpha.start[atFirst] = Start::neighbour; }},
    {"alpha-middle-zero", "each middle segment of the forward recursion starts without metrics",
     [](Design& d) { d.alpha.start[inMiddle] = Start::zero; }},
    {"alpha-middle-known", "each middle segment of the forward recursion starts in the known state",
     [](Design& d) { d.alpha.start[inMiddle] = Start::known; }},
    {"alpha-middle-untruncated",
     "each middle segment of the forward recursion starts with all bits of its metrics",
     [](Design& d) { d.alpha.start[inMiddle] = Start::notTruncated; }},
    {"alpha-middle-neighbour",
     "each middle segment of the forward recursion starts with the metrics of its neighbour",
     [](Design& d) { d.alpha.start[inMiddle] = Start::neighbour; }},
    {"alpha-middle-other-code",
     "each middle segment of the forward recursion starts with the metrics of the other code",
     [](Design& d) { d.alpha.start[inMiddle] = Start::otherCode; }},
    {"alpha-last-zero", "the last segment of the forward recursion starts without metrics",
     [](Design& d) { d.alpha.start[atLast] = Start::zero; }},
    {"alpha-last-known", "the last segment of the forward recursion starts in the known state",
     [](Design& d) { d.alpha.start[atLast] = Start::known; }},
    {"alpha-last-untruncated",
     "the last segment of the forward recursion starts with all bits of its metrics",
     [](Design& d) { d.alpha.start[atLast] = Start::notTruncated; }},
    {"alpha-last-neighbour",
     "the last segment of the forward recursion starts with the metrics of its neighbour",
     [](Design& d) { d.alpha.start[atLast] = Start::neighbour; }},
    {"alpha-last-other-code",
     "the last segment of the forward recursion starts with the metrics of the other code",
     [](Design& d) { d.alpha.start[atLast] = Start::otherCode; }},
    {"alpha-store-0-bits", "stored forward metrics lose no bits",
     [](Design& d) { d.alpha.truncatedBits = 0; }},
    {"alpha-store-2-bits", "stored forward metrics lose 2 bits, not 3",
     [](Design& d) { d.alpha.truncatedBits = 2; }},
    {"alpha-store-4-bits", "stored forward metrics lose 4 bits, not 3",
     [](Design& d) { d.alpha.truncatedBits = 4; }},
    {"alpha-store-toward-zero", "stored forward metrics are cut toward zero",
     [](Design& d) { d.alpha.truncation = Rounding::towardZero; }},
    {"alpha-store-to-nearest", "stored forward metrics are rounded",
     [](Design& d) { d.alpha.truncation = Rounding::nearest; }},
    {"alpha-unknown-1", "one pass of the forward recursion starts without stored metrics",
     [](Design& d) { d.alpha.unknownPasses = 1; }},
    {"alpha-unknown-3", "three passes of the forward recursion start without stored metrics",
     [](Design& d) { d.alpha.unknownPasses = 3; }},
    {"alpha-unknown-4", "two iterations of the forward recursion start without stored metrics",
     [](Design& d) { d.alpha.unknownPasses = 4; }},
    {"alpha-stored-early", "forward metrics are stored a step before the end",
     [](Design& d) { d.alpha.storedStep = 1; }},
    {"alpha-store-shared", "both codes store forward metrics in one place",
     [](Design& d) { d.alpha.sharesCodes = true; }},
    {"threads-2", "a unit has 2 threads", [](Design& d) { d.cut.threads = 2; }},
    {"threads-8", "a unit has 8 threads", [](Design& d) { d.cut.threads = 8; }},
    {"segments-most-4", "a block has 4 segments at most", [](Design& d) { d.cut.most = 4; }},
    {"segment-64", "a block is cut down to segments of 64 steps", [](Design& d) { d.cut.leastSegment = 64; }},
    {"segment-256", "a block is cut down to segments of 256 steps",
     [](Design& d) { d.cut.leastSegment = 256; }},
    {"segment-strictly", "a block of 128 steps for each segment is not cut again",
     [](Design& d) { d.cut.strictly = true; }},
    {"segment-136", "a block needs 136 steps for each segment to be cut again",
     [](Design& d) { d.cut.leastSegment = 136; }},
};

}  // namespace

std::span<const Fault> segmentFaults() {
    return faults;
}

}  // namespace quarzel::oracle
