// SPDX-License-Identifier: MIT
// Faults of the permutation between the codes.
#include "oracle/fault.hpp"

namespace quarzel::oracle {
namespace {

constexpr Fault faults[] = {
    {"f1-one-more", "f1 is one more", [](Design& d) { d.permutation.f1Added = 1; }},
    {"f2-one-more", "f2 is one more", [](Design& d) { d.permutation.f2Added = 1; }},
    {"f2-two-less", "f2 is two less", [](Design& d) { d.permutation.f2Added = -2; }},
    {"address-one-on", "addresses are one more, modulo K", [](Design& d) { d.permutation.added = 1; }},
    {"row-before", "the row of the next smaller size is read",
     [](Design& d) { d.permutation.rowShift = -1; }},
    {"row-after", "the row of the next greater size is read", [](Design& d) { d.permutation.rowShift = 1; }},
    {"address-12-bits", "addresses have 12 bits", [](Design& d) { d.permutation.addressBits = 12; }},
    {"address-11-bits", "addresses have 11 bits", [](Design& d) { d.permutation.addressBits = 11; }},
    {"address-10-bits", "addresses have 10 bits", [](Design& d) { d.permutation.addressBits = 10; }},
    {"address-9-bits", "addresses have 9 bits", [](Design& d) { d.permutation.addressBits = 9; }},
    {"product-24-bits", "the polynomial has 24 bits", [](Design& d) { d.permutation.productBits = 24; }},
    {"product-20-bits", "the polynomial has 20 bits", [](Design& d) { d.permutation.productBits = 20; }},
    {"product-16-bits", "the polynomial has 16 bits", [](Design& d) { d.permutation.productBits = 16; }},
    {"square-24-bits", "the square of the position has 24 bits",
     [](Design& d) { d.permutation.squareBits = 24; }},
    {"square-20-bits", "the square of the position has 20 bits",
     [](Design& d) { d.permutation.squareBits = 20; }},
    {"square-16-bits", "the square of the position has 16 bits",
     [](Design& d) { d.permutation.squareBits = 16; }},
    {"square-12-bits", "the square of the position has 12 bits",
     [](Design& d) { d.permutation.squareBits = 12; }},
    {"modulus-one-more", "the remainder is taken by K + 1",
     [](Design& d) { d.permutation.modulusAdded = 1; }},
    {"modulus-one-less", "the remainder is taken by K - 1",
     [](Design& d) { d.permutation.modulusAdded = -1; }},
    {"systematic-straight", "code 2 takes the systematic values in their natural order",
     [](Design& d) { d.permutation.systematicStraight = true; }},
    {"forward-straight", "extrinsic values go to code 2 without permutation",
     [](Design& d) { d.permutation.forwardStraight = true; }},
    {"back-straight", "extrinsic values go to code 1 without permutation",
     [](Design& d) { d.permutation.backStraight = true; }},
    {"systematic-inverse", "systematic values go to code 2 by the inverse permutation",
     [](Design& d) { d.permutation.systematicInverse = true; }},
    {"forward-inverse", "extrinsic values go to code 2 by the inverse permutation",
     [](Design& d) { d.permutation.forwardInverse = true; }},
    {"back-forward", "extrinsic values go to code 1 by the permutation, not by its inverse",
     [](Design& d) { d.permutation.backForward = true; }},
    {"permutation-inverse", "permutation and inverse are exchanged everywhere",
     [](Design& d) {
         d.permutation.systematicInverse = d.permutation.forwardInverse = d.permutation.backForward = true;
     }},
};

}  // namespace

std::span<const Fault> permutationFaults() {
    return faults;
}

}  // namespace quarzel::oracle
