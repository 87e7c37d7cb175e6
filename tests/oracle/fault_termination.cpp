// SPDX-License-Identifier: MIT
// Faults of the end of the trellis.
#include <algorithm>
#include <utility>

#include "oracle/fault.hpp"

namespace quarzel::oracle {
namespace {

constexpr Fault faults[] = {
    {"tail-ignored", "the tail is ignored", [](Design& d) { d.termination.start = Start::zero; }},
    {"tail-known-state", "the backward recursion starts in state 0 before the tail",
     [](Design& d) { d.termination.start = Start::known; }},
    {"tail-store-0-bits", "metrics of the tail lose no bits",
     [](Design& d) { d.termination.truncatedBits = 0; }},
    {"tail-store-2-bits", "metrics of the tail lose 2 bits, not 3",
     [](Design& d) { d.termination.truncatedBits = 2; }},
    {"tail-store-4-bits", "metrics of the tail lose 4 bits, not 3",
     [](Design& d) { d.termination.truncatedBits = 4; }},
    {"tail-step1-parity-negated", "the parity of the first tail step has the other sign",
     [](Design& d) {
         for (auto& state : d.termination.sign) {
             state[0][1] *= -1;
         }
     }},
    {"tail-step1-missing", "the first tail step is missing",
     [](Design& d) {
         for (auto& state : d.termination.sign) {
             state[0] = {0, 0};
         }
     }},
    {"tail-step2-parity-negated", "the parity of the second tail step has the other sign",
     [](Design& d) {
         for (auto& state : d.termination.sign) {
             state[1][1] *= -1;
         }
     }},
    {"tail-step2-missing", "the second tail step is missing",
     [](Design& d) {
         for (auto& state : d.termination.sign) {
             state[1] = {0, 0};
         }
     }},
    {"tail-step3-parity-negated", "the parity of the third tail step has the other sign",
     [](Design& d) {
         for (auto& state : d.termination.sign) {
             state[2][1] *= -1;
         }
     }},
    {"tail-step3-missing", "the third tail step is missing",
     [](Design& d) {
         for (auto& state : d.termination.sign) {
             state[2] = {0, 0};
         }
     }},
    {"tail-negated", "metrics of the tail have the other sign",
     [](Design& d) {
         for (auto& state : d.termination.sign) {
             for (auto& step : state) {
                 step = {-step[0], -step[1]};
             }
         }
     }},
    {"tail-states-2-3", "states 2 and 3 are exchanged before the tail",
     [](Design& d) { std::swap(d.termination.sign[2], d.termination.sign[3]); }},
    {"tail-states-4-7", "states 4 and 7 are exchanged before the tail",
     [](Design& d) { std::swap(d.termination.sign[4], d.termination.sign[7]); }},
    {"tail-states-reversed", "the states before the tail come in reverse order",
     [](Design& d) { std::reverse(d.termination.sign.begin(), d.termination.sign.end()); }},
    {"tail-8-bits", "metrics of the tail saturate at 8 bits",
     [](Design& d) {
         d.termination.metric = {8, true};
     }},
    {"tail-9-bits", "metrics of the tail have 9 bits", [](Design& d) { d.termination.metric.bits = 9; }},
    {"tail-10-bits", "metrics of the tail have 10 bits", [](Design& d) { d.termination.metric.bits = 10; }},
};

}  // namespace

std::span<const Fault> terminationFaults() {
    return faults;
}

}  // namespace quarzel::oracle
