// SPDX-License-Identifier: MIT
#include "sweep/block_simulator.hpp"

#include <algorithm>
#include <cstring>
#include <stdexcept>

namespace quarzel::sweep {

namespace {

/// How many of `count` decisions, bytes of 0 or 1, are not bit `lane` of their byte. 8 at a time; K is a
/// multiple of 8.
std::uint32_t differences(const std::uint8_t* bits, unsigned lane, const unsigned char* decisions,
                          std::size_t count) {
    constexpr std::uint64_t ones = 0x0101010101010101;
    constexpr std::uint64_t evenBytes = 0x00ff00ff00ff00ff;
    constexpr std::size_t mostAtOnce = std::size_t{255} * 8;  // sums that a byte can hold
    std::uint64_t total = 0;
    for (std::size_t start = 0; start < count; start += mostAtOnce) {
        const std::size_t end = std::min(start + mostAtOnce, count);
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

vardel_ip_quarzel_state* BlockSimulator::coreOf(const Curve& curve) {
    Core& core = itsCores[{curve.units, curve.algorithm}];
    if (core == nullptr) {
        vardel_ip_quarzel_generics generics;
        vardel_ip_quarzel_get_default_generics(&generics);
        generics.C_NUM_PU = curve.units;
        generics.C_ALGORITHM_TYPE = curve.algorithm;
        core.reset(vardel_ip_quarzel_create_state(generics));
        if (core == nullptr) {
            throw std::runtime_error("no model of the core could be made");
        }
    }
    return core.get();
}

const link::Encoder& BlockSimulator::encoderOf(std::uint32_t blockSize) {
    return itsEncoders.try_emplace(blockSize, blockSize).first->second;
}

void BlockSimulator::send(const Curve& curve, link::Decibels ebN0, const std::vector<std::uint64_t>& groups) {
    const link::Encoder& encoder = encoderOf(curve.blockSize);
    const auto channel = itsChannels.at(ebN0);
    const std::size_t codeBits = 3 * encoder.positions();
    const std::size_t most = groups.size() * blocksPerGroup;
    itsBits.assign(groups.size() * curve.blockSize, 0);
    itsCodeBits.resize(codeBits);
    itsSoft.resize(most * codeBits);
    itsBlocks.clear();
    for (std::size_t i = 0; i < groups.size(); ++i) {
        const std::uint64_t first = groups[i] * blocksPerGroup;
        const auto lanes =
            static_cast<unsigned>(std::min(blocksPerGroup, itsConfiguration.maxBlocks - first));
        std::uint8_t* const bits = itsBits.data() + i * curve.blockSize;
        const auto sourceOf = [&](unsigned lane) {
            return link::RandomSource({itsConfiguration.seed, curve.blockSize, ebN0, first + lane});
        };
        for (unsigned lane = 0; lane < lanes; ++lane) {
            sourceOf(lane).informationBits(lane, bits);
        }
        encoder.encode(bits, itsCodeBits.data());
        for (unsigned lane = 0; lane < lanes; ++lane) {
            int* const soft = itsSoft.data() + itsBlocks.size() * codeBits;
            channel->transmit(sourceOf(lane), itsCodeBits.data(), lane, codeBits, soft);
            itsBlocks.push_back(first + lane);
        }
    }
}

void BlockSimulator::decode(const Curve& curve, int iterations) {
    const std::size_t K = curve.blockSize;
    const std::size_t positions = K + 4;
    itsDecisions.resize(itsBlocks.size() * K);
    itsInputs.clear();
    itsOutputs.clear();
    for (std::size_t i = 0; i < itsBlocks.size(); ++i) {
        const int* const soft = itsSoft.data() + i * 3 * positions;
        itsInputs.push_back(
            {soft, soft + positions, soft + 2 * positions, static_cast<int>(positions), iterations, 0});
        itsOutputs.push_back({itsDecisions.data() + i * K, static_cast<int>(K), 0, 0});
    }
    if (vardel_ip_quarzel_bitacc_simulate_batch(coreOf(curve), itsOutputs.data(), itsInputs.data(),
                                                static_cast<int>(itsBlocks.size()), nullptr) != 0) {
        throw std::runtime_error("the decoder refused a block of " + std::to_string(K) + " bits");
    }
}

/// Count the bit errors of the blocks into a column of their rows.
void BlockSimulator::count(std::uint32_t blockSize, std::size_t counts, std::size_t column) {
    for (std::size_t i = 0; i < itsBlocks.size(); ++i) {
        // Only the last group can be short, so block i stands in group i / 8.
        const std::uint8_t* const bits = itsBits.data() + i / blocksPerGroup * blockSize;
        const unsigned char* const decisions = itsDecisions.data() + i * blockSize;
        const auto lane = static_cast<unsigned>(i % blocksPerGroup);
        itsErrors[i * counts + column] = differences(bits, lane, decisions, blockSize);
    }
}

ErrorList BlockSimulator::simulate(const Curve& curve, link::Decibels ebN0,
                                   const std::vector<std::uint64_t>& groups) {
    send(curve, ebN0, groups);
    const std::size_t counts = itsConfiguration.countsOf(curve);
    itsErrors.resize(itsBlocks.size() * counts);
    for (std::size_t column = 0; column < counts; ++column) {
        // A run of fewer iterations gives what the core has after them.
        decode(curve, curve.iterations - static_cast<int>(counts - 1 - column));
        count(curve.blockSize, counts, column);
    }
    ErrorList list;
    for (std::size_t i = 0; i < itsBlocks.size(); ++i) {
        const std::uint32_t* const row = itsErrors.data() + i * counts;
        if (std::any_of(row, row + counts, [](std::uint32_t errors) { return errors != 0; })) {
            list.append(itsBlocks[i], row, counts);
        }
    }
    return list;
}

}  // namespace quarzel::sweep
