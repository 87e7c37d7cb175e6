// SPDX-License-Identifier: MIT
// The functions that quarzel_pkg imports, but for those that take arrays; the package says what each does.
#include <svdpi.h>

#include <array>
#include <string>
#include <utility>
#include <vector>

#include "common/encoding.hpp"
#include "dpi_call.hpp"

namespace {

using namespace quarzel::bindings;
using namespace quarzel::dpi;

constexpr const char* closedText =
    "the decoder has been closed, or made in another process before a checkpoint; make a new one";
constexpr const char* memoryText = "there is not enough memory";

}  // namespace

extern "C" void* quarzel_dpi_open(int units, int algorithm, int tagWidth) {
    try {
        void* const handle = addCore();
        withCore(handle, [&](DpiCore& core) {
            raise(core, core.core.open({units, algorithm, tagWidth}));
            return 0;
        });
        return handle;
    } catch (...) {
        return nullptr;
    }
}

extern "C" int quarzel_dpi_close(void* handle) {
    const int status = withCore(handle, [](DpiCore& core) {
        raise(core, core.core.close());
        return 0;
    });
    if (status == 0) {
        removeCore(handle);
    }
    return status;
}

extern "C" const char* quarzel_dpi_error(void* handle) {
    if (handle == nullptr) {
        return memoryText;
    }
    const auto core = findCore(handle);
    return core == nullptr ? closedText : core->error.c_str();
}

extern "C" const char* quarzel_dpi_next_warning(void* handle) {
    const auto core = findCore(handle);
    if (core == nullptr || core->warnings.empty()) {
        return "";
    }
    core->warning = std::move(core->warnings.front());
    core->warnings.pop_front();
    return core->warning.c_str();
}

extern "C" void quarzel_dpi_push(void* handle, int systematic, int parity1, int parity2) {
    withCore(handle, [&](DpiCore& core) {
        core.soft.push_back({systematic, parity1, parity2});
        return 0;
    });
}

extern "C" int quarzel_dpi_run(void* handle, int iterations, unsigned tag) {
    return withCore(handle, [&](DpiCore& core) {
        // What was pushed is used up, whatever comes of it: the next block starts afresh.
        const std::vector<std::array<std::int32_t, 3>> soft = std::exchange(core.soft, {});
        const std::array<std::int32_t, 3> none{};
        const std::array<std::int32_t, 3>& first = soft.empty() ? none : soft.front();
        return decodeStreams<std::int32_t>(core, {&first[0], &first[1], &first[2]}, soft.size(), iterations,
                                           tag, 3);
    });
}

extern "C" int quarzel_dpi_pop(void* handle) {
    return withCore(handle, [](DpiCore& core) -> int {
        if (core.popped == core.bits.size()) {
            throw BindingError(Fault::value,
                               "all decisions of the last block have been popped; run the next one");
        }
        return core.bits[core.popped++];
    });
}

extern "C" unsigned quarzel_dpi_tag(void* handle) {
    const auto core = findCore(handle);
    return core == nullptr ? 0 : core->tag;
}

extern "C" int quarzel_dpi_trace_next(void* handle, int passes, const char* file) {
    return withCore(handle, [&](DpiCore& core) {
        if (passes < 1) {
            throw BindingError(Fault::value, "a trace must have 1 pass or more; there are two an iteration");
        }
        core.traceFile = file;
        core.tracePasses = static_cast<unsigned>(passes);
        return 0;
    });
}

extern "C" void quarzel_dpi_push_bit(void* handle, svBit bit) {
    withCore(handle, [&](DpiCore& core) {
        core.information.push_back(bit);
        return 0;
    });
}

extern "C" int quarzel_dpi_encode(void* handle) {
    return withCore(handle, [](DpiCore& core) {
        std::vector<std::uint8_t> bits;
        bits.swap(core.information);
        const std::size_t positions = bits.size() + quarzel::tailPositions;
        core.code.assign(3 * positions, 0);
        raise(core, encode(bits.data(), bits.size(), 1, core.code.data()));
        return static_cast<int>(positions);
    });
}

extern "C" int quarzel_dpi_code_bit(void* handle, int stream, int position) {
    return withCore(handle, [&](DpiCore& core) -> int {
        const auto positions = static_cast<int>(core.code.size() / 3);
        if (stream < 0 || stream > 2 || position < 0 || position >= positions) {
            throw BindingError(Fault::value, "there is no code bit " + std::to_string(position) +
                                                 " of stream " + std::to_string(stream));
        }
        return core.code[static_cast<std::size_t>(stream * positions + position)];
    });
}
