// SPDX-License-Identifier: MIT
#include "vectors/link_vectors.hpp"

#include <fmt/format.h>

#include "link/coding/transport_block.hpp"
#include "link/parallel.hpp"
#include "vectors/link_files.hpp"
#include "vectors/memory_names.hpp"

namespace quarzel::tool {

LinkVectors::LinkVectors(const VectorRequest& request, unsigned threads)
    : itsLink(*request.link), itsIterations(request.iterations), itsBlocks(request.blocks) {
    const LinkStageSource source(itsLink, request.ebN0, request.seed);
    link::forEachOnThreads(itsBlocks.size(), threads, [&] {
        return [&](std::size_t block) { itsBlocks[block] = source.make(static_cast<std::uint32_t>(block)); };
    });
}

CoreStimulus LinkVectors::stimulus() const {
    const std::size_t C = itsLink.segmentation().C;
    const std::size_t transmissions = itsLink.setup().redundancyVersions.size();
    CoreStimulus stimulus;
    for (const int iterations : itsIterations) {
        for (std::size_t block = 0; block < itsBlocks.size(); ++block) {
            for (std::size_t transmission = 0; transmission < transmissions; ++transmission) {
                for (std::size_t r = 0; r < C; ++r) {
                    const std::string about =
                        fmt::format("{}, transmission {}", blockText(itsLink, block), transmission);
                    stimulus.blocks.push_back(
                        {itsLink.segmentation().size(r), iterations,
                         about + (itsLink.hasCrc() ? fmt::format(", code block {}", r) : ""), "", 0});
                }
            }
        }
    }
    stimulus.soft = [this, C, transmissions](std::size_t i) {
        const std::size_t r = i % C;
        const LinkStages& block = itsBlocks[i / (C * transmissions) % itsBlocks.size()];
        const std::vector<std::int8_t>& streams = block.transmissions[i / C % transmissions].streams;
        const auto first = streams.begin() + static_cast<std::ptrdiff_t>(itsLink.softValuesBefore(r));
        return std::vector<std::int8_t>(
            first, first + static_cast<std::ptrdiff_t>(itsLink.codeBlock(r).softValues()));
    };
    return stimulus;
}

void LinkVectors::writeStages(OutputDirectory& directory, VectorContent& content) const {
    writeLink(directory, itsLink, itsBlocks, content);
}

void LinkVectors::writeDecided(OutputDirectory& directory, const VectorCore& core,
                               const std::vector<StimulusAndResponse>& blocks, VectorContent& content) const {
    const std::string place = core.directory + '/';
    for (std::size_t stream = 0; stream < softMemories.size(); ++stream) {
        content.stages.push_back({place + memoryFile(softMemories[stream]),
                                  fmt::format("d({}) as the core takes it, after each transmission", stream),
                                  "8 bits, two's complement, positive means 1", "3GPP TS 36.212, 5.1.4.1.1"});
    }
    content.stages.push_back(
        {place + memoryFile(decisionMemory), "c as the core decides", "1 bit", "3GPP TS 36.212, 5.1.3.2"});
    if (!itsLink.hasCrc()) {
        return;
    }
    const std::string file = place + memoryFile(crcMemory);
    content.stages.push_back({file,
                              "whether the CRC of the transport block and those of its code blocks hold",
                              "1 bit", "3GPP TS 36.212, 5.1.1 and 5.1.2"});
    content.files.push_back(directory.write(file, crcText(core, blocks)));
}

std::string LinkVectors::crcText(const VectorCore& core,
                                 const std::vector<StimulusAndResponse>& blocks) const {
    const std::size_t C = itsLink.segmentation().C;
    const link::TransportBlockCode code(itsLink.informationBits());
    std::string text = "// The transport block, then its code blocks; 1: the CRC holds\n";
    for (std::size_t first = 0; first < blocks.size(); first += C) {
        std::vector<std::uint8_t> decisions;
        for (std::size_t r = 0; r < C; ++r) {
            const std::vector<unsigned char>& own = blocks[first + r].decisions;
            decisions.insert(decisions.end(), own.begin(), own.end());
        }
        const link::TransportDecisions decided = code.decide(decisions);
        text += decided.ok ? '1' : '0';
        for (const bool holds : decided.blocksOk) {
            text += holds ? " 1" : " 0";
        }
        const std::string& about = core.blocks[first].stimulus;
        text += fmt::format(" // {} iterations, {}\n", core.blocks[first].iterations,
                            about.substr(0, about.rfind(',')));
    }
    return text;
}

}  // namespace quarzel::tool
