// SPDX-License-Identifier: MIT
#include "core.hpp"

#include <algorithm>
#include <vector>

#include "link/size_table.hpp"

namespace quarzel::bindings {

namespace {

[[noreturn]] void refuse(const char* name, const char* range, int value) {
    throw BindingError(Fault::value,
                       std::string(name) + " must be " + range + ", not " + std::to_string(value));
}

void checkIterations(int iterations) {
    if (iterations < 1 || iterations > 15) {
        refuse("iterations", "a number from 1 to 15", iterations);
    }
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

/// Traces passes while it lives.
class Tracing {
  public:
    Tracing(vardel_ip_quarzel_state* state, unsigned passes) : itsState(state) {
        vardel_ip_quarzel_bitacc_dump_config(itsState, passes);
    }
    Tracing(const Tracing&) = delete;
    Tracing& operator=(const Tracing&) = delete;
    ~Tracing() { vardel_ip_quarzel_bitacc_dump_config(itsState, 0); }

  private:
    vardel_ip_quarzel_state* itsState;
};

void checkOpen(const vardel_ip_quarzel_state* state) {
    if (state == nullptr) {
        throw BindingError(Fault::closed, "the decoder has been closed; make a new one");
    }
}

/// The model said no, and said why.
[[noreturn]] void failModel(const Messages& messages) {
    throw BindingError(Fault::model,
                       messages.errors.empty() ? "the model failed without a word" : messages.errors.front());
}

/// Blocks on their way through the C interface. Values that are no ints are widened in groups that stay in
/// the processor's cache, which costs a batch nothing that one could measure.
class Groups {
  public:
    Groups(vardel_ip_quarzel_state* state, int iterations) : itsState(state), itsIterations(iterations) {}

    /// Take the next group off the front of the blocks and decode it.
    void decodeFront(std::span<SoftBlock>& blocks, const Messages& messages) {
        const std::span<SoftBlock> group = blocks.first(groupSize(blocks));
        blocks = blocks.subspan(group.size());
        reserve(group);
        for (const SoftBlock& block : group) {
            add(block);
        }
        if (vardel_ip_quarzel_bitacc_simulate_batch(itsState, itsOutputs.data(), itsInputs.data(),
                                                    static_cast<int>(group.size()), nullptr) != 0) {
            failModel(messages);
        }
        for (std::size_t i = 0; i < group.size(); ++i) {
            group[i].tag = itsOutputs[i].tag;
        }
    }

  private:
    /// Enough blocks to fill the lanes of any processor, several times over when they are small.
    static std::size_t groupSize(std::span<const SoftBlock> blocks) {
        constexpr std::size_t leastBlocks = 32;
        constexpr std::size_t enoughValues = 1 << 16;
        std::size_t count = 0;
        std::size_t values = 0;
        while (count < blocks.size() && (values < enoughValues || count % leastBlocks != 0)) {
            values += 3 * blocks[count++].positions;
        }
        return count;
    }

    /// Make room, so that no pointer into the widened values moves.
    void reserve(std::span<const SoftBlock> group) {
        std::size_t values = 0;
        for (const SoftBlock& block : group) {
            values += block.type == SoftType::int32 ? 0 : 3 * block.positions;
        }
        itsInts.clear();
        itsInts.reserve(values);
        itsInputs.clear();
        itsOutputs.clear();
    }

    const int* ints(const SoftBlock& block, std::size_t stream) {
        if (block.type == SoftType::int32) {
            return static_cast<const int*>(block.streams[stream]);
        }
        const std::size_t from = itsInts.size();
        widen(block.streams[stream], block.type, block.positions, itsInts);
        return itsInts.data() + from;
    }

    void add(const SoftBlock& block) {
        const auto positions = static_cast<int>(block.positions);
        const int* const systematic = ints(block, 0);
        const int* const parity1 = ints(block, 1);
        const int* const parity2 = ints(block, 2);
        itsInputs.push_back({systematic, parity1, parity2, positions, itsIterations, block.tag});
        itsOutputs.push_back({block.bits, positions - 4, 0, 0});
    }

    vardel_ip_quarzel_state* itsState;
    int itsIterations;
    std::vector<int> itsInts;
    std::vector<vardel_ip_quarzel_inputs> itsInputs;
    std::vector<vardel_ip_quarzel_outputs> itsOutputs;
};

}  // namespace

int algorithmOf(std::string_view name) {
    const auto found = std::find(algorithmNames.begin(), algorithmNames.end(), name);
    if (found == algorithmNames.end()) {
        throw BindingError(Fault::value, "there is no algorithm '" + std::string(name) +
                                             "'; choose max-log, scaled-max-log or max-star");
    }
    return static_cast<int>(found - algorithmNames.begin());
}

std::uint32_t blockSizeOf(std::size_t positions) {
    if (const LteParams* const row = link::findPositions(positions)) {
        return row->K;
    }
    throw BindingError(Fault::value, "streams of " + std::to_string(positions) +
                                         " soft values fit no block size; the nearest that do: " +
                                         link::nearestPositionsText(positions));
}

Outcome Core::open(const CoreSettings& settings) noexcept {
    return guarded([&](const Messages& messages) {
        const Use use(itsBusy);
        checkSettings(settings);
        vardel_ip_quarzel_generics generics;
        vardel_ip_quarzel_get_default_generics(&generics);
        generics.C_NUM_PU = settings.units;
        generics.C_ALGORITHM_TYPE = settings.algorithm;
        generics.C_TAG_WIDTH = settings.tagWidth;
        itsState.reset(vardel_ip_quarzel_create_state(generics));
        if (itsState == nullptr) {
            failModel(messages);
        }
    });
}

Outcome Core::close() noexcept {
    return guarded([&](const Messages&) {
        const Use use(itsBusy);
        itsState.reset();
    });
}

Outcome Core::decode(std::span<SoftBlock> blocks, int iterations, const Interrupted& interrupted) noexcept {
    return guarded([&](const Messages& messages) {
        const Use use(itsBusy);
        checkOpen(itsState.get());
        checkIterations(iterations);
        for (const SoftBlock& block : blocks) {
            blockSizeOf(block.positions);
        }
        Groups groups(itsState.get(), iterations);
        while (!blocks.empty()) {
            groups.decodeFront(blocks, messages);
            if (interrupted && interrupted()) {
                throw BindingError(Fault::interrupted, "decoding was interrupted");
            }
        }
    });
}

Outcome Core::trace(SoftBlock& block, int iterations, unsigned passes, std::string& text) noexcept {
    return guarded([&](Messages& messages) {
        const Use use(itsBusy);
        checkOpen(itsState.get());
        checkIterations(iterations);
        blockSizeOf(block.positions);
        std::span<SoftBlock> blocks(&block, 1);
        {
            const Tracing tracing(itsState.get(), passes);
            Groups(itsState.get(), iterations).decodeFront(blocks, messages);
        }
        text.swap(messages.trace);
    });
}

}  // namespace quarzel::bindings
