// SPDX-License-Identifier: MIT
#include "sweeps/interruption.hpp"

#include <gtest/gtest.h>

#include <chrono>
#include <csignal>
#include <thread>

namespace quarzel::test {

TEST(Interruption, NotesASignalThatComesTwiceInARow) {
    const tool::Interruption interruption;
    EXPECT_FALSE(interruption.hasCome());
    std::raise(SIGTERM);
    EXPECT_TRUE(interruption.hasCome());
    std::raise(SIGTERM);
    std::raise(SIGINT);
}

TEST(InterruptionDeathTest, LetsALaterSignalEndTheProcess) {
    const auto waitWithLaterSignal = [] {
        const tool::Interruption interruption;
        std::raise(SIGINT);
        std::this_thread::sleep_for(std::chrono::milliseconds(1100));
        std::raise(SIGTERM);
    };
    EXPECT_EXIT(waitWithLaterSignal(), testing::KilledBySignal(SIGTERM), "");
}

}  // namespace quarzel::test
