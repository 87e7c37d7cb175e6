// SPDX-License-Identifier: MIT
#include "vectors/expected_decisions.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <filesystem>
#include <sstream>

#include "captures/bits_file.hpp"
#include "captures/npy_header.hpp"
#include "files/input_file.hpp"
#include "options/block_sizes.hpp"
#include "report_text.hpp"
#include "tool_error.hpp"
#include "vectors/manifest.hpp"
#include "vectors/memory_image.hpp"
#include "vectors/memory_names.hpp"

namespace fs = std::filesystem;

namespace quarzel::tool {

namespace {

/// Where a core and its set lie.
struct CorePlace {
    std::string set;   ///< directory of the set
    std::string name;  ///< directory of the core in it; empty: not told yet
};

CorePlace placeOf(const std::string& name) {
    std::error_code ignored;
    fs::path directory = fs::path(name).lexically_normal();
    if (!fs::is_directory(directory, ignored)) {
        directory = directory.has_parent_path() ? directory.parent_path() : fs::path(".");
    }
    if (fs::exists(directory / manifestName, ignored)) {
        return {directory.string(), ""};
    }
    const fs::path core = fs::canonical(directory, ignored);
    // Beside the name that the user gave, where that is possible, so that messages show it.
    if (!directory.has_filename()) {
        directory = directory.parent_path();
    }
    const bool isNamed = directory.filename() == core.filename();
    const fs::path set = isNamed ? directory.parent_path() : core.parent_path();
    if (!fs::exists(core.parent_path() / manifestName, ignored)) {
        throw fileError(name, "is not part of a vector set",
                        "name the directory of a core that 'quarzel vectors' made");
    }
    return {set.empty() ? "." : set.string(), core.filename().string()};
}

const VectorCore& coreAt(const CorePlace& place, const VectorContent& content) {
    std::vector<std::string> names;
    for (const VectorCore& core : content.cores) {
        if (core.directory == place.name || (place.name.empty() && content.cores.size() == 1)) {
            return core;
        }
        names.push_back((fs::path(place.set) / core.directory).string());
    }
    throw fileError(place.set,
                    place.name.empty() ? "holds the vectors of several cores"
                                       : fmt::format("holds no core '{}'", place.name),
                    fmt::format("name one: {}", fmt::join(names, ", ")));
}

ExpectedDecisions readCore(const std::string& name) {
    const CorePlace place = placeOf(name);
    const VectorContent content = readManifest(place.set);
    const VectorCore& core = coreAt(place, content);
    const fs::path directory = fs::path(place.set) / core.directory;
    ExpectedDecisions expected{directory.string(), {}, {}};
    std::size_t bits = 0;
    for (const VectorBlock& block : core.blocks) {
        expected.blocks.push_back(
            {block.blockSize, bits, block.iterations, block.stimulus,
             fmt::format("quarzel decode {} --units {} --algorithm {} --iterations {} --trace {} "
                         "--trace-block {}",
                         shellWord((directory / block.capture).string()), core.units, core.algorithm,
                         block.iterations, 2 * block.iterations, block.row)});
        bits += block.blockSize;
    }
    std::istringstream text(
        readUnaltered(place.set, core.directory + '/' + memoryFile(decisionMemory), content));
    const MemoryImage image = readMemoryText(text, bits, (directory / memoryFile(decisionMemory)).string());
    for (const MemoryWord& word : image.words) {
        expected.bits.push_back(static_cast<std::uint8_t>(word.value));
    }
    return expected;
}

}  // namespace

std::string ExpectedBlock::about() const {
    return iterations == 0
               ? ""
               : counted(static_cast<std::size_t>(iterations), "iteration", "iterations") + ", " + stimulus;
}

std::size_t ExpectedDecisions::packedSize() const {
    const auto hasFirstSize = [this](const ExpectedBlock& block) {
        return block.blockSize == blocks.front().blockSize;
    };
    return !blocks.empty() && std::all_of(blocks.begin(), blocks.end(), hasFirstSize)
               ? blocks.front().blockSize / 8
               : 0;
}

ExpectedDecisions readPacked(std::istream& stream, const std::string& file) {
    const NpyHeader header = readNpyHeader(stream, file);
    if (header.shape.size() != 2 || header.shape[1] > blockSizes().back().K / 8 ||
        !findBlockSize(8 * header.shape[1])) {
        throw fileError(
            file, "has shape " + shapeText(header.shape),
            "expected bits have shape (blocks, K/8), 8 to a byte, as 'quarzel decode -o' makes them");
    }
    const auto bytes = static_cast<std::size_t>(header.shape[1]);
    const PackedBits packed = readBitsAfter(header, stream, file, header.shape[0], bytes);
    ExpectedDecisions expected{file, {}, {}};
    for (std::size_t block = 0; block < packed.blocks(); ++block) {
        expected.blocks.push_back({static_cast<std::uint32_t>(8 * bytes), block * 8 * bytes, 0, "", ""});
    }
    for (const std::uint8_t byte : packed.bytes) {
        for (unsigned shift = 8; shift-- > 0;) {
            expected.bits.push_back(byte >> shift & 1U);
        }
    }
    return expected;
}

ExpectedDecisions readExpected(const std::string& name) {
    std::error_code ignored;
    if (fs::is_directory(name, ignored)) {
        return readCore(name);
    }
    std::ifstream stream = openInput(name);
    if (isNpy(stream, name)) {
        return readPacked(stream, name);
    }
    if (fs::path(name).filename() != memoryFile(decisionMemory)) {
        throw fileError(name, "is neither packed bits (.npy) nor a memory of a vector set",
                        "name the directory of a core that 'quarzel vectors' made");
    }
    return readCore(name);
}

}  // namespace quarzel::tool
