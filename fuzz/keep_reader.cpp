// SPDX-License-Identifier: MIT
// Changes inputs but for their first byte, so that a run stays with the readers that its corpus names.
#include <cstddef>
#include <cstdint>

extern "C" std::size_t LLVMFuzzerMutate(std::uint8_t* data, std::size_t size, std::size_t most);

extern "C" std::size_t LLVMFuzzerCustomMutator(std::uint8_t* data, std::size_t size, std::size_t most,
                                               unsigned) {
    return size == 0 ? 0 : 1 + LLVMFuzzerMutate(data + 1, size - 1, most - 1);
}
