// SPDX-License-Identifier: MIT
#pragma once

#include <atomic>
#include <cstddef>
#include <exception>
#include <mutex>
#include <system_error>
#include <thread>
#include <vector>

namespace quarzel::link {

/// Do pieces of work on threads. Each thread takes the next piece until none is left or one has thrown.
///
/// @param count       pieces, numbered from 0
/// @param threads     at least 1: this one and others, as far as the system gives them
/// @param makeWorker  called once on each thread; makes what does a piece: `worker(piece)`
/// @throws what the first piece that threw did, whichever thread was quicker: pieces are taken in order, and
///         those that are taken are done
template <class MakeWorker>
void forEachOnThreads(std::size_t count, unsigned threads, const MakeWorker& makeWorker) {
    std::atomic<std::size_t> next = 0;
    std::mutex mutex;  // of what follows
    std::size_t failedPiece = 0;
    std::exception_ptr failure;
    const auto work = [&] {
        std::size_t piece = count;  // what is thrown by no piece comes after what a piece throws
        try {
            auto worker = makeWorker();
            while ((piece = next++) < count) {
                worker(piece);
            }
        } catch (...) {
            next = count;
            const std::lock_guard lock(mutex);
            if (!failure || piece < failedPiece) {
                failure = std::current_exception();
                failedPiece = piece;
            }
        }
    };
    {
        std::vector<std::jthread> others;
        try {
            while (others.size() + 1 < threads) {
                others.emplace_back(work);
            }
        } catch (const std::system_error&) {
            // The system gives no more threads. Those that there are do the work.
        }
        work();
    }
    if (failure) {
        std::rethrow_exception(failure);
    }
}

}  // namespace quarzel::link
