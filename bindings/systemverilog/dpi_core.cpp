// SPDX-License-Identifier: MIT
#include "dpi_core.hpp"

#include <iterator>
#include <limits>
#include <map>
#include <mutex>
#include <random>

namespace quarzel::dpi {

namespace {

/// The cores of the process.
struct Registry {
    std::mutex mutex;
    std::map<std::uintptr_t, std::shared_ptr<DpiCore>> cores;
    /// The last handle. The first one is drawn, so that a handle of another process, which comes back when a
    /// simulation is restored, is none of this one. It is below 2^62, as VHDL's simulators need it.
    std::uintptr_t last = std::uintptr_t{std::random_device()()}
                          << (std::numeric_limits<std::uintptr_t>::digits / 2 - 2);
};

Registry& registry() {
    static Registry all;
    return all;
}

}  // namespace

bool DpiCore::take(bindings::Outcome&& outcome) {
    try {
        warnings.insert(warnings.end(), std::make_move_iterator(outcome.warnings.begin()),
                        std::make_move_iterator(outcome.warnings.end()));
        error = outcome.done() ? "" : outcome.message();
    } catch (const std::bad_alloc&) {
        outcome.fault = bindings::Fault::memory;
        error = outcome.message();
    }
    return outcome.done();
}

void* addCore() {
    auto core = std::make_shared<DpiCore>();
    Registry& all = registry();
    const std::lock_guard lock(all.mutex);
    all.cores.emplace(++all.last, std::move(core));
    return reinterpret_cast<void*>(all.last);
}

std::shared_ptr<DpiCore> findCore(void* handle) {
    Registry& all = registry();
    const std::lock_guard lock(all.mutex);
    const auto found = all.cores.find(reinterpret_cast<std::uintptr_t>(handle));
    return found == all.cores.end() ? nullptr : found->second;
}

void removeCore(void* handle) {
    Registry& all = registry();
    const std::lock_guard lock(all.mutex);
    all.cores.erase(reinterpret_cast<std::uintptr_t>(handle));
}

}  // namespace quarzel::dpi
