// SPDX-License-Identifier: MIT
#include <algorithm>
#include <iterator>
#include <string_view>

#include "oracle/fault.hpp"

namespace quarzel::oracle {
namespace {

constexpr Equivalent equivalents[] = {
    {"tail1-last-step",
     "the last step of the termination has one branch from each state, whose systematic and parity bit are "
     "equal: the two values are only added",
     allTypes},
    {"extrinsic-least-127",
     "extrinsic values are halved downward before anything reads them, and -127 and -128 both give -64",
     allTypes},
    {"extrinsic-greatest-126",
     "extrinsic values are halved downward before anything reads them, and 126 and 127 both give 63",
     allTypes},
    {"rest-odd-step-last",
     "segments of all 188 sizes have an even number of steps, and so has what whole windows leave of them",
     allTypes},
    {"level1-tie", "equal candidates are the same value, and at the first level no correction is pending",
     allTypes},
    {"llr-11-bits",
     "a path with the other bit leaves the best path for the steps of one 1 fed back, which changes at most "
     "256 + 255 + 256 + 256: no ratio reaches 1024. With corrections the greatest one seen is 821",
     allTypes},
    {"alpha-tie", "equal candidates are the same value, and no correction is pending", unstarredTypes},
    {"beta-tie", "equal candidates are the same value, and no correction is pending", unstarredTypes},
    {"level2-tie", "equal candidates are the same value, and no correction is pending", unstarredTypes},
    {"level3-tie", "equal candidates are the same value, and no correction is pending", unstarredTypes},
    {"alpha-exchanged",
     "the order of candidates matters for a difference of half the range alone, 2048. At the start of a "
     "block it is 1024 + 3 * 256 at most, later less",
     unstarredTypes},
    {"beta-exchanged",
     "the order of candidates matters for a difference of half the range alone, 2048. The greatest one seen "
     "before the tail is 1280",
     unstarredTypes},
    {"tree-order",
     "without corrections a tree of maxima depends on its order where differences reach 2048 alone. The "
     "greatest one seen is 1662",
     unstarredTypes},
};

}  // namespace

bool isEquivalent(const Fault& fault, int type) {
    return std::any_of(std::begin(equivalents), std::end(equivalents), [&](const Equivalent& equivalent) {
        return std::string_view(fault.name) == equivalent.name && (equivalent.types >> type & 1U) != 0;
    });
}

}  // namespace quarzel::oracle
