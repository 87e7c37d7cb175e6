// SPDX-License-Identifier: MIT
// Faults of the likelihood tree.
#include "oracle/fault.hpp"

namespace quarzel::oracle {
namespace {

constexpr Fault faults[] = {
    {"level1-tie", "equal candidates at level 1 of the likelihood tree give the second one",
     [](Design& d) { d.likelihood.comparison[0].secondAtTie = true; }},
    {"level1-minimum", "level 1 of the likelihood tree takes the smaller candidate",
     [](Design& d) { d.likelihood.comparison[0].takesSmaller = true; }},
    {"level1-compares-numbers", "level 1 of the likelihood tree compares without wrapping around",
     [](Design& d) { d.likelihood.comparison[0].modulo = false; }},
    {"level1-difference-11-bits", "level 1 of the likelihood tree compares 11 bits",
     [](Design& d) { d.likelihood.comparison[0].difference.bits = 11; }},
    {"level2-tie", "equal candidates at level 2 of the likelihood tree give the second one",
     [](Design& d) { d.likelihood.comparison[1].secondAtTie = true; }},
    {"level2-minimum", "level 2 of the likelihood tree takes the smaller candidate",
     [](Design& d) { d.likelihood.comparison[1].takesSmaller = true; }},
    {"level2-compares-numbers", "level 2 of the likelihood tree compares without wrapping around",
     [](Design& d) { d.likelihood.comparison[1].modulo = false; }},
    {"level2-difference-11-bits", "level 2 of the likelihood tree compares 11 bits",
     [](Design& d) { d.likelihood.comparison[1].difference.bits = 11; }},
    {"level3-tie", "equal candidates at level 3 of the likelihood tree give the second one",
     [](Design& d) { d.likelihood.comparison[2].secondAtTie = true; }},
    {"level3-minimum", "level 3 of the likelihood tree takes the smaller candidate",
     [](Design& d) { d.likelihood.comparison[2].takesSmaller = true; }},
    {"level3-compares-numbers", "level 3 of the likelihood tree compares without wrapping around",
     [](Design& d) { d.likelihood.comparison[2].modulo = false; }},
    {"level3-difference-11-bits", "level 3 of the likelihood tree compares 11 bits",
     [](Design& d) { d.likelihood.comparison[2].difference.bits = 11; }},
    {"tree-11-bits", "the likelihood tree has 11 bits", [](Design& d) { d.likelihood.metric.bits = 11; }},
    {"tree-saturates", "the sums of the likelihood tree saturate",
     [](Design& d) { d.likelihood.metric.saturates = true; }},
    {"llr-11-bits", "log-likelihood ratios have 11 bits", [](Design& d) { d.likelihood.result.bits = 11; }},
    {"llr-10-bits", "log-likelihood ratios have 10 bits", [](Design& d) { d.likelihood.result.bits = 10; }},
    {"llr-saturates", "log-likelihood ratios saturate",
     [](Design& d) { d.likelihood.result.saturates = true; }},
    {"tree-order", "pairs 1 and 2 are exchanged at level 2 of the likelihood tree",
     [](Design& d) {
         d.likelihood.order = {0, 2, 1, 3};
     }},
    {"tree-one1-metric", "bit 1 adds branch metric 0 to pair 1 of the likelihood tree",
     [](Design& d) { d.likelihood.branchMetric[1][1] = 0; }},
    {"tree-zero2-metric", "bit 0 takes branch metric 3 from pair 2 of the likelihood tree",
     [](Design& d) { d.likelihood.branchMetric[0][2] = 3; }},
    {"tree-one0-edge", "a branch of bit 1 ends in state 4 instead of 0",
     [](Design& d) { d.likelihood.edges[1][0][0].to ^= 4; }},
    {"tree-zero3-edge", "a branch of bit 0 begins in state 6 twice",
     [](Design& d) { d.likelihood.edges[0][3][0].from = 6; }},
    {"tree-one2-lost", "one of the branches of bit 1 with metric 2 is missing",
     [](Design& d) { d.likelihood.edges[1][2][1] = d.likelihood.edges[1][2][0]; }},
    {"tree-pair-lost", "bit 0 takes pair 2 twice and misses pair 3",
     [](Design& d) {
         d.likelihood.order = {0, 1, 2, 2};
     }},
    {"tree-alpha-after", "the likelihood tree reads the forward metrics of the next step",
     [](Design& d) { d.likelihood.alphaStep = 1; }},
    {"tree-alpha-before", "the likelihood tree reads the forward metrics of the step before",
     [](Design& d) { d.likelihood.alphaStep = -1; }},
    {"tree-beta-after", "the likelihood tree reads the backward metrics of the next step",
     [](Design& d) { d.likelihood.betaStep = 1; }},
    {"tree-beta-before", "the likelihood tree reads the backward metrics of the step before",
     [](Design& d) { d.likelihood.betaStep = -1; }},
    {"tree-gamma-after", "the likelihood tree reads the branch metrics of the next step",
     [](Design& d) { d.likelihood.gammaStep = 1; }},
    {"tree-gamma-before", "the likelihood tree reads the branch metrics of the step before",
     [](Design& d) { d.likelihood.gammaStep = -1; }},
};

}  // namespace

std::span<const Fault> likelihoodFaults() {
    return faults;
}

}  // namespace quarzel::oracle
