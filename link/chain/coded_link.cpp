// SPDX-License-Identifier: MIT
#include "link/chain/coded_link.hpp"

#include <algorithm>
#include <stdexcept>
#include <string>

#include "link/coding/coded_sizes.hpp"
#include "link/coding/crc.hpp"
#include "link/coding/turbo_encoding.hpp"
#include "link/size_table.hpp"

namespace quarzel::link {

namespace {

constexpr Crc transportCrc = Crc::crc24A;

void check(const LinkSetup& setup) {
    if ((setup.blockSize == 0) == (setup.transportBlock == 0)) {
        throw std::invalid_argument("a link has either code blocks alone or transport blocks");
    }
    if (setup.transportBlock > CodedLink::maxTransportBlock) {
        throw std::invalid_argument("a transport block has at most " +
                                    std::to_string(CodedLink::maxTransportBlock) + " bits here, not " +
                                    std::to_string(setup.transportBlock));
    }
    const std::size_t transmissions = setup.redundancyVersions.size();
    if (transmissions == 0 || transmissions > CodedLink::maxTransmissions) {
        throw std::invalid_argument("there must be 1 to " + std::to_string(CodedLink::maxTransmissions) +
                                    " transmissions, not " + std::to_string(transmissions));
    }
}

/// A code block alone is the only one, and has nothing but its own bits.
Segmentation cutOf(const LinkSetup& setup) {
    if (setup.transportBlock != 0) {
        return segmentationOf(setup.transportBlock + std::size_t{crcLength(transportCrc)});
    }
    const std::uint32_t K = checkedBlockSize(setup.blockSize);
    return {K, 1, K, 0, 1, 0, 0};
}

}  // namespace

std::size_t codedBitsOfRate(std::size_t informationBits, double rate, unsigned bitsOfSymbol) {
    constexpr double mostSymbols = 1 << 24;
    const double symbols = static_cast<double>(informationBits) / rate / bitsOfSymbol;
    return bitsOfSymbol * static_cast<std::size_t>(std::min(symbols, mostSymbols) + 0.5);
}

CodedLink::CodedLink(const LinkSetup& setup)
    : itsSetup((check(setup), setup)),
      itsInformationBits(setup.transportBlock != 0 ? setup.transportBlock : setup.blockSize),
      itsSegmentation(cutOf(setup)) {
    const std::size_t codeBits = 3 * (itsSegmentation.Kplus + tailPositions);
    if (!hasCrc() && itsSetup.codedBits == 0) {
        itsSetup.codedBits = codeBits;
    }
    makeCodeBlocks(codedSizes(itsSegmentation.C, itsSetup.codedBits, hasCrc() ? itsSetup.layers : 1,
                              bitsOfSymbol(itsSetup.channel.modulation)));
    if (hasCrc() || itsSetup.codedBits != codeBits) {
        itsRate = {static_cast<std::uint32_t>(itsInformationBits),
                   static_cast<std::uint32_t>(itsSetup.codedBits)};
    }
}

void CodedLink::makeCodeBlocks(const std::vector<std::size_t>& codedSizes) {
    const auto order =
        isMemoryless(itsSetup.channel) ? CodeBlockLink::Order::streams : CodeBlockLink::Order::sent;
    for (std::size_t r = 0; r < itsSegmentation.C; ++r) {
        const std::uint32_t K = itsSegmentation.size(r);
        const std::size_t filler = r == 0 ? itsSegmentation.F : 0;
        auto kind = std::find_if(itsKinds.begin(), itsKinds.end(), [&](const CodeBlockLink& known) {
            return known.matching().K() == K && known.matching().filler() == filler &&
                   known.codedBits() == codedSizes[r];
        });
        if (kind == itsKinds.end()) {
            kind = itsKinds.insert(kind, {K, filler, codedSizes[r], itsSetup.redundancyVersions, order});
        }
        itsKindOfBlock.push_back(static_cast<std::size_t>(kind - itsKinds.begin()));
    }
}

std::size_t CodedLink::bitsBefore(std::size_t r) const {
    const std::size_t smaller = std::min(r, itsSegmentation.Cminus);
    return smaller * itsSegmentation.Kminus + (r - smaller) * itsSegmentation.Kplus;
}

std::size_t CodedLink::softValuesBefore(std::size_t r) const {
    return 3 * (bitsBefore(r) + r * tailPositions);
}

void CodedLink::encode(std::span<const std::uint8_t> bits, std::span<std::uint8_t> blocks,
                       std::span<std::uint8_t> codeBits) const {
    if (hasCrc()) {
        std::vector<std::uint8_t> withParity(bits.begin(), bits.end());
        withParity.resize(itsSegmentation.B);
        writeCrc(transportCrc, bits, std::span(withParity).subspan(bits.size()));
        segment(itsSegmentation, withParity, blocks);
    } else {
        std::copy(bits.begin(), bits.end(), blocks.begin());
    }
    for (std::size_t r = 0; r < itsSegmentation.C; ++r) {
        const CodeBlockLink& block = codeBlock(r);
        turboEncode(block.encoder(), blocks.subspan(bitsBefore(r), block.matching().K()),
                    block.matching().filler(), codeBits.subspan(softValuesBefore(r), block.softValues()));
    }
}

}  // namespace quarzel::link
