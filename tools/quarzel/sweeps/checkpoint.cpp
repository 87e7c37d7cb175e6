// SPDX-License-Identifier: MIT
#include "sweeps/checkpoint.hpp"

#include <filesystem>
#include <iostream>
#include <utility>

#include "files/output_file.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

Checkpoint::Checkpoint(std::string file, std::chrono::seconds period, std::optional<sweep::Part> part)
    : itsFile(std::move(file)),
      itsPeriod(period),
      itsPart(std::move(part)),
      itsNextTime(Clock::now() + period) {}

void Checkpoint::lock() {
    if (!itsFile.empty()) {
        itsLock.emplace(itsFile);
    }
}

void Checkpoint::probe() const {
    if (!itsFile.empty()) {
        probeOutput(itsFile);
    }
}

bool Checkpoint::exists() const {
    std::error_code ignored;
    return !itsFile.empty() && std::filesystem::exists(itsFile, ignored);
}

void Checkpoint::update(const sweep::Dispatcher& dispatcher, Clock::time_point now) {
    if (now >= itsNextTime) {
        save(dispatcher);
        itsNextTime = Clock::now() + itsPeriod;
    }
}

bool Checkpoint::save(const sweep::Dispatcher& dispatcher) {
    if (itsFile.empty()) {
        return false;
    }
    try {
        writeOutput(itsFile, sweep::resultText({dispatcher.plan().seed, dispatcher.points(), itsPart}));
        return true;
    } catch (const ToolError& error) {
        if (!std::exchange(itsFailureIsReported, true)) {
            std::cerr << "quarzel: warning: the checkpoint could not be renewed: " << error.what() << '\n';
        }
        return false;
    }
}

void Checkpoint::remove() const {
    if (!itsFile.empty()) {
        std::error_code ignored;
        std::filesystem::remove(itsFile, ignored);
    }
}

}  // namespace quarzel::tool
