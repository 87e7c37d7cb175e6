// SPDX-License-Identifier: MIT
#include "support/count_allocations.hpp"

#include <atomic>
#include <cstdint>
#include <cstdlib>
#include <new>

namespace {
std::atomic<std::size_t> allocations{0};
std::atomic<std::size_t> freed{0};
std::atomic<std::size_t> firstToFail{SIZE_MAX};
std::atomic<std::size_t> lastToFail{SIZE_MAX};
std::atomic<std::size_t> failures{0};

void release(void* memory) {
    freed += memory != nullptr ? 1 : 0;
    std::free(memory);
}
}  // namespace

namespace quarzel::test {
std::size_t allocationCount() {
    return allocations;
}
std::size_t liveAllocations() {
    return allocations - failures - freed;
}
void failAllocationsAfter(std::size_t count) {
    firstToFail = allocations + count;
    lastToFail = SIZE_MAX;
}
void failOneAllocationAfter(std::size_t count) {
    firstToFail = lastToFail = allocations + count;
}
std::size_t failedAllocations() {
    return failures;
}
void allowAllocations() {
    firstToFail = SIZE_MAX;
}
}  // namespace quarzel::test

void* operator new(std::size_t size) {
    const std::size_t number = allocations++;
    if (number >= firstToFail && number <= lastToFail) {
        ++failures;
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
void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
    try {
        return operator new(size);
    } catch (const std::bad_alloc&) {
        return nullptr;
    }
}
void* operator new[](std::size_t size, const std::nothrow_t&) noexcept {
    return operator new(size, std::nothrow);
}
void operator delete(void* memory) noexcept {
    release(memory);
}
void operator delete[](void* memory) noexcept {
    release(memory);
}
void operator delete(void* memory, std::size_t) noexcept {
    release(memory);
}
void operator delete[](void* memory, std::size_t) noexcept {
    release(memory);
}
