// SPDX-License-Identifier: MIT
#include "link/coding/transport_block.hpp"

#include <algorithm>
#include <stdexcept>

#include "link/coding/coded_sizes.hpp"
#include "link/coding/crc.hpp"
#include "link/coding/require.hpp"
#include "link/coding/turbo_encoding.hpp"

namespace quarzel::link {

namespace {

constexpr Crc transportCrc = Crc::crc24A;

std::size_t withCrc(std::size_t A) {
    if (A == 0) {
        throw std::invalid_argument("a transport block has at least 1 bit, not 0");
    }
    return A + crcLength(transportCrc);
}

/// The pieces of an array, one after another.
template <class Value>
class Pieces {
  public:
    explicit Pieces(std::span<Value> values) : itsValues(values) {}

    std::span<Value> next(std::size_t size) {
        const std::span<Value> piece = itsValues.first(size);
        itsValues = itsValues.subspan(size);
        return piece;
    }

  private:
    std::span<Value> itsValues;
};

}  // namespace

TransportBlockCode::TransportBlockCode(std::size_t A, std::optional<std::size_t> NIR)
    : itsSize(A), itsSegmentation(segmentationOf(withCrc(A))) {
    for (std::size_t r = 0; r < itsSegmentation.C; ++r) {
        const std::uint32_t K = itsSegmentation.size(r);
        const std::size_t filler = r == 0 ? itsSegmentation.F : 0;
        auto kind = std::find_if(itsKinds.begin(), itsKinds.end(), [&](const Kind& known) {
            return known.matching.K() == K && known.matching.filler() == filler;
        });
        if (kind == itsKinds.end()) {
            const std::size_t size = NIR ? link::bufferSize(K, itsSegmentation.C, *NIR) : wholeBufferSize(K);
            kind = itsKinds.insert(kind, {Encoder(K), RateMatching(K, filler, size)});
        }
        itsKindOfBlock.push_back(static_cast<std::size_t>(kind - itsKinds.begin()));
        itsSoftValues += kind->matching.codeBits();
    }
}

void TransportBlockCode::encode(std::span<const std::uint8_t> bits, const Transmission& transmission,
                                std::span<std::uint8_t> coded) const {
    requireSize("bits of a transport block", bits.size(), itsSize);
    requireSize("coded bits", coded.size(), transmission.G);
    if (std::any_of(bits.begin(), bits.end(), [](std::uint8_t bit) { return bit > 1; })) {
        throw std::invalid_argument("the bits of a transport block must be 0 or 1");
    }
    const std::vector<std::size_t> sizes =
        codedSizes(itsSegmentation.C, transmission.G, transmission.layers, transmission.Qm);
    std::vector<std::uint8_t> withParity(bits.begin(), bits.end());
    withParity.resize(itsSegmentation.B);
    writeCrc(transportCrc, bits, std::span(withParity).subspan(itsSize));
    std::vector<std::uint8_t> blocks(itsSegmentation.totalSize());
    segment(itsSegmentation, withParity, blocks);

    Pieces<std::uint8_t> block(blocks);
    Pieces<std::uint8_t> codedBlock(coded);
    std::vector<std::uint8_t> streams;
    for (std::size_t r = 0; r < itsSegmentation.C; ++r) {
        const auto& [encoder, matching] = kindOf(r);
        streams.resize(3 * encoder.positions());
        turboEncode(encoder, block.next(encoder.blockSize()), matching.filler(), streams);
        rateMatch(matching, transmission.rv, streams, codedBlock.next(sizes[r]));
    }
}

std::vector<std::int8_t> TransportBlockCode::combine(std::span<const std::int16_t> soft,
                                                     const Transmission& transmission,
                                                     SoftBuffers& buffers) const {
    const std::vector<std::size_t> sizes =
        codedSizes(itsSegmentation.C, transmission.G, transmission.layers, transmission.Qm);
    requireSize("soft values", soft.size(), transmission.G);
    if (buffers.values.empty()) {
        buffers.values.resize(itsSoftValues);
    }
    requireSize("values in the soft buffers of this transport block", buffers.values.size(), itsSoftValues);

    std::vector<std::int8_t> streams(3 * (itsSegmentation.totalSize() + itsSegmentation.C * tailPositions));
    Pieces<std::int8_t> blockStreams(streams);
    Pieces<std::int16_t> buffer(buffers.values);
    Pieces<const std::int16_t> received(soft);
    for (std::size_t r = 0; r < itsSegmentation.C; ++r) {
        const RateMatching& table = matching(r);
        const std::span<std::int16_t> sums = buffer.next(table.codeBits());
        rateRecover(table, transmission.rv, received.next(sizes[r]), sums, buffers.width);
        readStreams(table, sums, blockStreams.next(3 * table.positions()));
    }
    return streams;
}

TransportDecisions TransportBlockCode::decode(std::span<const std::int16_t> soft,
                                              const Transmission& transmission, Core& core, int iterations,
                                              SoftBuffers& buffers) const {
    const std::vector<std::int8_t> streams = combine(soft, transmission, buffers);
    std::vector<std::uint8_t> decisions(itsSegmentation.totalSize());
    Pieces<const std::int8_t> groupStreams(streams);
    Pieces<std::uint8_t> groupDecisions(decisions);
    const auto decodeGroup = [&](std::size_t count, std::size_t K) {
        const std::size_t positions = K + quarzel::tailPositions;
        core.decode(softBlocks(groupStreams.next(3 * count * positions), positions), iterations,
                    groupDecisions.next(count * K));
    };
    decodeGroup(itsSegmentation.Cminus, itsSegmentation.Kminus);
    decodeGroup(itsSegmentation.Cplus, itsSegmentation.Kplus);
    return decide(decisions);
}

TransportDecisions TransportBlockCode::decide(std::span<const std::uint8_t> decisions) const {
    std::vector<std::uint8_t> bits(itsSegmentation.B);
    std::vector<bool> blocksOk = desegment(itsSegmentation, decisions, bits);
    const bool ok = crcHolds(transportCrc, bits);
    if (itsSegmentation.C == 1) {
        blocksOk = {ok};
    }
    bits.resize(itsSize);
    return {std::move(bits), ok, std::move(blocksOk)};
}

std::vector<std::uint8_t> encodeTransportBlock(std::span<const std::uint8_t> bits,
                                               const Transmission& transmission,
                                               std::optional<std::size_t> NIR) {
    std::vector<std::uint8_t> coded(transmission.G);
    TransportBlockCode(bits.size(), NIR).encode(bits, transmission, coded);
    return coded;
}

TransportDecisions decodeTransportBlock(std::span<const std::int16_t> soft, std::size_t A,
                                        const Transmission& transmission, Core& core, int iterations,
                                        SoftBuffers& buffers, std::optional<std::size_t> NIR) {
    return TransportBlockCode(A, NIR).decode(soft, transmission, core, iterations, buffers);
}

}  // namespace quarzel::link
