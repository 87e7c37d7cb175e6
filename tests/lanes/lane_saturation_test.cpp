// SPDX-License-Identifier: MIT
// Lanes find out about saturated values while it converts them.
#include <gtest/gtest.h>

#include <algorithm>
#include <bit>
#include <string>
#include <vector>

#include "lanes/lane_setup.hpp"
#include "support/capture.hpp"

namespace quarzel::test {
namespace {

/// Decode blocks of zeros of which one has one value out of range, and look for the warning.
void expectSeen(const lanes::Candidate& candidate, std::size_t K, std::size_t count, std::size_t position) {
    for (std::size_t stream = 0; stream < 3; ++stream) {
        const State state = makeLaneState(8, 8, 1, candidate);
        const std::vector<int> zeros(K + 4);
        std::vector<int> spoilt = zeros;
        spoilt[position] = 128;
        const std::size_t which = (position + stream) % count;
        std::vector<unsigned char> bits(count * K);
        std::vector<vardel_ip_quarzel_inputs> inputs;
        std::vector<vardel_ip_quarzel_outputs> outputs;
        for (std::size_t i = 0; i < count; ++i) {
            const auto of = [&](std::size_t s) {
                return (i == which && s == stream ? spoilt : zeros).data();
            };
            inputs.push_back({of(0), of(1), of(2), static_cast<int>(K + 4), 1, 0});
            outputs.push_back({bits.data() + i * K, static_cast<int>(K), 0, 0});
        }
        const Output output = capture([&] {
            EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate_batch(state.get(), outputs.data(), inputs.data(),
                                                              static_cast<int>(count), nullptr),
                      0);
        });
        static constexpr const char* streams[] = {"RSC1 systematic", "RSC1 parity", "RSC2 parity"};
        ASSERT_EQ(output.out, "WARNING:decoder:" + std::string(streams[stream]) + " value in position " +
                                  std::to_string(position) +
                                  " saturated positively, further saturation will not be reported\n")
            << candidate.name << ", K " << K << ", " << count << " blocks";
    }
}

TEST(LaneSaturation, IsToldAtEveryPositionOfABlockAloneAndInAGroup) {
    for (const lanes::Candidate& candidate : supportedCandidates()) {
        for (const std::size_t K : {40U, 120U, 512U, 1056U}) {
            for (const std::size_t count : {1U, 5U, 33U}) {
                // Every position of the smallest size; of the others some, and all about the ends of
                // segments.
                for (std::size_t position = 0; position < K + 4; ++position) {
                    const bool edge = position % (K / 8) < 2 || position >= K - 1;
                    if (K == 40 || position % 61 == 0 || (edge && count < 33)) {
                        ASSERT_NO_FATAL_FAILURE(expectSeen(candidate, K, count, position));
                    }
                }
            }
        }
    }
}

TEST(LaneSaturation, IsToldBeforeADecisionOverwritesIt) {
    for (const lanes::Candidate& candidate : supportedCandidates()) {
        const State state = makeLaneState(8, 8, 1, candidate);
        Block block(44);
        block.systematic[3] = -129;
        vardel_ip_quarzel_outputs outputs{reinterpret_cast<unsigned char*>(block.systematic.data()), 40, 0,
                                          0};
        const Output output = capture(
            [&] { EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate(state.get(), &outputs, block.inputs()), 0); });
        EXPECT_EQ(
            output.out,
            "WARNING:decoder:RSC1 systematic value in position 3 saturated negatively, further saturation "
            "will not be reported\n");
        EXPECT_NE(block.systematic[3], -129);
    }
}

TEST(LaneSaturation, IsToldBeforeDecisionsReachTheFirstOrTheLastBytesOfAStream) {
    // Decisions in the lowest byte of the one, in the two upper bytes of the other take them back into range;
    // the highest byte of a value does not matter.
    constexpr int low = 128;
    constexpr int high = -(1 << 16);
    constexpr bool lowFirst = std::endian::native == std::endian::little;
    const auto expectTold = [](int position, int value, std::ptrdiff_t dout) {
        const Block block(44);
        std::vector<int> room(3 * 44);
        int* const stream = &room[44];
        std::copy(block.systematic.begin(), block.systematic.end(), stream);
        stream[position] = value;
        vardel_ip_quarzel_inputs inputs = block.inputs();
        inputs.rsc1_sys = stream;
        vardel_ip_quarzel_outputs outputs{reinterpret_cast<unsigned char*>(stream) + dout, 40, 0, 0};
        const State state = makeState();
        const Output output =
            capture([&] { EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate(state.get(), &outputs, inputs), 0); });
        EXPECT_EQ(output.out, "WARNING:decoder:RSC1 systematic value in position " +
                                  std::to_string(position) + " saturated " +
                                  (value > 0 ? "positively" : "negatively") +
                                  ", further saturation will not be reported\n");
        EXPECT_NE(stream[position], value);
    };
    expectTold(0, lowFirst ? low : high, lowFirst ? -39 : -38);
    expectTold(43, lowFirst ? high : low, lowFirst ? 4 * 44 - 2 : 4 * 44 - 1);
}

TEST(LaneSaturation, IsToldInABatchBeforeALaterBlocksTruncationOrFault) {
    const State state = makeState();
    Block good(44);
    Block saturated(44, 200);
    std::vector<unsigned char> bits(3 * 40);
    std::vector<vardel_ip_quarzel_inputs> inputs = {good.inputs(), saturated.inputs(), good.inputs()};
    inputs[2].tag = 0x1FF;
    std::vector<vardel_ip_quarzel_outputs> outputs;
    for (std::size_t i = 0; i < inputs.size(); ++i) {
        outputs.push_back({bits.data() + 40 * i, 40, 0, 0});
    }
    const Output output = capture([&] {
        EXPECT_EQ(
            vardel_ip_quarzel_bitacc_simulate_batch(state.get(), outputs.data(), inputs.data(), 3, nullptr),
            0);
    });
    EXPECT_EQ(
        output.out,
        "WARNING:decoder:RSC1 systematic value in position 0 saturated positively, further saturation will "
        "not be reported\n"
        "WARNING:decoder:Input block tag has been truncated to 8 bits, further truncation will not be "
        "reported\n");
}

}  // namespace
}  // namespace quarzel::test
