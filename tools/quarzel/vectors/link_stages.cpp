// SPDX-License-Identifier: MIT
#include "vectors/link_stages.hpp"

#include <algorithm>
#include <cmath>
#include <complex>
#include <numeric>

#include "link/coding/crc.hpp"
#include "link/coding/sub_block_interleaver.hpp"
#include "link/modulation/modulation.hpp"

namespace quarzel::tool {

namespace {

/// The places of the streams that a transmission sends, in the order of the standard.
std::vector<std::uint16_t> placesSent(const link::CodeBlockLink& block, unsigned rv) {
    const link::RateMatching& matching = block.matching();
    std::vector<std::uint16_t> places;
    link::forEachPiece(matching, rv, block.codedBits(),
                       [&](std::size_t, std::size_t first, std::size_t count) {
                           const auto piece = matching.places().subspan(first, count);
                           places.insert(places.end(), piece.begin(), piece.end());
                       });
    return places;
}

/// The indices of places, those of equal ones in their order.
std::vector<std::size_t> sortedIndices(const std::vector<std::uint16_t>& places) {
    std::vector<std::size_t> indices(places.size());
    std::iota(indices.begin(), indices.end(), std::size_t{0});
    std::stable_sort(indices.begin(), indices.end(),
                     [&places](std::size_t a, std::size_t b) { return places[a] < places[b]; });
    return indices;
}

/// Append the three streams of a code block interleaved, and the circular buffer made of them.
void appendBuffer(std::span<const std::uint8_t> streams, LinkStages& stages) {
    const std::size_t positions = streams.size() / 3;
    const std::size_t size = link::subBlockColumns * link::subBlockRows(positions);
    std::vector<std::uint8_t> interleaved(3 * size);
    for (unsigned stream = 0; stream < 3; ++stream) {
        link::subBlockInterleave(streams.subspan(stream * positions, positions), stream,
                                 std::span(interleaved).subspan(stream * size, size));
    }
    stages.subBlocks.insert(stages.subBlocks.end(), interleaved.begin(), interleaved.end());
    stages.buffer.insert(stages.buffer.end(), interleaved.begin(),
                         interleaved.begin() + static_cast<std::ptrdiff_t>(size));
    for (std::size_t k = 0; k < size; ++k) {
        stages.buffer.push_back(interleaved[size + k]);
        stages.buffer.push_back(interleaved[2 * size + k]);
    }
}

std::vector<std::int8_t> symbolsOf(std::span<const std::uint8_t> bits, link::Modulation modulation) {
    std::vector<std::complex<double>> symbols(bits.size() / link::bitsOfSymbol(modulation));
    link::modulate(bits, modulation, symbols);
    const double unit = link::amplitudeUnit(modulation);
    std::vector<std::int8_t> components;
    for (const std::complex<double>& symbol : symbols) {
        components.push_back(static_cast<std::int8_t>(std::lround(symbol.real() / unit)));
        components.push_back(static_cast<std::int8_t>(std::lround(symbol.imag() / unit)));
    }
    return components;
}

}  // namespace

LinkStageSource::LinkStageSource(const link::CodedLink& link, link::Decibels ebN0, std::uint64_t seed)
    : itsLink(link),
      itsEbN0(ebN0),
      itsSeed(seed),
      itsChannel(link::makeChannel(link.setup().channel, ebN0, link.rate())) {}

LinkStages LinkStageSource::make(std::uint32_t block) const {
    const link::LinkSetup& setup = itsLink.setup();
    link::BlockName name{itsSeed, setup.blockSize, itsEbN0, block, 0, 0, setup.transportBlock, 0};
    LinkStages stages;
    // Information bits are drawn 8 at a time.
    stages.bits.resize((itsLink.informationBits() + 7) / 8 * 8);
    link::RandomSource(name).informationBits(stages.bits.data());
    stages.bits.resize(itsLink.informationBits());
    encode(stages);
    for (std::uint32_t i = 0; i < setup.redundancyVersions.size(); ++i) {
        name.transmission = i;
        stages.transmissions.push_back(transmit(
            stages, name, i == 0 ? std::span<const std::int8_t>() : stages.transmissions.back().streams));
    }
    return stages;
}

void LinkStageSource::encode(LinkStages& stages) const {
    const std::size_t C = itsLink.segmentation().C;
    stages.codeBlocks.resize(itsLink.bitsBefore(C));
    stages.streams.resize(itsLink.softValuesBefore(C));
    itsLink.encode(stages.bits, stages.codeBlocks, stages.streams);
    if (itsLink.hasCrc()) {
        stages.withCrc = stages.bits;
        stages.withCrc.resize(itsLink.segmentation().B);
        link::writeCrc(link::Crc::crc24A, stages.bits, std::span(stages.withCrc).subspan(stages.bits.size()));
    }
    for (std::size_t r = 0; r < C; ++r) {
        appendBuffer(std::span<const std::uint8_t>(stages.streams)
                         .subspan(itsLink.softValuesBefore(r), itsLink.codeBlock(r).softValues()),
                     stages);
    }
}

TransmissionStages LinkStageSource::transmit(const LinkStages& stages, link::BlockName name,
                                             std::span<const std::int8_t> earlier) const {
    const unsigned rv = itsLink.setup().redundancyVersions[name.transmission];
    TransmissionStages made;
    made.coded.resize(itsLink.setup().codedBits);
    made.received.resize(itsLink.setup().codedBits);
    made.streams.assign(earlier.begin(), earlier.end());
    made.streams.resize(stages.streams.size());
    made.softBuffer.resize(stages.buffer.size());
    std::vector<std::uint8_t> passing;
    std::vector<std::int8_t> received;
    std::uint8_t* coded = made.coded.data();
    std::int8_t* soft = made.received.data();
    std::int8_t* buffer = made.softBuffer.data();
    for (std::uint32_t r = 0; r < itsLink.segmentation().C; ++r) {
        const link::CodeBlockLink& block = itsLink.codeBlock(r);
        const std::size_t place = itsLink.softValuesBefore(r);
        name.codeBlock = r;
        passing.resize(block.codedBits());
        received.resize(block.codedBits());
        block.select(name.transmission, stages.streams.data() + place, passing.data());
        block.send(*itsChannel, name, passing.data(), 0, received.data(), made.streams.data() + place);

        const std::vector<std::size_t> sent = sortedIndices(placesSent(block, rv));
        const std::vector<std::size_t> passed = sortedIndices(block.places(name.transmission));
        for (std::size_t i = 0; i < sent.size(); ++i) {
            coded[sent[i]] = passing[passed[i]];
            soft[sent[i]] = received[passed[i]];
        }
        const link::RateMatching& matching = block.matching();
        for (std::size_t i = 0; i < matching.codeBits(); ++i) {
            buffer[matching.entries()[i]] = made.streams[place + matching.places()[i]];
        }
        coded += block.codedBits();
        soft += block.codedBits();
        buffer += matching.bufferSize();
    }
    made.symbols = symbolsOf(made.coded, itsLink.setup().channel.modulation);
    return made;
}

}  // namespace quarzel::tool
