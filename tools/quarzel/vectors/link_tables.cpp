// SPDX-License-Identifier: MIT
#include "vectors/link_tables.hpp"

#include <fmt/format.h>

namespace quarzel::tool {

std::string linkLayoutText(const link::CodedLink& link) {
    std::string text =
        "// K, filler, coded bits, entries of w; first word in code_blocks, streams, coded, buffer\n";
    std::size_t coded = 0;
    std::size_t entries = 0;
    for (std::size_t r = 0; r < link.segmentation().C; ++r) {
        const link::CodeBlockLink& block = link.codeBlock(r);
        const link::RateMatching& matching = block.matching();
        text += fmt::format("{:08x} {:08x} {:08x} {:08x} {:08x} {:08x} {:08x} {:08x} // code block {}\n",
                            matching.K(), matching.filler(), block.codedBits(), matching.bufferSize(),
                            link.bitsBefore(r), link.softValuesBefore(r), coded, entries, r);
        coded += block.codedBits();
        entries += matching.bufferSize();
    }
    return text;
}

std::string linkVersionText(const link::CodedLink& link) {
    std::string text;
    for (const unsigned rv : link.setup().redundancyVersions) {
        text += fmt::format("{}\n", rv);
    }
    return text;
}

std::string linkHeaderText(const link::CodedLink& link, std::size_t blocks) {
    const std::size_t C = link.segmentation().C;
    std::size_t entries = 0;
    for (std::size_t r = 0; r < C; ++r) {
        entries += link.codeBlock(r).matching().bufferSize();
    }
    return fmt::format(
        "// The link, and the words of a transport block in the memories of this directory.\n"
        "localparam LINK_BLOCKS = {};\n"
        "localparam LINK_TRANSMISSIONS = {};  // rv.hex has a word for each\n"
        "localparam LINK_CODE_BLOCKS = {};  // layout.hex has 8 words for each\n"
        "localparam LINK_BITS = {};\n"
        "localparam LINK_BITS_WITH_CRC = {};\n"
        "localparam LINK_CODE_BLOCK_BITS = {};\n"
        "localparam LINK_STREAM_WORDS = {};\n"
        "localparam LINK_BUFFER_WORDS = {};\n"
        "localparam LINK_CODED_BITS = {};  // of a transmission\n"
        "localparam LINK_BITS_OF_SYMBOL = {};\n",
        blocks, link.setup().redundancyVersions.size(), C, link.informationBits(), link.segmentation().B,
        link.bitsBefore(C), link.softValuesBefore(C), entries, link.setup().codedBits,
        link::bitsOfSymbol(link.setup().channel.modulation));
}

}  // namespace quarzel::tool
