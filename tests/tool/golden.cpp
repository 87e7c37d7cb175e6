// SPDX-License-Identifier: MIT
#include "golden.hpp"

#include <gtest/gtest.h>

#include <cstdlib>
#include <fstream>

#include "temporary_directory.hpp"

namespace quarzel::test {

void expectGolden(const std::string& text, const std::string& name) {
    const std::string file = std::string(QUARZEL_GOLDEN) + '/' + name;
    const char* const renew = std::getenv("QUARZEL_RENEW_GOLDEN");
    if (renew != nullptr && std::string(renew) == "1") {
        ASSERT_TRUE(std::ofstream(file, std::ios::binary) << text << std::flush) << file;
        return;
    }
    EXPECT_EQ(text, readFile(file));
}

}  // namespace quarzel::test
