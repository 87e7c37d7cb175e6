// SPDX-License-Identifier: MIT
#include "sweep/block_simulator.hpp"

#include <algorithm>
#include <span>

#include "link/bit_errors.hpp"

namespace quarzel::sweep {

Core& BlockSimulator::coreOf(const Setup& setup) {
    return itsCores.try_emplace({setup.units, setup.algorithm}, CoreSettings{setup.units, setup.algorithm})
        .first->second;
}

link::LinkRun& BlockSimulator::runOf(const Setup& setup) {
    const link::CodedLink& link = itsChannels.linkOf(setup);
    if (itsLink != &link) {
        itsLink = &link;
        itsRun.emplace(link, itsSeed);
    }
    return *itsRun;
}

const link::Encoder& BlockSimulator::encoderOf(std::uint32_t blockSize) {
    return itsEncoders.try_emplace(blockSize, blockSize).first->second;
}

void BlockSimulator::send(const Setup& setup, const std::vector<std::uint64_t>& octets) {
    const link::Encoder& encoder = encoderOf(setup.blockSize);
    const auto channel = itsChannels.of(setup);
    const std::size_t codeBits = 3 * encoder.positions();
    itsBits.resize(octets.size() * setup.blockSize);
    itsCodeBits.resize(codeBits);
    itsSoft.resize(octets.size() * blocksPerOctet * codeBits);
    std::uint8_t* bits = itsBits.data();
    std::int8_t* soft = itsSoft.data();
    for (const std::uint64_t octet : octets) {
        const link::RandomSource source({itsSeed, setup.blockSize, setup.ebN0, octet * blocksPerOctet});
        source.octetBits(bits);
        encoder.encode(bits, itsCodeBits.data());
        channel->transmitOctet(source, itsCodeBits.data(), codeBits, soft);
        bits += setup.blockSize;
        soft += blocksPerOctet * codeBits;
    }
}

void BlockSimulator::decode(const Setup& setup, std::size_t counts, std::size_t blocks) {
    itsDecisions.resize(blocks * counts * setup.blockSize);
    const auto soft = softBlocks(std::span<const std::int8_t>(itsSoft), setup.blockSize + tailPositions);
    if (counts > 1) {
        coreOf(setup).decodeEveryIteration(soft, setup.iterations, itsDecisions);
    } else {
        coreOf(setup).decode(soft, setup.iterations, itsDecisions);
    }
}

/// The blocks with bit errors after any of the iterations that are counted.
ErrorList BlockSimulator::count(std::size_t K, std::size_t counts,
                                const std::vector<std::uint64_t>& octets) const {
    std::vector<std::uint32_t> row(counts);
    const std::uint8_t* bits = itsBits.data();
    const unsigned char* decisions = itsDecisions.data();
    ErrorList list;
    for (const std::uint64_t octet : octets) {
        for (unsigned lane = 0; lane < blocksPerOctet; ++lane) {
            for (std::uint32_t& errors : row) {
                errors = link::bitErrors(bits, lane, decisions, K);
                decisions += K;
            }
            if (std::any_of(row.begin(), row.end(), [](std::uint32_t errors) { return errors != 0; })) {
                list.append(octet * blocksPerOctet + lane, row.data(), counts);
            }
        }
        bits += K;
    }
    return list;
}

ErrorList BlockSimulator::simulate(const Setup& setup, std::size_t counts,
                                   const std::vector<std::uint64_t>& octets) {
    if (!setup.sending.isPlain()) {
        return simulateLink(setup, counts, runOf(setup), *itsChannels.of(setup), coreOf(setup), octets);
    }
    send(setup, octets);
    decode(setup, counts, octets.size() * blocksPerOctet);
    return count(setup.blockSize, counts, octets);
}

std::vector<SentBlock> BlockSimulator::makeAgain(const Setup& setup, std::uint64_t number) {
    if (!setup.sending.isPlain()) {
        return sendOverLink(setup, itsChannels.linkOf(setup), runOf(setup), *itsChannels.of(setup),
                            coreOf(setup), number);
    }
    send(setup, {number / blocksPerOctet});
    const auto lane = static_cast<unsigned>(number % blocksPerOctet);
    const std::size_t values = itsSoft.size() / blocksPerOctet;
    const auto soft = itsSoft.begin() + static_cast<std::ptrdiff_t>(lane * values);
    return {{bitsOfLane(itsBits, lane), {soft, soft + static_cast<std::ptrdiff_t>(values)}}};
}

}  // namespace quarzel::sweep
