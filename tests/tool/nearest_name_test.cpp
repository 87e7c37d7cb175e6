// SPDX-License-Identifier: MIT
#include "shell/nearest_name.hpp"

#include <gtest/gtest.h>

namespace quarzel::test {

using tool::nearestName;

const std::vector<std::string> names = {"--units", "--algorithm", "--iterations", "--trace", "--trace-file"};

TEST(NearestName, IsOneTypingErrorAway) {
    EXPECT_EQ(nearestName("--uints", names), "--units") << "two letters exchanged";
    EXPECT_EQ(nearestName("--unit", names), "--units") << "a letter less";
    EXPECT_EQ(nearestName("--traces", names), "--trace") << "a letter more";
    EXPECT_EQ(nearestName("--tracf", names), "--trace") << "another letter";
}

TEST(NearestName, IsTheOneThatAWordBegins) {
    EXPECT_EQ(nearestName("--iter", names), "--iterations");
    EXPECT_EQ(nearestName("--trace-", names), "--trace-file");
}

TEST(NearestName, IsTheNearestOfSeveral) {
    EXPECT_EQ(nearestName("--trace-flie", names), "--trace-file");
    EXPECT_EQ(nearestName("ab", {"cb", "ac"}), "cb") << "the first of equals";
}

TEST(NearestName, IsNoneWhenNothingIsNear) {
    EXPECT_EQ(nearestName("--seed", names), std::nullopt);
    EXPECT_EQ(nearestName("", names), std::nullopt);
    EXPECT_EQ(nearestName("--units", {}), std::nullopt);
}

}  // namespace quarzel::test
