// SPDX-License-Identifier: MIT
// The core gives what a decoder written plainly from the definition of its arithmetic gives, at every pass.
#include "oracle/plain_decoder.hpp"

#include <gtest/gtest.h>

#include <iostream>
#include <map>
#include <random>
#include <sstream>
#include <string>

#include "frozen/frozen_core.hpp"
#include "lanes/lane_setup.hpp"
#include "oracle/plain_qpp_rows.hpp"
#include "support/model.hpp"
#include "support/random.hpp"

namespace quarzel::test {
namespace {

/// A core and its plain decoder, which runs each pass when the core has run it.
class Pair {
  public:
    Pair(int units, int algorithm)
        : itsState(makeState(genericsOf(units, 8, algorithm))),
          itsPlain(oracle::soundDesign(units, algorithm)) {}

    /// Decode a block with both; the first difference, or nothing.
    std::string differenceOn(const Block& block) {
        itsDifference.clear();
        itsPasses = 0;
        const oracle::Streams streams{block.systematic, block.parity1, block.parity2};
        itsPlain.load(streams);
        vardel_ip_quarzel_set_passes(itsState.get(), 2 * static_cast<unsigned>(block.iterations), take, this);
        std::vector<unsigned char> bits(block.systematic.size() - 4);
        vardel_ip_quarzel_outputs outputs{bits.data(), static_cast<int>(bits.size()), 0, 0};
        const int status = vardel_ip_quarzel_bitacc_simulate(itsState.get(), &outputs, block.inputs());
        note("status", 0, 0, 0, status);
        note("passes", 0, 0, 2 * block.iterations, itsPasses);
        const oracle::Answer answer = itsPlain.decode(streams, block.iterations, block.tag);
        note("tag", 0, 0, static_cast<int>(answer.tag), static_cast<int>(outputs.tag));
        for (std::size_t i = 0; i < bits.size(); ++i) {
            note("decision", i, 0, answer.decisions[i], bits[i]);
        }
        return itsDifference;
    }

  private:
    static void take(void* self, const vardel_ip_quarzel_pass* pass) {
        static_cast<Pair*>(self)->compare(*pass);
    }

    void note(const char* what, std::size_t step, std::size_t column, int plain, int core) {
        if (plain != core && itsDifference.empty()) {
            std::ostringstream text;
            text << "pass " << itsPasses << ' ' << what << '[' << step << "][" << column << "]: plain "
                 << plain << ", core " << core;
            itsDifference = text.str();
        }
    }

    /// All signals at the information steps; what a core computes at the termination steps, too.
    void compare(const vardel_ip_quarzel_pass& pass) {
        itsPlain.runPass(static_cast<int>(pass.pass));
        note("code", 0, 0, itsPlain.codeOf(static_cast<int>(pass.pass)) + 1, static_cast<int>(pass.code));
        const oracle::Signals& plain = itsPlain.signals();
        for (std::size_t k = 0; k < pass.steps; ++k) {
            note("intrinsic", k, 0, 8 * plain.intrinsic[k], pass.intrinsic[k]);
            if (k > pass.block_size) {
                continue;
            }
            for (std::size_t state = 0; state < 8; ++state) {
                note("alpha", k, state, 16 * plain.alpha[k][state], pass.alpha[8 * k + state]);
            }
            if (k == pass.block_size) {
                continue;
            }
            for (std::size_t state = 0; state < 8; ++state) {
                note("beta", k, state, 16 * plain.beta[k][state], pass.beta[8 * k + state]);
            }
            static constexpr std::size_t order[] = {2, 1, 3,
                                                    0};  // x - p - q, x - p + q, x + p - q, x + p + q
            for (std::size_t metric = 0; metric < 4; ++metric) {
                note("gamma", k, metric, 16 * plain.gamma[k][order[metric]], pass.gamma[4 * k + metric]);
            }
            note("llr", k, 0, 16 * plain.llr[k], pass.llr[k]);
            note("extrinsic", k, 0, 16 * plain.extrinsic[k], pass.extrinsic[k]);
        }
        ++itsPasses;
    }

    State itsState;
    oracle::PlainDecoder itsPlain;
    std::string itsDifference;
    int itsPasses = 0;
};

Block anyBlock(std::mt19937& random, std::size_t K) {
    const int kind = randomFrom(random, 0, inputKinds);
    Block block = kind == inputKinds ? Block(K + 4, 0) : randomBlock(random, static_cast<Input>(kind), K);
    block.iterations = randomFrom(random, 0, 9) == 0 ? randomFrom(random, 1, 15) : randomFrom(random, 1, 3);
    block.tag = static_cast<unsigned>(randomFrom(random, 0, 255));
    return block;
}

TEST(PlainDecoder, EqualsTheCoreInEverySignalOfEveryPass) {
    std::mt19937 random = seededRandom();
    std::map<std::pair<int, int>, Pair> pairs;
    const int blocks = exhaustive() ? 10000 : 300;
    for (int b = 0; b < blocks; ++b) {
        const int units = 2 << randomFrom(random, 0, 2), algorithm = randomFrom(random, 0, 2);
        const int mostRow = b % 25 == 0 ? 187 : 92;  // sizes up to 1056 are enough for most blocks
        const int row = exhaustive() ? b % 188 : randomFrom(random, 0, mostRow);
        const auto K = static_cast<std::size_t>(oracle::qppRows[static_cast<std::size_t>(row)].K);
        const Block block = anyBlock(random, K);
        Pair& pair = pairs.try_emplace({units, algorithm}, units, algorithm).first->second;
        ASSERT_EQ(pair.differenceOn(block), "")
            << "block " << b << ", K = " << K << ", " << units << " units, type " << algorithm << ", "
            << block.iterations << " iterations";
    }
    std::cout << blocks << " blocks compared\n";
}

// The core decodes in lanes, groups of blocks as large as its widest vectors. QUARZEL_TEST_BLOCKS: how many
// blocks.
TEST(PlainDecoder, DecidesAsTheCoreDoes) {
    std::mt19937 random = seededRandom();
    const char* const wanted = std::getenv("QUARZEL_TEST_BLOCKS");
    const long blocks = wanted != nullptr ? std::atol(wanted) : 1000;
    constexpr int group = 64;
    std::map<std::pair<int, int>, FrozenCore> cores;
    long compared = 0;
    for (; compared < blocks; compared += group) {
        const int units = 2 << randomFrom(random, 0, 2), algorithm = randomFrom(random, 0, 2);
        // Few sizes above 104, for the time that they take.
        const int row = randomFrom(random, 0, randomFrom(random, 0, 499) == 0 ? 187 : 8);
        const auto K = static_cast<std::size_t>(oracle::qppRows[static_cast<std::size_t>(row)].K);
        std::vector<Block> sent;
        for (int b = 0; b < group; ++b) {
            sent.push_back(anyBlock(random, K));
        }
        const FrozenCase which{static_cast<std::uint32_t>(K), static_cast<std::uint32_t>(units),
                               static_cast<std::uint32_t>(algorithm)};
        const Decisions decisions =
            cores.try_emplace({units, algorithm}, which, implementations().front()).first->second(sent);
        oracle::PlainDecoder plain(oracle::soundDesign(units, algorithm));
        for (std::size_t b = 0; b < sent.size(); ++b) {
            const oracle::Streams streams{sent[b].systematic, sent[b].parity1, sent[b].parity2};
            ASSERT_EQ(plain.decode(streams, sent[b].iterations, 0).decisions, decisions[b])
                << "block " << compared + static_cast<long>(b) << ", K = " << K << ", " << units
                << " units, type " << algorithm << ", " << sent[b].iterations << " iterations";
        }
    }
    std::cout << compared << " blocks compared\n";
}

}  // namespace
}  // namespace quarzel::test
