// SPDX-License-Identifier: MIT
// A decode with the C++ class.
#include <iostream>
#include <quarzel/core.hpp>

int main() {
    quarzel::Core core({.units = 8, .algorithm = 0});
    const std::vector<std::int8_t> soft(3 * 44, -8);
    std::vector<unsigned char> bits(40);
    std::vector<unsigned> tags = {1};
    core.decode(quarzel::softBlocks<std::int8_t>(soft, 44), 6, bits, tags);
    std::cout << "status 0, " << bits.size() << " bits, first bit " << int{bits[0]} << ", tag " << tags[0]
              << '\n';
}
