// SPDX-License-Identifier: MIT
// The library as a program without simulator loads it, and four-valued soft values, which no simulator here
// has.
#include <dlfcn.h>
#include <gtest/gtest.h>
#include <svdpi.h>
#include <unistd.h>

#include <array>
#include <cstdio>
#include <cstdlib>
#include <random>
#include <string>
#include <vector>

namespace {

constexpr int K = 40;
constexpr std::size_t positions = K + 4;
using Logic = std::array<svLogicVecVal, 6148>;
using Bits = std::array<svBit, 6144>;

/// The value of one bit of four-valued logic.
enum class Value { zero, one, z, x };

void setBit(svLogicVecVal& word, int bit, Value value) {
    const unsigned mask = 1U << bit;
    const auto code = static_cast<unsigned>(value);
    word.aval = (word.aval & ~mask) | ((code & 1) != 0 ? mask : 0);
    word.bval = (word.bval & ~mask) | ((code & 2) != 0 ? mask : 0);
}

class DpiLibrary : public testing::Test {
  protected:
    void SetUp() override {
        itsLibrary = dlopen(QUARZEL_DPI_LIBRARY, RTLD_NOW | RTLD_LOCAL);
        ASSERT_NE(itsLibrary, nullptr) << dlerror();
        itsHandle = function<void*(int, int, int)>("quarzel_dpi_open")(2, 1, 8);
        ASSERT_EQ(error(), "");
        itsRandom.seed(seed);
        SCOPED_TRACE(seed);
        for (Logic& stream : itsLogic) {
            stream.fill({0, 0});
            for (std::size_t i = 0; i < positions; ++i) {
                stream.at(i).aval =
                    static_cast<unsigned>(std::uniform_int_distribution<>(-128, 127)(itsRandom));
            }
        }
    }

    void TearDown() override {
        function<int(void*)>("quarzel_dpi_close")(itsHandle);
        dlclose(itsLibrary);
    }

    template <class Signature>
    Signature* function(const char* name) {
        return reinterpret_cast<Signature*>(dlsym(itsLibrary, name));
    }

    std::string error() { return function<const char*(void*)>("quarzel_dpi_error")(itsHandle); }

    int decodeLogic(int size = K + 4) {
        const auto decode =
            function<int(void*, int, const svLogicVecVal*, const svLogicVecVal*, const svLogicVecVal*, int,
                         unsigned, svBit*)>("quarzel_dpi_decode_logic");
        return decode(itsHandle, size, itsLogic[0].data(), itsLogic[1].data(), itsLogic[2].data(), 6, 0,
                      itsLogicBits.data());
    }

    static constexpr unsigned seed = 20260;
    std::mt19937 itsRandom;
    void* itsLibrary = nullptr;
    void* itsHandle = nullptr;
    std::array<Logic, 3> itsLogic = {};
    Bits itsLogicBits = {};
};

TEST_F(DpiLibrary, DecodesFourValuedSoftValuesAsBytes) {
    std::array<std::array<char, 6148>, 3> bytes = {};
    for (std::size_t stream = 0; stream < 3; ++stream) {
        for (std::size_t i = 0; i < positions; ++i) {
            bytes.at(stream).at(i) = static_cast<char>(itsLogic.at(stream).at(i).aval);
        }
    }
    Bits bits = {};
    const auto decode =
        function<int(void*, int, const char*, const char*, const char*, int, unsigned, svBit*)>(
            "quarzel_dpi_decode_fixed");
    ASSERT_EQ(decode(itsHandle, K + 4, bytes[0].data(), bytes[1].data(), bytes[2].data(), 6, 0, bits.data()),
              K);
    ASSERT_EQ(decodeLogic(), K);
    EXPECT_EQ(itsLogicBits, bits);
}

TEST_F(DpiLibrary, NamesTheFirstUnknownBitOfEachStream) {
    const std::array names = {"systematic", "parity1", "parity2"};
    for (std::size_t stream = 0; stream < 3; ++stream) {
        for (const std::size_t position : {std::size_t{0}, std::size_t{17}, positions - 1}) {
            svLogicVecVal& word = itsLogic.at(stream).at(position);
            const svLogicVecVal known = word;
            word = {0x25, 0};
            setBit(word, 3, Value::x);
            EXPECT_EQ(decodeLogic(), -1);
            EXPECT_EQ(error(), std::string(names.at(stream)) + " is 0010x101 in position " +
                                   std::to_string(position) + "; drive every bit with 0 or 1");
            setBit(word, 3, Value::z);
            EXPECT_EQ(decodeLogic(), -1);
            EXPECT_EQ(error(), std::string(names.at(stream)) + " is 0010z101 in position " +
                                   std::to_string(position) + "; drive every bit with 0 or 1");
            word = known;
        }
    }
    EXPECT_EQ(decodeLogic(), K);
    EXPECT_EQ(error(), "");
}

TEST_F(DpiLibrary, ShowsAsManyBitsOfAnUnknownValueAsItHas) {
    itsLogic[0][5] = {~0U, ~0U};  // x in every bit
    EXPECT_EQ(decodeLogic(), -1);
    EXPECT_EQ(error(), "systematic is xxxxxxxx in position 5; drive every bit with 0 or 1");
    itsLogic[0][5] = {0, ~0U};
    EXPECT_EQ(decodeLogic(), -1);
    EXPECT_EQ(error(), "systematic is zzzzzzzz in position 5; drive every bit with 0 or 1");
    itsLogic[0][5] = {0x100, 0};
    setBit(itsLogic[0][5], 9, Value::x);
    EXPECT_EQ(decodeLogic(), -1);
    EXPECT_EQ(error(), "systematic is 0x100000000 in position 5; drive every bit with 0 or 1");
}

TEST_F(DpiLibrary, LooksAtThePositionsOfTheBlockAlone) {
    itsLogic[1][positions] = {0, ~0U};
    EXPECT_EQ(decodeLogic(), K);
}

TEST_F(DpiLibrary, RefusesSizesBeforeItReads) {
    const std::string text =
        "there is no block size for streams of 6149 soft values; the nearest that have one: 6148 (K = 6144)";
    EXPECT_EQ(decodeLogic(6149), -1);
    EXPECT_EQ(error(), text);
    EXPECT_EQ(decodeLogic(-1), -1);
}

TEST_F(DpiLibrary, RefusesOpenArraysWhereThereAreNone) {
    const auto decode =
        function<int(void*, void*, void*, void*, int, unsigned, void*)>("quarzel_dpi_decode_open");
    EXPECT_EQ(decode(itsHandle, nullptr, nullptr, nullptr, 6, 0, nullptr), -1);
    EXPECT_EQ(error(), "this program has no open arrays; use arrays of a fixed size");
}

TEST_F(DpiLibrary, RefusesAHandleThatItHasNotGiven) {
    void* const stranger = reinterpret_cast<void*>(1);
    EXPECT_EQ(function<int(void*)>("quarzel_dpi_close")(stranger), -1);
    EXPECT_STREQ(
        function<const char*(void*)>("quarzel_dpi_error")(stranger),
        "the decoder has been closed, or made in another process before a checkpoint; make a new one");
}

/// Each allocation of a block that is pushed, decoded and traced fails, by itself and with all that follow
/// it: the call that misses it says so, and a block that is pushed anew is decoded, and traced when that was
/// asked for before.
TEST_F(DpiLibrary, TellsOfEachAllocationThatFailsAndGoesOn) {
    const auto push = function<void(void*, int, int, int)>("quarzel_dpi_push");
    const auto run = function<int(void*, int, unsigned)>("quarzel_dpi_run");
    const auto traceNext = function<int(void*, int, const char*)>("quarzel_dpi_trace_next");
    const std::string trace = testing::TempDir() + "dpi_trace_" + std::to_string(getpid());
    const std::string mark = trace + ".failed";
    const std::string lack = "there is not enough memory; decode fewer blocks in one call";
    setenv("QUARZEL_FAILED", mark.c_str(), 1);
    setenv("QUARZEL_FAILING_IN", "quarzel_dpi", 1);
    const auto decode = [&] {
        bool isPushed = true;
        for (std::size_t i = 0; i < positions; ++i) {
            const auto value = [&](std::size_t stream) {
                return static_cast<int>(static_cast<signed char>(itsLogic.at(stream).at(i).aval));
            };
            push(itsHandle, value(0), value(1), value(2));
            isPushed = isPushed && error().empty();
        }
        const int result = run(itsHandle, 6, 0);
        EXPECT_EQ(result == K, error().empty());
        EXPECT_TRUE(result == K || !isPushed || error() == lack) << error();
        return result == K;
    };
    ASSERT_EQ(decodeLogic(), K);
    const auto expectDecisions = [&] {
        for (std::size_t i = 0; i < K; ++i) {
            ASSERT_EQ(function<int(void*)>("quarzel_dpi_pop")(itsHandle), itsLogicBits.at(i)) << i;
        }
    };
    int failures = 0;
    for (const std::string more : {"", "+"}) {
        for (int number = 1;; ++number) {
            SCOPED_TRACE(std::to_string(number) + more);
            ASSERT_EQ(traceNext(itsHandle, 2, trace.c_str()), 0);
            setenv("QUARZEL_FAILING", ("malloc " + std::to_string(number) + more).c_str(), 1);
            const bool isDecoded = decode();
            unsetenv("QUARZEL_FAILING");
            const bool failed = std::remove(mark.c_str()) == 0;
            failures += failed ? 1 : 0;
            if (!isDecoded) {
                EXPECT_NE(std::remove(trace.c_str()), 0);
                ASSERT_TRUE(decode());
            }
            expectDecisions();
            EXPECT_EQ(std::remove(trace.c_str()), 0);
            if (!failed || HasFailure()) {
                break;
            }
        }
    }
    EXPECT_GT(failures, 20);
    unsetenv("QUARZEL_FAILING_IN");
}

}  // namespace
