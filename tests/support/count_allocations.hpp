// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>

namespace quarzel::test {

/// Heap allocations of the program so far. A program that links count_allocations.cpp has its global operator
/// new replaced by one that counts.
std::size_t allocationCount();

/// Those that were not freed yet.
std::size_t liveAllocations();

/// Let the allocation after the next `count` ones fail, and all later ones, until `allowAllocations`.
void failAllocationsAfter(std::size_t count);
/// Let only that one fail.
void failOneAllocationAfter(std::size_t count);
/// How many have failed so far.
std::size_t failedAllocations();
void allowAllocations();

}  // namespace quarzel::test
