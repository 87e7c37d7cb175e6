// SPDX-License-Identifier: MIT
// A core on another processor, for the test of the frozen decisions: frozen_decoder UNITS ALGORITHM K reads
// blocks from standard input, each a byte with its iterations and 3 (K + 4) bytes with soft values. It
// decodes them by every implementation and writes their decisions, a byte each, to standard output. It ends
// with 1 when the implementations differ.
#include <algorithm>
#include <cstddef>
#include <iostream>
#include <iterator>
#include <string>

#include "frozen/frozen_core.hpp"

using namespace quarzel::test;

int main(int argc, char** argv) {
    if (argc != 4) {
        return 2;
    }
    const auto number = [argv](int n) { return static_cast<std::uint32_t>(std::stoul(argv[n])); };
    const FrozenCase which{number(3), number(1), number(2)};
    const std::string bytes{std::istreambuf_iterator<char>(std::cin), {}};
    const std::size_t size = which.K + 4;
    std::vector<Block> blocks;
    for (auto byte = bytes.begin(); bytes.end() - byte > static_cast<std::ptrdiff_t>(3 * size);) {
        Block block(size);
        block.iterations = *byte++;
        for (std::vector<int>* const stream : {&block.systematic, &block.parity1, &block.parity2}) {
            std::transform(byte, byte + static_cast<std::ptrdiff_t>(size), stream->begin(),
                           [](char value) { return static_cast<signed char>(value); });
            byte += static_cast<std::ptrdiff_t>(size);
        }
        blocks.push_back(block);
    }
    const std::vector<std::string> names = implementations();
    const Decisions decisions = FrozenCore(which, names.front())(blocks);
    for (std::size_t i = 1; i < names.size(); ++i) {
        if (FrozenCore(which, names[i])(blocks) != decisions) {
            std::cerr << names[i] << " differs from " << names.front() << '\n';
            return 1;
        }
    }
    for (const std::vector<unsigned char>& bits : decisions) {
        std::cout.write(reinterpret_cast<const char*>(bits.data()),
                        static_cast<std::streamsize>(bits.size()));
    }
    return std::cout.flush() ? 0 : 1;
}
