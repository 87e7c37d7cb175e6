// SPDX-License-Identifier: MIT
// Faults of iterations, decisions and tags.
#include "oracle/fault.hpp"

namespace quarzel::oracle {
namespace {

constexpr Fault faults[] = {
    {"iteration-more", "an iteration more is run", [](Design& d) { d.outcome.iterationsAdded = 1; }},
    {"iteration-less", "an iteration less is run", [](Design& d) { d.outcome.iterationsAdded = -1; }},
    {"iterations-3-bits", "the number of iterations has 3 bits",
     [](Design& d) { d.outcome.iterationBits = 3; }},
    {"iterations-2-bits", "the number of iterations has 2 bits",
     [](Design& d) { d.outcome.iterationBits = 2; }},
    {"iterations-most-8", "8 iterations are run at most", [](Design& d) { d.outcome.mostIterations = 8; }},
    {"iterations-most-14", "14 iterations are run at most", [](Design& d) { d.outcome.mostIterations = 14; }},
    {"pass-less", "the last pass is not run", [](Design& d) { d.outcome.passesAdded = -1; }},
    {"pass-more", "a pass more is run", [](Design& d) { d.outcome.passesAdded = 1; }},
    {"stops-when-agreed", "the decoder stops when an iteration changes no decision",
     [](Design& d) { d.outcome.stopsWhenAgreed = true; }},
    {"zero-decides-0", "a ratio of 0 decides 0", [](Design& d) { d.outcome.zeroDecides = 0; }},
    {"decisions-inverted", "decisions are inverted", [](Design& d) { d.outcome.inverted = true; }},
    {"decisions-extrinsic", "extrinsic values decide", [](Design& d) { d.outcome.fromExtrinsic = true; }},
    {"decisions-interleaved", "decisions come in interleaved order",
     [](Design& d) { d.outcome.interleaved = true; }},
    {"decisions-late", "decisions come a position late", [](Design& d) { d.outcome.delay = 1; }},
    {"decisions-early", "decisions come a position early", [](Design& d) { d.outcome.delay = -1; }},
    {"tag-7-bits", "tags lose bit 7", [](Design& d) { d.outcome.tagBits = 7; }},
    {"tag-bit0-low", "bit 0 of tags is stuck at 0", [](Design& d) { d.outcome.tagStuckAt0 = 1; }},
    {"tag-bit7-high", "bit 7 of tags is stuck at 1", [](Design& d) { d.outcome.tagStuckAt1 = 128; }},
    {"tag-before", "the tag of the block before comes back", [](Design& d) { d.outcome.previousTag = true; },
     allTypes, true},
};

}  // namespace

std::span<const Fault> outcomeFaults() {
    return faults;
}

}  // namespace quarzel::oracle
