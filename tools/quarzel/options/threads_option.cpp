// SPDX-License-Identifier: MIT
#include "options/threads_option.hpp"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <cstdint>
#include <thread>

#include "options/whole_number.hpp"

namespace quarzel::tool {

unsigned allCores() {
    return std::max(1U, std::thread::hardware_concurrency());
}

void addThreadsOption(CLI::App& command, unsigned& threads) {
    command
        .add_option("--threads", threads,
                    "Threads that decode, 1 to 1024; what they give does\nnot depend on their number "
                    "(default: all cores)")
        ->type_name("N")
        ->transform(
            wholeNumber([](std::uint64_t n) { return n >= 1 && n <= 1024; }, "a number from 1 to 1024"));
}

}  // namespace quarzel::tool
