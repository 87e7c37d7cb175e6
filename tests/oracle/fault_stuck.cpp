// SPDX-License-Identifier: MIT
// Faults of registers of state metrics.
#include "oracle/fault.hpp"

namespace quarzel::oracle {
namespace {

constexpr Fault faults[] = {
    {"alpha0-bit0-low", "bit 0 of forward state 0 is stuck at 0", [](Design& d) { d.alpha.stuckAt0[0] = 1; }},
    {"alpha0-bit11-high", "bit 11 of forward state 0 is stuck at 1",
     [](Design& d) { d.alpha.stuckAt1[0] = 2048; }},
    {"alpha3-bit5-high", "bit 5 of forward state 3 is stuck at 1",
     [](Design& d) { d.alpha.stuckAt1[3] = 32; }},
    {"alpha5-bit11-low", "bit 11 of forward state 5 is stuck at 0",
     [](Design& d) { d.alpha.stuckAt0[5] = 2048; }},
    {"alpha7-bit4-low", "bit 4 of forward state 7 is stuck at 0",
     [](Design& d) { d.alpha.stuckAt0[7] = 16; }},
    {"alpha2-bit10-high", "bit 10 of forward state 2 is stuck at 1",
     [](Design& d) { d.alpha.stuckAt1[2] = 1024; }},
    {"alpha6-bit0-high", "bit 0 of forward state 6 is stuck at 1",
     [](Design& d) { d.alpha.stuckAt1[6] = 1; }},
    {"alpha4-bit8-low", "bit 8 of forward state 4 is stuck at 0",
     [](Design& d) { d.alpha.stuckAt0[4] = 256; }},
    {"beta1-bit0-low", "bit 0 of backward state 1 is stuck at 0", [](Design& d) { d.beta.stuckAt0[1] = 1; }},
    {"beta0-bit11-high", "bit 11 of backward state 0 is stuck at 1",
     [](Design& d) { d.beta.stuckAt1[0] = 2048; }},
    {"beta4-bit3-high", "bit 3 of backward state 4 is stuck at 1", [](Design& d) { d.beta.stuckAt1[4] = 8; }},
    {"beta6-bit11-low", "bit 11 of backward state 6 is stuck at 0",
     [](Design& d) { d.beta.stuckAt0[6] = 2048; }},
    {"beta7-bit10-high", "bit 10 of backward state 7 is stuck at 1",
     [](Design& d) { d.beta.stuckAt1[7] = 1024; }},
    {"beta2-bit6-low", "bit 6 of backward state 2 is stuck at 0", [](Design& d) { d.beta.stuckAt0[2] = 64; }},
    {"beta3-bit7-low", "bit 7 of backward state 3 is stuck at 0",
     [](Design& d) { d.beta.stuckAt0[3] = 128; }},
    {"beta5-bit1-high", "bit 1 of backward state 5 is stuck at 1", [](Design& d) { d.beta.stuckAt1[5] = 2; }},
};

}  // namespace

std::span<const Fault> stuckFaults() {
    return faults;
}

}  // namespace quarzel::oracle
