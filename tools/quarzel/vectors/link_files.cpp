// SPDX-License-Identifier: MIT
#include "vectors/link_files.hpp"

#include <fmt/format.h>

#include "vectors/link_tables.hpp"

namespace quarzel::tool {

namespace {

constexpr const char* directoryName = "link/";
constexpr const char* bitWords = "1 bit";
constexpr const char* nullWords = "2 bits: 0, 1, or 2 for <NULL>";
constexpr const char* softWords = "8 bits, two's complement, positive means 1";

std::string wordText(std::uint8_t bit) {
    return bit == link::nullBit ? "2\n" : bit != 0 ? "1\n" : "0\n";
}

std::string wordText(std::int8_t soft) {
    return fmt::format("{:02x}\n", static_cast<std::uint8_t>(soft));
}

/// Sizes of the parts of a stage that belong to each code block.
using PartSize = std::size_t (*)(const link::CodeBlockLink&, unsigned Qm);

std::size_t bitsOf(const link::CodeBlockLink& block, unsigned) {
    return block.matching().K();
}
std::size_t streamsOf(const link::CodeBlockLink& block, unsigned) {
    return block.softValues();
}
std::size_t entriesOf(const link::CodeBlockLink& block, unsigned) {
    return block.matching().bufferSize();
}
std::size_t codedOf(const link::CodeBlockLink& block, unsigned) {
    return block.codedBits();
}
std::size_t symbolsOf(const link::CodeBlockLink& block, unsigned Qm) {
    return 2 * block.codedBits() / Qm;
}

/// Writes the memories of one link.
class StageWriter {
  public:
    StageWriter(OutputDirectory& directory, const link::CodedLink& link,
                const std::vector<LinkStages>& blocks, VectorContent& content)
        : itsDirectory(directory), itsLink(link), itsBlocks(blocks), itsContent(content) {}

    void write(const std::string& name, const std::string& text) {
        itsContent.files.push_back(itsDirectory.write(directoryName + name, text));
    }

    /// A stage of whole transport blocks.
    void writeWhole(const VectorStage& stage, std::vector<std::uint8_t> LinkStages::*values) {
        std::string text;
        for (std::size_t i = 0; i < itsBlocks.size(); ++i) {
            text += fmt::format("// {}\n", tool::blockText(itsLink, i));
            for (const std::uint8_t bit : itsBlocks[i].*values) {
                text += wordText(bit);
            }
        }
        writeStage(stage, text);
    }

    /// A stage of code blocks before they are sent.
    void writeParts(const VectorStage& stage, std::vector<std::uint8_t> LinkStages::*values, PartSize size) {
        std::string text;
        for (std::size_t i = 0; i < itsBlocks.size(); ++i) {
            appendParts(text, tool::blockText(itsLink, i), itsBlocks[i].*values, size);
        }
        writeStage(stage, text);
    }

    /// A stage of code blocks in each transmission.
    template <class Value>
    void writeSent(const VectorStage& stage, std::vector<Value> TransmissionStages::*values, PartSize size) {
        std::string text;
        for (std::size_t i = 0; i < itsBlocks.size(); ++i) {
            std::size_t number = 0;
            for (const TransmissionStages& transmission : itsBlocks[i].transmissions) {
                appendParts(text, fmt::format("{}, transmission {}", tool::blockText(itsLink, i), number++),
                            transmission.*values, size);
            }
        }
        writeStage(stage, text);
    }

  private:
    void writeStage(const VectorStage& stage, const std::string& text) {
        VectorStage placed = stage;
        placed.file = directoryName + stage.file;
        itsContent.stages.push_back(std::move(placed));
        write(stage.file, text);
    }

    template <class Value>
    void appendParts(std::string& text, const std::string& about, const std::vector<Value>& values,
                     PartSize size) {
        auto value = values.begin();
        for (std::size_t r = 0; r < itsLink.segmentation().C; ++r) {
            text += "// " + about + (itsLink.hasCrc() ? fmt::format(", code block {}\n", r) : "\n");
            const auto end =
                value + static_cast<std::ptrdiff_t>(size(
                            itsLink.codeBlock(r), link::bitsOfSymbol(itsLink.setup().channel.modulation)));
            for (; value != end; ++value) {
                text += wordText(*value);
            }
        }
    }

    OutputDirectory& itsDirectory;
    const link::CodedLink& itsLink;
    const std::vector<LinkStages>& itsBlocks;
    VectorContent& itsContent;
};

/// The section of 3GPP TS 36.211 that defines a modulation.
std::string modulationClause(link::Modulation modulation) {
    const unsigned Qm = link::bitsOfSymbol(modulation);
    return fmt::format("3GPP TS 36.211, 7.1.{}", Qm == 1 ? 1 : Qm / 2 + 1);
}

}  // namespace

std::string blockText(const link::CodedLink& link, std::size_t block) {
    return fmt::format("{} block {}", link.hasCrc() ? "transport" : "code", block);
}

void writeLink(OutputDirectory& directory, const link::CodedLink& link, const std::vector<LinkStages>& blocks,
               VectorContent& content) {
    StageWriter writer(directory, link, blocks, content);
    const std::string modulation = modulationClause(link.setup().channel.modulation);
    writer.write("link.vh", linkHeaderText(link, blocks.size()));
    writer.write("layout.hex", linkLayoutText(link));
    writer.write("rv.hex", linkVersionText(link));
    if (link.hasCrc()) {
        writer.writeWhole({"bits.hex", "a, bits of the transport block", bitWords, "3GPP TS 36.212, 5.1.1"},
                          &LinkStages::bits);
        writer.writeWhole({"with_crc.hex", "b, the same with CRC24A", bitWords, "3GPP TS 36.212, 5.1.1"},
                          &LinkStages::withCrc);
    }
    writer.writeParts(
        {"code_blocks.hex",
         link.hasCrc() ? "c, with filler, and CRC24B where there are several" : "c, bits of the code block",
         nullWords, "3GPP TS 36.212, 5.1.2"},
        &LinkStages::codeBlocks, bitsOf);
    writer.writeParts({"streams.hex", "d(0), d(1) and d(2), one after another, of the encoder", nullWords,
                       "3GPP TS 36.212, 5.1.3.2"},
                      &LinkStages::streams, streamsOf);
    writer.writeParts({"sub_blocks.hex", "v(0), v(1) and v(2), one after another, interleaved", nullWords,
                       "3GPP TS 36.212, 5.1.4.1.1"},
                      &LinkStages::subBlocks, entriesOf);
    writer.writeParts({"buffer.hex", "w, the circular buffer", nullWords, "3GPP TS 36.212, 5.1.4.1.2"},
                      &LinkStages::buffer, entriesOf);
    writer.writeSent({"coded.hex", "e of each code block, one after another: f", bitWords,
                      "3GPP TS 36.212, 5.1.4.1.2 and 5.1.5"},
                     &TransmissionStages::coded, codedOf);
    writer.writeSent({"symbols.hex", "I and Q of each symbol",
                      "8 bits, two's complement; the least amplitude is 1", modulation},
                     &TransmissionStages::symbols, symbolsOf);
    writer.writeSent({"received.hex", "soft values of coded.hex, received", softWords, modulation},
                     &TransmissionStages::received, codedOf);
    writer.writeSent({"soft_buffer.hex", "w after the transmission, 0 at dummies and filler bits", softWords,
                      "3GPP TS 36.212, 5.1.4.1.2"},
                     &TransmissionStages::softBuffer, entriesOf);
}

}  // namespace quarzel::tool
