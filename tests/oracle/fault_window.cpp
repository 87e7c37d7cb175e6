// SPDX-License-Identifier: MIT
// Faults of the windows of the backward recursion.
#include "oracle/fault.hpp"

namespace quarzel::oracle {
namespace {

constexpr Fault faults[] = {
    {"beta-store-0-bits", "stored backward metrics lose no bits",
     [](Design& d) { d.beta.truncatedBits = 0; }},
    {"beta-store-2-bits", "stored backward metrics lose 2 bits, not 3",
     [](Design& d) { d.beta.truncatedBits = 2; }},
    {"beta-store-4-bits", "stored backward metrics lose 4 bits, not 3",
     [](Design& d) { d.beta.truncatedBits = 4; }},
    {"beta-store-toward-zero", "stored backward metrics are cut toward zero",
     [](Design& d) { d.beta.truncation = Rounding::towardZero; }},
    {"beta-store-to-nearest", "stored backward metrics are rounded",
     [](Design& d) { d.beta.truncation = Rounding::nearest; }},
    {"beta-unknown-1", "one pass of the backward recursion starts without stored metrics",
     [](Design& d) { d.beta.unknownPasses = 1; }},
    {"beta-unknown-3", "three passes of the backward recursion start without stored metrics",
     [](Design& d) { d.beta.unknownPasses = 3; }},
    {"beta-unknown-4", "two iterations of the backward recursion start without stored metrics",
     [](Design& d) { d.beta.unknownPasses = 4; }},
    {"beta-stored-early", "backward metrics are stored a step before the end",
     [](Design& d) { d.beta.storedStep = 1; }},
    {"beta-store-shared", "both codes store backward metrics in one place",
     [](Design& d) { d.beta.sharesCodes = true; }},
    {"beta-first-zero", "the first window of the backward recursion starts without metrics",
     [](Design& d) { d.beta.start[atFirst] = Start::zero; }},
    {"beta-first-known", "the first window of the backward recursion starts in the known state",
     [](Design& d) { d.beta.start[atFirst] = Start::known; }},
    {"beta-first-untruncated",
     "the first window of the backward recursion starts with all bits of its metrics",
     [](Design& d) { d.beta.start[atFirst] = Start::notTruncated; }},
    {"beta-first-neighbour",
     "the first window of the backward recursion starts with the metrics of its neighbour",
     [](Design& d) { d.beta.start[atFirst] = Start::neighbour; }},
    {"beta-first-other-code",
     "the first window of the backward recursion starts with the metrics of the other code",
     [](Design& d) { d.beta.start[atFirst] = Start::otherCode; }},
    {"beta-middle-zero", "each middle window of the backward recursion starts without metrics",
     [](Design& d) { d.beta.start[inMiddle] = Start::zero; }},
    {"beta-middle-known", "each middle window of the backward recursion starts in the known state",
     [](Design& d) { d.beta.start[inMiddle] = Start::known; }},
    {"beta-middle-untruncated",
     "each middle window of the backward recursion starts with all bits of its metrics",
     [](Design& d) { d.beta.start[inMiddle] = Start::notTruncated; }},
    {"beta-middle-neighbour",
     "each middle window of the backward recursion starts with the metrics of its neighbour",
     [](Design& d) { d.beta.start[inMiddle] = Start::neighbour; }},
    {"beta-middle-other-code",
     "each middle window of the backward recursion starts with the metrics of the other code",
     [](Design& d) { d.beta.start[inMiddle] = Start::otherCode; }},
    {"beta-last-zero", "the last window of the backward recursion starts without metrics",
     [](Design& d) { d.beta.start[atLast] = Start::zero; }},
    {"beta-last-known", "the last window of the backward recursion starts in the known state",
     [](Design& d) { d.beta.start[atLast] = Start::known; }},
    {"beta-last-neighbour",
     "the last window of the backward recursion starts with the metrics of its neighbour",
     [](Design& d) { d.beta.start[atLast] = Start::neighbour; }},
    {"beta-last-other-code",
     "the last window of the backward recursion starts with the metrics of the other code",
     [](Design& d) { d.beta.start[atLast] = Start::otherCode; }},
    {"window-32", "windows have 32 steps",
     [](Design& d) {
         d.cut.window = 32;
         d.cut.halvedBelow = 64;
     }},
    {"window-63", "whole windows have 63 steps", [](Design& d) { d.cut.window = 63; }},
    {"window-65", "whole windows have 65 steps", [](Design& d) { d.cut.window = 65; }},
    {"window-128", "windows have 128 steps", [](Design& d) { d.cut.window = 128; }},
    {"rest-not-halved", "the rest of a segment is not halved", [](Design& d) { d.cut.halvedBelow = 0; }},
    {"rest-halved-below-96", "a rest of 96 steps and more is not halved",
     [](Design& d) { d.cut.halvedBelow = 96; }},
    {"window-96", "windows have 96 steps",
     [](Design& d) {
         d.cut.halvedBelow = 192;
         d.cut.window = 96;
     }},
    {"rest-odd-step-last", "the odd step of a halved rest goes to the upper window",
     [](Design& d) { d.cut.halfRounding = 0; }},
    {"rest-two-more", "the lower half of a rest has a step too many",
     [](Design& d) { d.cut.halfRounding = 2; }},
    {"rest-first", "the short windows lie at the low end of a segment",
     [](Design& d) { d.cut.restFirst = true; }},
    {"windows-not-stored", "metrics below the windows of a segment are not stored",
     [](Design& d) { d.windowStore.windows = false; }},
    {"segments-not-stored", "metrics below segments are not stored",
     [](Design& d) { d.windowStore.segments = false; }},
    {"window-stored-in-own-place", "the metrics below a window are stored as its own",
     [](Design& d) { d.windowStore.windowShift = 1; }},
    {"segment-stored-in-own-place", "the metrics below a segment are stored for the segment itself",
     [](Design& d) { d.windowStore.segmentShift = 1; }},
    {"segment-stored-two-below", "the metrics below a segment are stored for the segment below the next one",
     [](Design& d) { d.windowStore.segmentShift = -1; }},
    {"window-read-late", "stored metrics are read when a window starts, not one window before",
     [](Design& d) { d.windowStore.readsLate = true; }},
    {"window-spills", "a window overwrites the top metrics of the one below",
     [](Design& d) { d.windowStore.spills = true; }},
};

}  // namespace

std::span<const Fault> windowFaults() {
    return faults;
}

}  // namespace quarzel::oracle
