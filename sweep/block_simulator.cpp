// SPDX-License-Identifier: MIT
#include "sweep/block_simulator.hpp"

#include <algorithm>
#include <cstring>
#include <span>

namespace quarzel::sweep {

namespace {

/// How many of `count` decisions, bytes of 0 or 1, differ from bit `lane` of the byte that was sent. Takes 8
/// at a time; every K is a multiple of 8.
std::uint32_t differences(const std::uint8_t* bits, unsigned lane, const unsigned char* decisions,
                          std::size_t count) {
    constexpr std::uint64_t ones = 0x0101010101010101;
    constexpr std::uint64_t evenBytes = 0x00ff00ff00ff00ff;
    constexpr std::size_t maxAtOnce = std::size_t{255} * 8;  // sums that a byte can hold
    std::uint64_t total = 0;
    for (std::size_t start = 0; start < count; start += maxAtOnce) {
        const std::size_t end = std::min(start + maxAtOnce, count);
        std::uint64_t sums = 0;
        for (std::size_t i = start; i < end; i += 8) {
            std::uint64_t sent = 0;
            std::uint64_t decided = 0;
            std::memcpy(&sent, bits + i, 8);
            std::memcpy(&decided, decisions + i, 8);
            sums += (sent >> lane & ones) ^ decided;
        }
        sums = (sums & evenBytes) + (sums >> 8 & evenBytes);
        total += sums * 0x0001000100010001 >> 48;
    }
    return static_cast<std::uint32_t>(total);
}

}  // namespace

std::shared_ptr<const link::QuantisedChannel> Channels::at(link::Decibels ebN0) {
    const std::lock_guard lock(itsMutex);
    auto& channel = itsChannels[ebN0];
    if (channel == nullptr) {
        channel = std::make_shared<const link::QuantisedChannel>(itsQuantiser, ebN0);
    }
    return channel;
}

Core& BlockSimulator::coreOf(const Curve& curve) {
    return itsCores.try_emplace({curve.units, curve.algorithm}, CoreSettings{curve.units, curve.algorithm})
        .first->second;
}

const link::Encoder& BlockSimulator::encoderOf(std::uint32_t blockSize) {
    return itsEncoders.try_emplace(blockSize, blockSize).first->second;
}

void BlockSimulator::send(const Curve& curve, link::Decibels ebN0, const std::vector<std::uint64_t>& octets) {
    const link::Encoder& encoder = encoderOf(curve.blockSize);
    const auto channel = itsChannels.at(ebN0);
    const std::size_t codeBits = 3 * encoder.positions();
    itsBits.assign(octets.size() * curve.blockSize, 0);
    itsCodeBits.resize(codeBits);
    itsSoft.resize(octets.size() * blocksPerOctet * codeBits);
    itsBlocks.clear();
    for (std::size_t i = 0; i < octets.size(); ++i) {
        const std::uint64_t first = octets[i] * blocksPerOctet;
        const auto lanes =
            static_cast<unsigned>(std::min(blocksPerOctet, itsConfiguration.maxBlocks - first));
        std::uint8_t* const bits = itsBits.data() + i * curve.blockSize;
        const auto sourceOf = [&](unsigned lane) {
            return link::RandomSource({itsConfiguration.seed, curve.blockSize, ebN0, first + lane});
        };
        for (unsigned lane = 0; lane < lanes; ++lane) {
            sourceOf(lane).informationBits(lane, bits);
        }
        encoder.encode(bits, itsCodeBits.data());
        for (unsigned lane = 0; lane < lanes; ++lane) {
            channel->transmit(sourceOf(lane), itsCodeBits.data(), lane, codeBits,
                              itsSoft.data() + itsBlocks.size() * codeBits);
            itsBlocks.push_back(first + lane);
        }
    }
    itsSoft.resize(itsBlocks.size() * codeBits);
}

void BlockSimulator::decode(const Curve& curve) {
    const std::size_t counts = itsConfiguration.countsOf(curve);
    itsDecisions.resize(itsBlocks.size() * counts * curve.blockSize);
    const std::size_t positions = curve.blockSize + tailPositions;
    const auto soft = softBlocks(std::span<const std::int8_t>(itsSoft), positions);
    if (itsConfiguration.perIteration) {
        coreOf(curve).decodeEveryIteration(soft, curve.iterations, itsDecisions);
    } else {
        coreOf(curve).decode(soft, curve.iterations, itsDecisions);
    }
}

/// The blocks with bit errors after any of the iterations that are counted.
ErrorList BlockSimulator::count(const Curve& curve) const {
    const std::size_t K = curve.blockSize;
    std::vector<std::uint32_t> row(itsConfiguration.countsOf(curve));
    const unsigned char* decisions = itsDecisions.data();
    ErrorList list;
    for (std::size_t i = 0; i < itsBlocks.size(); ++i) {
        // Only the last octet can be short, so block i is in octet i / 8.
        const std::uint8_t* const bits = itsBits.data() + i / blocksPerOctet * K;
        for (std::uint32_t& errors : row) {
            errors = differences(bits, static_cast<unsigned>(i % blocksPerOctet), decisions, K);
            decisions += K;
        }
        if (std::any_of(row.begin(), row.end(), [](std::uint32_t errors) { return errors != 0; })) {
            list.append(itsBlocks[i], row.data(), row.size());
        }
    }
    return list;
}

ErrorList BlockSimulator::simulate(const Curve& curve, link::Decibels ebN0,
                                   const std::vector<std::uint64_t>& octets) {
    send(curve, ebN0, octets);
    decode(curve);
    return count(curve);
}

}  // namespace quarzel::sweep
