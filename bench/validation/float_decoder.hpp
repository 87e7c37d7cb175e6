// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <array>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <span>
#include <utility>
#include <vector>

#include "quarzel/code.hpp"

namespace quarzel::validation {

/// What a textbook decoder does, where textbooks differ.
struct FloatSettings {
    bool isExact = false;  ///< log-MAP, else max-log
    std::vector<float> scales = {
        1};                    ///< of the extrinsics in each iteration; the last one for all that follow
    std::size_t segments = 1;  ///< a pass is cut into as many, whose inner boundaries start with what they
                               ///< were an iteration before, and at first with nothing known
};

/// The turbo decoder of LTE as textbooks have it, in floating point: log-likelihood ratios ln P(1) / P(0) in,
/// decisions out. It shares no arithmetic with the core and shows what the core's costs. It decodes some
/// blocks at once for the sake of speed.
class FloatDecoder {
  public:
    static constexpr std::size_t lanes = 16;

    /// A value for each block.
    using Values = std::array<float, lanes>;

    FloatDecoder(std::uint32_t blockSize, FloatSettings settings)
        : itsSettings(std::move(settings)),
          itsPermutation(permutation(blockSize)),
          itsForward(blockSize + tail + 1),
          itsExtrinsic(blockSize),
          itsPrior(blockSize) {
        for (auto& boundaries : itsBoundaries) {
            boundaries.resize(2 * (itsSettings.segments + 1));
        }
    }

    std::size_t blockSize() const { return itsPermutation.size(); }

    /// @param streams  3 (K + 4) ratios, the streams as the core takes them
    /// @param bits     receives K decisions, bit i of each from block i
    void decode(std::span<const Values> streams, unsigned iterations, std::span<std::uint16_t> bits) {
        const std::size_t K = blockSize();
        takeApart(streams);
        std::fill(itsPrior.begin(), itsPrior.end(), Values{});
        for (auto& boundaries : itsBoundaries) {
            std::fill(boundaries.begin(), boundaries.end(), Metrics{});
        }
        for (unsigned iteration = 0; iteration < iterations; ++iteration) {
            const float scale =
                itsSettings.scales[std::min<std::size_t>(iteration, itsSettings.scales.size() - 1)];
            for (unsigned code = 0; code < 2; ++code) {
                pass(code);
                for (std::size_t k = 0; k < K; ++k) {
                    // What code 1 learns about bit p(k) is at k for code 2, and back.
                    const std::size_t from = code == 0 ? itsPermutation[k] : k;
                    const std::size_t to = code == 0 ? k : itsPermutation[k];
                    for (std::size_t lane = 0; lane < lanes; ++lane) {
                        itsPrior[to][lane] = scale * itsExtrinsic[from][lane];
                    }
                }
            }
        }
        for (std::size_t k = 0; k < K; ++k) {
            std::uint16_t decided = 0;
            // The full ratio of the last pass, that of code 2: it is in interleaved order.
            for (std::size_t lane = 0; lane < lanes; ++lane) {
                decided = static_cast<std::uint16_t>(decided | (itsDecided[k][lane] > 0 ? 1U << lane : 0U));
            }
            bits[itsPermutation[k]] = decided;
        }
    }

  private:
    static constexpr std::size_t states = 8;
    static constexpr std::size_t tail = 3;
    using Metrics = std::array<Values, states>;

    /// The state after `state`, and the parity bit, for an information bit; the first delay is the highest
    /// bit.
    static constexpr std::size_t nextState(std::size_t state, std::size_t bit) {
        const std::size_t fed = bit ^ (state >> 1 & 1) ^ (state & 1);
        return fed << 2 | state >> 1;
    }
    static constexpr std::size_t parityOf(std::size_t state, std::size_t bit) {
        const std::size_t fed = bit ^ (state >> 1 & 1) ^ (state & 1);
        return fed ^ (state >> 2 & 1) ^ (state & 1);
    }

    void takeApart(std::span<const Values> streams) {
        const std::size_t K = blockSize();
        const auto stream = [&](std::size_t i) { return streams.subspan(i * (K + 4), K + 4); };
        itsSystematic[0].assign(stream(0).begin(), stream(0).begin() + static_cast<std::ptrdiff_t>(K));
        itsSystematic[1].clear();
        for (std::size_t k = 0; k < K; ++k) {
            itsSystematic[1].push_back(stream(0)[itsPermutation[k]]);
        }
        for (unsigned code = 0; code < 2; ++code) {
            const auto parity = stream(1 + code);
            itsParity[code].assign(parity.begin(), parity.begin() + static_cast<std::ptrdiff_t>(K));
            // The tail of a code, 6 values of systematic and parity in turns, stands in two columns of three
            // streams.
            for (std::size_t i = 0; i < 2 * tail; ++i) {
                const Values& value = stream(i % 3)[K + 2 * code + i / 3];
                (i % 2 == 0 ? itsSystematic : itsParity)[code].push_back(value);
            }
        }
    }

    float maximum(float a, float b) const {
        const float most = std::max(a, b);
        return itsSettings.isExact ? most + std::log1p(std::exp(-std::abs(a - b))) : most;
    }

    /// The metric of a branch is the sum of the ratios of its bits that are 1.
    struct Branches {
        std::array<Values, 4> metrics;  ///< by information bit * 2 + parity bit
    };
    Branches branches(unsigned code, std::size_t step) const {
        Branches made{};
        for (std::size_t lane = 0; lane < lanes; ++lane) {
            const float prior = step < blockSize() ? itsPriorNow[step][lane] : 0;
            const float systematic = itsSystematic[code][step][lane] + prior;
            const float parity = itsParity[code][step][lane];
            made.metrics[1][lane] = parity;
            made.metrics[2][lane] = systematic;
            made.metrics[3][lane] = systematic + parity;
        }
        return made;
    }

    template <bool forward>
    Metrics step(const Metrics& from, const Branches& branch) const {
        Metrics to;
        std::array<bool, states> isFirst;
        isFirst.fill(true);
        for (std::size_t state = 0; state < states; ++state) {
            for (std::size_t bit = 0; bit < 2; ++bit) {
                const std::size_t next = nextState(state, bit);
                const std::size_t source = forward ? state : next;
                const std::size_t target = forward ? next : state;
                const Values& metric = branch.metrics[2 * bit + parityOf(state, bit)];
                for (std::size_t lane = 0; lane < lanes; ++lane) {
                    const float candidate = from[source][lane] + metric[lane];
                    to[target][lane] = isFirst[target] ? candidate : maximum(to[target][lane], candidate);
                }
                isFirst[target] = false;
            }
        }
        for (std::size_t state = states; state-- > 0;) {
            for (std::size_t lane = 0; lane < lanes; ++lane) {
                to[state][lane] -= to[0][lane];
            }
        }
        return to;
    }

    static Metrics knownState() {
        Metrics metrics;
        for (std::size_t state = 0; state < states; ++state) {
            metrics[state].fill(state == 0 ? 0 : -1e9F);
        }
        return metrics;
    }

    void pass(unsigned code) {
        const std::size_t K = blockSize();
        const std::size_t count = itsSettings.segments;
        itsPriorNow = itsPrior.data();
        std::vector<Metrics>& boundaries = itsBoundaries[code];  // forward ones, then backward ones
        const auto start = [&](std::size_t segment) { return K * segment / count; };
        boundaries[0] = knownState();
        Metrics backward = knownState();
        for (std::size_t k = K + tail; k-- > K;) {
            backward = step<false>(backward, branches(code, k));
        }
        boundaries[count + 1 + count] = backward;

        const std::vector<Metrics> before = boundaries;
        for (std::size_t segment = 0; segment < count; ++segment) {
            itsForward[start(segment)] = before[segment];
            for (std::size_t k = start(segment); k < start(segment + 1); ++k) {
                itsForward[k + 1] = step<true>(itsForward[k], branches(code, k));
            }
            if (segment + 1 < count) {
                boundaries[segment + 1] = itsForward[start(segment + 1)];
            }
        }
        itsDecided.resize(K);
        for (std::size_t segment = 0; segment < count; ++segment) {
            backward = before[count + 1 + segment + 1];
            for (std::size_t k = start(segment + 1); k-- > start(segment);) {
                const Branches branch = branches(code, k);
                // The segment before has left its own last metrics at the boundary.
                decide(code, k, k == start(segment) ? before[segment] : itsForward[k], branch, backward);
                backward = step<false>(backward, branch);
            }
            if (segment > 0) {
                boundaries[count + 1 + segment] = backward;
            }
        }
    }

    void decide(unsigned code, std::size_t k, const Metrics& forward, const Branches& branch,
                const Metrics& backward) {
        std::array<Values, 2> most;
        for (std::size_t bit = 0; bit < 2; ++bit) {
            for (std::size_t state = 0; state < states; ++state) {
                const std::size_t target = nextState(state, bit);
                const Values& metric = branch.metrics[2 * bit + parityOf(state, bit)];
                for (std::size_t lane = 0; lane < lanes; ++lane) {
                    const float path = forward[state][lane] + metric[lane] + backward[target][lane];
                    most[bit][lane] = state == 0 ? path : maximum(most[bit][lane], path);
                }
            }
        }
        for (std::size_t lane = 0; lane < lanes; ++lane) {
            const float ratio = most[1][lane] - most[0][lane];
            itsDecided[k][lane] = ratio;
            itsExtrinsic[k][lane] = ratio - itsSystematic[code][k][lane] - itsPriorNow[k][lane];
        }
    }

    FloatSettings itsSettings;
    std::vector<unsigned> itsPermutation;
    std::array<std::vector<Values>, 2> itsSystematic;
    std::array<std::vector<Values>, 2> itsParity;
    std::array<std::vector<Metrics>, 2> itsBoundaries;
    std::vector<Metrics> itsForward;  ///< before each step
    std::vector<Values> itsExtrinsic;
    std::vector<Values> itsPrior;
    const Values* itsPriorNow = nullptr;
    std::vector<Values> itsDecided;  ///< the full ratios of the last pass
};

}  // namespace quarzel::validation
