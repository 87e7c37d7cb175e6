// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <iterator>
#include <string>

#include "support/capture.hpp"
#include "support/count_allocations.hpp"
#include "support/model.hpp"

namespace {
bool refuseMemory = false;
}

/// The linker puts this in place of malloc.
extern "C" void* __real_malloc(std::size_t size);
extern "C" void* __wrap_malloc(std::size_t size) {
    return refuseMemory ? nullptr : __real_malloc(size);
}

namespace quarzel::test {
namespace {

std::size_t allocationsOf(vardel_ip_quarzel_state* state, std::size_t K) {
    std::vector<unsigned char> bits(K);
    vardel_ip_quarzel_outputs outputs{bits.data(), static_cast<int>(K), 0, 0};
    const Block block(K + 4);
    const std::size_t before = allocationCount();
    EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate(state, &outputs, block.inputs()), 0);
    return allocationCount() - before;
}

constexpr std::size_t sizes[] = {6144, 40, 6144, 6080, 512, 1056, 1056, 2112, 40, 5056};

TEST(Allocation, NoneForABlockOfASizeThatWasSeen) {
    for (const int algorithm : {0, 1, 2}) {
        const State state = makeState(genericsOf(8, 8, algorithm));
        EXPECT_GT(allocationsOf(state.get(), 6144), 0U);
        for (const std::size_t K : sizes) {
            allocationsOf(state.get(), K);
        }
        for (const std::size_t K : sizes) {
            EXPECT_EQ(allocationsOf(state.get(), K), 0U) << K;
        }
    }
}

TEST(Allocation, LiteralDecodesTakeTheTwoVectorsOfTheCallOnceTheLargestSizeWasSeen) {
    for (const int algorithm : {0, 1, 2}) {
        const State state = makeState(genericsOf(8, 8, algorithm));
        vardel_ip_quarzel_set_implementation(state.get(), "literal");
        EXPECT_GT(allocationsOf(state.get(), 6144), 2U);
        for (const std::size_t K : sizes) {
            EXPECT_LE(allocationsOf(state.get(), K), 2U) << K;
        }
    }
}

TEST(Allocation, ErrorLinesAreWrittenWhereThereIsNoMemoryAtAll) {
    const State state = makeState();
    const Block block(6144 + 4);
    std::vector<unsigned char> bits(6144);
    vardel_ip_quarzel_outputs outputs{bits.data(), 6144, 0, 0};
    int status = 0;
    vardel_ip_quarzel_state* none = state.get();
    const Output output = capture([&] {
        failAllocationsAfter(0);
        status = vardel_ip_quarzel_bitacc_simulate(state.get(), &outputs, block.inputs());
        none = vardel_ip_quarzel_create_state(defaultGenerics());
        allowAllocations();
    });
    EXPECT_EQ(status, 99);
    EXPECT_EQ(none, nullptr);
    EXPECT_EQ(output.err,
              "ERROR:decoder:Unhandled exception has occurred\n"
              "ERROR:decoder:Unhandled exception has occurred\n");
}

TEST(Allocation, OfALineForWhichThereIsNoMemoryWhatFitsIsWritten) {
    const State state = makeState();
    const std::string name(600, 'x');
    const Output output = capture([&] {
        failAllocationsAfter(0);
        vardel_ip_quarzel_set_implementation(state.get(), name.c_str());
        allowAllocations();
    });
    EXPECT_EQ(output.err, ("ERROR:decoder:There is no implementation '" + name).substr(0, 511) + "\n");
}

TEST(Allocation, AStateWithoutMemoryForItsRecordIsALine) {
    vardel_ip_quarzel_state* state = nullptr;
    vardel_ip_quarzel_state* unfilled = nullptr;
    const Output output = capture([&] {
        refuseMemory = true;
        state = vardel_ip_quarzel_create_state(defaultGenerics());
        unfilled = create_default_state(defaultGenerics());
        refuseMemory = false;
    });
    EXPECT_EQ(state, nullptr);
    EXPECT_EQ(unfilled, nullptr);
    EXPECT_EQ(output.err,
              "ERROR:decoder:Could not allocate memory for decoder state\n"
              "ERROR:decoder:Could not allocate memory for decoder state\n");
}

TEST(Allocation, WithoutMemoryForStatusesNoBlockIsDecoded) {
    const State state = makeState();
    const Block block(44);
    const vardel_ip_quarzel_inputs inputs = block.inputs();
    std::vector<unsigned char> bits(40, 7);
    vardel_ip_quarzel_outputs outputs{bits.data(), 40, 0, 0};
    int status = 0;
    const Output output = capture([&] {
        failAllocationsAfter(0);
        status = vardel_ip_quarzel_bitacc_simulate_batch(state.get(), &outputs, &inputs, 1, nullptr);
        allowAllocations();
    });
    EXPECT_EQ(status, 99);
    EXPECT_EQ(output.err, "ERROR:decoder:Unhandled exception has occurred\n");
    EXPECT_EQ(bits, std::vector<unsigned char>(40, 7));
}

TEST(Allocation, WithoutMemoryTheTablesOfTheCodeAreRefused) {
    unsigned permutation[40];
    unsigned char corrections[2];
    failAllocationsAfter(0);
    const int noPermutation = vardel_ip_quarzel_get_permutation(40, permutation);
    const int noCorrections = vardel_ip_quarzel_get_corrections(corrections);
    allowAllocations();
    EXPECT_EQ(noPermutation, 1);
    EXPECT_EQ(noCorrections, 1);
}

/// Let memory run out after every number of allocations of a call, until it has enough: each time the call
/// gives the warning of the block's first value, and the one after it none.
void expectToldOnce(const char* implementation, const std::function<int(vardel_ip_quarzel_state*)>& call) {
    int failures = 0;
    for (bool enough = false; !enough; ++failures) {
        const State state = makeState();
        if (implementation != nullptr) {
            vardel_ip_quarzel_set_implementation(state.get(), implementation);
        }
        const std::size_t failed = failedAllocations();
        const Output output = capture([&] {
            failAllocationsAfter(static_cast<std::size_t>(failures));
            call(state.get());
            allowAllocations();
        });
        enough = failedAllocations() == failed;
        ASSERT_EQ(output.out,
                  "WARNING:decoder:RSC1 systematic value in position 0 saturated positively, further "
                  "saturation will not be reported\n")
            << "after " << failures << " allocations";
        EXPECT_EQ(capture([&] { EXPECT_EQ(call(state.get()), 0); }).out, "");
        ASSERT_LT(failures, 1000);
    }
    EXPECT_GT(failures, 3);
}

TEST(Allocation, ASaturatedValueIsToldOnceWhereverMemoryRunsOut) {
    const Block saturated(40 + 4, 500);
    const Block good(1024 + 4, 5);
    std::vector<unsigned char> bits(1024);
    vardel_ip_quarzel_outputs outputs[3];
    std::fill(std::begin(outputs), std::end(outputs), vardel_ip_quarzel_outputs{bits.data(), 1024, 0, 0});
    vardel_ip_quarzel_inputs inputs[] = {saturated.inputs(), saturated.inputs(), good.inputs()};
    inputs[0].iterations = 0;
    int statuses[3];
    for (const char* implementation : {static_cast<const char*>(nullptr), "literal"}) {
        expectToldOnce(implementation, [&](vardel_ip_quarzel_state* state) {
            return vardel_ip_quarzel_bitacc_simulate(state, outputs, saturated.inputs());
        });
        // The block that fails need not be the one with the value. One is refused at any rate.
        expectToldOnce(implementation, [&](vardel_ip_quarzel_state* state) {
            EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate_batch(state, outputs, inputs, 3, statuses), 1);
            return std::max(statuses[1], statuses[2]);
        });
    }
}

TEST(Allocation, ATraceAskedForBeforeMemoryRanOutIsWrittenAfterIt) {
    std::vector<unsigned char> bits(6144);
    vardel_ip_quarzel_outputs outputs{bits.data(), 6144, 0, 0};
    const Block large(1024 + 4, 20);
    const Block small(44, 5);
    const auto traceOf = [&](std::size_t allowed, int& status) {
        const State state = makeState();
        vardel_ip_quarzel_bitacc_simulate(state.get(), &outputs, large.inputs());
        vardel_ip_quarzel_bitacc_dump_config(state.get(), 3);
        capture([&] {
            failAllocationsAfter(allowed);
            status = vardel_ip_quarzel_bitacc_simulate(state.get(), &outputs, small.inputs());
            allowAllocations();
        });
        // A decode that failed may have written passes of its trace before: count on from a fresh request.
        vardel_ip_quarzel_bitacc_dump_config(state.get(), 2);
        return capture([&] { vardel_ip_quarzel_bitacc_simulate(state.get(), &outputs, small.inputs()); }).out;
    };
    int status = -1;
    const std::string undisturbed = traceOf(SIZE_MAX / 2, status);
    ASSERT_EQ(status, 0);
    int failures = 0;
    for (std::size_t allowed = 0; status != 0 || allowed == 0; ++allowed) {
        std::string trace = traceOf(allowed, status);
        // A block that failed is not counted.
        const std::size_t at = trace.find("decode=1");
        if (status != 0) {
            ++failures;
            ASSERT_NE(at, std::string::npos) << allowed;
            while (trace.find("decode=1") != std::string::npos) {
                trace.replace(trace.find("decode=1"), 8, "decode=2");
            }
        }
        ASSERT_EQ(trace, undisturbed) << allowed;
        ASSERT_LT(allowed, 2000U);
    }
    EXPECT_GT(failures, 10);
}

}  // namespace
}  // namespace quarzel::test
