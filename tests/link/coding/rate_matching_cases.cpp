// SPDX-License-Identifier: MIT
#include "link/coding/rate_matching_cases.hpp"

#include <set>

namespace quarzel::test {

BufferCase::BufferCase(int size, int fillerBits, bool isLimited) : K(size), filler(fillerBits) {
    standard::Streams labels;
    int label = 0;
    for (int stream = 0; stream < 3; ++stream) {
        for (int position = 0; position < K + 4; ++position, ++label) {
            const bool isNull = stream < 2 && position < filler;
            labels[static_cast<std::size_t>(stream)].push_back(isNull ? standard::null : label);
        }
    }
    w = standard::circularBuffer(labels);
    const int whole = static_cast<int>(w.size());
    Ncb = isLimited ? whole / 2 + K % 31 : whole;
}

std::string BufferCase::text() const {
    return "K " + std::to_string(K) + ", filler " + std::to_string(filler) + ", N_cb " + std::to_string(Ncb);
}

std::vector<int> BufferCase::sent(int rv, int E) const {
    std::vector<int> labels;
    for (const int index : standard::selection(w, K + 4, Ncb, rv, E)) {
        labels.push_back(w[static_cast<std::size_t>(index)]);
    }
    return labels;
}

std::vector<int> BufferCase::codedSizes() const {
    std::set<int> sizes = {1, 2};
    for (int multiple = 1; multiple <= 35; ++multiple) {
        for (const int beside : {-1, 0, 1}) {
            sizes.insert(multiple * Ncb / 7 + beside);
        }
    }
    return {sizes.begin(), sizes.end()};
}

}  // namespace quarzel::test
