// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <ostream>
#include <string>

#include "files/file_lock.hpp"
#include "sweep/dispatcher.hpp"
#include "sweep/result.hpp"
#include "sweeps/checkpoint.hpp"
#include "sweeps/make_workers.hpp"
#include "sweeps/sweep_options.hpp"
#include "sweeps/sweep_table.hpp"

namespace quarzel::tool {

/// What `quarzel sweep` is asked for.
struct SweepRunOptions {
    SweepOptions sweep;
    std::optional<std::string> output;
    std::optional<std::string> checkpoint;  ///< its file
    std::uint64_t checkpointSeconds = 30;
    bool resume = false;
    std::uint64_t keptFailures = 0;  ///< of each point
    unsigned threads = 0;            ///< 0: the usual number
    SweepForm form = SweepForm::table;
};

/// A sweep, from what its files already hold to the result in its place.
class SweepRun {
  public:
    /// Lock and probe the files, read what they hold, and plan what is missing.
    /// @param options  must outlive the run, and so must results
    /// @throws ToolError that says what to do
    SweepRun(const SweepRunOptions& options, std::ostream& results);

    /// Simulate what is missing, write the result and print it.
    /// @throws ToolError when it was interrupted or a file could not be written
    void run(const MakeWorkers& makeWorkers);

  private:
    std::unique_ptr<FileLock> lockFiles();
    void checkOptions() const;
    sweep::Result knownResult() const;
    sweep::Plan plan() const;
    bool simulate(sweep::Workers& workers);
    [[noreturn]] void failInterrupted();
    void takePoints();
    void write(bool isShown);
    void writeOutputFile();
    void print() const;
    void keepFailures(const MakeWorkers& makeWorkers) const;

    const SweepRunOptions& itsOptions;
    std::ostream& itsReport;
    sweep::Configuration itsConfiguration;
    sweep::Shard itsShard;
    Checkpoint itsCheckpoint;
    std::unique_ptr<FileLock> itsLock;
    sweep::Result itsResult;
    sweep::Dispatcher itsDispatcher;
};

}  // namespace quarzel::tool
