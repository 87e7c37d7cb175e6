// SPDX-License-Identifier: MIT
#include "coverage/pass_replay.hpp"

#include <algorithm>
#include <array>

namespace quarzel::tool {

namespace {

constexpr int least = -128;  ///< branch metric and extrinsic value
constexpr int greatest = 127;

/// The levels of the tree of maxima.
constexpr std::array<Comparison, 3> treeEvents = {{
    {Event::firstTie, Event::firstOrder, Event::firstCorrection},
    {Event::secondTie, Event::secondOrder, Event::secondCorrection},
    {Event::thirdTie, Event::thirdOrder, Event::thirdCorrection},
}};

/// Where bit 1 and bit 0 stand among the positions of an event that has `count` of each.
constexpr std::size_t placeOf(std::size_t bit, std::size_t count, std::size_t number) {
    return (bit == 1 ? 0 : count) + number;
}

}  // namespace

void PassReplay::add(const vardel_ip_quarzel_pass& pass, bool isLast) {
    const PassValues values(pass);
    if (pass.pass != 0) {
        addAPriori();
    }
    addBranches(values);
    itsRecursions.add(values);
    addRatios(values, isLast);
    addExtrinsic(values);
}

/// Each extrinsic value of the pass before is the a-priori value of one step of this one, halved.
void PassReplay::addAPriori() {
    for (const int value : itsExtrinsic) {
        itsCounts.addIf(value % 2 != 0, Event::aPrioriFloor, value < 0 ? 0 : 1);
    }
}

void PassReplay::addBranches(const PassValues& pass) {
    for (std::size_t step = 0; step < pass.K(); ++step) {
        for (std::size_t column = 0; column < 4; ++column) {
            const int parity = column >= 2 ? pass.parity(step) : -pass.parity(step);
            const int metric = pass.intrinsic(step) + parity;
            itsCounts.addIf(metric > greatest, Event::branchAbove, column);
            itsCounts.addIf(metric < least, Event::branchBelow, column);
            requireEqual(std::clamp(metric, least, greatest), pass.branch(step, column));
        }
    }
}

/// The largest path metric of a bit.
Candidate PassReplay::bestOf(std::size_t bit, const Metrics& alpha, const Metrics& beta,
                             const PassValues& pass, std::size_t step) {
    const auto pathFrom = [&](std::size_t state) {
        return plus({alpha[state]}, beta[itsTrellis.target[bit][state]], Event::pathWrap,
                    placeOf(bit, encoderStates, state), itsCounts);
    };
    const auto larger = [&](std::size_t level, const Candidate& first, const Candidate& second,
                            std::size_t position) {
        return itsMaximum.larger(first, second, treeEvents[level], position, itsCounts);
    };
    std::array<Candidate, 4> pairs;
    for (std::size_t pair = 0; pair < pairs.size(); ++pair) {
        const std::size_t even = 2 * pair;
        const std::size_t place = placeOf(bit, pairs.size(), pair);
        const int branch = pass.branch(step, itsTrellis.column[even]);
        pairs[pair] = plus(larger(0, pathFrom(even + 1), pathFrom(even), place), bit == 1 ? branch : -branch,
                           Event::pairWrap, place, itsCounts);
    }
    const Candidate lower = larger(1, pairs[0], pairs[1], placeOf(bit, 2, 0));
    const Candidate upper = larger(1, pairs[2], pairs[3], placeOf(bit, 2, 1));
    return larger(2, lower, upper, placeOf(bit, 1, 0));
}

int PassReplay::ratioAt(const PassValues& pass, std::size_t step) {
    const Metrics alpha = pass.alpha(step);
    const Metrics beta = pass.beta(step);
    const auto maximum = [&](std::size_t bit) {
        const Candidate best = bestOf(bit, alpha, beta, pass, step);
        return wrapped(best.value + best.pending);
    };
    const int difference = maximum(1) - maximum(0);
    itsCounts.addIf(difference != wrapped(difference), Event::ratioWrap, 0);
    return wrapped(difference);
}

void PassReplay::addRatios(const PassValues& pass, bool isLast) {
    for (std::size_t step = 0; step < pass.K(); ++step) {
        requireEqual(ratioAt(pass, step), pass.ratio(step));
        itsCounts.addIf(isLast && pass.ratio(step) == 0, Event::zeroRatio, 0);
    }
}

void PassReplay::addExtrinsic(const PassValues& pass) {
    itsExtrinsic.clear();
    for (std::size_t step = 0; step < pass.K(); ++step) {
        int value = pass.ratio(step) - 2 * pass.intrinsic(step);
        if (itsAlgorithm == 1) {
            itsCounts.addIf(3 * value % 4 != 0, Event::extrinsicFloor, value < 0 ? 0 : 1);
            value = 3 * value >> 2;
        }
        itsCounts.addIf(value > greatest, Event::extrinsicAbove, 0);
        itsCounts.addIf(value < least, Event::extrinsicBelow, 0);
        itsExtrinsic.push_back(std::clamp(value, least, greatest));
        requireEqual(itsExtrinsic.back(), pass.extrinsic(step));
    }
}

}  // namespace quarzel::tool
