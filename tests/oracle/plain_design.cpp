// SPDX-License-Identifier: MIT
#include "oracle/plain_design.hpp"

#include <cmath>

namespace quarzel::oracle {
namespace {

/// A step of the encoder, 1 + D + D^3 over 1 + D^2 + D^3. Bit 2 of the state is the newest one.
struct Step {
    int to, bit, parity;
};

Step stepOf(int state, int fedBack) {
    const int newest = state >> 2, middle = (state >> 1) & 1, oldest = state & 1;
    return {state >> 1 | fedBack << 2, fedBack ^ middle ^ oldest, fedBack ^ newest ^ oldest};
}

/// The branch metric of a step from a state. Two of them have the same value; states of a pair share one.
int metricOf(int from) {
    return from >> 1;
}

void setTrellis(Design& design) {
    std::array<std::array<int, 4>, 2> found{};
    for (int from = 7; from >= 0;
         --from) {  // of two states that share a branch metric the odd one comes first
        for (int fedBack = 0; fedBack < 2; ++fedBack) {
            const Step step = stepOf(from, fedBack);
            const int metric = metricOf(from), sign = step.bit == 1 ? 1 : -1;
            const std::size_t candidate = step.bit == 1 ? 0 : 1;  // bit 1 comes first
            design.alpha.branches[static_cast<std::size_t>(step.to)][candidate] = {from, metric, sign};
            design.beta.branches[static_cast<std::size_t>(from)][candidate] = {step.to, metric, sign};
            auto& edges =
                design.likelihood.edges[static_cast<std::size_t>(step.bit)][static_cast<std::size_t>(metric)];
            edges[static_cast<std::size_t>(
                found[static_cast<std::size_t>(step.bit)][static_cast<std::size_t>(metric)]++)] = {from,
                                                                                                   step.to};
        }
    }
}

/// From each state the encoder returns to state 0 in three steps that feed back 0.
void setTermination(Termination& termination) {
    for (std::size_t state = 0; state < 8; ++state) {
        int at = static_cast<int>(state);
        for (auto& signs : termination.sign[state]) {
            const Step step = stepOf(at, 0);
            signs = {step.bit == 1 ? 1 : -1, step.parity == 1 ? 1 : -1};
            at = step.to;
        }
    }
}

/// ln(1 + exp(-x)) in units of 1/8 at x = 0, 1/2, ... 15/2.
std::array<int, 16> correctionTable() {
    std::array<int, 16> table{};
    for (std::size_t i = 0; i < table.size(); ++i) {
        table[i] = static_cast<int>(std::floor(8 * std::log1p(std::exp(-static_cast<double>(i) / 2)) + 0.5));
    }
    return table;
}

}  // namespace

Design soundDesign(int units, int type) {
    Design design;
    design.type = type;
    design.cut.units = units;
    setTrellis(design);
    setTermination(design.termination);
    int place = 0;
    for (auto& code : design.inputs.tail) {
        for (auto& step : code) {
            step = {place, place + 1};
            place += 2;
        }
    }
    if (type == 1) {
        design.exchange.numerator = 3;
    }
    if (type == 2) {
        Correction correction;
        correction.timing = Timing::late;
        correction.table = correctionTable();
        design.alpha.correction = design.beta.correction = correction;
        design.likelihood.correction.fill(correction);
    }
    return design;
}

}  // namespace quarzel::oracle
