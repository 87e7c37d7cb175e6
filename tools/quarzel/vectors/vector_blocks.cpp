// SPDX-License-Identifier: MIT
#include "vectors/vector_blocks.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <future>
#include <mutex>

#include "decode/core_model.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

StimulusAndResponse makeBlock(const PlannedBlock& planned, const StimulusSource& source, int units,
                              CoreModel& core) {
    StimulusAndResponse made{source.make(planned, static_cast<std::uint32_t>(units)),
                             std::vector<unsigned char>(planned.blockSize)};
    const SoftBlock soft(made.soft.begin(), made.soft.end());
    if (const auto failed = core.decode({&soft, 1}, planned.iterations, made.decisions)) {
        throw ToolError(ExitCode::decodingFailed, "",
                        fmt::format("a block of {} bits could not be decoded (status {})", planned.blockSize,
                                    failed->status),
                        "the line above says why");
    }
    return made;
}

}  // namespace

std::vector<StimulusAndResponse> makeBlocks(const std::vector<PlannedBlock>& plan,
                                            const StimulusSource& source, int units, int algorithm,
                                            unsigned threads,
                                            const std::function<void(std::size_t)>& progress) {
    std::vector<StimulusAndResponse> blocks(plan.size());
    std::mutex mutex;
    std::size_t next = 0;
    std::size_t done = 0;
    const auto makeSome = [&] {
        CoreModel core(units, algorithm);
        for (std::unique_lock lock(mutex); next < plan.size();) {
            const std::size_t block = next++;
            lock.unlock();
            StimulusAndResponse made = makeBlock(plan[block], source, units, core);
            lock.lock();
            blocks[block] = std::move(made);
            progress(++done);
        }
    };
    const auto work = [&] {
        try {
            makeSome();
        } catch (...) {
            const std::lock_guard lock(mutex);
            next = plan.size();  // the others need not go on
            throw;
        }
    };
    std::vector<std::future<void>> workers;
    for (unsigned i = 0; i < std::max(1U, threads); ++i) {
        workers.push_back(std::async(std::launch::async, work));
    }
    for (std::future<void>& worker : workers) {
        worker.get();
    }
    return blocks;
}

}  // namespace quarzel::tool
