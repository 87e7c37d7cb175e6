// SPDX-License-Identifier: MIT
// Faults of the soft inputs and the tail.
#include <utility>

#include "oracle/fault.hpp"

namespace quarzel::oracle {
namespace {

constexpr Fault faults[] = {
    {"input-least-127", "soft values are limited to -127", [](Design& d) { d.inputs.least = -127; }},
    {"input-greatest-126", "soft values are limited to 126", [](Design& d) { d.inputs.greatest = 126; }},
    {"input-bit0-low", "bit 0 of the soft values is stuck at 0", [](Design& d) { d.inputs.stuckAt0 = 1; }},
    {"input-bit0-high", "bit 0 of the soft values is stuck at 1", [](Design& d) { d.inputs.stuckAt1 = 1; }},
    {"input-bit6-low", "bit 6 of the soft values is stuck at 0", [](Design& d) { d.inputs.stuckAt0 = 64; }},
    {"input-unsigned", "the sign bit of the soft values is stuck at 0",
     [](Design& d) { d.inputs.stuckAt0 = 128; }},
    {"systematic-negated", "systematic values have the other sign", [](Design& d) { d.inputs.sign[0] = -1; }},
    {"parity1-negated", "parity values of code 1 have the other sign",
     [](Design& d) { d.inputs.sign[1] = -1; }},
    {"parity2-negated", "parity values of code 2 have the other sign",
     [](Design& d) { d.inputs.sign[2] = -1; }},
    {"parities-swapped", "the codes take the parity of each other",
     [](Design& d) {
         d.inputs.parity = {2, 1};
     }},
    {"parity1-for-both", "code 2 takes the parity of code 1",
     [](Design& d) {
         d.inputs.parity = {1, 1};
     }},
    {"parity2-for-both", "code 1 takes the parity of code 2",
     [](Design& d) {
         d.inputs.parity = {2, 2};
     }},
    {"systematic-late", "systematic values come a position late", [](Design& d) { d.inputs.delay[0] = 1; }},
    {"parity1-late", "parity values of code 1 come a position late",
     [](Design& d) { d.inputs.delay[1] = 1; }},
    {"parity2-late", "parity values of code 2 come a position late",
     [](Design& d) { d.inputs.delay[2] = 1; }},
    {"tail-codes-swapped", "the codes take the tail of each other",
     [](Design& d) { std::swap(d.inputs.tail[0], d.inputs.tail[1]); }},
    {"tail1-for-both", "code 2 takes the tail of code 1",
     [](Design& d) { d.inputs.tail[1] = d.inputs.tail[0]; }},
    {"tail2-for-both", "code 1 takes the tail of code 2",
     [](Design& d) { d.inputs.tail[0] = d.inputs.tail[1]; }},
    {"tail1-parity-first", "systematic and parity values of tail 1 are swapped",
     [](Design& d) {
         for (auto& step : d.inputs.tail[0]) {
             std::swap(step[0], step[1]);
         }
     }},
    {"tail2-parity-first", "systematic and parity values of tail 2 are swapped",
     [](Design& d) {
         for (auto& step : d.inputs.tail[1]) {
             std::swap(step[0], step[1]);
         }
     }},
    {"tail1-by-streams", "tail 1 is read along the streams",
     [](Design& d) {
         d.inputs.tail[0] = {{{0, 1}, {3, 4}, {6, 7}}};
     }},
    {"tail2-by-streams", "tail 2 is read along the streams",
     [](Design& d) {
         d.inputs.tail[1] = {{{0, 2}, {3, 5}, {6, 8}}};
     }},
    {"tail1-reversed", "the steps of tail 1 come in reverse order",
     [](Design& d) { std::swap(d.inputs.tail[0][0], d.inputs.tail[0][2]); }},
    {"tail2-reversed", "the steps of tail 2 come in reverse order",
     [](Design& d) { std::swap(d.inputs.tail[1][0], d.inputs.tail[1][2]); }},
    {"tail1-last-two", "the last two steps of tail 1 are swapped",
     [](Design& d) { std::swap(d.inputs.tail[0][1], d.inputs.tail[0][2]); }},
    {"tail2-first-two", "the first two steps of tail 2 are swapped",
     [](Design& d) { std::swap(d.inputs.tail[1][0], d.inputs.tail[1][1]); }},
    {"tail1-last-step", "systematic and parity value of the last step of tail 1 are swapped",
     [](Design& d) { std::swap(d.inputs.tail[0][2][0], d.inputs.tail[0][2][1]); }},
    {"tail2-first-step", "systematic and parity value of the first step of tail 2 are swapped",
     [](Design& d) { std::swap(d.inputs.tail[1][0][0], d.inputs.tail[1][0][1]); }},
    {"tail1-one-on", "tail 1 is read from one value on",
     [](Design& d) {
         for (auto& step : d.inputs.tail[0]) {
             ++step[0];
             ++step[1];
         }
     }},
    {"tail2-one-back", "tail 2 is read from one value back",
     [](Design& d) {
         for (auto& step : d.inputs.tail[1]) {
             --step[0];
             --step[1];
         }
     }},
};

}  // namespace

std::span<const Fault> inputFaults() {
    return faults;
}

}  // namespace quarzel::oracle
