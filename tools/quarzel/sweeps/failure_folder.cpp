// SPDX-License-Identifier: MIT
#include "sweeps/failure_folder.hpp"

#include <fmt/format.h>

#include <filesystem>
#include <iterator>
#include <map>
#include <sstream>
#include <vector>

#include "captures/bits_file.hpp"
#include "captures/capture_file.hpp"
#include "files/open_file.hpp"
#include "files/output_file.hpp"
#include "sweep/block_simulator.hpp"
#include "sweeps/sweep_table.hpp"
#include "tool_error.hpp"

namespace fs = std::filesystem;

namespace quarzel::tool {

namespace {

constexpr const char* list = "failures.csv";

/// Code blocks of one size for one core.
struct FailureCapture {
    std::uint32_t blockSize;
    std::vector<std::int8_t> soft = {};
    std::vector<std::uint8_t> bits = {};  ///< a byte for each
    std::size_t blocks = 0;

    void append(const sweep::SentBlock& block) {
        soft.insert(soft.end(), block.soft.begin(), block.soft.end());
        bits.insert(bits.end(), block.bits.begin(), block.bits.end());
        ++blocks;
    }

    std::string sentNpy() const {
        PackedBits packed(blocks, blockSize);
        for (std::size_t block = 0; block < blocks; ++block) {
            packed.set(block, bits.data() + block * blockSize);
        }
        return npyOf(packed);
    }
};

/// The blocks of a sweep that are kept, and the list of them.
class FailureCaptures {
  public:
    explicit FailureCaptures(std::uint64_t seed) : itsSeed(seed), itsSimulator(seed, itsChannels) {
        itsList << "capture,row,seed,point,number,code_block,bit_errors,";
        printFieldNames(itsList);
        itsList << "ebn0_db,sending\n";
    }

    /// @param point  the number of its point in the result
    void add(std::size_t point, const sweep::Setup& setup, const sweep::FailingBlock& failing) {
        const std::vector<sweep::SentBlock> blocks = itsSimulator.makeAgain(setup, failing.number);
        for (std::size_t r = 0; r < blocks.size(); ++r) {
            const auto K = static_cast<std::uint32_t>(blocks[r].bits.size());
            const std::string name =
                fmt::format("k{}_u{}_a{}_i{}", K, setup.units, setup.algorithm, setup.iterations);
            FailureCapture& capture = itsCaptures.try_emplace(name, FailureCapture{K}).first->second;
            itsList << fmt::format("{}.soft.npy,{},{},{},{},{},{},", name, capture.blocks, itsSeed, point,
                                   failing.number, r, failing.bitErrors);
            printFields(itsList, setup);
            const std::string sending = sweep::sendingText(setup.sending);
            itsList << fmt::format("{},{}\n", setup.ebN0.value(),
                                   sending.empty() ? "" : fmt::format("\"{}\"", sending.substr(2)));
            capture.append(blocks[r]);
        }
    }

    std::string listText() const { return itsList.str(); }
    const std::map<std::string, FailureCapture>& captures() const { return itsCaptures; }

  private:
    std::uint64_t itsSeed;
    sweep::Channels itsChannels;
    sweep::BlockSimulator itsSimulator;
    std::map<std::string, FailureCapture> itsCaptures;  ///< by name
    std::ostringstream itsList;
};

}  // namespace

void FailureFolder::probe() const {
    std::error_code ignored;
    if (!fs::exists(fs::symlink_status(itsName, ignored))) {
        probeRename(itsName, itsName);
    } else if (fs::is_directory(itsName, ignored)) {
        probeOutput(path(list));
    } else {
        throw fileError(itsName, "is not a directory", "remove it, or name another output with -o");
    }
}

void FailureFolder::write(const sweep::Result& result, const FailingBlocks& failing) const {
    FailureCaptures captures(result.seed);
    for (const auto& [setup, blocks] : failing) {
        const auto point = std::distance(result.points.begin(), result.points.find(setup));
        for (const sweep::FailingBlock& block : blocks) {
            captures.add(static_cast<std::size_t>(point), setup, block);
        }
    }
    std::error_code error;
    fs::create_directory(itsName, error);
    if (error) {
        throw fileError(itsName, "cannot be made: " + error.message(), "check its folder");
    }
    fs::remove(path(list), error);
    for (const auto& [name, capture] : captures.captures()) {
        writeOutput(path(name + ".soft.npy"), softNpy(capture.soft, capture.blockSize));
        writeOutput(path(name + ".sent.npy"), capture.sentNpy());
    }
    writeOutput(path(list), captures.listText());
}

}  // namespace quarzel::tool
