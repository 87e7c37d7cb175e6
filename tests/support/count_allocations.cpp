// SPDX-License-Identifier: MIT
#include "support/count_allocations.hpp"

#include <atomic>
#include <cstdint>
#include <cstdlib>
#include <new>

namespace {
std::atomic<std::size_t> allocations{0};
std::atomic<std::size_t> limit{SIZE_MAX};
}  // namespace

namespace quarzel::test {
std::size_t allocationCount() {
    return allocations;
}
void failAllocationsAfter(std::size_t count) {
    limit = allocations + count;
}
void allowAllocations() {
    limit = SIZE_MAX;
}
}  // namespace quarzel::test

void* operator new(std::size_t size) {
    if (allocations++ >= limit) {
        throw std::bad_alloc();
    }
    if (void* memory = std::malloc(size == 0 ? 1 : size)) {
        return memory;
    }
    throw std::bad_alloc();
}
void* operator new[](std::size_t size) {
    return operator new(size);
}
void operator delete(void* memory) noexcept {
    std::free(memory);
}
void operator delete[](void* memory) noexcept {
    std::free(memory);
}
void operator delete(void* memory, std::size_t) noexcept {
    std::free(memory);
}
void operator delete[](void* memory, std::size_t) noexcept {
    std::free(memory);
}
