// SPDX-License-Identifier: MIT
#include "decode/decode_together.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <iostream>
#include <mutex>
#include <span>
#include <string>
#include <vector>

#include "decode/progress.hpp"
#include "link/parallel.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

/// Blocks that fill the lanes many times over and yet take only milliseconds, fewer where there are too few
/// blocks to keep the threads busy.
std::size_t groupSize(const Capture& capture, unsigned threads) {
    constexpr std::size_t bits = 200'000;
    constexpr std::size_t groupsPerThread = 4;
    return std::clamp<std::size_t>(capture.blocks() / (groupsPerThread * threads), 1,
                                   bits / capture.blockSize);
}

/// The warning of the first group that warned. It is printed at the end.
///
/// A core warns once in its life. Threads take groups in order, so that the first warning of one of them is
/// that of the first group.
class FirstWarning {
  public:
    FirstWarning() = default;
    FirstWarning(const FirstWarning&) = delete;
    FirstWarning& operator=(const FirstWarning&) = delete;
    ~FirstWarning() {
        if (!itsText.empty()) {
            std::cerr << itsText;
        }
    }

    void take(std::size_t group, std::string_view text) {
        const std::lock_guard lock(itsMutex);
        if (itsText.empty() || group < itsGroup) {
            itsGroup = group;
            itsText = fmt::format("{}\n", text);
        }
    }

  private:
    std::mutex itsMutex;
    std::size_t itsGroup = 0;
    std::string itsText;
};

}  // namespace

void decodePart(Core& core, const Capture& capture, std::size_t first, std::size_t count, int iterations,
                PackedBits& decisions) {
    const std::size_t K = capture.blockSize;
    std::vector<unsigned char> bits(count * K);
    try {
        core.decode(capture.part(first, count), iterations, bits);
    } catch (const Error& error) {
        throw decodingError(capture.file,
                            fmt::format("block {} of 0 to {}", first + error.block(), capture.blocks() - 1),
                            error);
    }
    for (std::size_t i = 0; i < count; ++i) {
        decisions.set(first + i, bits.data() + i * K);
    }
}

PackedBits decodeTogether(const Capture& capture, const CoreOptions& options, unsigned threads,
                          Progress& progress) {
    const std::size_t size = groupSize(capture, threads);
    PackedBits decisions(capture.blocks(), capture.blockSize);
    FirstWarning warning;
    std::mutex mutex;  // of what follows
    std::size_t done = 0;
    const auto makeWorker = [&] {
        return [&, core = coreOf(options)](std::size_t group) mutable {
            const std::size_t first = group * size;
            const std::size_t count = std::min(size, capture.blocks() - first);
            core.onMessage([&](MessageKind, std::string_view text) { warning.take(group, text); });
            decodePart(core, capture, first, count, options.iterations, decisions);
            const std::lock_guard lock(mutex);
            done += count;
            progress.update(done);
        };
    };
    link::forEachOnThreads((capture.blocks() + size - 1) / size, threads, makeWorker);
    return decisions;
}

}  // namespace quarzel::tool
