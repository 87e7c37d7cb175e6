// SPDX-License-Identifier: MIT
// The array call is the batch call in another form: same bits, statuses, tags and lines.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

#include "support/capture.hpp"
#include "support/model.hpp"
#include "support/random.hpp"

namespace quarzel::test {
namespace {

/// How the values of an array lie in memory.
struct Form {
    const char* name;
    bool positionsFirst;  ///< (blocks, K + 4, 3) instead of (blocks, 3, K + 4)
    bool backwards;       ///< the last block comes first
};
constexpr Form forms[] = {
    {"streams after one another", false, false},
    {"streams interleaved", true, false},
    {"backwards", false, true},
};

struct Batch {
    std::size_t K;
    std::vector<std::vector<int>> streams;  ///< three for each block
    std::vector<unsigned> tags;
    int iterations;

    std::size_t count() const { return tags.size(); }
};

Batch randomBatch(std::mt19937& random, std::size_t K, std::size_t count, int iterations, int least,
                  int most) {
    Batch batch{K, {}, {}, iterations};
    std::uniform_int_distribution<int> noise(-60, 60);
    std::uniform_int_distribution<int> any(least, most);
    for (std::size_t block = 0; block < count; ++block) {
        for (int stream = 0; stream < 3; ++stream) {
            auto& values = batch.streams.emplace_back(K + 4);
            for (int& value : values) {
                value = random() % 50 == 0 ? any(random) : noise(random);
            }
        }
        batch.tags.push_back(static_cast<unsigned>(random() % 300));
    }
    return batch;
}

/// What a call gave back.
struct Seen {
    int status = -1;
    std::vector<int> statuses;
    std::vector<unsigned char> bits;
    std::vector<unsigned> tags;
    Output output;

    bool operator==(const Seen& other) const {
        return status == other.status && statuses == other.statuses && bits == other.bits &&
               tags == other.tags && output.out == other.output.out && output.err == other.output.err;
    }
};

Seen byBatch(vardel_ip_quarzel_state* state, const Batch& batch, int iterations) {
    Seen seen;
    seen.bits.assign(batch.count() * batch.K, 0xEE);
    std::vector<vardel_ip_quarzel_inputs> inputs;
    std::vector<vardel_ip_quarzel_outputs> outputs;
    for (std::size_t i = 0; i < batch.count(); ++i) {
        inputs.push_back({batch.streams[3 * i].data(), batch.streams[3 * i + 1].data(),
                          batch.streams[3 * i + 2].data(), static_cast<int>(batch.K + 4), iterations,
                          batch.tags[i]});
        outputs.push_back({seen.bits.data() + i * batch.K, static_cast<int>(batch.K), 0, 777});
    }
    seen.statuses.resize(batch.count());
    seen.output = capture([&] {
        seen.status = vardel_ip_quarzel_bitacc_simulate_batch(
            state, outputs.data(), inputs.data(), static_cast<int>(batch.count()), seen.statuses.data());
    });
    for (const vardel_ip_quarzel_outputs& output : outputs) {
        seen.tags.push_back(output.tag);
    }
    return seen;
}

template <class Value>
Seen byArray(vardel_ip_quarzel_state* state, const Batch& batch, const Form& form, bool everyIteration) {
    const std::size_t positions = batch.K + 4;
    const std::size_t count = batch.count();
    std::vector<Value> values(3 * positions * count);
    const auto positionStride = static_cast<std::ptrdiff_t>(form.positionsFirst ? 3 : 1);
    const auto streamStride = static_cast<std::ptrdiff_t>(form.positionsFirst ? 1 : positions);
    const auto blockStride = static_cast<std::ptrdiff_t>(3 * positions) * (form.backwards ? -1 : 1);
    Value* const first =
        values.data() + (form.backwards ? static_cast<std::ptrdiff_t>(3 * positions * (count - 1)) : 0);
    for (std::size_t i = 0; i < count; ++i) {
        for (std::size_t stream = 0; stream < 3; ++stream) {
            for (std::size_t position = 0; position < positions; ++position) {
                first[static_cast<std::ptrdiff_t>(i) * blockStride +
                      static_cast<std::ptrdiff_t>(stream) * streamStride +
                      static_cast<std::ptrdiff_t>(position) * positionStride] =
                    static_cast<Value>(batch.streams[3 * i + stream][position]);
            }
        }
    }
    const auto decisions = static_cast<std::size_t>(everyIteration ? batch.iterations : 1);
    Seen seen;
    seen.bits.assign(count * decisions * batch.K, 0xEE);
    seen.tags.assign(count, 777);
    seen.statuses.resize(count);
    const vardel_ip_quarzel_array_inputs inputs{first,
                                                first + streamStride,
                                                first + 2 * streamStride,
                                                blockStride,
                                                positionStride,
                                                static_cast<int>(sizeof(Value)),
                                                static_cast<int>(positions),
                                                static_cast<int>(count),
                                                batch.iterations,
                                                batch.tags.data()};
    const vardel_ip_quarzel_array_outputs outputs{
        seen.bits.data(), static_cast<std::ptrdiff_t>(decisions * batch.K),
        everyIteration ? static_cast<std::ptrdiff_t>(batch.K) : 0, seen.tags.data()};
    seen.output = capture([&] {
        seen.status = vardel_ip_quarzel_bitacc_simulate_array(state, &outputs, &inputs, seen.statuses.data());
    });
    return seen;
}

template <class Value>
void compare(std::mt19937& random, int least, int most) {
    for (const char* implementation : {"best", "literal"}) {
        for (const std::size_t K : {40U, 120U, 512U, 1056U}) {
            for (const Form& form : forms) {
                const std::size_t count = implementation == std::string("best") ? 37 : 3;
                const Batch batch = randomBatch(random, K, count, 3, least, most);
                SCOPED_TRACE(std::string(implementation) + ", K " + std::to_string(K) + ", " + form.name +
                             ", bytes " + std::to_string(sizeof(Value)));
                const auto make = [&] {
                    State state = makeState(genericsOf(4, 8, static_cast<int>(random() % 3)));
                    if (implementation == std::string("literal")) {
                        vardel_ip_quarzel_set_implementation(state.get(), "literal");
                    }
                    return state;
                };
                const std::mt19937 before = random;
                const State one = make();
                random = before;
                const State other = make();
                const Seen expected = byBatch(one.get(), batch, batch.iterations);
                const Seen seen = byArray<Value>(other.get(), batch, form, false);
                EXPECT_EQ(expected.status, 0);
                EXPECT_TRUE(seen == expected);
                EXPECT_EQ(seen.output.out, expected.output.out);
            }
        }
    }
}

TEST(ArrayCall, IsTheBatchCallForEveryTypeOfValueAndOrderInMemory) {
    std::mt19937 random = seededRandom();
    compare<std::int8_t>(random, INT8_MIN, INT8_MAX);
    compare<std::int16_t>(random, INT16_MIN, INT16_MAX);
    compare<std::int32_t>(random, INT32_MIN, INT32_MAX);
}

TEST(ArrayCall, WithoutTagsEveryBlockHasTheTag0) {
    const std::vector<signed char> soft(3 * 44, 8);
    std::vector<unsigned char> bits(40);
    unsigned tag = 777;
    const vardel_ip_quarzel_array_inputs inputs{
        soft.data(), soft.data() + 44, soft.data() + 88, 132, 1, VARDEL_IP_QUARZEL_INT8, 44, 1, 1, nullptr};
    const vardel_ip_quarzel_array_outputs outputs{bits.data(), 40, 0, &tag};
    EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate_array(makeState().get(), &outputs, &inputs, nullptr), 0);
    EXPECT_EQ(tag, 0U);
}

TEST(ArrayCall, GivesAfterEachIterationWhatADecodeOfSoManyGives) {
    std::mt19937 random = seededRandom();
    for (const char* implementation : {"best", "literal"}) {
        for (const std::size_t K : {40U, 128U, 2112U}) {
            for (const int algorithm : {0, 1, 2}) {
                const Batch batch = randomBatch(random, K, 9, 5, -128, 127);
                const State state = makeState(genericsOf(8, 8, algorithm));
                if (implementation == std::string("literal")) {
                    vardel_ip_quarzel_set_implementation(state.get(), "literal");
                }
                const Seen seen = byArray<std::int8_t>(state.get(), batch, forms[0], true);
                ASSERT_EQ(seen.status, 0);
                for (int iterations = 1; iterations <= 5; ++iterations) {
                    const Seen expected = byBatch(state.get(), batch, iterations);
                    for (std::size_t i = 0; i < batch.count(); ++i) {
                        const auto at =
                            seen.bits.begin() + static_cast<std::ptrdiff_t>(
                                                    (5 * i + static_cast<std::size_t>(iterations) - 1) * K);
                        EXPECT_TRUE(std::equal(at, at + static_cast<std::ptrdiff_t>(K),
                                               expected.bits.begin() + static_cast<std::ptrdiff_t>(i * K)))
                            << implementation << ", K " << K << ", block " << i << ", after " << iterations;
                    }
                }
            }
        }
    }
}

TEST(ArrayCall, ASizeThatIsRefusedFailsBlockByBlock) {
    std::mt19937 random = seededRandom();
    Batch batch = randomBatch(random, 41, 3, 2, -128, 127);
    const State one = makeState();
    const State other = makeState();
    const Seen expected = byBatch(one.get(), batch, 2);
    const Seen seen = byArray<std::int16_t>(other.get(), batch, forms[1], false);
    EXPECT_EQ(seen.status, 2);
    EXPECT_TRUE(seen == expected);
    batch.iterations = 16;
    EXPECT_EQ(byArray<std::int16_t>(other.get(), batch, forms[0], false).output.err,
              "ERROR:decoder:Number of iterations must be in the range 1 to 15\n"
              "ERROR:decoder:Number of iterations must be in the range 1 to 15\n"
              "ERROR:decoder:Number of iterations must be in the range 1 to 15\n");
}

TEST(ArrayCall, WrongArgumentsAreRefusedInTheirOrder) {
    const State state = makeState();
    std::vector<std::int8_t> values(3 * 44, -8);
    std::vector<unsigned char> bits(40, 0xEE);
    vardel_ip_quarzel_array_inputs inputs{values.data(), values.data(), values.data(), 0, 1, 3, 44, -1, 2,
                                          nullptr};
    vardel_ip_quarzel_array_outputs outputs{bits.data(), 40, 0, nullptr};
    const auto textOf = [&](vardel_ip_quarzel_state* s, const vardel_ip_quarzel_array_outputs* out,
                            const vardel_ip_quarzel_array_inputs* in) {
        return capture([&] { EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate_array(s, out, in, nullptr), 1); })
            .err;
    };
    EXPECT_EQ(textOf(nullptr, nullptr, nullptr),
              "ERROR:decoder:Simulate array called with null state structure\n");
    EXPECT_EQ(textOf(state.get(), nullptr, nullptr),
              "ERROR:decoder:Simulate array called with null output structure\n");
    EXPECT_EQ(textOf(state.get(), &outputs, nullptr),
              "ERROR:decoder:Simulate array called with null input structure\n");
    EXPECT_EQ(textOf(state.get(), &outputs, &inputs),
              "ERROR:decoder:value_type must be VARDEL_IP_QUARZEL_INT8, VARDEL_IP_QUARZEL_INT16 or "
              "VARDEL_IP_QUARZEL_INT32\n");
    inputs.value_type = VARDEL_IP_QUARZEL_INT8;
    EXPECT_EQ(textOf(state.get(), &outputs, &inputs), "ERROR:decoder:count must not be negative\n");
    inputs.count = 0;
    EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate_array(state.get(), &outputs, &inputs, nullptr), 0);
    inputs.count = 1;
    inputs.rsc1_par = nullptr;
    EXPECT_EQ(textOf(state.get(), &outputs, &inputs), "ERROR:decoder:rsc1_par must not be a null pointer\n");
    outputs.dout = nullptr;
    EXPECT_EQ(textOf(state.get(), &outputs, &inputs),
              "ERROR:decoder:Simulate called with null pointer for dout\n");
    EXPECT_EQ(bits, std::vector<unsigned char>(40, 0xEE));
}

}  // namespace
}  // namespace quarzel::test
