// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <cstring>
#include <functional>
#include <type_traits>

#include "decoder/decoder.hpp"
#include "engine/engine.hpp"
#include "fixed/number_format.hpp"
#include "interface/state.hpp"
#include "support/capture.hpp"
#include "support/model.hpp"

namespace quarzel::test {
namespace {

TEST(Generics, DefaultsAreThoseOfTheCore) {
    vardel_ip_quarzel_generics generics;
    std::memset(&generics, 0xA5, sizeof generics);
    EXPECT_EQ(vardel_ip_quarzel_get_default_generics(&generics), &generics);
    EXPECT_STREQ(generics.C_PATH, "./");
    EXPECT_STREQ(generics.C_FAMILY, "durnox5");
    EXPECT_STREQ(generics.C_COMPONENT_NAME, "quarzel");
    EXPECT_EQ(generics.C_SPARE_1, 512);
    EXPECT_EQ(generics.C_STATE_INT_WIDTH, 9);
    EXPECT_EQ(generics.C_STATE_FRAC_WIDTH, 3);
    EXPECT_EQ(generics.C_INPUT_INT_WIDTH, 5);
    EXPECT_EQ(generics.C_INPUT_FRAC_WIDTH, 3);
    EXPECT_EQ(generics.C_SPARE_2, 0);
    EXPECT_EQ(generics.C_SPARE_3, 0);
    EXPECT_EQ(generics.C_SPARE_4, 0);
    EXPECT_EQ(generics.C_NUM_PU, 2);
    EXPECT_EQ(generics.C_TAG_WIDTH, 8);
    EXPECT_EQ(generics.C_ALGORITHM_TYPE, 1);
}

TEST(Generics, DefaultsMakeAMaxLogCoreOfTwoUnitsWithScaledExtrinsics) {
    const State state = makeState();
    ASSERT_NE(state, nullptr);
    EXPECT_EQ(state->engine->getProperties(), "MOD");
    EXPECT_EQ(state->decoder->getProperties(), "3GPPPU:2");
    EXPECT_EQ(state->decoder->extrinsicScale(), 0.75);
    EXPECT_EQ(state->state_format->getProperties(), "Fix_12_3");
    EXPECT_EQ(state->branch_format->getProperties(), "Fix_8_3");
    EXPECT_EQ(state->input_format->getProperties(), "Fix_8_3");
    EXPECT_EQ(state->tag_mask, 0xFFU);
    EXPECT_EQ(state->saturation_reported, 0);
    EXPECT_EQ(state->tag_truncation_reported, 0);
}

TEST(Generics, AlgorithmTypeChoosesEngineAndScale) {
    const State maxLog = makeState(genericsOf(4, 8, 0));
    EXPECT_EQ(maxLog->engine->getProperties(), "MOD");
    EXPECT_EQ(maxLog->decoder->extrinsicScale(), 1.0);
    EXPECT_EQ(maxLog->decoder->getProperties(), "3GPPPU:4");
    const State maxStar = makeState(genericsOf(8, 8, 2));
    EXPECT_EQ(maxStar->engine->getProperties(), "MOD#:16");
    EXPECT_EQ(maxStar->decoder->extrinsicScale(), 1.0);
    EXPECT_EQ(maxStar->decoder->getProperties(), "3GPPPU:8");
}

struct BadGeneric {
    const char* name;
    std::function<void(vardel_ip_quarzel_generics&)> change;
    const char* message;
};

/// In the order in which they are tested.
const std::vector<BadGeneric>& badGenerics() {
    using G = vardel_ip_quarzel_generics;
    static const std::vector<BadGeneric> all = {
        {"NumPU", [](G& g) { g.C_NUM_PU = 3; }, "C_NUM_PU must be either 2, 4 or 8"},
        {"TagWidth", [](G& g) { g.C_TAG_WIDTH = -1; }, "C_TAG_WIDTH must be in range 0 to 32"},
        {"AlgorithmType", [](G& g) { g.C_ALGORITHM_TYPE = 3; }, "C_ALGORITHM_TYPE must be in range 0 to 2"},
        {"StateInt", [](G& g) { g.C_STATE_INT_WIDTH = 8; }, "C_STATE_INT_WIDTH must be 9"},
        {"StateFrac", [](G& g) { g.C_STATE_FRAC_WIDTH = 2; }, "C_STATE_FRAC_WIDTH must be 3"},
        {"InputInt", [](G& g) { g.C_INPUT_INT_WIDTH = 4; }, "C_INPUT_INT_WIDTH must be 5"},
        {"InputFrac", [](G& g) { g.C_INPUT_FRAC_WIDTH = 4; }, "C_INPUT_FRAC_WIDTH must be 3"},
    };
    return all;
}

TEST(Generics, EachFaultIsNamedAndTheFirstOneWins) {
    for (std::size_t first = 0; first < badGenerics().size(); ++first) {
        vardel_ip_quarzel_generics alone = defaultGenerics();
        badGenerics()[first].change(alone);
        vardel_ip_quarzel_generics andAllLater = defaultGenerics();
        for (std::size_t i = first; i < badGenerics().size(); ++i) {
            badGenerics()[i].change(andAllLater);
        }
        for (const auto& generics : {alone, andAllLater}) {
            const Output output = capture([&] { EXPECT_EQ(makeState(generics), nullptr); });
            EXPECT_EQ(output.err, "ERROR:decoder:" + std::string(badGenerics()[first].message) + "\n");
            EXPECT_EQ(output.out, "");
        }
    }
}

TEST(Generics, RangesEndWhereTheyShould) {
    const auto accepted = [](int units, int width, int algorithm) {
        bool made = false;
        capture([&] { made = makeState(genericsOf(units, width, algorithm)) != nullptr; });
        return made;
    };
    for (int units = -1; units <= 17; ++units) {
        EXPECT_EQ(accepted(units, 8, 1), units == 2 || units == 4 || units == 8) << units;
    }
    for (const int width : {-2147483647 - 1, -1, 33, 2147483647}) {
        EXPECT_FALSE(accepted(2, width, 1)) << width;
    }
    for (const int algorithm : {-1, 3, 2147483647}) {
        EXPECT_FALSE(accepted(2, 8, algorithm)) << algorithm;
    }
}

TEST(Generics, TagMaskHasTheWidthsBitsAndNoneAt0And32) {
    for (int width = 0; width <= 32; ++width) {
        const State state = makeState(genericsOf(2, width, 1));
        ASSERT_NE(state, nullptr) << width;
        const unsigned expected = width == 32 ? 0U : static_cast<unsigned>((1ULL << width) - 1);
        EXPECT_EQ(state->tag_mask, expected) << width;
    }
}

TEST(Generics, TextsAndSparesMayHoldAnything) {
    vardel_ip_quarzel_generics generics = defaultGenerics();
    generics.C_PATH = generics.C_FAMILY = generics.C_COMPONENT_NAME = nullptr;
    generics.C_SPARE_1 = generics.C_SPARE_2 = generics.C_SPARE_3 = generics.C_SPARE_4 = -123456;
    const State state = makeState(generics);
    ASSERT_NE(state, nullptr);
    EXPECT_EQ(state->generics.C_SPARE_4, -123456);
    EXPECT_EQ(state->generics.C_PATH, nullptr);
}

TEST(State, DestroyingNothingDoesNothing) {
    const Output output = capture([] { vardel_ip_quarzel_destroy_state(nullptr); });
    EXPECT_EQ(output.out + output.err, "");
}

TEST(State, ADefaultStateRefusesToDecodeInEveryForm) {
    const State state(create_default_state(genericsOf(2, 8, 1)));
    const Block block(44);
    std::vector<unsigned char> bits(40);
    vardel_ip_quarzel_outputs outputs{bits.data(), 40, 0, 0};
    const vardel_ip_quarzel_inputs inputs = block.inputs();
    const vardel_ip_quarzel_array_inputs arrayInputs{
        inputs.rsc1_sys, inputs.rsc1_par, inputs.rsc2_par, 44, 1, VARDEL_IP_QUARZEL_INT32, 44, 1, 2, nullptr};
    const vardel_ip_quarzel_array_outputs arrayOutputs{bits.data(), 40, 0, nullptr};
    const Output output = capture([&] {
        vardel_ip_quarzel_bitacc_dump_config(state.get(), 1);
        EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate(state.get(), &outputs, inputs), 99);
        EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate_batch(state.get(), &outputs, &inputs, 1, nullptr), 99);
        EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate_array(state.get(), &arrayOutputs, &arrayInputs, nullptr),
                  99);
    });
    const std::string line = "ERROR:decoder:Unhandled exception has occurred\n";
    EXPECT_EQ(output.err, line + line + line);
    EXPECT_EQ(output.out, "");
}

TEST(State, ADefaultStateHasNoComponentsAndCanBeDestroyed) {
    const State state(create_default_state(genericsOf(99, 32, 99)));
    ASSERT_NE(state, nullptr);
    EXPECT_EQ(state->decoder, nullptr);
    EXPECT_EQ(state->interleaver, nullptr);
    EXPECT_EQ(state->engine, nullptr);
    EXPECT_EQ(state->state_format, nullptr);
    EXPECT_EQ(state->input_format, nullptr);
    EXPECT_EQ(state->branch_format, nullptr);
    EXPECT_EQ(state->generics.C_NUM_PU, 99);
    EXPECT_EQ(state->tag_mask, 0U);
}

TEST(State, RecordIsPlainAndInTheDocumentedOrder) {
    static_assert(std::is_trivially_copyable_v<vardel_ip_quarzel_state>);
    if (sizeof(void*) != 8) {
        GTEST_SKIP() << "the offsets are those of 64-bit processors";
    }
    EXPECT_EQ(offsetof(vardel_ip_quarzel_state, generics), 0U);
    EXPECT_EQ(offsetof(vardel_ip_quarzel_state, decoder), 72U);
    EXPECT_EQ(offsetof(vardel_ip_quarzel_state, interleaver), 80U);
    EXPECT_EQ(offsetof(vardel_ip_quarzel_state, engine), 88U);
    EXPECT_EQ(offsetof(vardel_ip_quarzel_state, state_format), 96U);
    EXPECT_EQ(offsetof(vardel_ip_quarzel_state, input_format), 104U);
    EXPECT_EQ(offsetof(vardel_ip_quarzel_state, branch_format), 112U);
    EXPECT_EQ(offsetof(vardel_ip_quarzel_state, saturation_reported), 120U);
    EXPECT_EQ(offsetof(vardel_ip_quarzel_state, tag_truncation_reported), 121U);
    EXPECT_EQ(offsetof(vardel_ip_quarzel_state, tag_mask), 124U);
}

}  // namespace
}  // namespace quarzel::test
