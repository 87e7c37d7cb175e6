// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <functional>
#include <tuple>

#include "support/count_allocations.hpp"
#include "support/model.hpp"

namespace quarzel::test {
namespace {

/// The lines that a state has written; counting them takes no memory.
struct Lines {
    int unhandled = 0;
    int others = 0;

    static void receive(void* cookie, int, const char* text) {
        auto& lines = *static_cast<Lines*>(cookie);
        ++(std::strcmp(text, "ERROR:decoder:Unhandled exception has occurred") == 0 ? lines.unhandled
                                                                                    : lines.others);
    }
};

/// Let each allocation of an attempt fail: by itself, or with all that follow it. An attempt ends what it
/// began, so that nothing is left allocated. Returns how many attempts met a failure.
int failEverywhere(const std::function<void()>& attempt) {
    int failures = 0;
    for (const auto fail : {failAllocationsAfter, failOneAllocationAfter}) {
        for (std::size_t count = 0;; ++count) {
            SCOPED_TRACE(count);
            const std::size_t live = liveAllocations();
            const std::size_t failed = failedAllocations();
            fail(count);
            attempt();
            allowAllocations();
            EXPECT_EQ(liveAllocations(), live);
            if (failedAllocations() == failed || testing::Test::HasFailure()) {
                break;
            }
            ++failures;
        }
    }
    return failures;
}

/// For each unit count and algorithm.
class AllocationFailure : public testing::TestWithParam<std::tuple<int, int>> {
  protected:
    [[nodiscard]] State make(Lines& lines) const {
        const auto [units, algorithm] = GetParam();
        const vardel_ip_quarzel_generics generics = genericsOf(units, 8, algorithm);
        return State(vardel_ip_quarzel_create_state_with_messages(&generics, &Lines::receive, &lines));
    }

    /// Decode in one form of the call, wherever memory runs out: the statuses are right, each failure has its
    /// line, decisions that were given are those of a state that lacked nothing, and the state is good for
    /// the next call.
    template <class Decode>
    void decodeEverywhere(std::size_t blocks, std::size_t K, const Decode& decode) const {
        Lines lines;
        std::vector<unsigned char> right(blocks * K, 2);
        std::vector<unsigned char> bits(blocks * K);
        std::vector<int> statuses(blocks + 1);
        ASSERT_EQ(decode(make(lines).get(), right.data(), statuses.data()), 0);
        ASSERT_EQ(std::count(right.begin(), right.end(), 2), 0);
        int refused = 0;
        const auto attempt = [&] {
            const std::size_t room = failedAllocations();
            lines = {};
            std::fill(bits.begin(), bits.end(), static_cast<unsigned char>(2));
            std::fill(statuses.begin(), statuses.end() - 1, -77);
            // A block more, that must not be taken for one that is not decided on yet.
            statuses.back() = -1;
            const State state = make(lines);
            if (state == nullptr) {
                EXPECT_EQ(lines.unhandled + lines.others, 1);
                ++refused;
                return;
            }
            const int result = decode(state.get(), bits.data(), statuses.data());
            EXPECT_EQ(lines.others, 0);
            EXPECT_EQ(lines.unhandled, std::count(statuses.begin(), statuses.end(), 99));
            EXPECT_EQ(statuses.back(), -1);
            for (std::size_t block = 0; block < blocks; ++block) {
                EXPECT_TRUE(statuses[block] == 0 || statuses[block] == 99) << statuses[block];
                const auto first = static_cast<std::ptrdiff_t>(block * K);
                const auto last = first + static_cast<std::ptrdiff_t>(K);
                if (statuses[block] == 0) {
                    EXPECT_TRUE(std::equal(bits.begin() + first, bits.begin() + last, right.begin() + first));
                } else {
                    EXPECT_EQ(std::count(bits.begin() + first, bits.begin() + last, 2),
                              static_cast<std::ptrdiff_t>(K));
                    EXPECT_EQ(result, 99);
                }
            }
            if (failedAllocations() != room) {
                allowAllocations();
                EXPECT_EQ(decode(state.get(), bits.data(), statuses.data()), 0);
                EXPECT_EQ(bits, right);
            }
        };
        EXPECT_GT(failEverywhere(attempt), 20);
        EXPECT_GT(refused, 5);
    }
};

TEST_P(AllocationFailure, OfASingleCallIsAStatusAndALine) {
    for (const char* name : {static_cast<const char*>(nullptr), "literal"}) {
        const Block block(512 + 4, -8);
        decodeEverywhere(1, 512, [&](vardel_ip_quarzel_state* state, unsigned char* bits, int* status) {
            if (name != nullptr && vardel_ip_quarzel_set_implementation(state, name) != 0) {
                return *status = 99;
            }
            vardel_ip_quarzel_outputs outputs{bits, 512, 0, 0};
            return *status = vardel_ip_quarzel_bitacc_simulate(state, &outputs, block.inputs());
        });
    }
}

TEST_P(AllocationFailure, OfABatchSpoilsNoOtherBlock) {
    const std::vector<std::size_t> sizes = {40, 1024, 40, 512};
    std::vector<Block> blocks;
    std::vector<vardel_ip_quarzel_inputs> inputs;
    for (const std::size_t K : sizes) {
        blocks.emplace_back(K + 4, 8);
    }
    for (const Block& block : blocks) {
        inputs.push_back(block.inputs());
    }
    std::vector<unsigned char> room(4 * 1024);
    decodeEverywhere(4, 40, [&](vardel_ip_quarzel_state* state, unsigned char* bits, int* statuses) {
        std::array<vardel_ip_quarzel_outputs, 4> outputs{};
        for (std::size_t i = 0; i < outputs.size(); ++i) {
            outputs.at(i) = {&room[i * 1024], 1024, 0, 0};
        }
        const int result =
            vardel_ip_quarzel_bitacc_simulate_batch(state, outputs.data(), inputs.data(), 4, statuses);
        for (std::size_t i = 0; i < outputs.size(); ++i) {
            if (statuses[i] == 0) {
                std::copy_n(&room[i * 1024], 40, bits + i * 40);
            }
        }
        return result;
    });
}

TEST_P(AllocationFailure, OfAnArrayCallSpoilsNoOtherBlock) {
    const std::vector<std::int8_t> soft(9 * 44 * 3, 8);
    decodeEverywhere(9, 40, [&](vardel_ip_quarzel_state* state, unsigned char* bits, int* statuses) {
        const vardel_ip_quarzel_array_inputs inputs{soft.data(),
                                                    &soft[std::size_t{9} * 44],
                                                    &soft[std::size_t{18} * 44],
                                                    44,
                                                    1,
                                                    VARDEL_IP_QUARZEL_INT8,
                                                    44,
                                                    9,
                                                    3,
                                                    nullptr};
        const vardel_ip_quarzel_array_outputs outputs{bits, 40, 0, nullptr};
        return vardel_ip_quarzel_bitacc_simulate_array(state, &outputs, &inputs, statuses);
    });
}

TEST_P(AllocationFailure, OfThePortOfPassesIsAStatus) {
    const Block block(512 + 4, -8);
    Lines lines;
    const auto count = [](void* cookie, const vardel_ip_quarzel_pass*) { ++*static_cast<int*>(cookie); };
    std::vector<unsigned char> bits(512);
    int met = 0;
    EXPECT_GT(failEverywhere([&] {
                  const std::size_t failed = failedAllocations();
                  lines = {};
                  const State state = make(lines);
                  if (state == nullptr) {
                      return;
                  }
                  int passes = 0;
                  const bool asked = vardel_ip_quarzel_set_passes(state.get(), 4, count, &passes) == 0;
                  EXPECT_EQ(lines.unhandled + lines.others, asked ? 0 : 1);
                  vardel_ip_quarzel_outputs outputs{bits.data(), 512, 0, 0};
                  const int status = vardel_ip_quarzel_bitacc_simulate(state.get(), &outputs, block.inputs());
                  EXPECT_TRUE(status == 0 || status == 99);
                  if (failedAllocations() != failed) {
                      allowAllocations();
                      ++met;
                      ASSERT_EQ(vardel_ip_quarzel_set_passes(state.get(), 4, count, &passes), 0);
                      passes = 0;
                      EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate(state.get(), &outputs, block.inputs()), 0);
                  }
                  EXPECT_TRUE(passes == 4 || (!asked && passes == 0));
              }),
              10);
    EXPECT_GT(met, 5);
}

INSTANTIATE_TEST_SUITE_P(Cores, AllocationFailure,
                         testing::Combine(testing::Values(2, 4, 8), testing::Values(0, 1, 2)));

}  // namespace
}  // namespace quarzel::test
