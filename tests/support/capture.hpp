// SPDX-License-Identifier: MIT
#pragma once

#include <gtest/gtest.h>

#include <string>
#include <utility>

namespace quarzel::test {

/// What a piece of code wrote to the standard streams.
struct Output {
    std::string out;
    std::string err;
};

/// Run `action` and take what it writes to the standard output and error streams.
template <class Action>
Output capture(Action&& action) {
    testing::internal::CaptureStdout();
    testing::internal::CaptureStderr();
    std::forward<Action>(action)();
    Output output;
    output.out = testing::internal::GetCapturedStdout();
    output.err = testing::internal::GetCapturedStderr();
    return output;
}

}  // namespace quarzel::test
