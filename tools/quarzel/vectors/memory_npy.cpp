// SPDX-License-Identifier: MIT
#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <limits>
#include <string_view>

#include "captures/npy_header.hpp"
#include "tool_error.hpp"
#include "vectors/memory_image.hpp"

namespace quarzel::tool {

namespace {

/// Bytes of an element, for truth values and little-endian integers.
std::size_t bytesOf(const std::string& type, const std::string& file) {
    constexpr std::array<std::string_view, 9> types = {"|b1", "|u1", "|i1", "<u2", "<i2",
                                                       "<u4", "<i4", "<u8", "<i8"};
    if (std::find(types.begin(), types.end(), type) == types.end()) {
        throw fileError(file, fmt::format("holds values of type '{}'", type),
                        "save truth values or little-endian integers, with numpy's astype('u1') for example");
    }
    return static_cast<std::size_t>(type[2] - '0');
}

std::uint64_t elementsOf(const std::vector<std::uint64_t>& shape, const std::string& file) {
    std::uint64_t count = 1;
    for (const std::uint64_t length : shape) {
        if (length != 0 && count > std::numeric_limits<std::uint64_t>::max() / 64 / length) {
            throw fileError(file, "has shape " + shapeText(shape), "save the array again with numpy.save");
        }
        count *= length;
    }
    return count;
}

/// A little-endian number; one of more than 32 bits becomes the greatest, which is not a bit either.
std::uint32_t numberOf(const std::array<char, 8>& bytes, std::size_t size) {
    std::uint64_t value = 0;
    for (std::size_t i = size; i > 0; --i) {
        value = value << 8 | static_cast<unsigned char>(bytes[i - 1]);
    }
    return static_cast<std::uint32_t>(
        std::min<std::uint64_t>(value, std::numeric_limits<std::uint32_t>::max()));
}

}  // namespace

MemoryImage readMemoryNpy(std::istream& stream, std::size_t size, std::size_t packedSize,
                          const std::string& file) {
    const NpyHeader header = readNpyHeader(stream, file);
    const std::size_t bytes = bytesOf(header.type, file);
    requireCOrder(header, file);
    const bool isPacked =
        packedSize != 0 && header.type == "|u1" && header.shape.size() == 2 && header.shape[1] == packedSize;
    const std::uint64_t elements = elementsOf(header.shape, file);
    MemoryImage image;
    image.words.resize(size);
    std::size_t address = 0;
    const auto put = [&](std::uint32_t value) {
        if (address < size) {
            image.words[address] = {MemoryWord::Kind::known, value, 0};
        } else {
            ++image.beyond;
        }
        ++address;
    };
    std::array<char, 8> element{};
    for (std::uint64_t i = 0; i < elements; ++i) {
        if (!stream.read(element.data(), static_cast<std::streamsize>(bytes))) {
            throw fileError(file, "ends within its array", "copy it again, it was cut short");
        }
        const std::uint32_t value = numberOf(element, bytes);
        if (!isPacked) {
            put(value);
            continue;
        }
        for (unsigned shift = 8; shift-- > 0;) {
            put(value >> shift & 1U);
        }
    }
    requireEnd(stream, file);
    return image;
}

}  // namespace quarzel::tool
