// SPDX-License-Identifier: MIT
#include "link/coding/coded_sizes.hpp"

#include <algorithm>
#include <stdexcept>
#include <string>

#include "link/coding/require.hpp"
#include "link/coding/sub_block_interleaver.hpp"
#include "quarzel/code.hpp"

namespace quarzel::link {

std::size_t softBits(const SoftMemory& memory) {
    const std::size_t shares = memory.KC * memory.KMIMO * std::min(memory.Mdlharq, memory.Mlimit);
    if (shares == 0 || memory.Nsoft == 0) {
        throw std::invalid_argument("N_soft, K_C, K_MIMO, M_DL_HARQ and M_limit must be at least 1");
    }
    return memory.Nsoft / shares;
}

std::size_t wholeBufferSize(std::uint32_t K) {
    return 3 * subBlockColumns * subBlockRows(K + quarzel::tailPositions);
}

std::size_t bufferSize(std::uint32_t K, std::size_t C, std::size_t NIR) {
    if (C == 0) {
        throw std::invalid_argument("there must be at least 1 code block, not 0");
    }
    return std::min(NIR / C, wholeBufferSize(K));
}

std::vector<std::size_t> codedSizes(std::size_t C, std::size_t G, unsigned layers, unsigned Qm) {
    const std::size_t unit = std::size_t{layers} * Qm;
    if (C == 0 || unit == 0) {
        throw std::invalid_argument("code blocks, layers and bits of a symbol must be at least 1");
    }
    if (G < C * unit) {
        throw std::invalid_argument("the code blocks need at least " + std::to_string(C * unit) +
                                    " coded bits, not " + std::to_string(G));
    }
    requireMultiple("coded bits", G, unit);
    const std::size_t symbols = G / unit;
    std::vector<std::size_t> sizes(C, unit * (symbols / C));
    for (std::size_t r = C - symbols % C; r < C; ++r) {
        sizes[r] += unit;
    }
    return sizes;
}

}  // namespace quarzel::link
