// SPDX-License-Identifier: MIT
#include "sweeps/rebuild_command.hpp"

#include <fmt/format.h>
#include <CLI/CLI.hpp>

#include <iostream>
#include <iterator>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "captures/bits_file.hpp"
#include "captures/capture_file.hpp"
#include "decode/decode_together.hpp"
#include "decode/decode_traced.hpp"
#include "decode/progress.hpp"
#include "files/input_file.hpp"
#include "files/output_file.hpp"
#include "options/whole_number.hpp"
#include "report_text.hpp"
#include "sweep/block_simulator.hpp"
#include "sweeps/rebuild_report.hpp"
#include "sweeps/sweep_files.hpp"
#include "tool_error.hpp"
#include "trace/trace_file.hpp"
#include "trace/trace_options.hpp"

namespace quarzel::tool {

namespace {

struct RebuildOptions {
    std::string result;
    std::optional<std::size_t> point;
    std::uint64_t number = 0;
    std::size_t codeBlock = 0;
    std::optional<std::string> output;
    std::optional<std::string> sent;
    TraceOptions trace;
    bool json = false;

    bool isTraceOnStandardOutput() const { return trace.passes && trace.isToStandardOutput(); }
};

constexpr const char* description = "Make a block of a sweep again, to decode and trace it";

constexpr const char* footer =
    R"(The bits and the noise of a block follow from the seed, its point and its number
alone, so that any block of a sweep is made again at once, however many there
were. It is decoded by the core of its point. Points and blocks count from 0:
points in the order of 'quarzel show', blocks as in failures.csv, which 'quarzel
sweep --keep-failures' writes.

A block that was sent several times is made as the core was given it the last
time. Of a transport block one of its code blocks is taken.

Files:
  CAPTURE  npy of int8, shape (1, 3, K + 4), for 'quarzel decode'
  BITS     the information bits that were sent: npy of uint8, shape (1, K/8)
  FILE     as for 'quarzel decode'; the block is number 0 in the trace

Example:
  quarzel rebuild result.json --point 2 --number 1234567 --trace 12
)";

/// @throws ToolError when two outputs are one, one is the result, or one could not be written
void checkOutputs(const RebuildOptions& options) {
    if (options.json && options.isTraceOnStandardOutput()) {
        throw ToolError(ExitCode::usage, "--json", "the trace goes to standard output",
                        "name a file for it with --trace-file");
    }
    std::vector<std::string> taken = {options.result};
    const auto check = [&taken](const char* option, const std::string& file) {
        if (file.empty() || isStandardStream(file)) {
            throw ToolError(ExitCode::usage, option, "it needs a file of its own", "name one");
        }
        for (const std::string& other : taken) {
            if (isSameFile(file, other)) {
                throw ToolError(ExitCode::usage, option, fmt::format("{} is named twice", file),
                                "give another name");
            }
        }
        probeOutput(file);
        taken.push_back(file);
    };
    if (options.output) {
        check("-o", *options.output);
    }
    if (options.sent) {
        check("--sent", *options.sent);
    }
    if (options.trace.passes && !options.trace.isToStandardOutput()) {
        check("--trace-file", options.trace.file);
    }
}

/// The number of the point that the user means.
std::size_t pointOf(const RebuildOptions& options, const sweep::Result& result) {
    const std::size_t points = result.points.size();
    if (options.point ? *options.point >= points : points != 1) {
        throw ToolError(
            ExitCode::usage, "--point",
            fmt::format("{} has {}", options.result, counted(points, "point", "points")),
            points == 0
                ? "name another result"
                : fmt::format("give a number from 0 to {}, in the order of 'quarzel show'", points - 1));
    }
    return options.point.value_or(0);
}

void requireBlock(const RebuildOptions& options, const sweep::PointState& point) {
    if (options.number >= point.blocks) {
        throw ToolError(ExitCode::usage, "--number",
                        fmt::format("the point has {}", counted(point.blocks, "block", "blocks")),
                        point.blocks == 0 ? "name another point"
                                          : fmt::format("give a number from 0 to {}", point.blocks - 1));
    }
}

/// Decode the only block of a capture, and trace it if the user wants that.
PackedBits decodeBlock(const RebuildOptions& options, const Capture& capture, const CoreOptions& core,
                       std::ostream& results) {
    if (options.trace.passes) {
        if (options.trace.block != 0) {
            throw ToolError(ExitCode::usage, "--trace-block", "there is one block", "leave it out");
        }
        Progress progress(std::cerr, false, 1);
        TraceFile trace(options.trace, results);
        return decodeTraced(capture, core, 0, trace, progress);
    }
    PackedBits decisions(1, capture.blockSize);
    Core decoder = coreOf(core);
    decodePart(decoder, capture, 0, 1, core.iterations, decisions);
    return decisions;
}

void rebuild(const RebuildOptions& options, std::ostream& results) {
    checkOutputs(options);
    const std::string text = readBytes(options.result);
    const sweep::Result result = aboutFile(options.result, [&text] { return sweep::readResult(text); });
    const std::size_t number = pointOf(options, result);
    const auto& [setup, point] = *std::next(result.points.begin(), static_cast<std::ptrdiff_t>(number));
    requireBlock(options, point);

    sweep::Channels channels;
    const std::vector<sweep::SentBlock> blocks =
        sweep::BlockSimulator(result.seed, channels).makeAgain(setup, options.number);
    if (options.codeBlock >= blocks.size()) {
        throw ToolError(ExitCode::usage, "--code-block",
                        fmt::format("the block has {}", counted(blocks.size(), "code block", "code blocks")),
                        fmt::format("give a number from 0 to {}", blocks.size() - 1));
    }
    const sweep::SentBlock& block = blocks[options.codeBlock];
    const auto K = static_cast<std::uint32_t>(block.bits.size());
    PackedBits sent(1, K);
    sent.set(0, block.bits.data());
    const Capture capture{options.result, K, {block.soft.begin(), block.soft.end()}};
    CoreOptions core;
    core.units = setup.units;
    core.algorithm = setup.algorithm;
    core.iterations = setup.iterations;
    const PackedBits decisions = decodeBlock(options, capture, core, results);
    if (options.output) {
        writeOutput(*options.output, softNpy(block.soft, K));
    }
    if (options.sent) {
        writeBits(*options.sent, sent);
    }
    const RebuildReport report{options.result,
                               result.seed,
                               number,
                               setup,
                               options.number,
                               options.codeBlock,
                               blocks.size(),
                               K,
                               findErrors(decisions, sent)};
    (options.json ? printJson : printText)(options.isTraceOnStandardOutput() ? std::cerr : results, report);
}

}  // namespace

void addRebuildCommand(CLI::App& app, std::ostream& results) {
    auto options = std::make_shared<RebuildOptions>();
    CLI::App* command = app.add_subcommand("rebuild", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    command->add_option("RESULT", options->result, "The result of a sweep")->required()->type_name("");
    const auto addNumber = [command](const char* name, auto& number, const char* text) {
        return command->add_option(name, number, text)
            ->type_name("N")
            ->transform(wholeNumber([](std::uint64_t) { return true; }, "a whole number"));
    };
    addNumber("--number", options->number, "The number of the block, from 0")->required();
    addNumber("--point", options->point, "The point, from 0 (default: the only one)");
    addNumber("--code-block", options->codeBlock, "Code block of a transport block, from 0\n(default 0)");
    command->add_option("-o,--output", options->output, "Write the soft values to this file")
        ->type_name("CAPTURE");
    command->add_option("--sent", options->sent, "Write the bits that were sent to this file")
        ->type_name("BITS");
    addTraceOptions(*command, options->trace);
    command->add_flag("--json", options->json, "Print one JSON object instead of text");
    command->callback([options, &results] { rebuild(*options, results); });
}

}  // namespace quarzel::tool
