// SPDX-License-Identifier: MIT
#include "decode_command.hpp"

#include <fmt/format.h>
#include <unistd.h>

#include <chrono>
#include <filesystem>
#include <iostream>
#include <memory>
#include <optional>
#include <string>

#include "bits_file.hpp"
#include "capture_file.hpp"
#include "core_model.hpp"
#include "core_options.hpp"
#include "decode_report.hpp"
#include "output_file.hpp"
#include "progress.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

struct DecodeOptions {
    std::string capture;
    std::optional<std::string> reference;
    std::optional<std::string> output;
    CoreOptions core;
    bool json = false;
};

constexpr const char* description = "Decode the code blocks of a capture";

constexpr const char* footer = R"(Soft values:
  Integers in units of 1/8: 8 stands for 1.0. The sign is the bit: POSITIVE
  MEANS BIT 1, negative means bit 0. A log-likelihood ratio ln(P(1)/P(0)) times
  8 fits. The core takes -128 to 127; it saturates what lies outside, with a
  warning at the first such value.

Files:
  CAPTURE  npy (numpy.save) of int8, int16 or int32, shape (blocks, 3, K + 4).
           Axis 1 is the systematic stream, the parity of the first and the
           parity of the second constituent code. The last 4 positions hold the
           12 tail values in the order of 3GPP TS 36.212, section 5.1.3.2.2.
           'quarzel info' tells the valid K.
           Or text: CSV with the header systematic,parity1,parity2, one position
           a line, an empty line between blocks.
  BITS     npy of uint8, shape (blocks, K/8): 8 bits to a byte, the first bit
           highest, as numpy.packbits(bits, axis=1) makes them.
  OUT      the same. It is written whole or not at all.

Example:
  quarzel decode capture.npy --units 8 --reference sent.npy -o decided.npy

  decodes capture.npy as a core with 8 processing units does, compares the
  decisions with the bits that were sent and keeps them in decided.npy. Bit
  errors are a result, not a failure: the exit code is 0.
)";

/// Throw when writing `output` would replace a file that is read.
void refuseToOverwrite(const std::string& output, const std::string& input) {
    std::error_code ignored;
    if (std::filesystem::equivalent(output, input, ignored)) {
        throw ToolError(ExitCode::usage, "-o", fmt::format("{} is also read", output), "give another name");
    }
}

PackedBits decodeBlocks(const Capture& capture, const DecodeOptions& options) {
    CoreModel core(options.core.units, options.core.algorithm);
    PackedBits decisions{capture.blockSize / 8, {}};
    std::vector<unsigned char> bits(capture.blockSize);
    const std::size_t total = capture.blocks.size();
    Progress progress(std::cerr, ::isatty(STDERR_FILENO) != 0, total);
    for (std::size_t block = 0; block < total; ++block) {
        if (const int status = core.decode(capture.blocks[block], options.core.iterations, bits)) {
            throw ToolError(
                ExitCode::decodingFailed, options.capture,
                fmt::format("block {} of {} could not be decoded (status {})", block + 1, total, status),
                "the line above says why");
        }
        decisions.append(bits);
        progress.update(block + 1);
    }
    return decisions;
}

void decode(const DecodeOptions& options, std::ostream& results) {
    if (options.output) {
        if (options.output->empty()) {
            throw ToolError(ExitCode::usage, "-o", "the name of the file is empty", "give one");
        }
        refuseToOverwrite(*options.output, options.capture);
        if (options.reference) {
            refuseToOverwrite(*options.output, *options.reference);
        }
        probeOutput(*options.output);
    }
    const Capture capture = readCapture(options.capture);
    std::optional<PackedBits> reference;
    if (options.reference) {
        reference = readBits(*options.reference, capture.blocks.size(), capture.blockSize / 8);
    }

    const auto start = std::chrono::steady_clock::now();
    const PackedBits decisions = decodeBlocks(capture, options);
    const std::chrono::duration<double> duration = std::chrono::steady_clock::now() - start;

    if (options.output) {
        writeBits(*options.output, decisions);
    }
    DecodeReport report{options.capture,       capture.blockSize, options.core,
                        capture.blocks.size(), duration.count(),  {}};
    if (reference) {
        report.errors = countErrors(decisions, *reference);
    }
    (options.json ? printJson : printText)(results, report);
}

}  // namespace

void addDecodeCommand(CLI::App& app, std::ostream& results) {
    auto options = std::make_shared<DecodeOptions>();
    CLI::App* command = app.add_subcommand("decode", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    command->add_option("CAPTURE", options->capture, "Soft values to decode")->required()->type_name("");
    addCoreOptions(*command, options->core);
    command->add_option("--reference", options->reference, "Count errors against the bits in this file")
        ->type_name("BITS");
    command->add_option("-o,--output", options->output, "Write the decided bits to this file")
        ->type_name("OUT");
    command->add_flag("--json", options->json, "Print one JSON object instead of text");
    command->callback([options, &results] { decode(*options, results); });
}

}  // namespace quarzel::tool
