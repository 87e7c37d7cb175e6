// SPDX-License-Identifier: MIT
// Sequences of calls through the C interface: a model with lanes and one without cannot be told apart.
#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "interleaver/lte_block_sizes.hpp"
#include "lanes/lane_setup.hpp"
#include "support/capture.hpp"
#include "support/random.hpp"

namespace quarzel::test {
namespace {

/// What is written to both standard streams, in one pipe: the order of the lines shows.
template <class Action>
std::string captureInterleaved(Action&& action) {
    const int err = dup(STDERR_FILENO);
    testing::internal::CaptureStdout();
    dup2(STDOUT_FILENO, STDERR_FILENO);
    std::forward<Action>(action)();
    dup2(err, STDERR_FILENO);
    close(err);
    return testing::internal::GetCapturedStdout();
}

/// Where a call's arrays lie in the memory of all calls, in integers. No place is a null pointer.
using Place = std::optional<std::size_t>;

struct Call {
    Place streams[3];
    Place bits;
    int size;
    int allocated;
    int iterations;
    unsigned tag;
};

/// A step of a sequence: a trace is switched on or off, or blocks are decoded by one call or several.
struct Step {
    std::optional<unsigned> dump;
    std::vector<Call> calls;
    bool batch = false;
    bool wantsStatuses = true;
};

struct Sequence {
    std::vector<int> memory;
    std::vector<Step> steps;
};

/// All that a caller can see of a sequence, but the text.
struct Seen {
    std::vector<int> memory;
    std::vector<int> statuses;
    std::vector<std::pair<int, unsigned>> records;
};

/// Run a sequence, its batches as batches or as single calls.
Seen run(vardel_ip_quarzel_state* state, const Sequence& sequence, bool batches) {
    Seen seen{sequence.memory, {}, {}};
    const auto at = [&seen](const Place& place) { return place ? &seen.memory[*place] : nullptr; };
    for (const Step& step : sequence.steps) {
        if (step.dump) {
            vardel_ip_quarzel_bitacc_dump_config(state, *step.dump);
        }
        std::vector<vardel_ip_quarzel_outputs> outputs;
        std::vector<vardel_ip_quarzel_inputs> inputs;
        for (const Call& call : step.calls) {
            outputs.push_back(
                {reinterpret_cast<unsigned char*>(at(call.bits)), call.allocated, -77, 0xDEADBEEF});
            inputs.push_back({at(call.streams[0]), at(call.streams[1]), at(call.streams[2]), call.size,
                              call.iterations, call.tag});
        }
        std::vector<int> statuses(step.calls.size(), -1);
        int first = 0;
        if (batches && step.batch) {
            first = vardel_ip_quarzel_bitacc_simulate_batch(state, outputs.data(), inputs.data(),
                                                            static_cast<int>(inputs.size()),
                                                            step.wantsStatuses ? statuses.data() : nullptr);
        } else {
            for (std::size_t i = 0; i < inputs.size(); ++i) {
                statuses[i] = vardel_ip_quarzel_bitacc_simulate(state, &outputs[i], inputs[i]);
                first = first == 0 ? statuses[i] : first;
            }
        }
        if (step.wantsStatuses) {
            seen.statuses.insert(seen.statuses.end(), statuses.begin(), statuses.end());
        }
        seen.statuses.push_back(first);
        for (const vardel_ip_quarzel_outputs& output : outputs) {
            seen.records.emplace_back(output.dout_size, output.tag);
        }
    }
    return seen;
}

/// What a random sequence may hold.
struct Mix {
    std::vector<std::uint32_t> sizes;
    int steps;
    int mostIterations;
    bool faults;  ///< wrong arguments, refused sizes, small buffers
    bool dumps;
};

class SequenceMaker {
  public:
    SequenceMaker(std::mt19937& random, const Mix& mix) : itsRandom(random), itsMix(mix) {
        // Few sizes a sequence, so that blocks of one size meet.
        for (int i = 0; i < 4; ++i) {
            itsSizes.push_back(mix.sizes[random() % mix.sizes.size()]);
        }
    }

    Sequence make() {
        for (int i = 0; i < itsMix.steps; ++i) {
            Step step;
            if (itsMix.dumps && chance(4)) {
                step.dump = static_cast<unsigned>(randomFrom(itsRandom, 0, 3));
            }
            step.batch = !chance(3);
            step.wantsStatuses = !chance(4);
            const int count = step.batch ? randomFrom(itsRandom, 0, chance(4) ? 40 : 8) : 1;
            for (int c = 0; c < count; ++c) {
                step.calls.push_back(makeCall());
            }
            itsSequence.steps.push_back(std::move(step));
        }
        return std::move(itsSequence);
    }

  private:
    bool chance(unsigned oneIn) { return itsRandom() % oneIn == 0; }

    std::size_t allocate(std::size_t ints) {
        const std::size_t place = itsSequence.memory.size();
        itsSequence.memory.resize(place + ints, 0x5A5A5A5A);
        return place;
    }

    Call makeCall() {
        const std::uint32_t K = itsSizes[itsRandom() % itsSizes.size()];
        const auto size = static_cast<int>(K + 4);
        Call call{{}, {}, size, chance(8) ? -1 : static_cast<int>(K), 1, 0};
        call.iterations = randomFrom(itsRandom, 1, chance(2) ? 2 : itsMix.mostIterations);
        call.tag = chance(4) ? static_cast<unsigned>(itsRandom()) : static_cast<unsigned>(itsRandom() % 256);
        const auto kind = static_cast<Input>(randomFrom(itsRandom, 0, inputKinds - 1));
        const bool saturates = chance(10);
        for (Place& place : call.streams) {
            std::vector<int> stream(K + 4);
            fillStream(itsRandom, kind, stream);
            if (saturates) {
                stream[itsRandom() % stream.size()] = randomFrom(itsRandom, -(1 << 25), 1 << 25);
            }
            place = allocate(stream.size());
            std::copy(stream.begin(), stream.end(),
                      itsSequence.memory.begin() + static_cast<std::ptrdiff_t>(*place));
        }
        call.bits = allocate(K / 4 + 2);
        if (itsMix.faults && chance(4)) {
            spoil(call);
        }
        return call;
    }

    void spoil(Call& call) {
        switch (randomFrom(itsRandom, 0, 7)) {
            case 0:
                call.bits.reset();
                break;
            case 1:
                call.streams[itsRandom() % 3].reset();
                break;
            case 2:
                call.iterations = chance(2) ? 0 : 16;
                break;
            case 3:
                call.size = chance(2) ? 0 : -5;
                break;
            case 4:
                call.size = randomFrom(itsRandom, 1, 4);
                break;
            case 5:
                call.size -= randomFrom(itsRandom, 1, 7);
                break;
            default:
                call.allocated = call.size - 5;
        }
    }

    std::mt19937& itsRandom;
    const Mix& itsMix;
    std::vector<std::uint32_t> itsSizes;
    Sequence itsSequence;
};

void expectSame(const Seen& lanes, const Seen& literal) {
    EXPECT_EQ(lanes.statuses, literal.statuses);
    EXPECT_EQ(lanes.records, literal.records);
    EXPECT_TRUE(lanes.memory == literal.memory) << "decisions, or bytes that are none";
}

/// Compare random sequences on every candidate.
void compare(const Mix& mix, int count) {
    std::mt19937 random = seededRandom();
    const auto candidates = supportedCandidates();
    ASSERT_FALSE(candidates.empty());
    for (int i = 0; i < (exhaustive() ? 50 : 1) * count; ++i) {
        const Sequence sequence = SequenceMaker(random, mix).make();
        const int units = 2 << randomFrom(random, 0, 2);
        const int algorithm = randomFrom(random, 0, 2);
        const State literalState = makeLiteralState(units, 8, algorithm);
        Seen literal;
        const bool interleaved = i % 2 == 0;
        Output expected;
        if (interleaved) {
            expected.out = captureInterleaved([&] { literal = run(literalState.get(), sequence, false); });
        } else {
            expected = capture([&] { literal = run(literalState.get(), sequence, false); });
        }
        for (const lanes::Candidate& candidate : candidates) {
            for (const bool batches : {false, true}) {
                SCOPED_TRACE(candidate.name + std::string(batches ? ", batches" : ", single calls") +
                             ", sequence " + std::to_string(i) + ", units " + std::to_string(units) +
                             ", type " + std::to_string(algorithm));
                const State state = makeLaneState(units, 8, algorithm, candidate);
                Seen seen;
                Output output;
                if (interleaved) {
                    output.out = captureInterleaved([&] { seen = run(state.get(), sequence, batches); });
                } else {
                    output = capture([&] { seen = run(state.get(), sequence, batches); });
                }
                expectSame(seen, literal);
                EXPECT_TRUE(output.out == expected.out) << "text";
                EXPECT_TRUE(output.err == expected.err) << "text of the error stream";
                ASSERT_FALSE(testing::Test::HasFailure());
            }
        }
    }
}

std::vector<std::uint32_t> sizesUpTo(std::uint32_t most) {
    std::vector<std::uint32_t> sizes = lteBlockSizes();
    std::erase_if(sizes, [most](std::uint32_t K) { return K > most; });
    return sizes;
}

/// How many sequences to compare; fewer where the literal decoder is slow for want of an optimiser.
constexpr int scaled(int count) {
#if defined(NDEBUG)
    return count;
#else
    return count / 10;
#endif
}

TEST(LaneSequences, CallsOfAllSizesAreAsIfDecodedLiterally) {
    compare({sizesUpTo(6144), 4, 6, false, false}, scaled(30));
}

TEST(LaneSequences, FaultsAndWarningsAreAsIfDecodedLiterally) {
    compare({sizesUpTo(512), 12, 15, true, false}, scaled(60));
}

TEST(LaneSequences, TracesInBetweenAreAsIfAllWasDecodedLiterally) {
    compare({sizesUpTo(160), 12, 3, false, true}, scaled(60));
}

TEST(LaneSequences, TracesAmongLargerBlocksAndFaultsAreAsIfAllWasDecodedLiterally) {
    compare({sizesUpTo(1056), 8, 2, true, true}, scaled(20));
}

TEST(LaneBatch, MoreBlocksThanAreHandedOverAtOnceAreAsIfDecodedLiterally) {
    std::mt19937 random = seededRandom();
    for (const bool alike : {true, false}) {
        std::vector<Block> blocks;
        std::vector<vardel_ip_quarzel_inputs> inputs;
        for (std::size_t i = 0; i < 600; ++i) {
            Block& block = blocks.emplace_back(alike || random() % 4 != 0 ? 44 : 52);
            for (std::vector<int>* stream : {&block.systematic, &block.parity1, &block.parity2}) {
                std::ranges::generate(*stream, [&] { return static_cast<int>(random() % 60) - 30; });
            }
        }
        std::ranges::transform(blocks, std::back_inserter(inputs), &Block::inputs);
        const auto decisions = [&](const char* implementation) {
            const State state = makeState();
            EXPECT_EQ(vardel_ip_quarzel_set_implementation(state.get(), implementation), 0);
            std::vector<unsigned char> bits(600 * 48, 7);
            std::vector<vardel_ip_quarzel_outputs> outputs;
            for (std::size_t i = 0; i < 600; ++i) {
                outputs.push_back({&bits[48 * i], 48, 0, 0});
            }
            EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate_batch(state.get(), outputs.data(), inputs.data(), 600,
                                                              nullptr),
                      0);
            return bits;
        };
        EXPECT_EQ(decisions(lanes::bestCandidate().name), decisions("literal")) << alike;
    }
}

TEST(LaneBatch, WrongArgumentsAreRefusedInTheirOrder) {
    const State state = makeState();
    Block block(44);
    std::vector<unsigned char> bits(40);
    vardel_ip_quarzel_outputs output{bits.data(), 40, -77, 5};
    const vardel_ip_quarzel_inputs input = block.inputs();
    const auto textOf = [&](vardel_ip_quarzel_state* s, vardel_ip_quarzel_outputs* out,
                            const vardel_ip_quarzel_inputs* in, int count, int expected) {
        int statuses[] = {-9};
        const Output text = capture([&] {
            EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate_batch(s, out, in, count, statuses), expected);
        });
        EXPECT_EQ(text.out, "");
        EXPECT_EQ(statuses[0], -9);
        EXPECT_EQ(output.dout_size, -77);
        return text.err;
    };
    EXPECT_EQ(textOf(nullptr, nullptr, nullptr, -1, 1),
              "ERROR:decoder:Simulate batch called with null state structure\n");
    EXPECT_EQ(textOf(state.get(), nullptr, nullptr, -1, 1), "ERROR:decoder:count must not be negative\n");
    EXPECT_EQ(textOf(state.get(), nullptr, nullptr, 0, 0), "");
    EXPECT_EQ(textOf(state.get(), nullptr, nullptr, 1, 1),
              "ERROR:decoder:Simulate batch called with null output structures\n");
    EXPECT_EQ(textOf(state.get(), &output, nullptr, 1, 1),
              "ERROR:decoder:Simulate batch called with null input structures\n");
    EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate_batch(state.get(), &output, &input, 1, nullptr), 0);
    EXPECT_EQ(output.dout_size, 40);
}

}  // namespace
}  // namespace quarzel::test
