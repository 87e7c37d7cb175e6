// SPDX-License-Identifier: MIT
#include "decode/decode_command.hpp"

#include <fmt/format.h>
#include <unistd.h>
#include <CLI/CLI.hpp>

#include <chrono>
#include <iostream>
#include <memory>
#include <optional>
#include <string>

#include "captures/bits_file.hpp"
#include "captures/capture_file.hpp"
#include "decode/decode_report.hpp"
#include "decode/decode_together.hpp"
#include "decode/decode_traced.hpp"
#include "decode/progress.hpp"
#include "files/input_file.hpp"
#include "files/output_file.hpp"
#include "options/core_options.hpp"
#include "options/quantiser_options.hpp"
#include "options/threads_option.hpp"
#include "tool_error.hpp"
#include "trace/trace_file.hpp"
#include "trace/trace_options.hpp"

namespace quarzel::tool {

namespace {

struct DecodeOptions {
    std::string capture;
    std::optional<std::string> reference;
    std::optional<std::string> output;
    std::optional<double> scale;  ///< of real numbers
    CoreOptions core;
    TraceOptions trace;
    unsigned threads = allCores();
    bool json = false;
};

constexpr const char* description = "Decode the code blocks of a capture";

constexpr const char* footer = R"(Soft values:
  Integers in units of 1/8: 8 stands for 1.0. The sign is the bit: POSITIVE
  MEANS BIT 1, negative means bit 0. The core takes -128 to 127; it saturates
  what lies outside, with a warning at the first such value.

Real numbers:
  Log-likelihood ratios ln(P(1)/P(0)) become soft values with --llr 4. Samples
  of +1 for bit 1 and -1 for bit 0 with noise of the variance v need --scale S
  with S = 8 / v. Both multiply, round to the nearest and clip to -128..127.

Files:
  CAPTURE  npy (numpy.save) of int8, int16 or int32, or of float32 or float64
           with --llr or --scale. Its shape is (blocks, 3, K + 4).
           Axis 1 is the systematic stream, the parity of the first and the
           parity of the second constituent code. The last 4 positions hold the
           12 tail values in the order of 3GPP TS 36.212, section 5.1.3.2.2.
           'quarzel info' tells the valid K.
           Or text: CSV with the header systematic,parity1,parity2, one position
           a line, an empty line between blocks.
  BITS     npy of uint8, shape (blocks, K/8): 8 bits to a byte, the first bit
           highest, as numpy.packbits(bits, axis=1) makes them.
  OUT      the same. It is written whole or not at all. With - it goes to
           standard output, and the report to standard error.
  FILE     every value of every trellis step of the passes traced: as text, as
           rows of block, pass, step, signal, state, raw and real value, or as
           waves. It is written whole or not at all, too. 'quarzel trace-diff'
           compares it with another.

Examples:
  quarzel decode capture.npy --units 8 --reference sent.npy -o decided.npy
  quarzel decode capture.npy --units 8 --trace 12 --trace-block 4
  quarzel decode ratios.npy --llr 4

  The first decodes capture.npy as a core with 8 processing units does, compares
  the decisions with the bits that were sent and keeps them in decided.npy. Bit
  errors are a result, not a failure: the exit code is 0. The report names the
  wrong blocks, the first ten or, with --json, all. The second prints the trace
  of 12 passes, which are 6 iterations, of the fifth block: blocks, passes and
  steps count from 0. The third decodes log-likelihood ratios.
)";

/// Throw when the file could not be written, or writing it would replace a file that is read.
/// @param option  the option that names the file
void checkOutput(const char* option, const std::string& file, const DecodeOptions& options) {
    if (file.empty()) {
        throw ToolError(ExitCode::usage, option, "the name of the file is empty", "give one");
    }
    if (isSameFile(file, options.capture) || (options.reference && isSameFile(file, *options.reference))) {
        throw ToolError(ExitCode::usage, option, fmt::format("{} is also read", file), "give another name");
    }
    probeOutput(file);
}

void checkOutputs(const DecodeOptions& options) {
    if (options.output) {
        checkOutput("-o", *options.output, options);
    }
    const TraceOptions& trace = options.trace;
    if (!trace.passes) {
        return;
    }
    if (trace.isToStandardOutput()) {
        if (options.output && isStandardStream(*options.output)) {
            throw ToolError(ExitCode::usage, "-o", "the trace goes to standard output",
                            "name a file for it with --trace-file");
        }
        if (options.json) {
            throw ToolError(ExitCode::usage, "--json", "the trace goes to standard output",
                            "name a file for it with --trace-file");
        }
        return;
    }
    checkOutput("--trace-file", trace.file, options);
    if (options.output && isSameFile(*options.output, trace.file)) {
        throw ToolError(ExitCode::usage, "--trace-file",
                        fmt::format("{} is also the output of -o", trace.file), "give another name");
    }
}

/// The trace that the user wants, or null.
std::unique_ptr<TraceFile> openTrace(const Capture& capture, const DecodeOptions& options,
                                     std::ostream& results) {
    const TraceOptions& trace = options.trace;
    if (!trace.passes) {
        return nullptr;
    }
    if (trace.block >= capture.blocks()) {
        throw ToolError(ExitCode::usage, "--trace-block",
                        fmt::format("{} has no block {}", options.capture, trace.block),
                        fmt::format("give a number from 0 to {}", capture.blocks() - 1));
    }
    return std::make_unique<TraceFile>(trace, results);
}

PackedBits decodeBlocks(const Capture& capture, const DecodeOptions& options, TraceFile* trace) {
    Progress progress(std::cerr, ::isatty(STDERR_FILENO) != 0, capture.blocks());
    return trace != nullptr ? decodeTraced(capture, options.core, options.trace.block, *trace, progress)
                            : decodeTogether(capture, options.core, options.threads, progress);
}

void decode(const DecodeOptions& options, std::ostream& results) {
    checkOutputs(options);
    std::ifstream soft = openInput(options.capture);
    const Capture capture = readCapture(soft, options.capture, options.scale);
    std::optional<PackedBits> reference;
    if (options.reference) {
        std::ifstream bits = openInput(*options.reference);
        reference = readBits(bits, *options.reference, capture.blocks(), capture.blockSize / 8);
    }
    const std::unique_ptr<TraceFile> trace = openTrace(capture, options, results);

    const auto start = std::chrono::steady_clock::now();
    const PackedBits decisions = decodeBlocks(capture, options, trace.get());
    const std::chrono::duration<double> duration = std::chrono::steady_clock::now() - start;

    if (options.output) {
        writeBits(*options.output, decisions);
    }
    DecodeReport report{options.capture,  capture.blockSize, options.core,
                        capture.blocks(), duration.count(),  {}};
    if (reference) {
        report.errors = findErrors(decisions, *reference);
    }
    // Standard output that holds a trace or the decisions holds nothing else.
    const bool isTaken = (trace != nullptr && options.trace.isToStandardOutput()) ||
                         (options.output && isStandardStream(*options.output));
    (options.json ? printJson : printText)(isTaken ? std::cerr : results, report);
}

}  // namespace

void addDecodeCommand(CLI::App& app, std::ostream& results) {
    auto options = std::make_shared<DecodeOptions>();
    CLI::App* command = app.add_subcommand("decode", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    command->add_option("CAPTURE", options->capture, "Soft values to decode")->required()->type_name("");
    addRealNumberOptions(*command, options->scale);
    addCoreOptions(*command, options->core);
    command->add_option("--reference", options->reference, "Find errors: compare with the bits in this file")
        ->type_name("BITS");
    command->add_option("-o,--output", options->output, "Write the decided bits to this file")
        ->type_name("OUT");
    addThreadsOption(*command, options->threads);
    addTraceOptions(*command, options->trace);
    command->add_flag("--json", options->json, "Print one JSON object instead of text");
    command->callback([options, &results] { decode(*options, results); });
}

}  // namespace quarzel::tool
