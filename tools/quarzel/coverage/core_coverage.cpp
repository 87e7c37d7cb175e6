// SPDX-License-Identifier: MIT
#include "coverage/core_coverage.hpp"

#include <fmt/format.h>

#include <mutex>

#include "coverage/pass_replay.hpp"
#include "link/parallel.hpp"
#include "quarzel/core.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

EventCounts eventsOf(const CoverageBlock& block, int units, int algorithm) {
    PassReplay replay(static_cast<std::uint32_t>(units), algorithm);
    const unsigned passes = 2 * static_cast<unsigned>(block.iterations);
    std::vector<unsigned char> bits(block.capture->blockSize);
    try {
        // Soft values out of range come with a warning, which 'quarzel decode' prints.
        Core core(CoreSettings{units, algorithm}, [](MessageKind, std::string_view) {});
        core.passes(passes, [&replay, passes](const vardel_ip_quarzel_pass& pass) {
            replay.add(pass, pass.pass + 1 == passes);
        });
        core.decode(block.capture->part(block.row, 1), block.iterations, bits);
    } catch (const Error& error) {
        throw decodingError(block.capture->file, fmt::format("block {}", block.row), error);
    }
    return replay.counts();
}

}  // namespace

EventCounts countEvents(const std::vector<CoverageBlock>& blocks, int units, int algorithm, unsigned threads,
                        const std::function<void(std::size_t)>& progress) {
    EventCounts counts;
    std::mutex mutex;  // of what follows
    std::size_t done = 0;
    link::forEachOnThreads(blocks.size(), threads, [&] {
        return [&](std::size_t block) {
            const EventCounts found = eventsOf(blocks[block], units, algorithm);
            const std::lock_guard lock(mutex);
            counts += found;
            progress(++done);
        };
    });
    return counts;
}

}  // namespace quarzel::tool
