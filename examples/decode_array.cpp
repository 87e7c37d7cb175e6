#include <cstdint>
#include <iostream>
#include <quarzel/core.hpp>
#include <vector>

int main() {
    quarzel::Core core({.units = 8, .algorithm = 0});
    const std::vector<std::int8_t> soft(100 * 3 * 44, -8);  // 100 blocks of 3 x (K + 4) soft values, K = 40
    std::vector<unsigned char> bits(100 * 40);
    core.decode(quarzel::softBlocks<std::int8_t>(soft, 44), 6, bits);
    std::cout << bits.size() << " bits decoded by " << core.implementation() << ", first bit " << int{bits[0]}
              << '\n';
}
