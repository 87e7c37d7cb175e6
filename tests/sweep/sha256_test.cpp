// SPDX-License-Identifier: MIT
#include "sweep/sha256.hpp"

#include <gtest/gtest.h>

namespace quarzel::test {

// The examples of FIPS 180.
TEST(Sha256, IsThatOfTheStandard) {
    EXPECT_EQ(sweep::sha256("abc"), "ba7816bf8f01cfea414140de5dae2223b00361a396177a9cb410ff61f20015ad");
    EXPECT_EQ(sweep::sha256("abcdbcdecdefdefgefghfghighijhijkijkljklmklmnlmnomnopnopq"),
              "248d6a61d20638b8e5c026930c3e6039a33ce45964ff2167f6ecedd419db06c1");
}

}  // namespace quarzel::test
