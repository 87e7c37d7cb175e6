// SPDX-License-Identifier: MIT
#include "link_set.hpp"

#include <algorithm>
#include <fstream>

#include "link/coding/standard_coding.hpp"
#include "run_tool.hpp"
#include "vectors/memory_image.hpp"

namespace quarzel::test {

std::vector<LinkCase> linkCases() {
    return {
        LinkCase{"OneCodeBlockWithFiller",
                 {"--transport-block", "70", "--coded-bits", "202", "--modulation", "qpsk", "--rv", "0,2"},
                 {0, 70, 202, 1, {0, 2}, {link::Modulation::qpsk, {}, link::Demapping::maxLog, {}}}},
        LinkCase{"TwoCodeBlocksOverAFadingChannel",
                 {"--transport-block", "6200", "--coded-bits", "9600", "--modulation", "16qam", "--channel",
                  "rayleigh", "--demapping", "exact", "--harq", "3"},
                 {0,
                  6200,
                  9600,
                  1,
                  {0, 2, 3},
                  {link::Modulation::qam16, link::Fading::perSymbol, link::Demapping::exact, {}}}},
        LinkCase{"ACodeBlockAloneSentSeveralTimes",
                 {"--block-size", "40", "--coded-bits", "500", "--rv", "1,1", "--llr", "30"},
                 {40,
                  0,
                  500,
                  1,
                  {1, 1},
                  {link::Modulation::bpsk, {}, link::Demapping::maxLog, {link::Quantiser::Kind::llr, 30}}}}};
}

Words::Words(const std::string& file) {
    std::ifstream stream(file);
    EXPECT_TRUE(stream) << file;
    constexpr std::size_t most = 1 << 20;
    for (const tool::MemoryWord& word : tool::readMemoryText(stream, most, file).words) {
        if (word.kind == tool::MemoryWord::Kind::missing) {
            break;
        }
        EXPECT_EQ(word.kind, tool::MemoryWord::Kind::known);
        itsWords.push_back(static_cast<int>(word.value));
    }
}

std::vector<int> Words::bits(std::size_t count) {
    std::vector<int> bits = next(count);
    std::replace(bits.begin(), bits.end(), 2, standard::null);
    return bits;
}

std::vector<int> Words::soft(std::size_t count) {
    std::vector<int> values = next(count);
    std::transform(values.begin(), values.end(), values.begin(),
                   [](int word) { return word < 128 ? word : word - 256; });
    return values;
}

std::vector<int> Words::next(std::size_t count) {
    std::vector<int> words(count);
    for (int& word : words) {
        word = itsWords.at(itsNext++);
    }
    return words;
}

LinkSet::LinkSet() {
    std::vector<std::string> arguments = {"vectors",      path(""),
                                          "--blocks",     std::to_string(blocks),
                                          "--seed",       std::to_string(seed),
                                          "--units",      "4",
                                          "--iterations", "2"};
    arguments.insert(arguments.end(), GetParam().options.begin(), GetParam().options.end());
    const ToolRun run = runTool(arguments);
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 0);
}

std::vector<Words> LinkSet::inputs() const {
    return {words("u4_a1/rsc1_sys.hex"), words("u4_a1/rsc1_par.hex"), words("u4_a1/rsc2_par.hex")};
}

std::vector<int> LinkSet::nextInput(std::vector<Words>& inputs, std::size_t K) {
    std::vector<int> streams;
    for (Words& input : inputs) {
        const std::vector<int> values = input.soft(K + tailPositions);
        streams.insert(streams.end(), values.begin(), values.end());
    }
    return streams;
}

}  // namespace quarzel::test
