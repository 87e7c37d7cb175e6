// SPDX-License-Identifier: MIT
#include "oracle/fault.hpp"

namespace quarzel::oracle {

std::vector<Fault> catalogue() {
    std::vector<Fault> all;
    for (const auto& part : {inputFaults(), permutationFaults(), exchangeFaults(), recursionFaults(),
                             stuckFaults(), correctionFaults(), segmentFaults(), windowFaults(),
                             terminationFaults(), likelihoodFaults(), outcomeFaults()}) {
        all.insert(all.end(), part.begin(), part.end());
    }
    return all;
}

}  // namespace quarzel::oracle
