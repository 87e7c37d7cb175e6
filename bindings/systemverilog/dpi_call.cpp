// SPDX-License-Identifier: MIT
#include "dpi_call.hpp"

#include <cstdio>
#include <string>
#include <utility>

namespace quarzel::dpi {

using namespace quarzel::bindings;

namespace {

void writeFile(const std::string& name, const std::string& text) {
    std::FILE* const file = std::fopen(name.c_str(), "w");
    const bool whole = file != nullptr && std::fwrite(text.data(), 1, text.size(), file) == text.size();
    if (file == nullptr || std::fclose(file) != 0 || !whole) {
        throw BindingError(Fault::value, name + " cannot be written; choose another file for the trace");
    }
}

}  // namespace

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
    const unsigned passes = std::exchange(core.tracePasses, 0);
    Outcome outcome = passes == 0 ? core.core.decode(job) : core.core.traceText(job, passes);
    const std::string trace = std::move(outcome.trace);
    raise(core, std::move(outcome));
    if (passes != 0) {
        writeFile(core.traceFile, trace);
    }
    core.tag = tag;
    return static_cast<int>(K);
}

}  // namespace quarzel::dpi
