// SPDX-License-Identifier: MIT
#include "decode/decode_together.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <atomic>
#include <exception>
#include <iostream>
#include <mutex>
#include <optional>
#include <span>
#include <streambuf>
#include <system_error>
#include <thread>
#include <utility>
#include <vector>

#include "decode/core_model.hpp"
#include "decode/progress.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

/// Blocks that fill the lanes many times over and yet take only milliseconds, fewer where there are too few
/// blocks to keep the threads busy.
std::size_t groupSize(const Capture& capture, unsigned threads) {
    constexpr std::size_t bits = 200'000;
    constexpr std::size_t groupsPerThread = 4;
    return std::clamp<std::size_t>(capture.blocks.size() / (groupsPerThread * threads), 1,
                                   bits / capture.blockSize);
}

/// While it lives, what any thread writes to std::cout is lost, but not that something was.
class Silence : std::streambuf {
  public:
    Silence() : itsBuffer(std::cout.rdbuf(this)) {}
    ~Silence() override { std::cout.rdbuf(itsBuffer); }
    Silence(const Silence&) = delete;
    Silence& operator=(const Silence&) = delete;

    bool broken() const { return itsBroken; }

  private:
    std::streamsize xsputn(const char* /*text*/, std::streamsize count) override {
        itsBroken = true;
        return count;
    }

    std::streambuf* itsBuffer;
    std::atomic<bool> itsBroken = false;
};

/// Let the library warn of the first soft value that it will saturate.
void warnOfSaturation(const Capture& capture, const CoreOptions& core) {
    const auto isLoud = [](const SoftBlock& block) {
        return std::any_of(block.begin(), block.end(), [](int value) { return value < -128 || value > 127; });
    };
    const auto loud = std::find_if(capture.blocks.begin(), capture.blocks.end(), isLoud);
    if (loud != capture.blocks.end()) {
        std::vector<unsigned char> bits(capture.blockSize);
        CoreModel(core.units, core.algorithm).decode({&*loud, 1}, 1, bits);
    }
}

/// The work that the threads share: each takes the next group of blocks until none is left or one has failed.
class SharedWork {
  public:
    SharedWork(const Capture& capture, const CoreOptions& core, std::size_t groupSize, Progress& progress)
        : itsCapture(capture),
          itsCore(core),
          itsGroupSize(groupSize),
          itsProgress(progress),
          itsDecisions(capture.blocks.size(), capture.blockSize) {}

    void run() {
        try {
            CoreModel core(itsCore.units, itsCore.algorithm);
            std::vector<unsigned char> bits(itsGroupSize * itsCapture.blockSize);
            while (!itsStopped) {
                const std::size_t first = itsNext.fetch_add(itsGroupSize);
                if (first >= itsCapture.blocks.size()) {
                    return;
                }
                decodeGroup(core, first, bits);
            }
        } catch (...) {
            const std::lock_guard lock(itsMutex);
            itsException = std::current_exception();
            itsStopped = true;
        }
    }

    /// @throws what a thread has thrown, and ToolError for a block that could not be decoded
    PackedBits result() {
        if (itsException) {
            std::rethrow_exception(itsException);
        }
        if (itsFailure) {
            throw decodingError(itsCapture, itsFailure->index, itsFailure->status);
        }
        return std::move(itsDecisions);
    }

  private:
    void decodeGroup(CoreModel& core, std::size_t first, std::span<unsigned char> bits) {
        const std::size_t count = std::min(itsGroupSize, itsCapture.blocks.size() - first);
        const std::size_t K = itsCapture.blockSize;
        const auto failed = core.decode(std::span(itsCapture.blocks).subspan(first, count),
                                        itsCore.iterations, bits.first(count * K));
        for (std::size_t i = 0; i < count; ++i) {
            itsDecisions.set(first + i, bits.data() + i * K);
        }
        const std::lock_guard lock(itsMutex);
        if (failed && (!itsFailure || first + failed->index < itsFailure->index)) {
            // Groups are taken in order: what could hold an earlier failure is being decoded already.
            itsFailure = FailedBlock{first + failed->index, failed->status};
            itsStopped = true;
        }
        itsDone += count;
        itsProgress.update(itsDone);
    }

    const Capture& itsCapture;
    const CoreOptions& itsCore;
    const std::size_t itsGroupSize;
    Progress& itsProgress;
    PackedBits itsDecisions;
    std::atomic<std::size_t> itsNext = 0;
    std::atomic<bool> itsStopped = false;
    std::mutex itsMutex;  ///< of what follows
    std::size_t itsDone = 0;
    std::optional<FailedBlock> itsFailure;
    std::exception_ptr itsException;
};

/// Do the work on this thread and on others.
/// @return whether a model had something to say. It would be its warning of the first value that it
///         saturates, once for each model
bool runSilently(SharedWork& work, unsigned threads) {
    const Silence silence;
    {
        std::vector<std::jthread> helpers;
        try {
            while (helpers.size() + 1 < threads) {
                helpers.emplace_back([&work] { work.run(); });
            }
        } catch (const std::system_error&) {
            // The system gives no more threads. Those that there are do the work.
        }
        work.run();
    }
    return silence.broken();
}

}  // namespace

PackedBits decodeTogether(const Capture& capture, const CoreOptions& core, unsigned threads,
                          Progress& progress) {
    SharedWork work(capture, core, groupSize(capture, threads), progress);
    if (runSilently(work, threads)) {
        warnOfSaturation(capture, core);
    }
    return work.result();
}

ToolError decodingError(const Capture& capture, std::size_t block, int status) {
    return {ExitCode::decodingFailed, capture.file,
            fmt::format("block {} of {} could not be decoded (status {})", block + 1, capture.blocks.size(),
                        status),
            "the line above says why"};
}

}  // namespace quarzel::tool
