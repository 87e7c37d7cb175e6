// SPDX-License-Identifier: MIT
#include "host_core.hpp"

#include <algorithm>
#include <vector>

#include "link/choice.hpp"
#include "link/size_table.hpp"

namespace quarzel::bindings {

namespace {

[[noreturn]] void refuse(const char* name, const char* range, int value) {
    throw BindingError(Fault::value,
                       std::string(name) + " must be " + range + ", not " + std::to_string(value));
}

void checkSettings(const CoreSettings& settings) {
    if (settings.units != 2 && settings.units != 4 && settings.units != 8) {
        refuse("units", "2, 4 or 8", settings.units);
    }
    if (settings.algorithm < 0 || settings.algorithm > 2) {
        refuse("algorithm", "0, 1 or 2", settings.algorithm);
    }
    if (settings.tagWidth < 0 || settings.tagWidth > 32) {
        refuse("tag width", "a number from 0 to 32", settings.tagWidth);
    }
}

/// Keeps a core to the thread that is using it.
class Use {
  public:
    /// @throws BindingError when another thread uses it
    explicit Use(std::atomic<bool>& busy) : itsBusy(busy) {
        if (itsBusy.exchange(true)) {
            throw BindingError(
                Fault::busy,
                "the decoder is in use by another thread; give each thread a decoder of its own");
        }
    }
    Use(const Use&) = delete;
    Use& operator=(const Use&) = delete;
    ~Use() { itsBusy = false; }

  private:
    std::atomic<bool>& itsBusy;
};

/// Does something at the end of a scope.
template <class End>
class AtEnd {
  public:
    explicit AtEnd(End end) : itsEnd(end) {}
    AtEnd(const AtEnd&) = delete;
    AtEnd& operator=(const AtEnd&) = delete;
    ~AtEnd() { itsEnd(); }

  private:
    End itsEnd;
};

/// Blocks that are decoded before somebody is asked whether to stop: enough to fill the lanes of any
/// processor, and to make the asking cost nothing.
std::size_t groupSize(std::size_t positions) {
    constexpr std::size_t maxLanes = 32;
    constexpr std::size_t enoughValues = 1 << 18;
    return (enoughValues / (3 * positions) / maxLanes + 1) * maxLanes;
}

/// The same for the first of some blocks of any sizes: enough of each size for the lanes, where there are
/// many.
std::size_t recordGroupSize(std::span<const vardel_ip_quarzel_inputs> inputs) {
    constexpr std::size_t enoughValues = 1 << 20;
    std::size_t values = 0;
    std::size_t count = 0;
    while (count < inputs.size() && values < enoughValues) {
        values += 3 * static_cast<std::size_t>(inputs[count++].din_size);
    }
    return count;
}

void askWhetherToStop(const HostCore::Interrupted& interrupted) {
    if (interrupted && interrupted()) {
        throw BindingError(Fault::interrupted, "decoding was interrupted");
    }
}

template <SoftValue Value>
void decodeGroups(Core& core, SoftBlocks<Value> blocks, DecodeJob job,
                  const HostCore::Interrupted& interrupted) {
    const std::size_t K = blockSizeOf(blocks.positions);
    while (blocks.count != 0) {
        SoftBlocks<Value> group = blocks;
        group.count = std::min(blocks.count, groupSize(blocks.positions));
        const std::size_t bits =
            group.count * K * (job.everyIteration ? static_cast<std::size_t>(job.iterations) : 1);
        const std::size_t tags = job.tags.empty() ? 0 : group.count;
        if (job.everyIteration) {
            core.decodeEveryIteration(group, job.iterations, job.bits.first(bits), job.tags.first(tags));
        } else {
            core.decode(group, job.iterations, job.bits.first(bits), job.tags.first(tags));
        }
        askWhetherToStop(interrupted);
        job.bits = job.bits.subspan(bits);
        job.tags = job.tags.subspan(tags);
        const std::ptrdiff_t step = blocks.blockStride * static_cast<std::ptrdiff_t>(group.count);
        blocks.count -= group.count;
        blocks.systematic += step;
        blocks.parity1 += step;
        blocks.parity2 += step;
    }
}

void decodeJob(Core& core, const DecodeJob& job, const HostCore::Interrupted& interrupted = {}) {
    checkIterations(job.iterations);
    std::visit([&](const auto& blocks) { decodeGroups(core, blocks, job, interrupted); }, job.blocks);
}

}  // namespace

int algorithmOf(std::string_view name) {
    return static_cast<int>(link::placeOf(algorithmNames, name, "algorithm"));
}

std::uint32_t blockSizeOf(std::size_t positions) {
    if (const auto size = link::findPositions(positions)) {
        return size->K;
    }
    throw BindingError(Fault::value, "there is no block size for streams of " + std::to_string(positions) +
                                         " soft values; the nearest that have one: " +
                                         link::nearestPositionsText(positions));
}

void checkIterations(int iterations) {
    if (iterations < 1 || iterations > 15) {
        refuse("iterations", "a number from 1 to 15", iterations);
    }
}

/// Do some work with the core, which hands its warnings and its trace to the outcome.
template <class Work>
Outcome HostCore::use(Work work) noexcept {
    Outcome outcome;
    guard(outcome, [&] {
        const Use inUse(itsBusy);
        if (!itsCore) {
            throw BindingError(Fault::closed, "the decoder has been closed; make a new one");
        }
        itsCore->onMessage([&outcome](MessageKind kind, std::string_view line) {
            if (kind == MessageKind::trace) {
                outcome.trace.append(line) += '\n';
            } else {
                outcome.warnings.emplace_back(plainText(line));
            }
        });
        work(*itsCore);
    });
    return outcome;
}

Outcome HostCore::open(const CoreSettings& settings, const std::string& implementation) noexcept {
    return guarded([&] {
        const Use inUse(itsBusy);
        checkSettings(settings);
        if (!implementation.empty()) {
            link::placeOf(implementations(), implementation, "implementation");
        }
        itsCore.emplace(settings);
        if (!implementation.empty()) {
            itsCore->choose(implementation);
        }
        itsImplementation = itsCore->implementation();
    });
}

Outcome HostCore::close() noexcept {
    return guarded([&] {
        const Use inUse(itsBusy);
        itsCore.reset();
    });
}

Outcome HostCore::decode(const DecodeJob& job, const Interrupted& interrupted) noexcept {
    return use([&](Core& core) { decodeJob(core, job, interrupted); });
}

Outcome HostCore::decodeBatch(std::span<const vardel_ip_quarzel_inputs> inputs,
                              std::span<vardel_ip_quarzel_outputs> outputs,
                              const Interrupted& interrupted) noexcept {
    return use([&](Core& core) {
        for (const vardel_ip_quarzel_inputs& block : inputs) {
            checkIterations(block.iterations);
            blockSizeOf(static_cast<std::size_t>(block.din_size));
        }
        while (!inputs.empty()) {
            const std::size_t count = recordGroupSize(inputs);
            core.decode(inputs.first(count), outputs.first(count));
            askWhetherToStop(interrupted);
            inputs = inputs.subspan(count);
            outputs = outputs.subspan(count);
        }
    });
}

Outcome HostCore::traceText(const DecodeJob& block, unsigned passes) noexcept {
    return use([&](Core& core) {
        core.trace(passes);
        const AtEnd end([&core] { core.trace(0); });
        decodeJob(core, block);
    });
}

Outcome HostCore::tracePasses(const DecodeJob& block, unsigned passes,
                              const Core::PassHandler& handler) noexcept {
    return use([&](Core& core) {
        core.passes(passes, handler);
        const AtEnd end([&core] { core.passes(0, {}); });
        decodeJob(core, block);
    });
}

}  // namespace quarzel::bindings
