// SPDX-License-Identifier: MIT
#include "captures/bits_file.hpp"

#include <fmt/format.h>

#include <array>
#include <bit>
#include <xtensor/xadapt.hpp>
#include <xtensor/xnpy.hpp>

#include "files/output_file.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

void PackedBits::set(std::size_t block, const unsigned char* bits) {
    for (std::size_t i = 0; i < bytesPerBlock; ++i, bits += 8) {
        unsigned byte = 0;
        for (std::size_t bit = 0; bit < 8; ++bit) {
            byte = byte << 1 | bits[bit];
        }
        bytes[block * bytesPerBlock + i] = static_cast<std::uint8_t>(byte);
    }
}

PackedBits readBits(std::istream& stream, const std::string& file, std::size_t blocks,
                    std::size_t bytesPerBlock) {
    return readBitsAfter(readNpyHeader(stream, file), stream, file, blocks, bytesPerBlock);
}

PackedBits readBitsAfter(const NpyHeader& header, std::istream& stream, const std::string& file,
                         std::size_t blocks, std::size_t bytesPerBlock) {
    if (header.type != "|u1") {
        throw fileError(file, fmt::format("holds values of type '{}'", header.type),
                        "save bits as uint8 with numpy.packbits(bits, axis=1)");
    }
    requireCOrder(header, file);
    const std::vector<std::uint64_t> shape = {blocks, bytesPerBlock};
    if (header.shape != shape) {
        throw fileError(
            file, "has shape " + shapeText(header.shape),
            fmt::format("for this capture it must be {}, that is (blocks, K/8)", shapeText(shape)));
    }
    PackedBits bits(0, 8 * bytesPerBlock);
    std::vector<char> row(bytesPerBlock);
    for (std::size_t block = 0; block < blocks; ++block) {
        if (!stream.read(row.data(), static_cast<std::streamsize>(row.size()))) {
            throw fileError(file, "ends within its array", "copy it again, it was cut short");
        }
        bits.bytes.insert(bits.bytes.end(), row.begin(), row.end());
    }
    requireEnd(stream, file);
    return bits;
}

std::string npyOf(const PackedBits& bits) {
    const std::array<std::size_t, 2> shape = {bits.blocks(), bits.bytesPerBlock};
    return xt::dump_npy(xt::adapt(bits.bytes, shape));
}

void writeBits(const std::string& file, const PackedBits& bits) {
    writeOutput(file, npyOf(bits));
}

BitErrors findErrors(const PackedBits& decided, const PackedBits& sent) {
    BitErrors errors;
    for (std::size_t block = 0; block < sent.blocks(); ++block) {
        WrongBlock wrong{block, 0, 0};
        for (std::size_t i = 0; i < sent.bytesPerBlock; ++i) {
            const std::size_t at = block * sent.bytesPerBlock + i;
            const auto differing = static_cast<std::uint8_t>(decided.bytes[at] ^ sent.bytes[at]);
            if (differing != 0 && wrong.bits == 0) {
                wrong.firstBit = 8 * i + static_cast<std::size_t>(std::countl_zero(differing));
            }
            wrong.bits += static_cast<std::size_t>(std::popcount(differing));
        }
        if (wrong.bits > 0) {
            errors.bits += wrong.bits;
            errors.blocks.push_back(wrong);
        }
    }
    return errors;
}

}  // namespace quarzel::tool
