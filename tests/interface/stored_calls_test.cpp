// SPDX-License-Identifier: MIT
// The stored calls of the C interface: status, decisions, tag and every byte of text.
#include <gtest/gtest.h>

#include <string>

#include "support/capture.hpp"
#include "support/model.hpp"
#include "support/vectors.hpp"

namespace quarzel::test {
namespace {

void replay(const nlohmann::json& stored) {
    SCOPED_TRACE(stored["name"].get<std::string>());
    const State state =
        makeState(genericsOf(stored["num_pu"], stored["tag_width"], stored["algorithm_type"]));
    ASSERT_NE(state, nullptr);
    if (stored["dump_count"] != 0) {
        vardel_ip_quarzel_bitacc_dump_config(state.get(), stored["dump_count"]);
    }
    for (const nlohmann::json& call : stored["calls"]) {
        const Block block(call["rsc1_sys"], call["rsc1_par"], call["rsc2_par"], call["iterations"],
                          call["tag"]);
        Result result;
        const Output output = capture([&] { result = simulate(state.get(), block.inputs()); });
        EXPECT_EQ(result.status, call["status"].get<int>());
        EXPECT_EQ(output.out, call["stdout"].get<std::string>());
        EXPECT_EQ(output.err, call["stderr"].get<std::string>());
        if (result.status == 0) {
            std::string bits;
            for (int i = 0; i < result.outputs.dout_size; ++i) {
                bits += static_cast<char>('0' + result.bits[static_cast<std::size_t>(i)]);
            }
            EXPECT_EQ(bits, call["dout"].get<std::string>());
            EXPECT_EQ(result.outputs.tag, call["tag_out"].get<unsigned>());
        }
    }
}

/// Replay the cases whose name begins with `kind`, of which there are `count`.
void replayKind(const std::string& kind, std::size_t count) {
    std::size_t replayed = 0;
    for (const nlohmann::json& stored : readCases("decode.jsonl")) {
        if (stored["name"].get<std::string>().starts_with(kind)) {
            replay(stored);
            ++replayed;
        }
    }
    EXPECT_EQ(replayed, count);
}

TEST(StoredCalls, NoisyBlocksGiveTheStoredDecisions) {
    replayKind("noisy", 108);
}

TEST(StoredCalls, ExtremeInputsGiveTheStoredDecisionsAndWarnings) {
    replayKind("extreme", 28);
}

TEST(StoredCalls, SequencesOfSizesOnOneStateGiveTheStoredDecisions) {
    replayKind("sequence", 12);
}

TEST(StoredCalls, TracesAreTheStoredText) {
    replayKind("dump", 8);
}

}  // namespace
}  // namespace quarzel::test
