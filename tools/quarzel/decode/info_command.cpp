// SPDX-License-Identifier: MIT
#include "decode/info_command.hpp"

#include <fmt/format.h>
#include <CLI/CLI.hpp>

#include <array>
#include <cstdint>
#include <memory>
#include <nlohmann/json.hpp>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "decode/atlas.hpp"
#include "options/block_sizes.hpp"
#include "options/whole_number.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

constexpr const char* description = "Tell the valid block sizes, or how the core cuts one";

constexpr const char* footer = R"(Without K: the block sizes that LTE has. With K:
  interleaver  the permutation pi(i) = (f1 i + f2 i^2) mod K, with f1 and f2
               from 3GPP TS 36.212, Table 5.1.3-3
  threads      4 for each processing unit of the core
  segments     equal parts of the block that the threads work on at the same
               time. Each keeps at least 64 trellis steps, and so a small block
               leaves threads idle.
  windows      parts of a segment, each of 64 steps at most, over which the
               backward recursion runs one after the other
  Eb/N0        at which so many blocks fail, as 'quarzel threshold' finds it for
               2 units, to 0.02 dB

Example:
  quarzel info 6144
)";

constexpr std::array<std::uint32_t, 3> cores = {2, 4, 8};  // in units

std::span<const unsigned> windowsOf(const Layout& layout) {
    return std::span(layout.window_steps).first(layout.windows);
}

/// Lengths with equal neighbours taken together: "2 x 64 + 54 + 53".
std::string lengthsText(std::span<const unsigned> lengths) {
    std::vector<std::string> groups;
    for (std::size_t first = 0, end = 0; first < lengths.size(); first = end) {
        while (end < lengths.size() && lengths[end] == lengths[first]) {
            ++end;
        }
        groups.push_back(end - first == 1 ? std::to_string(lengths[first])
                                          : fmt::format("{} x {}", end - first, lengths[first]));
    }
    return fmt::format("{}", fmt::join(groups, " + "));
}

void printSizes(std::ostream& stream) {
    stream << fmt::format("{} block sizes, in information bits:\n", blockSizes().size());
    for (const BlockSizeRange& range : blockSizeRanges()) {
        stream << fmt::format("{:5} to {:4} in steps of {:2}\n", range.first, range.last, range.step);
    }
}

void printSizesJson(std::ostream& stream) {
    nlohmann::ordered_json sizes = nlohmann::ordered_json::array();
    for (const BlockSize& size : blockSizes()) {
        sizes.push_back(size.K);
    }
    stream << nlohmann::ordered_json{{"block_sizes", sizes}}.dump() << '\n';
}

/// A line for each core, after an empty one: "8 iterations, type 1: 10 % of blocks fail at 1.20 dB, 1 %
/// at 2.32 dB".
void printAtlas(std::ostream& stream, std::span<const AtlasRow> rows) {
    const AtlasRow* last = nullptr;
    for (const AtlasRow& row : rows) {
        const bool isNewCore =
            last == nullptr || last->algorithm != row.algorithm || last->iterations != row.iterations;
        stream << (isNewCore ? fmt::format("\n{} iterations, type {}: {:g} % of blocks fail", row.iterations,
                                           row.algorithm, 100 * row.bler)
                             : fmt::format(", {:g} %", 100 * row.bler))
               << fmt::format(" at {:.2f} dB", row.ebN0);
        last = &row;
    }
    stream << (rows.empty() ? "" : "\n");
}

void printSize(std::ostream& stream, const BlockSize& size) {
    stream << fmt::format(
        "block size   {} information bits\n"
        "interleaver  pi(i) = ({} i + {} i^2) mod {}, f1 = {}, f2 = {}\n"
        "\n"
        "units  threads  segments  steps per segment  windows per segment\n",
        size.K, size.f1, size.f2, size.K, size.f1, size.f2);
    for (const std::uint32_t units : cores) {
        const Layout layout = quarzel::layout(size.K, units);
        stream << fmt::format("{:5}  {:7}  {:8}  {:17}  {} ({})\n", units, layout.threads, layout.segments,
                              layout.segment_steps, layout.windows, lengthsText(windowsOf(layout)));
    }
    printAtlas(stream, atlasOf(size.K));
}

void printSizeJson(std::ostream& stream, const BlockSize& size) {
    nlohmann::ordered_json layouts = nlohmann::ordered_json::array();
    for (const std::uint32_t units : cores) {
        const Layout layout = quarzel::layout(size.K, units);
        layouts.push_back({{"units", units},
                           {"threads", layout.threads},
                           {"segments", layout.segments},
                           {"steps_per_segment", layout.segment_steps},
                           {"window_lengths", windowsOf(layout)}});
    }
    nlohmann::ordered_json thresholds = nlohmann::ordered_json::array();
    for (const AtlasRow& row : atlasOf(size.K)) {
        thresholds.push_back({{"units", 2},
                              {"algorithm", row.algorithm},
                              {"iterations", row.iterations},
                              {"bler", row.bler},
                              {"ebn0_db", row.ebN0},
                              {"ebn0_interval", {row.low, row.high}}});
    }
    const nlohmann::ordered_json object = {{"block_size", size.K},
                                           {"f1", size.f1},
                                           {"f2", size.f2},
                                           {"cores", layouts},
                                           {"thresholds", thresholds}};
    stream << object.dump() << '\n';
}

}  // namespace

void addInfoCommand(CLI::App& app, std::ostream& results) {
    struct InfoOptions {
        std::optional<std::uint64_t> K;
        bool json = false;
    };
    auto options = std::make_shared<InfoOptions>();
    CLI::App* command = app.add_subcommand("info", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    command->add_option("K", options->K, "Block size in information bits")
        ->type_name("")
        ->transform(wholeNumber([](std::uint64_t) { return true; }, "a whole number"));
    command->add_flag("--json", options->json, "Print one JSON object instead of text");
    command->callback([options, &results] {
        if (options->K) {
            (options->json ? printSizeJson : printSize)(results, knownBlockSize(*options->K, "K"));
        } else {
            (options->json ? printSizesJson : printSizes)(results);
        }
    });
}

}  // namespace quarzel::tool
