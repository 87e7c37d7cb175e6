// SPDX-License-Identifier: MIT
#include "vectors/vector_blocks.hpp"

#include <fmt/format.h>

#include <mutex>
#include <span>

#include "link/parallel.hpp"
#include "quarzel/core.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

StimulusAndResponse makeBlock(const PlannedBlock& planned, const StimulusSource& source, int units,
                              Core& core) {
    StimulusAndResponse made{source.make(planned, static_cast<std::uint32_t>(units)),
                             std::vector<unsigned char>(planned.blockSize)};
    try {
        core.decode(softBlocks(std::span<const std::int8_t>(made.soft), made.soft.size() / 3),
                    planned.iterations, made.decisions);
    } catch (const Error& error) {
        throw decodingError("", fmt::format("a block of {} bits", planned.blockSize), error);
    }
    return made;
}

}  // namespace

std::vector<StimulusAndResponse> makeBlocks(const std::vector<PlannedBlock>& plan,
                                            const StimulusSource& source, int units, int algorithm,
                                            unsigned threads,
                                            const std::function<void(std::size_t)>& progress) {
    std::vector<StimulusAndResponse> blocks(plan.size());
    std::mutex mutex;  // of what follows
    std::size_t done = 0;
    link::forEachOnThreads(plan.size(), threads, [&] {
        return [&, core = Core(CoreSettings{units, algorithm})](std::size_t block) mutable {
            blocks[block] = makeBlock(plan[block], source, units, core);
            const std::lock_guard lock(mutex);
            progress(++done);
        };
    });
    return blocks;
}

}  // namespace quarzel::tool
