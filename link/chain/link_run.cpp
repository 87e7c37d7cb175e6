// SPDX-License-Identifier: MIT
#include "link/chain/link_run.hpp"

#include <algorithm>

#include "link/bit_errors.hpp"
#include "link/coding/crc.hpp"

namespace quarzel::link {

void LinkRun::begin(Decibels ebN0, std::span<const std::uint64_t> octets, std::uint64_t end) {
    const std::size_t C = itsLink.segmentation().C;
    const std::size_t blockBits = itsLink.segmentation().totalSize();
    const std::size_t codeBits = itsLink.softValuesBefore(C);
    itsEbN0 = ebN0;
    itsOctets.assign(octets.begin(), octets.end());
    itsBits.resize(octets.size() * blockBits);
    itsCodeBits.resize(octets.size() * codeBits);
    itsBlocks.clear();
    // Information bits are drawn 8 at a time.
    std::vector<std::uint8_t> information((itsLink.informationBits() + 7) / 8 * 8);
    for (std::size_t octet = 0; octet < octets.size(); ++octet) {
        const std::uint64_t first = octets[octet] * blocksPerOctet;
        for (std::uint64_t block = first; block < std::min(first + blocksPerOctet, end); ++block) {
            itsBlocks.push_back(block);
        }
        RandomSource(nameOf(first)).octetBits(information.data());
        itsLink.encode(std::span(information).first(itsLink.informationBits()),
                       std::span(itsBits).subspan(octet * blockBits, blockBits),
                       std::span(itsCodeBits).subspan(octet * codeBits, codeBits));
    }
    itsSoft.resize(itsBlocks.size() * codeBits);
}

BlockName LinkRun::nameOf(std::uint64_t block) const {
    return {itsSeed, itsLink.setup().blockSize, itsEbN0, block, 0, 0, itsLink.setup().transportBlock, 0};
}

std::size_t LinkRun::octetOf(std::size_t i) const {
    const auto found = std::lower_bound(itsOctets.begin(), itsOctets.end(), itsBlocks[i] / blocksPerOctet);
    return static_cast<std::size_t>(found - itsOctets.begin());
}

std::size_t LinkRun::softPlace(std::size_t i, std::size_t r) const {
    return size() * itsLink.softValuesBefore(r) + i * itsLink.codeBlock(r).softValues();
}

std::span<const std::int8_t> LinkRun::soft(std::size_t i, std::size_t r) const {
    return {itsSoft.data() + softPlace(i, r), itsLink.codeBlock(r).softValues()};
}

std::span<const std::uint8_t> LinkRun::bits(std::size_t i) const {
    const std::size_t count = itsLink.segmentation().totalSize();
    return {itsBits.data() + octetOf(i) * count, count};
}

void LinkRun::transmit(const Channel& channel, std::uint32_t transmission) {
    const std::size_t C = itsLink.segmentation().C;
    itsCoded.resize(itsLink.setup().codedBits);
    itsReceived.resize(itsLink.setup().codedBits);
    std::size_t selected = itsOctets.size();
    for (std::size_t i = 0; i < size(); ++i) {
        BlockName name = nameOf(itsBlocks[i]);
        name.transmission = transmission;
        const std::size_t octet = octetOf(i);
        std::uint8_t* coded = itsCoded.data();
        for (std::size_t r = 0; r < C; ++r) {
            const CodeBlockLink& block = itsLink.codeBlock(r);
            if (octet != selected) {
                block.select(
                    transmission,
                    itsCodeBits.data() + octet * itsLink.softValuesBefore(C) + itsLink.softValuesBefore(r),
                    coded);
            }
            name.codeBlock = static_cast<std::uint32_t>(r);
            block.send(channel, name, coded, lane(i), itsReceived.data(), itsSoft.data() + softPlace(i, r));
            coded += block.codedBits();
        }
        selected = octet;
    }
}

void LinkRun::decode(Core& core, int iterations, bool everyIteration) {
    const Segmentation& segmentation = itsLink.segmentation();
    itsCounts = everyIteration ? static_cast<std::size_t>(iterations) : 1;
    itsDecisions.resize(size() * itsCounts * segmentation.totalSize());
    const auto decodeGroup = [&](std::size_t first, std::size_t count) {
        if (count == 0 || size() == 0) {
            return;
        }
        const CodeBlockLink& kind = itsLink.codeBlock(first);
        const auto soft = softBlocks(std::span<const std::int8_t>(itsSoft).subspan(
                                         softPlace(0, first), size() * count * kind.softValues()),
                                     kind.encoder().positions());
        const auto decisions = std::span(itsDecisions)
                                   .subspan(size() * itsCounts * itsLink.bitsBefore(first),
                                            size() * itsCounts * count * kind.encoder().blockSize());
        if (everyIteration) {
            core.decodeEveryIteration(soft, iterations, decisions);
        } else {
            core.decode(soft, iterations, decisions);
        }
    };
    decodeGroup(0, segmentation.Cminus);
    decodeGroup(segmentation.Cminus, segmentation.Cplus);
}

const std::uint8_t* LinkRun::decisions(std::size_t i, std::size_t r, std::size_t count) const {
    const std::size_t K = itsLink.codeBlock(r).encoder().blockSize();
    return itsDecisions.data() + itsCounts * (size() * itsLink.bitsBefore(r) + i * K) + count * K;
}

Verdict LinkRun::verdict(std::size_t i, std::size_t count) {
    const Segmentation& segmentation = itsLink.segmentation();
    const std::span<const std::uint8_t> sent = bits(i);
    const std::size_t parity = segmentation.C > 1 ? crcLength(Crc::crc24B) : 0;
    Verdict verdict{0, true};
    for (std::size_t r = 0; r < segmentation.C; ++r) {
        const std::uint8_t* const decided = decisions(i, r, count);
        const std::uint8_t* const own = sent.data() + itsLink.bitsBefore(r);
        const std::size_t start = r == 0 ? segmentation.F : 0;
        const std::size_t end = segmentation.size(r);
        const bool isLast = r + 1 == segmentation.C;
        const std::size_t endOfInformation =
            end - parity - (isLast && itsLink.hasCrc() ? crcLength(Crc::crc24A) : 0);
        const auto errors = [&](std::size_t from, std::size_t to) {
            return bitErrors(own + from, lane(i), decided + from, to - from);
        };
        const std::uint32_t wrong = errors(start, endOfInformation);
        verdict.wrongBits += wrong;
        verdict.isAccepted = verdict.isAccepted && wrong == 0 && errors(endOfInformation, end) == 0;
    }
    // The CRCs of what was sent hold, so only wrong bits need a look at them.
    if (!verdict.isAccepted && itsLink.hasCrc()) {
        verdict.isAccepted = crcsHold(i, count);
    }
    return verdict;
}

bool LinkRun::crcsHold(std::size_t i, std::size_t count) {
    const Segmentation& segmentation = itsLink.segmentation();
    itsJoined.resize(segmentation.totalSize() + segmentation.B);
    const auto blocks = std::span(itsJoined).first(segmentation.totalSize());
    const auto joined = std::span(itsJoined).last(segmentation.B);
    for (std::size_t r = 0; r < segmentation.C; ++r) {
        std::copy_n(decisions(i, r, count), segmentation.size(r), blocks.data() + itsLink.bitsBefore(r));
    }
    const std::vector<bool> holds = desegment(segmentation, blocks, joined);
    return std::find(holds.begin(), holds.end(), false) == holds.end() && crcHolds(Crc::crc24A, joined);
}

void LinkRun::retain(std::span<const std::uint8_t> isWaiting) {
    std::vector<std::uint64_t> kept;
    std::vector<std::size_t> places;  // where the streams of the kept blocks are
    const std::size_t C = itsLink.segmentation().C;
    for (std::size_t i = 0; i < size(); ++i) {
        if (isWaiting[i] != 0) {
            kept.push_back(itsBlocks[i]);
        }
    }
    for (std::size_t r = 0; r < C; ++r) {
        for (std::size_t i = 0; i < size(); ++i) {
            if (isWaiting[i] != 0) {
                places.push_back(softPlace(i, r));
            }
        }
    }
    itsBlocks = std::move(kept);
    // Every place is at or after the one that it moves to.
    for (std::size_t k = 0; k < places.size(); ++k) {
        const std::size_t r = k / size();
        std::copy_n(itsSoft.begin() + static_cast<std::ptrdiff_t>(places[k]),
                    itsLink.codeBlock(r).softValues(),
                    itsSoft.begin() + static_cast<std::ptrdiff_t>(softPlace(k % size(), r)));
    }
    itsSoft.resize(size() * itsLink.softValuesBefore(C));
}

}  // namespace quarzel::link
