// SPDX-License-Identifier: MIT
#include "sweeps/make_workers.hpp"

#include "options/threads_option.hpp"

namespace quarzel::tool {

std::unique_ptr<sweep::Workers> makeThreadWorkers(unsigned threads) {
    return std::make_unique<sweep::ThreadWorkers>(threads == 0 ? allCores() : threads);
}

}  // namespace quarzel::tool
