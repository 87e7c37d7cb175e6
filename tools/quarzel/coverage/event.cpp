// SPDX-License-Identifier: MIT
#include "coverage/event.hpp"

#include <fmt/format.h>

#include "coverage/maximum.hpp"

namespace quarzel::tool {

namespace {

using Names = std::vector<std::string>;

/// "PREFIX0", "PREFIX1" and so on.
Names numbered(const std::string& prefix, std::size_t count, std::size_t first = 0) {
    Names names;
    for (std::size_t i = first; i < first + count; ++i) {
        names.push_back(fmt::format("{}{}", prefix, i));
    }
    return names;
}

/// One list behind the other.
Names both(Names names, const Names& others) {
    names.insert(names.end(), others.begin(), others.end());
    return names;
}

/// Both bits, with a number each: "1.0", ... "0.0", ...
Names byBit(std::size_t count) {
    return both(numbered("1.", count), numbered("0.", count));
}

std::vector<EventFacts> makeFacts() {
    const Names once = {"any"};
    const Names states = numbered("", 8);
    const Names columns = numbered("g", 4, 4);
    const Names signs = {"negative", "positive"};
    const Names bits = {"1", "0"};
    constexpr unsigned scaledTypes = 1U << 1U;  // no other one scales extrinsic values
    constexpr unsigned starTypes = 1U << 2U;    // no other one has a correction table
    const Names entries = both(numbered("+", correctionEntries + 1), numbered("-", correctionEntries + 1));
    // Of the values that are halved and scaled all are whole: what rounds them down is the mask behind,
    // whatever their sign. Neither division truncates by itself.
    return {
        {"branch-above", "a branch metric is limited to the greatest one", columns},
        {"branch-below", "a branch metric is limited to the least one", columns},
        {"a-priori-floor", "halving an odd a-priori value rounds it down", signs},
        {"extrinsic-floor", "scaling an extrinsic value by 3/4 rounds it down", signs, scaledTypes},
        {"extrinsic-above", "an extrinsic value is limited to the greatest one", once},
        {"extrinsic-below", "an extrinsic value is limited to the least one", once},
        {"zero-ratio", "a ratio of 0 decides", once},
        {"alpha-tie", "the candidates of a forward metric are equal", states},
        {"alpha-order", "the modulo maximum of these takes the smaller number", states},
        {"alpha-wrap", "one of these wraps around", states},
        {"alpha-correction", "difference of these by the entry of its correction", entries, starTypes},
        {"alpha-pending", "a correction is pending where a segment ends, and lost", states, starTypes},
        {"alpha-mask", "the mask of a segment's last metrics clears bits", states},
        {"alpha-next-pass", "a segment starts with metrics that this pass changes", {"inner", "last"}},
        {"beta-tie", "the candidates of a backward metric are equal", states},
        {"beta-order", "the modulo maximum of these takes the smaller number", states},
        {"beta-wrap", "one of these wraps around", states},
        {"beta-correction", "difference of these by the entry of its correction", entries, starTypes},
        {"beta-pending", "a correction is pending where a window ends, and lost", states, starTypes},
        {"beta-mask", "the mask of a window's last metrics clears bits", states},
        {"tail-mask", "the mask of the metrics below the tail clears bits", states},
        {"beta-next-pass", "a window starts with metrics that this pass changes", {"inner", "top"}},
        {"beta-same-pass", "a window starts with metrics that this pass has changed", once},
        {"path-wrap", "the sum of forward and backward metric wraps around", byBit(8)},
        {"first-tie", "first level of the tree: two paths are equal", byBit(4)},
        {"first-order", "the modulo maximum of these takes the smaller number", byBit(4)},
        {"first-correction", "difference of these by the entry of its correction", entries, starTypes},
        {"pair-wrap", "adding the branch metric behind the first level wraps around", byBit(4)},
        {"second-tie", "second level of the tree: two pairs are equal", byBit(2)},
        {"second-order", "the modulo maximum of these takes the smaller number", byBit(2)},
        {"second-correction", "difference of these by the entry of its correction", entries, starTypes},
        {"third-tie", "third level of the tree: both halves are equal", bits},
        {"third-order", "the modulo maximum of these takes the smaller number", bits},
        {"third-correction", "difference of these by the entry of its correction", entries, starTypes},
        {"ratio-wrap", "the difference of the two maxima wraps around", once},
    };
}

}  // namespace

const std::vector<EventFacts>& eventFacts() {
    static const std::vector<EventFacts> facts = makeFacts();
    return facts;
}

}  // namespace quarzel::tool
