// SPDX-License-Identifier: MIT
// A core on another processor, for the test of the frozen decisions: frozen_decoder UNITS ALGORITHM
// ITERATIONS K reads blocks of 3 (K + 4) soft values, a byte each, from standard input, decodes them by every
// implementation, and writes their decisions, a byte each, to standard output. It ends with 1 when the
// implementations differ.
#include <cstdlib>
#include <iostream>
#include <iterator>
#include <string>

#include "frozen/frozen_core.hpp"

using namespace quarzel::test;

int main(int argc, char** argv) {
    if (argc != 5) {
        return 2;
    }
    const auto number = [argv](int n) { return static_cast<std::uint32_t>(std::stoul(argv[n])); };
    const FrozenCase which{number(4), number(1), number(2)};
    const std::string soft{std::istreambuf_iterator<char>(std::cin), {}};
    const std::size_t size = which.K + 4;
    std::vector<Block> blocks;
    for (std::size_t first = 0; first + 3 * size <= soft.size(); first += 3 * size) {
        Block block(size);
        block.iterations = static_cast<int>(number(3));
        for (std::size_t i = 0; i < size; ++i) {
            block.systematic[i] = static_cast<signed char>(soft[first + i]);
            block.parity1[i] = static_cast<signed char>(soft[first + size + i]);
            block.parity2[i] = static_cast<signed char>(soft[first + 2 * size + i]);
        }
        blocks.push_back(block);
    }
    const Decisions decisions = FrozenCore(which, "literal")(blocks);
    for (const std::string& name : implementations()) {
        if (FrozenCore(which, name)(blocks) != decisions) {
            std::cerr << name << " differs from literal\n";
            return 1;
        }
    }
    for (const std::vector<unsigned char>& bits : decisions) {
        std::cout.write(reinterpret_cast<const char*>(bits.data()),
                        static_cast<std::streamsize>(bits.size()));
    }
    return std::cout.flush() ? 0 : 1;
}
