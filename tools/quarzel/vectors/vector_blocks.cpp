// SPDX-License-Identifier: MIT
#include "vectors/vector_blocks.hpp"

#include <fmt/format.h>

#include <mutex>
#include <span>
#include <utility>

#include "link/parallel.hpp"
#include "quarzel/core.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

StimulusAndResponse makeBlock(const VectorBlock& block, std::vector<std::int8_t> soft, Core& core) {
    StimulusAndResponse made{std::move(soft), std::vector<unsigned char>(block.blockSize)};
    try {
        core.decode(softBlocks(std::span<const std::int8_t>(made.soft), made.soft.size() / 3),
                    block.iterations, made.decisions);
    } catch (const Error& error) {
        throw decodingError("", fmt::format("a block of {} bits", block.blockSize), error);
    }
    return made;
}

}  // namespace

std::vector<StimulusAndResponse> makeBlocks(const CoreStimulus& stimulus, int units, int algorithm,
                                            unsigned threads,
                                            const std::function<void(std::size_t)>& progress) {
    std::vector<StimulusAndResponse> blocks(stimulus.blocks.size());
    std::mutex mutex;  // of what follows
    std::size_t done = 0;
    link::forEachOnThreads(blocks.size(), threads, [&] {
        return [&, core = Core(CoreSettings{units, algorithm})](std::size_t block) mutable {
            blocks[block] = makeBlock(stimulus.blocks[block], stimulus.soft(block), core);
            const std::lock_guard lock(mutex);
            progress(++done);
        };
    });
    return blocks;
}

}  // namespace quarzel::tool
