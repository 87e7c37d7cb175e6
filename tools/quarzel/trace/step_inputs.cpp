// SPDX-License-Identifier: MIT
#include "trace/step_inputs.hpp"

#include <fmt/format.h>

#include <algorithm>

namespace quarzel::tool {

namespace {

/// Half an extrinsic value, rounded down as the core does.
constexpr int halfOf(int extrinsic) {
    return extrinsic >> 1;
}

}  // namespace

std::string StepInputs::parenthesised(int number) {
    return number < 0 ? fmt::format("({})", number) : std::to_string(number);
}

std::string StepInputs::nameOf(const Place& place) const {
    const std::string name = fmt::format("{} of step {}", traceColumns()[place.column].heading(), place.step);
    return place.pass == itsDifference.pass || isInput(place.column)
               ? name
               : fmt::format("{} in pass {}", name, *place.pass);
}

TraceValue StepInputs::valueIn(std::size_t trace, const Place& place) const {
    return itsDifference.blocks[trace]->value(place.pass, place.step, place.column);
}

int StepInputs::known(const Place& place) const {
    const TraceValue value = valueIn(0, place);
    if (!value.isNumber()) {
        throw MissingInput{nameOf(place)};
    }
    return value.raw();
}

int StepInputs::take(const Place& place) {
    const int value = known(place);
    itsTaken.push_back(place);
    return value;
}

int StepInputs::soft(const char* stream) {
    const std::string name = fmt::format("code{}_{}", constituentCode(*itsDifference.pass), stream);
    return take({std::nullopt, itsDifference.step, *columnUnder(name)});
}

StepInputs::Sum StepInputs::twiceIntrinsic() {
    const int systematic = soft("sys");
    const std::uint32_t pass = *itsDifference.pass;
    if (pass == 0) {
        return {systematic, fmt::format("the systematic value, {}", systematic)};
    }
    const std::vector<unsigned> table = permutation(itsDifference.steps - terminationSteps);
    const auto inverse = std::ranges::find(table, itsDifference.step);
    const auto step = constituentCode(pass) == 2 ? table[itsDifference.step]
                                                 : static_cast<std::uint32_t>(inverse - table.begin());
    const int extrinsic = take({pass - 1, step, *findColumn("ext")});
    const int sum = systematic + halfOf(extrinsic);
    return {sum, fmt::format(
                     "the systematic value and half the extrinsic value of step {} in pass {}, {} + {} = {}",
                     step, pass - 1, systematic, parenthesised(halfOf(extrinsic)), sum)};
}

template <class Is>
std::string StepInputs::namesOf(Is is) const {
    constexpr std::size_t mostNames = 4;
    std::vector<std::string> names;
    std::size_t others = 0;
    for (const Place& place : itsTaken) {
        const std::string name = nameOf(place);
        if (!is(valueIn(0, place), valueIn(1, place)) || std::ranges::find(names, name) != names.end()) {
            continue;
        }
        if (names.size() < mostNames) {
            names.push_back(name);
        } else {
            ++others;
        }
    }
    std::string text = fmt::format("{}", fmt::join(names, ", "));
    return others == 0 ? text : fmt::format("{} and {} more", text, others);
}

std::string StepInputs::notToldByB() const {
    return namesOf([](TraceValue, TraceValue b) { return !b.isThere(); });
}

std::string StepInputs::otherInB() const {
    return namesOf([](TraceValue a, TraceValue b) { return b.isThere() && !(a == b); });
}

}  // namespace quarzel::tool
