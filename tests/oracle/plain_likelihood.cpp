// SPDX-License-Identifier: MIT
#include "oracle/plain_decoder.hpp"

namespace quarzel::oracle {

/// The greatest metric of the paths through a step that carry a bit: eight branches in a tree of three
/// levels.
Candidate PlainDecoder::likelihoodOf(std::size_t bit, int step) const {
    const Likelihood& tree = itsDesign.likelihood;
    const auto near = [this, step](int steps) {
        return static_cast<std::size_t>(std::clamp(step + steps, 0, itsK - 1));
    };
    const Metrics& alpha = itsSignals.alpha[near(tree.alphaStep)];
    const Metrics& beta = itsSignals.beta[near(tree.betaStep)];
    const auto& gamma = itsSignals.gamma[near(tree.gammaStep)];
    const auto best = [&tree](std::size_t level, const Candidate& first, const Candidate& second) {
        return maximum(tree.comparison[level], tree.correction[level], tree.metric, first, second);
    };
    const auto path = [&](const Edge& edge) {
        const int sum = alpha[static_cast<std::size_t>(edge.from)] + beta[static_cast<std::size_t>(edge.to)];
        return Candidate{held(tree.metric, sum), 0};
    };
    std::array<Candidate, 4> pair;
    for (std::size_t m = 0; m < 4; ++m) {
        const auto& edges = tree.edges[bit][m];
        pair[m] = best(0, path(edges[0]), path(edges[1]));
        const int metric = gamma[static_cast<std::size_t>(tree.branchMetric[bit][m])];
        pair[m].value = held(tree.metric, pair[m].value + (bit == 1 ? metric : -metric));
    }
    const auto& order = tree.order;
    const Candidate left = best(1, pair[order[0]], pair[order[1]]);
    const Candidate right = best(1, pair[order[2]], pair[order[3]]);
    return tree.thirdSwapped ? best(2, right, left) : best(2, left, right);
}

void PlainDecoder::runLikelihood(int steps) {
    const Likelihood& tree = itsDesign.likelihood;
    for (int k = 0; k < steps; ++k) {
        const Candidate one = likelihoodOf(1, k), zero = likelihoodOf(0, k);
        const int pending = tree.lastPending ? one.pending - zero.pending : 0;
        itsSignals.llr[static_cast<std::size_t>(k)] = held(tree.result, one.value - zero.value + pending);
    }
}

}  // namespace quarzel::oracle
