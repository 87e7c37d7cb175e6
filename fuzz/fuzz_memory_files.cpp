// SPDX-License-Identifier: MIT
// Memories of a simulation: text and npy.
#include "input_bytes.hpp"
#include "reading.hpp"
#include "require.hpp"
#include "vectors/memory_image.hpp"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    using namespace quarzel;
    fuzz::InputBytes bytes(data, size);
    const bool isText = bytes.takeBool();
    const auto words = static_cast<std::size_t>(bytes.takeFrom(0, 255));
    const auto packedSize = static_cast<std::size_t>(bytes.takeFrom(0, 10));
    fuzz::readText(bytes.rest(), [&](std::istream& stream) {
        const tool::MemoryImage image = isText ? tool::readMemoryText(stream, words, "memory.hex")
                                               : tool::readMemoryNpy(stream, words, packedSize, "memory.npy");
        fuzz::require(image.words.size() <= words, "no more words than asked for");
    });
    return 0;
}
