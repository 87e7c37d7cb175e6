// SPDX-License-Identifier: MIT
#include "decode/info_command.hpp"

#include <fmt/format.h>

#include <cstdint>
#include <memory>
#include <nlohmann/json.hpp>
#include <optional>
#include <string>
#include <vector>

#include "decode/core_layout.hpp"
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

Example:
  quarzel info 6144
)";

std::vector<CoreLayout> layoutsOf(std::uint32_t K) {
    return {coreLayout(K, 2), coreLayout(K, 4), coreLayout(K, 8)};
}

/// Lengths with equal neighbours taken together: "2 x 64 + 54 + 53".
std::string lengthsText(const std::vector<std::uint32_t>& lengths) {
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
    stream << fmt::format("{} block sizes, in information bits:\n", lteParams.size());
    for (const BlockSizeRange& range : blockSizeRanges()) {
        stream << fmt::format("{:5} to {:4} in steps of {:2}\n", range.first, range.last, range.step);
    }
}

void printSizesJson(std::ostream& stream) {
    nlohmann::ordered_json sizes = nlohmann::ordered_json::array();
    for (const LteParams& row : lteParams) {
        sizes.push_back(row.K);
    }
    stream << nlohmann::ordered_json{{"block_sizes", sizes}}.dump() << '\n';
}

void printSize(std::ostream& stream, const LteParams& row) {
    stream << fmt::format(
        "block size   {} information bits\n"
        "interleaver  pi(i) = ({} i + {} i^2) mod {}, f1 = {}, f2 = {}\n"
        "\n"
        "units  threads  segments  steps per segment  windows per segment\n",
        row.K, row.f1, row.f2, row.K, row.f1, row.f2);
    for (const CoreLayout& layout : layoutsOf(row.K)) {
        stream << fmt::format("{:5}  {:7}  {:8}  {:17}  {} ({})\n", layout.units, layout.threads,
                              layout.segments, layout.steps, layout.windows.size(),
                              lengthsText(layout.windows));
    }
}

void printSizeJson(std::ostream& stream, const LteParams& row) {
    nlohmann::ordered_json cores = nlohmann::ordered_json::array();
    for (const CoreLayout& layout : layoutsOf(row.K)) {
        cores.push_back({{"units", layout.units},
                         {"threads", layout.threads},
                         {"segments", layout.segments},
                         {"steps_per_segment", layout.steps},
                         {"window_lengths", layout.windows}});
    }
    const nlohmann::ordered_json object = {
        {"block_size", row.K}, {"f1", row.f1}, {"f2", row.f2}, {"cores", cores}};
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
            (options->json ? printSizeJson : printSize)(results, blockSizeRow(*options->K, "K"));
        } else {
            (options->json ? printSizesJson : printSizes)(results);
        }
    });
}

}  // namespace quarzel::tool
