// SPDX-License-Identifier: MIT
// The functions that quarzel_pkg imports; the package says what each does. Every one returns, whatever
// happens: quarzel_dpi_error tells what went wrong in the last call.
#include <svdpi.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <string>
#include <utility>
#include <vector>

#include "common/encoding.hpp"
#include "dpi_core.hpp"

#define QUARZEL_DPI extern "C" __attribute__((visibility("default")))

namespace {

using namespace quarzel::bindings;
using quarzel::dpi::DpiCore;

constexpr const char* closedText = "the decoder has been closed; make a new one";
constexpr const char* memoryText = "there is not enough memory";
constexpr int failed = -1;

/// Call `work` with the core of a handle.
/// @return what it returns; -1 when there is no such core or `work` has thrown
template <class Work>
int withCore(void* handle, Work work) noexcept {
    try {
        const auto core = quarzel::dpi::findCore(handle);
        if (core == nullptr) {
            return failed;
        }
        int result = failed;
        core->take(guarded([&] { result = work(*core); }));
        return core->error.empty() ? result : failed;
    } catch (...) {
        return failed;
    }
}

/// Let an outcome inside `withCore` count as its own.
void raise(DpiCore& core, Outcome&& outcome) {
    const Fault fault = outcome.fault;
    if (!core.take(std::move(outcome))) {
        throw BindingError(fault, core.error);
    }
}

void writeFile(const std::string& name, const std::string& text) {
    std::FILE* const file = std::fopen(name.c_str(), "w");
    const bool whole = file != nullptr && std::fwrite(text.data(), 1, text.size(), file) == text.size();
    if (file == nullptr || std::fclose(file) != 0 || !whole) {
        throw BindingError(Fault::value, name + " cannot be written; choose another file for the trace");
    }
}

/// Decode a block into core.bits, traced when that was asked for.
/// @return K
template <quarzel::SoftValue Value>
int decode(DpiCore& core, std::array<const Value*, 3> streams, std::size_t positions, int iterations,
           unsigned tag) {
    const std::uint32_t K = blockSizeOf(positions);
    core.bits.assign(K, 0);
    core.popped = 0;
    const quarzel::SoftBlocks<Value> block{streams[0], streams[1], streams[2], 1, positions, 0};
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

const std::int8_t* bytes(const void* values) {
    return static_cast<const std::int8_t*>(values);
}

/// Elements of an open array, which must have one dimension and lie as in C.
/// @return their number
std::size_t sizeOf(svOpenArrayHandle array, const char* name) {
    if (svDimensions(array) != 1 || svGetArrayPtr(array) == nullptr) {
        throw BindingError(Fault::type, std::string(name) + " must be an unpacked array of one dimension");
    }
    return static_cast<std::size_t>(svSize(array, 1));
}

}  // namespace

QUARZEL_DPI void* quarzel_dpi_open(int units, int algorithm, int tagWidth) {
    try {
        void* const handle = quarzel::dpi::addCore();
        withCore(handle, [&](DpiCore& core) {
            raise(core, core.core.open({units, algorithm, tagWidth}));
            return 0;
        });
        return handle;
    } catch (...) {
        return nullptr;
    }
}

QUARZEL_DPI int quarzel_dpi_close(void* handle) {
    const int status = withCore(handle, [](DpiCore& core) {
        raise(core, core.core.close());
        return 0;
    });
    if (status == 0) {
        quarzel::dpi::removeCore(handle);
    }
    return status;
}

QUARZEL_DPI const char* quarzel_dpi_error(void* handle) {
    if (handle == nullptr) {
        return memoryText;
    }
    const auto core = quarzel::dpi::findCore(handle);
    return core == nullptr ? closedText : core->error.c_str();
}

QUARZEL_DPI const char* quarzel_dpi_next_warning(void* handle) {
    const auto core = quarzel::dpi::findCore(handle);
    if (core == nullptr || core->warnings.empty()) {
        return "";
    }
    core->warning = std::move(core->warnings.front());
    core->warnings.pop_front();
    return core->warning.c_str();
}

QUARZEL_DPI int quarzel_dpi_decode_fixed(void* handle, int positions, const char* systematic,
                                         const char* parity1, const char* parity2, int iterations,
                                         unsigned tag, svBit* bits) {
    return withCore(handle, [&](DpiCore& core) {
        const auto size = static_cast<std::size_t>(std::max(positions, 0));
        const std::array streams = {bytes(systematic), bytes(parity1), bytes(parity2)};
        const int K = decode(core, streams, size, iterations, tag);
        std::copy(core.bits.begin(), core.bits.end(), bits);
        return K;
    });
}

QUARZEL_DPI int quarzel_dpi_decode_open(void* handle, svOpenArrayHandle systematic, svOpenArrayHandle parity1,
                                        svOpenArrayHandle parity2, int iterations, unsigned tag,
                                        svOpenArrayHandle bits) {
    return withCore(handle, [&](DpiCore& core) {
        const std::size_t positions = sizeOf(systematic, "systematic");
        if (sizeOf(parity1, "parity1") != positions || sizeOf(parity2, "parity2") != positions) {
            throw BindingError(Fault::value, "the three streams must have the same size");
        }
        const std::uint32_t K = blockSizeOf(positions);
        if (sizeOf(bits, "bits") < K) {
            throw BindingError(Fault::value, "bits has no room for " + std::to_string(K) + " decisions");
        }
        const std::array streams = {bytes(svGetArrayPtr(systematic)), bytes(svGetArrayPtr(parity1)),
                                    bytes(svGetArrayPtr(parity2))};
        decode(core, streams, positions, iterations, tag);
        std::copy(core.bits.begin(), core.bits.end(), static_cast<svBit*>(svGetArrayPtr(bits)));
        return static_cast<int>(K);
    });
}

QUARZEL_DPI void quarzel_dpi_push(void* handle, int systematic, int parity1, int parity2) {
    withCore(handle, [&](DpiCore& core) {
        core.soft[0].push_back(systematic);
        core.soft[1].push_back(parity1);
        core.soft[2].push_back(parity2);
        return 0;
    });
}

QUARZEL_DPI int quarzel_dpi_run(void* handle, int iterations, unsigned tag) {
    return withCore(handle, [&](DpiCore& core) {
        // What was pushed is used up, whatever comes of it: the next block starts afresh.
        std::array<std::vector<std::int32_t>, 3> soft;
        for (std::size_t stream = 0; stream < soft.size(); ++stream) {
            soft[stream].swap(core.soft[stream]);
        }
        const std::array<const std::int32_t*, 3> streams = {soft[0].data(), soft[1].data(), soft[2].data()};
        return decode(core, streams, soft[0].size(), iterations, tag);
    });
}

QUARZEL_DPI int quarzel_dpi_pop(void* handle) {
    return withCore(handle, [](DpiCore& core) -> int {
        if (core.popped == core.bits.size()) {
            throw BindingError(Fault::value,
                               "all decisions of the last block have been popped; run the next one");
        }
        return core.bits[core.popped++];
    });
}

QUARZEL_DPI unsigned quarzel_dpi_tag(void* handle) {
    const auto core = quarzel::dpi::findCore(handle);
    return core == nullptr ? 0 : core->tag;
}

QUARZEL_DPI int quarzel_dpi_trace_next(void* handle, int passes, const char* file) {
    return withCore(handle, [&](DpiCore& core) {
        if (passes < 1) {
            throw BindingError(Fault::value, "a trace must have 1 pass or more; there are two an iteration");
        }
        core.traceFile = file;
        core.tracePasses = static_cast<unsigned>(passes);
        return 0;
    });
}

QUARZEL_DPI void quarzel_dpi_push_bit(void* handle, svBit bit) {
    withCore(handle, [&](DpiCore& core) {
        core.information.push_back(bit);
        return 0;
    });
}

QUARZEL_DPI int quarzel_dpi_encode(void* handle) {
    return withCore(handle, [](DpiCore& core) {
        std::vector<std::uint8_t> bits;
        bits.swap(core.information);
        const std::size_t positions = bits.size() + quarzel::tailPositions;
        core.code.assign(3 * positions, 0);
        raise(core, encode(bits.data(), bits.size(), 1, core.code.data()));
        return static_cast<int>(positions);
    });
}

QUARZEL_DPI int quarzel_dpi_code_bit(void* handle, int stream, int position) {
    return withCore(handle, [&](DpiCore& core) -> int {
        const auto positions = static_cast<int>(core.code.size() / 3);
        if (stream < 0 || stream > 2 || position < 0 || position >= positions) {
            throw BindingError(Fault::value, "there is no code bit " + std::to_string(position) +
                                                 " of stream " + std::to_string(stream));
        }
        return core.code[static_cast<std::size_t>(stream * positions + position)];
    });
}
