// SPDX-License-Identifier: MIT
// Compiled once for each instruction set, with QUARZEL_PROBE its name and QUARZEL_PROBE_LANES its lanes.
#include "lanes/lane_probe.hpp"

#include "lanes/lane_rules.hpp"
#include "lanes/lane_soft_input.hpp"

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

template <std::size_t W, class Value>
void toWords(const Value* values, std::int16_t* result, bool* saturated, std::size_t count) {
    for (std::size_t i = 0; i < count; i += W) {
        lanes::SoftInput input;
        std::int16_t words[W];
        input.template toWords<W>(values + i).store(words);
        for (std::size_t value = 0; value < W; ++value) {
            result[i + value] = words[lanes::SoftInput::laneOf<Value>(value, W)];
        }
        saturated[i / W] = input.saturated();
    }
}

template <std::size_t W>
constexpr Conversions conversions = {W, toWords<W, std::int8_t>, toWords<W, std::int16_t>,
                                     toWords<W, std::int32_t>};

}  // namespace

extern const LaneProbe QUARZEL_PROBE;
const LaneProbe QUARZEL_PROBE = {staircase,
                                 {halfExtrinsic<0>, halfExtrinsic<1>},
                                 larger,
                                 {conversions<8>, conversions<lanes::inputWidth>}};

}  // namespace quarzel::test
