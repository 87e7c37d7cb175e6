// SPDX-License-Identifier: MIT
#include "vectors/vectors_command.hpp"

#include <fmt/format.h>
#include <unistd.h>
#include <CLI/CLI.hpp>

#include <iostream>
#include <memory>
#include <nlohmann/json.hpp>
#include <optional>
#include <string>

#include "decode/progress.hpp"
#include "report_text.hpp"
#include "sweeps/interruption.hpp"
#include "tool_error.hpp"
#include "vectors/vector_set.hpp"
#include "vectors/vectors_options.hpp"

namespace quarzel::tool {

namespace {

constexpr const char* description = "Make stimulus and expected response for a test bench";

constexpr const char* footer = R"(Stimuli:
  noise          a code word of random bits over BPSK and white Gaussian noise;
                 the same blocks that 'quarzel sweep' decodes
  zero           0 everywhere
  full-scale     a code word at -128 and 127, without noise
  ties           8 and -8 at random, no code word: many metrics are equal
  saturating     -128 and 127 at random, no code word: metrics wrap around
  first-segment  a code word with noise in the first thread segment alone
  last-segment   a code word with noise in the last thread segment and the tail

Captures:
  With --capture the blocks are those of a capture, as 'quarzel decode' reads
  it, all of them with each number of iterations; soft values outside -128 to
  127 are saturated as the core does it. Real numbers need --llr or --scale.
  Block n of the capture is row n of the set's npy files, both from 0.

Covering sets:
  With --cover each core has about ten blocks, chosen so that their decisions
  and tags give away every fault of a catalogue of 330 that a design can have
  and any block can find. The manifest tells how many they find, and how many
  of 30 further faults, which no block was chosen for. Tags are in tags.hex.

  With --cover-sizes the set has, for every K, blocks of noise and one of the
  other stimuli in turn, and all stimuli at the smallest and the greatest K of
  each number of thread segments. That reaches every K, every shape of windows,
  first, middle and last segments, both ends of the range in each stream, and
  all iteration counts; the manifest counts what is reached.

Links:
  With --transport-block, or any other option of rate matching, modulation and
  further transmissions, the blocks come from a link (3GPP TS 36.212 and 36.211)
  and the set has a directory link/ with each stage: transport block, CRC, code
  blocks, encoder, interleaver, circular buffer, coded bits, symbols, soft
  values received, soft buffer. The set has one link, so lists have one item.
  Every block is sent and decoded in all transmissions, whatever its CRCs say.

Directory:
  manifest.json  configuration, blocks, coverage, SHA-256 of every file
  README.md      what the files are
  u2_a1/ ...     one for each core, here of 2 units and algorithm 1:
    config.vh    sizes as localparams, to be included
    blocks.hex   4 words a block: K, iterations, address of its first soft value
                 and of its first decision
    rsc1_sys.hex, rsc1_par.hex, rsc2_par.hex
                 soft values of all blocks, two's complement bytes
    dout.hex     the decisions expected, a bit a word
    npy/         the same blocks by K and iterations, for 'quarzel decode'
    tags.hex     with --cover: the tag of each block, 8 bits
    crc.hex      of transport blocks: which CRCs hold
  link/          the stages of a link; the manifest tells what each file holds
  The .hex files are for $readmemh; blocks, transmissions and bits count from 0.
  The directory is written whole or not at all. The same seed and options give
  the same bytes, whatever the number of threads. Off a terminal a line a
  minute on standard error tells how far it is.

Examples:
  quarzel vectors vectors --block-size 40,6144 --units 8 --ebn0 0.8
  quarzel vectors covering --cover --units 4 --algorithm 2
  quarzel vectors own --capture result.json.failures/k1024_u2_a1_i6.soft.npy
  quarzel vectors link --transport-block 4264 --coded-bits 12876 --rv 0,2
  quarzel compare vectors/u8_a1 simulated.hex
)";

void printSummary(std::ostream& results, const VectorsOptions& options, const VectorSetSummary& summary) {
    if (options.json) {
        const nlohmann::ordered_json object = {{"directory", options.directory}, {"cores", summary.cores},
                                               {"blocks", summary.blocks},       {"bits", summary.bits},
                                               {"files", summary.files},         {"bytes", summary.bytes}};
        results << object.dump(-1, ' ', false, nlohmann::ordered_json::error_handler_t::replace) << '\n';
        return;
    }
    std::string text;
    reportLine(text, "directory", options.directory);
    reportLine(text, "cores", std::to_string(summary.cores));
    reportLine(text, "blocks", std::to_string(summary.blocks));
    reportLine(text, "bits", std::to_string(summary.bits));
    reportLine(text, "files", fmt::format("{}, {:.1f} MB", summary.files, double(summary.bytes) / 1e6));
    results << text;
}

void makeVectors(const VectorsOptions& options, std::ostream& results) {
    const VectorRequest request = requestOf(options);
    const Interruption interruption;
    std::optional<Progress> progress;
    const VectorSetSummary summary =
        makeVectorSet(request, options.directory, options.replace, options.threads,
                      [&](std::size_t done, std::size_t total) {
                          if (interruption.hasCome()) {
                              throw ToolError(ExitCode::interrupted, options.directory,
                                              "was not made, since a signal came", "run the command again");
                          }
                          if (!progress) {
                              progress.emplace(std::cerr, ::isatty(STDERR_FILENO) != 0, total);
                          }
                          progress->update(done);
                      });
    progress.reset();
    printSummary(results, options, summary);
}

}  // namespace

void addVectorsCommand(CLI::App& app, std::ostream& results) {
    auto options = std::make_shared<VectorsOptions>();
    CLI::App* command = app.add_subcommand("vectors", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    addVectorsOptions(*command, *options);
    command->callback([options, &results] { makeVectors(*options, results); });
}

}  // namespace quarzel::tool
