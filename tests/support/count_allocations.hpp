// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>

namespace quarzel::test {

/// Heap allocations of the program so far. A program that links count_allocations.cpp has its global operator
/// new replaced by one that counts.
std::size_t allocationCount();

/// Let the allocation after the next `count` ones fail, and all later ones, until `allowAllocations`.
void failAllocationsAfter(std::size_t count);
void allowAllocations();

}  // namespace quarzel::test
