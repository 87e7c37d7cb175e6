// SPDX-License-Identifier: MIT
// Faults of the recursions.
#include <utility>

#include "oracle/fault.hpp"

namespace quarzel::oracle {
namespace {

constexpr Fault faults[] = {
    {"alpha-tie", "equal candidates of the forward recursion give the second one",
     [](Design& d) { d.alpha.comparison.secondAtTie = true; }},
    {"alpha-minimum", "the forward recursion takes the smaller candidate",
     [](Design& d) { d.alpha.comparison.takesSmaller = true; }},
    {"alpha-compares-numbers", "the forward recursion compares without wrapping around",
     [](Design& d) { d.alpha.comparison.modulo = false; }},
    {"alpha-difference-11-bits", "the forward recursion compares 11 bits",
     [](Design& d) { d.alpha.comparison.difference.bits = 11; }},
    {"alpha-difference-10-bits", "the forward recursion compares 10 bits",
     [](Design& d) { d.alpha.comparison.difference.bits = 10; }},
    {"alpha-difference-saturates", "the differences of the forward recursion saturate",
     [](Design& d) { d.alpha.comparison.difference.saturates = true; }},
    {"alpha-11-bits", "forward metrics have 11 bits", [](Design& d) { d.alpha.metric.bits = 11; }},
    {"alpha-10-bits", "forward metrics have 10 bits", [](Design& d) { d.alpha.metric.bits = 10; }},
    {"alpha-saturates", "forward metrics saturate", [](Design& d) { d.alpha.metric.saturates = true; }},
    {"alpha-gamma-after", "the forward recursion reads the branch metrics of the next step",
     [](Design& d) { d.alpha.metricStep = 1; }},
    {"alpha-gamma-before", "the forward recursion reads the branch metrics of the step before",
     [](Design& d) { d.alpha.metricStep = -1; }},
    {"alpha-exchanged", "first and second candidate of the forward recursion are exchanged",
     [](Design& d) {
         for (auto& pair : d.alpha.branches) {
             std::swap(pair[0], pair[1]);
         }
     }},
    {"alpha1-metric", "forward state 1 takes the other branch metric",
     [](Design& d) {
         for (Branch& branch : d.alpha.branches[1]) {
             branch.metric ^= 1;
         }
     }},
    {"alpha6-metric", "the first branch of forward state 6 takes the other branch metric",
     [](Design& d) { d.alpha.branches[6][0].metric ^= 1; }},
    {"alpha2-signs", "the branches of forward state 2 have the other sign",
     [](Design& d) {
         for (Branch& branch : d.alpha.branches[2]) {
             branch.sign *= -1;
         }
     }},
    {"alpha5-sign", "the second branch of forward state 5 has the other sign",
     [](Design& d) { d.alpha.branches[5][1].sign = 1; }},
    {"alpha4-states", "the states of the branches of forward state 4 are exchanged",
     [](Design& d) { std::swap(d.alpha.branches[4][0].state, d.alpha.branches[4][1].state); }},
    {"alpha7-state", "the first branch of forward state 7 is that of another state",
     [](Design& d) { d.alpha.branches[7][0].state ^= 2; }},
    {"alpha0-one-branch", "forward state 0 has its first branch alone",
     [](Design& d) { d.alpha.branches[0][1] = d.alpha.branches[0][0]; }},
    {"beta-tie", "equal candidates of the backward recursion give the second one",
     [](Design& d) { d.beta.comparison.secondAtTie = true; }},
    {"beta-minimum", "the backward recursion takes the smaller candidate",
     [](Design& d) { d.beta.comparison.takesSmaller = true; }},
    {"beta-compares-numbers", "the backward recursion compares without wrapping around",
     [](Design& d) { d.beta.comparison.modulo = false; }},
    {"beta-difference-11-bits", "the backward recursion compares 11 bits",
     [](Design& d) { d.beta.comparison.difference.bits = 11; }},
    {"beta-difference-10-bits", "the backward recursion compares 10 bits",
     [](Design& d) { d.beta.comparison.difference.bits = 10; }},
    {"beta-difference-saturates", "the differences of the backward recursion saturate",
     [](Design& d) { d.beta.comparison.difference.saturates = true; }},
    {"beta-11-bits", "backward metrics have 11 bits", [](Design& d) { d.beta.metric.bits = 11; }},
    {"beta-10-bits", "backward metrics have 10 bits", [](Design& d) { d.beta.metric.bits = 10; }},
    {"beta-saturates", "backward metrics saturate", [](Design& d) { d.beta.metric.saturates = true; }},
    {"beta-gamma-after", "the backward recursion reads the branch metrics of the next step",
     [](Design& d) { d.beta.metricStep = 1; }},
    {"beta-gamma-before", "the backward recursion reads the branch metrics of the step before",
     [](Design& d) { d.beta.metricStep = -1; }},
    {"beta-exchanged", "first and second candidate of the backward recursion are exchanged",
     [](Design& d) {
         for (auto& pair : d.beta.branches) {
             std::swap(pair[0], pair[1]);
         }
     }},
    {"beta1-metric", "backward state 1 takes the other branch metric",
     [](Design& d) {
         for (Branch& branch : d.beta.branches[1]) {
             branch.metric ^= 1;
         }
     }},
    {"beta6-metric", "the first branch of backward state 6 takes the other branch metric",
     [](Design& d) { d.beta.branches[6][0].metric ^= 1; }},
    {"beta2-signs", "the branches of backward state 2 have the other sign",
     [](Design& d) {
         for (Branch& branch : d.beta.branches[2]) {
             branch.sign *= -1;
         }
     }},
    {"beta5-sign", "the second branch of backward state 5 has the other sign",
     [](Design& d) { d.beta.branches[5][1].sign = 1; }},
    {"beta4-states", "the states of the branches of backward state 4 are exchanged",
     [](Design& d) { std::swap(d.beta.branches[4][0].state, d.beta.branches[4][1].state); }},
    {"beta7-state", "the first branch of backward state 7 is that of another state",
     [](Design& d) { d.beta.branches[7][0].state ^= 2; }},
    {"beta0-one-branch", "backward state 0 has its first branch alone",
     [](Design& d) { d.beta.branches[0][1] = d.beta.branches[0][0]; }},
    {"known-state-7", "the known state is 7", [](Design& d) { d.knownState = 7; }},
    {"known-state-4", "the known state is 4", [](Design& d) { d.knownState = 4; }},
    {"unlikely-quarter", "states that cannot be start a quarter of the range lower",
     [](Design& d) { d.unlikelyMetric = -512; }},
    {"unlikely-none", "states that cannot be start like the known one",
     [](Design& d) { d.unlikelyMetric = 0; }},
    {"unlikely-half", "states that cannot be start half of the range lower",
     [](Design& d) { d.unlikelyMetric = -2048; }},
    {"unlikely-small", "states that cannot be start 128 units lower",
     [](Design& d) { d.unlikelyMetric = -128; }},
    {"unlikely-above", "states that cannot be start higher", [](Design& d) { d.unlikelyMetric = 1023; }},
};

}  // namespace

std::span<const Fault> recursionFaults() {
    return faults;
}

}  // namespace quarzel::oracle
