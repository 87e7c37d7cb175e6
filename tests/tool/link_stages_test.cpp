// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <fstream>
#include <optional>

#include "link/coding/standard_coding.hpp"
#include "link/modulation/standard_modulation.hpp"
#include "link_set.hpp"

namespace quarzel::test {

namespace {

using standard::Bits;

Bits joined(const standard::Streams& streams) {
    Bits all = streams[0];
    all.insert(all.end(), streams[1].begin(), streams[1].end());
    all.insert(all.end(), streams[2].begin(), streams[2].end());
    return all;
}

bool crcHolds(const Bits& bits, const std::vector<int>& powers) {
    const Bits parity = standard::parity(Bits(bits.begin(), bits.end() - 24), powers);
    return std::equal(parity.begin(), parity.end(), bits.end() - 24);
}

/// The code blocks of the transport block that comes next in the files of bits.
std::vector<Bits> nextCodeBlocks(std::size_t A, Words& bits, Words& withCrc) {
    Bits b = bits.bits(A);
    const Bits parity = standard::parity(b, standard::powersOfCrc24A());
    b.insert(b.end(), parity.begin(), parity.end());
    EXPECT_EQ(withCrc.bits(b.size()), b);
    return standard::segments(b);
}

class LinkStages : public LinkSet {};

}  // namespace

TEST_P(LinkStages, AreThoseOfTheStandardUpToTheSymbols) {
    Words codeBlockWords = words("link/code_blocks.hex");
    Words streams = words("link/streams.hex");
    Words subBlocks = words("link/sub_blocks.hex");
    Words buffer = words("link/buffer.hex");
    Words coded = words("link/coded.hex");
    Words symbols = words("link/symbols.hex");
    std::optional<Words> bits;
    std::optional<Words> withCrc;
    if (hasCrc()) {
        bits = words("link/bits.hex");
        withCrc = words("link/with_crc.hex");
    }
    const unsigned Qm = link::bitsOfSymbol(setup().channel.modulation);
    const double unit = link::amplitudeUnit(setup().channel.modulation);
    for (std::size_t block = 0; block < blocks; ++block) {
        const std::vector<Bits> c = hasCrc() ? nextCodeBlocks(setup().transportBlock, *bits, *withCrc)
                                             : std::vector<Bits>{codeBlockWords.bits(setup().blockSize)};
        std::vector<standard::Streams> d;
        for (const Bits& codeBlock : c) {
            if (hasCrc()) {
                ASSERT_EQ(codeBlockWords.bits(codeBlock.size()), codeBlock);
            }
            d.push_back(standard::turboCode(codeBlock));
            ASSERT_EQ(streams.bits(3 * d.back()[0].size()), joined(d.back()));
            for (int stream = 0; stream < 3; ++stream) {
                const Bits v = standard::subBlock(d.back()[static_cast<std::size_t>(stream)], stream);
                ASSERT_EQ(subBlocks.bits(v.size()), v);
            }
            const Bits w = standard::circularBuffer(d.back());
            ASSERT_EQ(buffer.bits(w.size()), w);
        }
        for (const unsigned rv : setup().redundancyVersions) {
            Bits f;
            for (std::size_t r = 0; r < c.size(); ++r) {
                const Bits w = standard::circularBuffer(d[r]);
                const int E =
                    standard::codedSize(static_cast<int>(r), static_cast<int>(c.size()),
                                        static_cast<int>(setup().codedBits), 1, static_cast<int>(Qm));
                for (const int k : standard::selection(w, static_cast<int>(d[r][0].size()),
                                                       static_cast<int>(w.size()), static_cast<int>(rv), E)) {
                    f.push_back(w[static_cast<std::size_t>(k)]);
                }
            }
            ASSERT_EQ(coded.bits(f.size()), f);
            for (std::size_t i = 0; i < f.size(); i += Qm) {
                const auto first = f.begin() + static_cast<std::ptrdiff_t>(i);
                const standard::Symbol symbol =
                    standard::symbolOf(std::vector<std::uint8_t>(first, first + Qm)) / unit;
                const std::vector<int> components = symbols.soft(2);
                ASSERT_NEAR(components[0], symbol.real(), 1e-9);
                ASSERT_NEAR(components[1], symbol.imag(), 1e-9);
            }
        }
    }
    EXPECT_TRUE(codeBlockWords.isAtEnd() && streams.isAtEnd() && subBlocks.isAtEnd() && buffer.isAtEnd() &&
                coded.isAtEnd() && symbols.isAtEnd());
}

TEST_P(LinkStages, TellWhichCrcsHold) {
    if (!hasCrc()) {
        EXPECT_FALSE(std::ifstream(path("u4_a1/crc.hex")));
        return;
    }
    const link::Segmentation segmentation = link::CodedLink(setup()).segmentation();
    Words decisions = words("u4_a1/dout.hex");
    Words crcs = words("u4_a1/crc.hex");
    for (std::size_t i = 0; i < blocks * transmissions(); ++i) {
        Bits whole;
        std::vector<int> holds;
        for (std::size_t r = 0; r < segmentation.C; ++r) {
            Bits c = decisions.bits(segmentation.size(r));
            c.erase(c.begin(), c.begin() + static_cast<std::ptrdiff_t>(r == 0 ? segmentation.F : 0));
            if (segmentation.C > 1) {
                holds.push_back(crcHolds(c, standard::powersOfCrc24B()) ? 1 : 0);
                c.resize(c.size() - 24);
            }
            whole.insert(whole.end(), c.begin(), c.end());
        }
        const int all = crcHolds(whole, standard::powersOfCrc24A()) ? 1 : 0;
        holds.insert(holds.begin(), all);
        holds.resize(segmentation.C + 1, all);
        EXPECT_EQ(crcs.bits(segmentation.C + 1), holds);
    }
    EXPECT_TRUE(decisions.isAtEnd() && crcs.isAtEnd());
}

INSTANTIATE_TEST_SUITE_P(AllKinds, LinkStages, testing::ValuesIn(linkCases()),
                         [](const auto& test) { return std::string(test.param.name); });

}  // namespace quarzel::test
