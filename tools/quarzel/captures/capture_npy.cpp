// SPDX-License-Identifier: MIT
#include <fmt/format.h>

#include <cstdint>

#include "captures/capture_readers.hpp"
#include "captures/npy_header.hpp"
#include "options/block_sizes.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

/// Read blocks of `values` elements of the type Element, in the machine's (little-endian) byte order.
template <class Element>
std::vector<std::int32_t> readBlocks(std::istream& stream, std::uint64_t count, std::size_t values,
                                     const std::string& file) {
    std::vector<std::int32_t> soft;
    std::vector<Element> elements(values);
    const auto bytes = static_cast<std::streamsize>(values * sizeof(Element));
    for (std::uint64_t block = 0; block < count; ++block) {
        if (!stream.read(reinterpret_cast<char*>(elements.data()), bytes)) {
            throw fileError(file, fmt::format("ends within block {} of {}", block + 1, count),
                            "copy it again, it was cut short");
        }
        soft.insert(soft.end(), elements.begin(), elements.end());
    }
    return soft;
}

}  // namespace

Capture readNpyCapture(std::istream& stream, const std::string& file) {
    const NpyHeader header = readNpyHeader(stream, file);
    const auto reader = header.type == "|i1"   ? &readBlocks<std::int8_t>
                        : header.type == "<i2" ? &readBlocks<std::int16_t>
                        : header.type == "<i4" ? &readBlocks<std::int32_t>
                                               : nullptr;
    if (reader == nullptr) {
        throw fileError(file, fmt::format("holds values of type '{}'", header.type),
                        "save int8, int16 or int32 (little-endian), with numpy's astype('<i2') for example");
    }
    requireCOrder(header, file);
    if (header.shape.size() != 3 || header.shape[1] != 3) {
        throw fileError(
            file, "has shape " + shapeText(header.shape),
            "a capture has shape (blocks, 3, K + 4), with systematic, parity 1, parity 2 in axis 1");
    }
    Capture capture;
    capture.blockSize = blockSizeOf(header.shape[2], file);
    if (header.shape[0] == 0) {
        throw fileError(file, "holds no block", "record at least one");
    }
    capture.soft = reader(stream, header.shape[0], 3 * capture.positions(), file);
    requireEnd(stream, file);
    return capture;
}

}  // namespace quarzel::tool
