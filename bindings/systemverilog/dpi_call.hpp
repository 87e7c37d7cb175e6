// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>

#include "dpi_core.hpp"

/// What the functions that quarzel_pkg imports share. Every one of them returns, whatever happens:
/// quarzel_dpi_error tells what went wrong in the last call.
namespace quarzel::dpi {

constexpr int failed = -1;

/// Call `work` with the core of a handle.
/// @return what it returns; -1 when there is no such core or `work` has thrown
template <class Work>
int withCore(void* handle, Work work) noexcept {
    try {
        const auto core = findCore(handle);
        if (core == nullptr) {
            return failed;
        }
        int result = failed;
        core->take(bindings::guarded([&] { result = work(*core); }));
        return core->error.empty() ? result : failed;
    } catch (...) {
        return failed;
    }
}

/// Let an outcome inside `withCore` count as its own.
void raise(DpiCore& core, bindings::Outcome&& outcome);

/// Decode a block into core.bits, traced when that was asked for.
/// @param K  its size
/// @return K
int decodeBlock(DpiCore& core, const bindings::ArrayBlocks& block, std::uint32_t K, int iterations,
                unsigned tag);

/// Decode a block that lies in three arrays.
/// @param positions  of the block; checked before an array is read
/// @param stride     from a value to the next one of its stream
/// @return K
template <SoftValue Value>
int decodeStreams(DpiCore& core, std::array<const Value*, 3> streams, std::size_t positions, int iterations,
                  unsigned tag, std::ptrdiff_t stride = 1) {
    const std::uint32_t K = bindings::blockSizeOf(positions);
    const SoftBlocks<Value> block{streams[0], streams[1], streams[2], 1, positions, 0, stride};
    return decodeBlock(core, block, K, iterations, tag);
}

}  // namespace quarzel::dpi
