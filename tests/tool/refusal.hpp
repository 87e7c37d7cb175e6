// SPDX-License-Identifier: MIT
#pragma once

#include <gtest/gtest.h>

#include <string>

#include "tool_error.hpp"

namespace quarzel::test {

/// The line that the user sees when a reader refuses a file; empty when it does not.
template <class Read>
std::string refusalOf(const Read& read) {
    try {
        read();
        return {};
    } catch (const tool::ToolError& error) {
        EXPECT_EQ(error.code(), tool::ExitCode::file);
        return tool::errorLine(error.what());
    }
}

}  // namespace quarzel::test
