// SPDX-License-Identifier: MIT
#pragma once

#include <random>
#include <string>
#include <vector>

#include "link/coding/standard_coding.hpp"

namespace quarzel::test {

/// A circular buffer to try, with the standard's view of it.
struct BufferCase {
    int K, filler, Ncb;
    standard::Bits w;  ///< of labels: each code bit is its place in the three streams

    BufferCase(int size, int fillerBits, bool isLimited);

    std::string text() const;

    /// What is sent, as labels.
    std::vector<int> sent(int rv, int E) const;

    /// 1, 2, and each multiple of N_cb / 7 up to 5 N_cb with one beside it on each side.
    std::vector<int> codedSizes() const;
};

/// Call `visit` with each of the 188 block sizes and each of its filler counts, with the whole buffer and a
/// limited one, where the environment asks for it; or with `count` of them.
template <class Visit>
void forBufferCases(std::mt19937& random, int count, Visit visit) {
    const auto pick = [&random](const std::vector<int>& list) {
        return std::uniform_int_distribution<std::size_t>(0, list.size() - 1)(random);
    };
    const std::vector<int>& sizes = standard::blockSizes();
    if (std::getenv("QUARZEL_TEST_EXHAUSTIVE") == nullptr) {
        for (int i = 0; i < count; ++i) {
            const std::size_t size = pick(sizes);
            const std::vector<int>& fillers = standard::fillers()[size];
            visit(BufferCase(sizes[size], fillers[pick(fillers)], i % 2 == 1));
        }
        return;
    }
    for (std::size_t size = 0; size < sizes.size(); ++size) {
        for (const int filler : standard::fillers()[size]) {
            visit(BufferCase(sizes[size], filler, false));
            visit(BufferCase(sizes[size], filler, true));
        }
    }
}

}  // namespace quarzel::test
