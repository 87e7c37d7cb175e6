// SPDX-License-Identifier: MIT
#include "sweeps/interruption.hpp"

#include <atomic>
#include <cstdint>
#include <ctime>

namespace quarzel::tool {

namespace {

constexpr std::int64_t nanosecondsPerSecond = 1'000'000'000;

std::atomic<std::int64_t> timeOfFirst = 0;  // in nanoseconds; 0: none has come
static_assert(std::atomic<std::int64_t>::is_always_lock_free, "a signal handler uses it");

/// Note the first signal; let one that comes a second later or more end the process. `timeout` and others
/// send the same one twice in a row, to the process and to its group. Async-signal-safe calls only.
void noteSignal(int signal) {
    timespec time{};
    ::clock_gettime(CLOCK_MONOTONIC, &time);
    const std::int64_t now = time.tv_sec * nanosecondsPerSecond + time.tv_nsec;
    std::int64_t first = 0;
    if (!timeOfFirst.compare_exchange_strong(first, now) && now - first >= nanosecondsPerSecond) {
        std::signal(signal, SIG_DFL);
        std::raise(signal);
    }
}

}  // namespace

Interruption::Interruption() {
    timeOfFirst = 0;
    struct sigaction action {};
    action.sa_handler = noteSignal;
    action.sa_flags = SA_RESTART;
    for (std::size_t i = 0; i < signals.size(); ++i) {
        ::sigaction(signals[i], nullptr, &itsFormer[i]);
        if (itsFormer[i].sa_handler != SIG_IGN) {
            ::sigaction(signals[i], &action, nullptr);
        }
    }
}

Interruption::~Interruption() {
    for (std::size_t i = 0; i < signals.size(); ++i) {
        ::sigaction(signals[i], &itsFormer[i], nullptr);
    }
}

bool Interruption::hasCome() const {
    return timeOfFirst != 0;
}

}  // namespace quarzel::tool
