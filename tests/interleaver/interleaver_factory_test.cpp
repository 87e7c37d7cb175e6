// SPDX-License-Identifier: MIT
// How an interleaver is created from its property string.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "interleaver/interleaver.hpp"
#include "interleaver/interleaver_3gpplte.hpp"
#include "support/capture.hpp"

namespace quarzel::test {
namespace {

using testing::IsEmpty;

TEST(InterleaverFactory, MakesAnInterleaverWithEmptyTables) {
    for (const std::string properties : {"3GPPLTE", "3GPPLTE:"}) {
        std::unique_ptr<TInterleaver> interleaver;
        const Output output = capture([&] { interleaver.reset(TInterleaver::create(properties)); });
        EXPECT_EQ(output.out + output.err, "") << properties;
        ASSERT_NE(interleaver, nullptr) << properties;
        EXPECT_NE(dynamic_cast<TInterleaver3GPPLTE*>(interleaver.get()), nullptr);
        EXPECT_EQ(interleaver->getProperties(), "3GPPLTE");
        EXPECT_THAT(interleaver->itsPermutation, IsEmpty());
        EXPECT_THAT(interleaver->itsInversePermutation, IsEmpty());
    }
}

TEST(InterleaverFactory, RefusesParametersAndShowsThem) {
    for (const std::string rest : {"x", " ", ":", "40", "a:b", "3GPPLTE"}) {
        TInterleaver* interleaver = nullptr;
        const Output output = capture([&] { interleaver = TInterleaver::create("3GPPLTE:" + rest); });
        EXPECT_EQ(interleaver, nullptr) << rest;
        EXPECT_EQ(output.out, "") << rest;
        EXPECT_EQ(output.err, "ERROR:TInterleaver3GPPLTE:Unexpected properties:" + rest + "\n");
    }
}

TEST(InterleaverFactory, ShowsTheUnknownTypeAndNotItsParameters) {
    TInterleaver* interleaver = nullptr;
    Output output = capture([&] { interleaver = TInterleaver::create("LTE"); });
    EXPECT_EQ(interleaver, nullptr);
    EXPECT_EQ(output.out, "");
    EXPECT_EQ(output.err, "ERROR:TInterleaver:Unrecognised type:LTE\n");

    output = capture([&] { interleaver = TInterleaver::create("3gpplte:x"); });
    EXPECT_EQ(interleaver, nullptr);
    EXPECT_EQ(output.out, "");
    EXPECT_EQ(output.err, "ERROR:TInterleaver:Unrecognised type:3gpplte\n");
}

TEST(LteInterleaverFactory, TakesWhatFollowsTheTypeName) {
    const std::unique_ptr<TInterleaver> interleaver(TInterleaver3GPPLTE::create(""));
    ASSERT_NE(interleaver, nullptr);
    EXPECT_EQ(interleaver->getProperties(), "3GPPLTE");

    TInterleaver* refused = nullptr;
    const Output output = capture([&] { refused = TInterleaver3GPPLTE::create("3GPPLTE"); });
    EXPECT_EQ(refused, nullptr);
    EXPECT_EQ(output.out, "");
    EXPECT_EQ(output.err, "ERROR:TInterleaver3GPPLTE:Unexpected properties:3GPPLTE\n");
}

}  // namespace
}  // namespace quarzel::test
