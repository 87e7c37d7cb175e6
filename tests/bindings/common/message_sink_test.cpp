// SPDX-License-Identifier: MIT
#include "common/message_sink.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <iostream>
#include <new>
#include <string>
#include <thread>

#include "common/outcome.hpp"
#include "fixed/text_output.hpp"
#include "support/capture.hpp"

namespace {

using namespace quarzel::bindings;
using testing::ElementsAre;

TEST(MessageSink, KeepsWhatIsSaidOnItsThreadAlone) {
    Messages messages;
    const auto printed = quarzel::test::capture([&] {
        const MessageSink sink(messages);
        quarzel::outputLine("WARNING:decoder:here: and so on");
        quarzel::errorLine("ERROR:decoder:wrong");
        quarzel::writeText(std::cout, "trace");
        std::thread([] { quarzel::outputLine("WARNING:decoder:elsewhere"); }).join();
    });
    EXPECT_THAT(messages.warnings, ElementsAre("here: and so on"));
    EXPECT_THAT(messages.errors, ElementsAre("wrong"));
    EXPECT_EQ(messages.trace, "trace");
    EXPECT_EQ(printed.out, "WARNING:decoder:elsewhere\n");
}

TEST(MessageSink, GivesWayToTheOneAroundIt) {
    Messages outer;
    const MessageSink outerSink(outer);
    {
        Messages inner;
        const MessageSink innerSink(inner);
        quarzel::outputLine("WARNING:decoder:inner");
        EXPECT_THAT(inner.warnings, ElementsAre("inner"));
    }
    quarzel::outputLine("WARNING:decoder:outer");
    EXPECT_THAT(outer.warnings, ElementsAre("outer"));
}

TEST(Guarded, LetsNothingThrough) {
    EXPECT_EQ(guarded([](const Messages&) { throw std::bad_alloc(); }).fault, Fault::memory);
    EXPECT_EQ(guarded([](const Messages&) { throw 1; }).fault, Fault::model);
    const Outcome outcome = guarded([](const Messages&) { throw std::runtime_error("odd"); });
    EXPECT_EQ(outcome.fault, Fault::model);
    EXPECT_STREQ(outcome.message(), "odd");
    EXPECT_EQ(guarded([](Messages& messages) { messages.incomplete = true; }).fault, Fault::memory);
}

}  // namespace
