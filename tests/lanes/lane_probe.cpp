// SPDX-License-Identifier: MIT
// Compiled once for each instruction set, with QUARZEL_PROBE its name and QUARZEL_PROBE_LANES its lanes.
#include "lanes/lane_probe.hpp"

#include "engine/lanes/lane_rules.hpp"
#include "engine/lanes/lane_transpose.hpp"

namespace quarzel::test {

namespace {

constexpr std::size_t width = QUARZEL_PROBE_LANES;
using Word = lanes::Lanes<width>;

void staircase(const std::int16_t* difference, std::int16_t* correction, std::size_t count) {
    for (std::size_t i = 0; i < count; i += width) {
        lanes::Staircase<Word>()(Word::load(difference + i)).store(correction + i);
    }
}

template <int Algorithm>
void halfExtrinsic(const std::int16_t* llr, const std::int16_t* channel, std::int16_t* half,
                   std::size_t count) {
    for (std::size_t i = 0; i < count; i += width) {
        lanes::halfExtrinsic<lanes::LaneRules<width, Algorithm>>(Word::load(llr + i), Word::load(channel + i))
            .store(half + i);
    }
}

void larger(const std::int16_t* x, const std::int16_t* y, std::int16_t* result, std::size_t count) {
    for (std::size_t i = 0; i < count; i += width) {
        moduloMax(Word::load(x + i), Word::load(y + i)).store(result + i);
    }
}

void words(const int* values, std::int16_t* result, bool* saturated, std::size_t count) {
    for (std::size_t i = 0; i < count; i += lanes::octetLanes) {
        lanes::SoftInput input;
        input.toWords(values + i, values + i + 4).store(result + i);
        saturated[i / lanes::octetLanes] = input.saturated();
    }
}

}  // namespace

extern const LaneProbe QUARZEL_PROBE;
const LaneProbe QUARZEL_PROBE = {staircase, {halfExtrinsic<0>, halfExtrinsic<1>}, larger, words};

}  // namespace quarzel::test
