// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>

namespace quarzel::test {

/// Heap allocations of the program so far. A program that links count_allocations.cpp has its global operator
/// new replaced by one that counts.
std::size_t allocationCount();

}  // namespace quarzel::test
