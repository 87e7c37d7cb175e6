// SPDX-License-Identifier: MIT
#include "dpi_call.hpp"

#include <string>
#include <utility>

#include "common/trace_file.hpp"

namespace quarzel::dpi {

using namespace quarzel::bindings;

void raise(DpiCore& core, Outcome&& outcome) {
    const Fault fault = outcome.fault;
    if (!core.take(std::move(outcome))) {
        throw BindingError(fault, core.error);
    }
}

int decodeBlock(DpiCore& core, const ArrayBlocks& block, std::uint32_t K, int iterations, unsigned tag) {
    core.bits.assign(K, 0);
    core.popped = 0;
    const DecodeJob job{block, iterations, core.bits, {&tag, 1}};
    Outcome outcome =
        core.tracePasses == 0 ? core.core.decode(job) : core.core.traceText(job, core.tracePasses);
    const std::string trace = std::move(outcome.trace);
    raise(core, std::move(outcome));
    if (core.tracePasses != 0) {
        // Where memory runs out, the trace is that of the next block.
        Outcome writing = guarded([&] { writeTrace(core.traceFile, trace); });
        if (writing.fault != Fault::memory) {
            core.tracePasses = 0;
        }
        raise(core, std::move(writing));
    }
    core.tag = tag;
    return static_cast<int>(K);
}

}  // namespace quarzel::dpi
