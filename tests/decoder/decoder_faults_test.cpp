// SPDX-License-Identifier: MIT
// Decoders that are wired in unusual ways, or that run out of memory, stay good.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <new>
#include <sstream>

#include "decoder/decoder_3gpu.hpp"
#include "engine/engine_mod.hpp"
#include "support/capture.hpp"
#include "support/count_allocations.hpp"
#include "support/decoder_setup.hpp"

namespace quarzel::test {
namespace {

/// An interleaver whose tables are longer than the blocks they serve, or shorter.
struct OddInterleaver : TInterleaver {
    std::int64_t surplus;  ///< negative: how many are missing

    explicit OddInterleaver(std::int64_t entries) : surplus(entries) {}

    bool calcInterleaver(std::vector<std::uint32_t>& out, unsigned K) const override {
        out.clear();
        for (std::uint32_t i = 0; i < K + surplus; ++i) {
            out.push_back(i < K ? K - 1 - i : 1000000);
        }
        return true;
    }
    std::string getProperties() const override { return "ODD"; }
};

TEST(DecoderFaults, ExtractionReadsAsManyEntriesOfAPermutationAsTheBlockHasBits) {
    OpenDecoder<TDecoder3G> decoder("MOD", false);
    OddInterleaver odd(5);
    decoder.connect(&odd, decoder.engine.engine.get());
    const std::vector<short> soft = randomSoft(3 * 44, 1);
    ASSERT_TRUE(decoder.extract(soft));
    ASSERT_EQ(decoder.itsSys[1].size(), 43U);
    for (std::size_t i = 0; i < 40; ++i) {
        EXPECT_EQ(decoder.itsSys[1][i], soft[3 * (39 - i)]);
    }
}

TEST(DecoderFaults, APermutationThatIsTooShortIsRefused) {
    OpenDecoder<TDecoder3G> decoder("MOD", false);
    OddInterleaver odd(-1);
    decoder.connect(&odd, decoder.engine.engine.get());
    const Output output = capture([&] { EXPECT_FALSE(decoder.extract(randomSoft(3 * 44, 1))); });
    EXPECT_EQ(output.err, "ERROR:TDecoder3G:The interleaver has no block size of 40 bits\n");
}

TEST(DecoderFaults, ABlockWithoutBitsReadsNothingOfTheTableOfAnother) {
    OpenDecoder<TDecoder3G> decoder("MOD", false);
    ASSERT_TRUE(decoder.extract(randomSoft(3 * 44, 1)));
    ASSERT_TRUE(decoder.extract(randomSoft(12, 2)));
    EXPECT_EQ(decoder.itsSys[1].size(), 3U);
}

TEST(DecoderFaults, ADecoderThatIsNotConnectedHasNothingToDump) {
    TDecoder3GPU decoder(false, 2, 4);
    decoder.allocate(43);
    std::ostringstream stream;
    decoder.dumpFull(stream, 0);
    TCalculationEngineMod withoutFormats;
    decoder.connect(nullptr, &withoutFormats);
    decoder.dumpFull(stream, 0);
    EXPECT_EQ(stream.str(), "");
    decoder.setDump(1);
    const Output output = capture([&] { EXPECT_TRUE(decoder.checkDump(0)); });
    EXPECT_EQ(output.out, "");
    EXPECT_EQ(decoder.dumpCount(), 0U);
}

TEST(DecoderFaults, AfterRunningOutOfMemoryTheAccessorsShowNothing) {
    OpenDecoder<TDecoder3GPU> decoder("MOD", false, 2U, 4U);
    ASSERT_TRUE(decoder.allocate(43));
    for (std::size_t allowed = 0; allowed < 4; ++allowed) {
        failAllocationsAfter(allowed);
        EXPECT_THROW(decoder.allocate(static_cast<unsigned>(6147 * (allowed + 1))), std::bad_alloc);
        allowAllocations();
        EXPECT_EQ(decoder.alpha().size(), 0U) << allowed;
        EXPECT_EQ(decoder.beta().size(), 0U);
        EXPECT_EQ(decoder.gamma().size(), 0U);
        std::ostringstream stream;
        decoder.dumpFull(stream, 0);
    }
    ASSERT_TRUE(decoder.allocate(43));
    EXPECT_EQ(decoder.alpha().size(), 43U);
    EXPECT_EQ(decoder.alpha()[42][7], 0);
}

TEST(DecoderFaults, ADumpToAStreamWithoutRoomLeavesItBad) {
    OpenDecoder<TDecoder3GPU> decoder("MOD", false, 2U, 4U);
    ASSERT_TRUE(decoder.extract(randomSoft(3 * 44, 1)));
    struct Full : std::streambuf {
        std::streamsize room = 300;
        std::streamsize xsputn(const char*, std::streamsize size) override {
            const std::streamsize taken = std::min(size, room);
            room -= taken;
            return taken;
        }
    } full;
    std::ostream stream(&full);
    decoder.dumpFull(stream, 0);
    EXPECT_TRUE(stream.bad());
    std::ostream other(&full);
    decoder.dumpInput(other);
    EXPECT_TRUE(other.bad());
    std::ostringstream failed;
    failed.setstate(std::ios::failbit);
    decoder.dumpFull(failed, 0);
    EXPECT_EQ(failed.str(), "");
}

/// A derived class reaches all that it needs to replace a recursion.
struct Derived : TDecoder3GPU {
    Derived() : TDecoder3GPU(false, 4, 4) {}

    bool calcAlpha(unsigned siso) override {
        ++calls;
        preCalcAlpha(siso, itsAlphaSegment[0].from, &itsAlphaInit[0][0]);
        preCalcBeta(siso, itsBetaSegment[0].from, &itsBetaInit[0][0]);
        preCalcBetaTail(siso, &itsBetaInit[0].back());
        for (const ABSegment& segment : itsAlphaSegment) {
            TDecoder3G::calcGamma(siso, segment.from, segment.to - 1);
            TDecoder3G::calcAlpha(siso, segment.from, segment.to);
        }
        return TDecoder3GPU::calcAlpha(siso);
    }

    int calls = 0;
};

TEST(DecoderFaults, ADerivedClassReachesSegmentsAndRangeForms) {
    Derived decoder;
    OpenDecoder<TDecoder3GPU> parts("MOD", false, 2U, 4U);
    decoder.connect(parts.interleaver.get(), parts.engine.engine.get());
    std::vector<unsigned char> hard;
    EXPECT_TRUE(decoder.decode(randomSoft(3 * 516, 3), hard, 2));
    EXPECT_EQ(decoder.calls, 4);
}

/// An engine whose recursions give up.
struct WeakEngine : TCalculationEngineMod {
    int forward = 0;   ///< how many it runs forward
    int backward = 0;  ///< how many it runs backward

    T8* alpha(unsigned n, const T8* gamma, T8* alpha) override {
        return forward-- > 0 ? TCalculationEngineMod::alpha(n, gamma, alpha) : nullptr;
    }
    T8* beta(unsigned n, const T8* gamma, T8* beta) override {
        return backward-- > 0 ? TCalculationEngineMod::beta(n, gamma, beta) : nullptr;
    }
};

TEST(DecoderFaults, ASegmentThatFailsEndsTheDecode) {
    // Four segments of two windows each.
    for (const auto& [forward, backward] : {std::pair{2, 9}, std::pair{4, 3}}) {
        OpenDecoder<TDecoder3GPU> decoder("MOD", false, 1U, 4U);
        WeakEngine weak;
        weak.setFormats(decoder.engine.branch.get(), decoder.engine.state.get(), decoder.engine.branch.get());
        ASSERT_TRUE(weak.initialise());
        weak.forward = forward;
        weak.backward = backward;
        decoder.connect(decoder.interleaver.get(), &weak);
        std::vector<unsigned char> hard = {7};
        EXPECT_FALSE(decoder.decode(randomSoft(3 * 516, 3), hard, 1));
        EXPECT_EQ(hard, std::vector<unsigned char>{7});
        EXPECT_EQ(std::min(weak.forward, weak.backward), -1);
    }
}

TEST(DecoderFaults, SettingsCanBeRead) {
    TDecoder3GPU decoder(false, 2, 4);
    decoder.setDump(3, true);
    decoder.setVerbosity(2);
    decoder.setExtrinsicIn({1, 2});
    decoder.setCounts(5, 6);
    EXPECT_EQ(decoder.dumpCount(), 3U);
    EXPECT_TRUE(decoder.dumpStop());
    EXPECT_EQ(decoder.verbosity(), 2U);
    EXPECT_EQ(decoder.extrinsicIn(), (std::vector<short>{1, 2}));
    EXPECT_EQ(decoder.decodeCount(), 5U);
    EXPECT_EQ(decoder.sisoCount(), 6U);
    EXPECT_EQ(decoder.interleaver(), nullptr);
    EXPECT_EQ(decoder.engine(), nullptr);
}

}  // namespace
}  // namespace quarzel::test
