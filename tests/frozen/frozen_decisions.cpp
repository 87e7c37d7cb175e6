// SPDX-License-Identifier: MIT
#include "frozen/frozen_decisions.hpp"

#include <string_view>

#include "interleaver/lte_block_sizes.hpp"
#include "sweep/sha256.hpp"

namespace quarzel::test {

std::vector<FrozenCase> frozenCases() {
    std::vector<FrozenCase> cases;
    for (const std::uint32_t K : lteBlockSizes()) {
        for (const std::uint32_t units : {2U, 4U, 8U}) {
            for (const std::uint32_t algorithm : {0U, 1U, 2U}) {
                cases.push_back({K, units, algorithm});
            }
        }
    }
    return cases;
}

std::string frozenHeader() {
    std::string header = "K,units,algorithm";
    for (const char* const name : frozenClassNames) {
        for (const int iterations : frozenIterations) {
            header += ',' + std::string(name) + '_' + std::to_string(iterations);
        }
    }
    return header;
}

std::string frozenDigest(const std::vector<unsigned char>& decisions) {
    const auto* const bytes = reinterpret_cast<const char*>(decisions.data());
    return sweep::sha256(std::string_view(bytes, decisions.size())).substr(0, 16);
}

}  // namespace quarzel::test
