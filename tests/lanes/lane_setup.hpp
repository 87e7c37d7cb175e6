// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <cstdlib>
#include <functional>
#include <iostream>
#include <random>
#include <string>
#include <vector>

#include "interface/lane_implementation.hpp"
#include "lanes/lanes.hpp"
#include "support/model.hpp"

namespace quarzel::test {

/// Whether the long run was asked for: environment variable QUARZEL_TEST_EXHAUSTIVE.
inline bool exhaustive() {
    return std::getenv("QUARZEL_TEST_EXHAUSTIVE") != nullptr;
}

/// The candidates that this machine can run, best first. Prints which these are and which are not.
inline std::vector<std::reference_wrapper<const lanes::Candidate>> supportedCandidates() {
    std::vector<std::reference_wrapper<const lanes::Candidate>> supported;
    for (const lanes::Candidate& candidate : lanes::candidates()) {
        const bool runs = candidate.supported();
        std::cout << (runs ? "candidate run: " : "candidate SKIPPED, not supported here: ") << candidate.name
                  << '\n';
        if (runs) {
            supported.emplace_back(candidate);
        }
    }
    return supported;
}

/// A model that decodes in lanes by an instruction set of the test's choice.
inline State makeLaneState(int units, int tagWidth, int algorithm, const lanes::Candidate& candidate) {
    State state = makeState(genericsOf(units, tagWidth, algorithm));
    state->lanes->choose(&candidate);
    return state;
}

/// A model that decodes everything literally.
inline State makeLiteralState(int units, int tagWidth, int algorithm) {
    State state = makeState(genericsOf(units, tagWidth, algorithm));
    vardel_ip_quarzel_set_implementation(state.get(), "literal");
    return state;
}

/// A random number from `least` to `most`.
inline int randomFrom(std::mt19937& random, int least, int most) {
    return std::uniform_int_distribution<int>(least, most)(random);
}

/// Kinds of input, from likely to adverse.
enum class Input {
    noisy,      ///< an all-zero code word with noise
    uniform,    ///< any 8-bit value
    fullScale,  ///< +127 or -128
    runs,       ///< +127 or -128 in runs of random length
    plusMinusOne,
    allEqual,
};
inline constexpr int inputKinds = 6;

inline void fillStream(std::mt19937& random, Input kind, std::vector<int>& stream) {
    std::normal_distribution<float> noise(-8.0F, 12.0F);
    const auto sign = [&random] { return random() % 2 == 0; };
    const auto end = [](bool positive) { return positive ? 127 : -128; };
    const int same = randomFrom(random, -128, 127);
    bool positive = sign();
    for (int& value : stream) {
        switch (kind) {
            case Input::noisy:
                value = std::clamp(static_cast<int>(noise(random)), -128, 127);
                break;
            case Input::uniform:
                value = randomFrom(random, -128, 127);
                break;
            case Input::fullScale:
                value = end(sign());
                break;
            case Input::runs:
                positive = random() % 16 == 0 ? !positive : positive;
                value = end(positive);
                break;
            case Input::plusMinusOne:
                value = sign() ? 1 : -1;
                break;
            case Input::allEqual:
                value = same;
                break;
        }
    }
}

inline Block randomBlock(std::mt19937& random, Input kind, std::size_t K) {
    Block block(K + 4);
    for (std::vector<int>* stream : {&block.systematic, &block.parity1, &block.parity2}) {
        fillStream(random, kind, *stream);
    }
    return block;
}

}  // namespace quarzel::test
