// SPDX-License-Identifier: MIT
#include "vectors/core_files.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <iterator>

#include "captures/bits_file.hpp"
#include "captures/capture_file.hpp"
#include "report_text.hpp"
#include "vectors/memory_names.hpp"

namespace quarzel::tool {

namespace {

/// What a reader of a memory sees before a block.
std::string commentOf(const VectorCore& core, std::size_t block) {
    const VectorBlock& it = core.blocks[block];
    return fmt::format("// block {}: K {}, {}, {}\n", block, it.blockSize,
                       counted(static_cast<std::size_t>(it.iterations), "iteration", "iterations"),
                       it.stimulus);
}

/// A memory of soft values, two's complement bytes, one a line.
std::string softText(const VectorCore& core, const std::vector<StimulusAndResponse>& blocks,
                     std::size_t stream) {
    std::string text;
    for (std::size_t block = 0; block < blocks.size(); ++block) {
        text += commentOf(core, block);
        const std::vector<std::int8_t>& soft = blocks[block].soft;
        const std::size_t positions = soft.size() / softMemories.size();
        for (std::size_t i = stream * positions; i < (stream + 1) * positions; ++i) {
            fmt::format_to(std::back_inserter(text), "{:02x}\n", static_cast<std::uint8_t>(soft[i]));
        }
    }
    return text;
}

/// The memory of decisions, a bit a line.
std::string decisionText(const VectorCore& core, const std::vector<StimulusAndResponse>& blocks) {
    std::string text;
    for (std::size_t block = 0; block < blocks.size(); ++block) {
        text += commentOf(core, block);
        for (const unsigned char bit : blocks[block].decisions) {
            text += bit != 0 ? "1\n" : "0\n";
        }
    }
    return text;
}

/// The memory of tags, two digits a line; empty where blocks have none.
std::string tagText(const VectorCore& core) {
    std::string text;
    for (std::size_t block = 0; block < core.blocks.size(); ++block) {
        if (const auto& tag = core.blocks[block].tag) {
            text += commentOf(core, block) + fmt::format("{:02x}\n", *tag);
        }
    }
    return text;
}

struct MemorySizes {
    std::size_t soft = 0;       ///< words of each memory of soft values
    std::size_t decisions = 0;  ///< words of the memory of decisions
};

/// The memory that tells of each block what it is and where it begins, four words a line.
std::string blockText(const VectorCore& core, MemorySizes& sizes) {
    std::string text = "// K, iterations, first soft value, first decision\n";
    for (const VectorBlock& block : core.blocks) {
        fmt::format_to(std::back_inserter(text), "{:08x} {:08x} {:08x} {:08x} // {}\n", block.blockSize,
                       block.iterations, sizes.soft, sizes.decisions, block.stimulus);
        sizes.soft += block.blockSize + 4;
        sizes.decisions += block.blockSize;
    }
    return text;
}

std::string headerText(const VectorCore& core, const MemorySizes& sizes) {
    std::uint32_t longest = 0;
    for (const VectorBlock& block : core.blocks) {
        longest = std::max(longest, block.blockSize);
    }
    return fmt::format(
        "// The core, and the sizes of the memories in this directory.\n"
        "localparam UNITS = {};\n"
        "localparam ALGORITHM = {};\n"
        "localparam BLOCKS = {};  // blocks.hex has 4 words for each\n"
        "localparam SOFT_WORDS = {};  // words of rsc1_sys.hex, rsc1_par.hex and rsc2_par.hex\n"
        "localparam DOUT_WORDS = {};  // words of dout.hex\n"
        "localparam MAX_K = {};\n",
        core.units, core.algorithm, core.blocks.size(), sizes.soft, sizes.decisions, longest);
}

/// The blocks of one size and number of iterations, in files that 'quarzel decode' reads.
struct CaptureFiles {
    std::string name;  ///< without the ends
    std::uint32_t blockSize;
    std::vector<const StimulusAndResponse*> blocks;

    std::string softNpy() const {
        std::vector<std::int8_t> soft;
        for (const StimulusAndResponse* const block : blocks) {
            soft.insert(soft.end(), block->soft.begin(), block->soft.end());
        }
        return tool::softNpy(soft, blockSize);
    }

    std::string decidedNpy() const {
        PackedBits decided(blocks.size(), blockSize);
        for (std::size_t i = 0; i < blocks.size(); ++i) {
            decided.set(i, blocks[i]->decisions.data());
        }
        return npyOf(decided);
    }
};

/// Distribute the blocks over captures, and tell the blocks where they are.
std::vector<CaptureFiles> capturesOf(VectorCore& core, const std::vector<StimulusAndResponse>& blocks) {
    std::vector<CaptureFiles> captures;
    for (std::size_t i = 0; i < blocks.size(); ++i) {
        VectorBlock& block = core.blocks[i];
        const std::string name = fmt::format("npy/k{}_i{}", block.blockSize, block.iterations);
        auto capture = std::find_if(captures.begin(), captures.end(), [&name](const CaptureFiles& candidate) {
            return candidate.name == name;
        });
        if (capture == captures.end()) {
            captures.push_back({name, block.blockSize, {}});
            capture = captures.end() - 1;
        }
        block.capture = name + ".soft.npy";
        block.row = capture->blocks.size();
        capture->blocks.push_back(&blocks[i]);
    }
    return captures;
}

}  // namespace

std::vector<VectorFile> writeCore(OutputDirectory& directory, VectorCore& core,
                                  const std::vector<StimulusAndResponse>& blocks) {
    std::vector<VectorFile> files;
    const auto write = [&](const std::string& name, std::string_view bytes) {
        files.push_back(directory.write(core.directory + '/' + name, bytes));
    };
    const std::vector<CaptureFiles> captures = capturesOf(core, blocks);
    MemorySizes sizes;
    const std::string table = blockText(core, sizes);
    write("config.vh", headerText(core, sizes));
    write(memoryFile(blockMemory), table);
    for (std::size_t stream = 0; stream < softMemories.size(); ++stream) {
        write(memoryFile(softMemories[stream]), softText(core, blocks, stream));
    }
    write(memoryFile(decisionMemory), decisionText(core, blocks));
    if (const std::string tags = tagText(core); !tags.empty()) {
        write(memoryFile(tagMemory), tags);
    }
    for (const CaptureFiles& capture : captures) {
        write(capture.name + ".soft.npy", capture.softNpy());
        write(capture.name + ".decided.npy", capture.decidedNpy());
    }
    return files;
}

}  // namespace quarzel::tool
