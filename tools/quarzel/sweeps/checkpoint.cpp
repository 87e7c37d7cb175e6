// SPDX-License-Identifier: MIT
#include "sweeps/checkpoint.hpp"

#include <filesystem>
#include <iostream>
#include <utility>

#include "files/output_file.hpp"
#include "sweeps/sweep_files.hpp"

namespace quarzel::tool {

Checkpoint::Checkpoint(std::string file, std::chrono::seconds period)
    : itsFile(std::move(file)), itsPeriod(period), itsNextTime(Clock::now() + period) {}

void Checkpoint::probe() const {
    if (!itsFile.empty()) {
        probeOutput(itsFile);
    }
}

bool Checkpoint::exists() const {
    std::error_code ignored;
    return !itsFile.empty() && std::filesystem::exists(itsFile, ignored);
}

sweep::Part Checkpoint::load(const sweep::Configuration& configuration, const sweep::Shard& shard) const {
    return aboutFile(itsFile, [&] {
        sweep::Part part = sweep::readPart(readBytes(itsFile));
        sweep::requireSameRun(part, configuration, shard);
        return part;
    });
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
        writeOutput(itsFile,
                    sweep::partText({dispatcher.configuration(), dispatcher.shard(), dispatcher.states()}));
        return true;
    } catch (const ToolError& error) {
        if (!std::exchange(itsFailureIsReported, true)) {
            std::cerr << "quarzel: warning: the checkpoint could not be renewed: " << error.what() << '\n';
        }
        return false;
    }
}

void Checkpoint::remove() const {
    std::error_code ignored;
    std::filesystem::remove(itsFile, ignored);
}

}  // namespace quarzel::tool
