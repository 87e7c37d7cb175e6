// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <set>
#include <string>

#include "oracle/fault.hpp"

namespace quarzel::test {
namespace {

TEST(FaultCatalogue, NamesEachFaultOnce) {
    std::set<std::string> names;
    for (const oracle::Fault& fault : oracle::catalogue()) {
        EXPECT_TRUE(names.insert(fault.name).second) << fault.name;
    }
    EXPECT_EQ(names.size(), 330U);
    for (const oracle::Fault& fault : oracle::heldOutFaults()) {
        EXPECT_TRUE(names.insert(fault.name).second) << fault.name;
    }
    EXPECT_EQ(names.size(), 360U);
}

}  // namespace
}  // namespace quarzel::test
