// SPDX-License-Identifier: MIT
#include "vectors/compare_command.hpp"

#include <CLI/CLI.hpp>
#include <memory>
#include <optional>
#include <string>
#include <utility>

#include "captures/npy_header.hpp"
#include "files/input_file.hpp"
#include "files/output_file.hpp"
#include "junit_report.hpp"
#include "vectors/compare_report.hpp"

namespace quarzel::tool {

namespace {

struct CompareOptions {
    std::string expected;
    std::string actual;
    std::optional<std::string> junit;
    bool json = false;
};

constexpr const char* description = "Check the decisions of a simulation";

constexpr const char* footer = R"(EXPECTED is one of
  the directory of a core in a set that 'quarzel vectors' made, or its dout.hex;
  the directory of the set, where it has only one core; what the manifest says
  of these files is checked
  npy of uint8, shape (blocks, K/8): bits as 'quarzel decode -o' writes them

ACTUAL is what the simulation gave for the same blocks in the same order:
  text as $writememh makes it, a decision a word: hexadecimal words, x and z
  digits, comments, addresses (@hex); a later word at an address counts
  npy of truth values or integers, a decision an element, whatever its shape; or
  of uint8, shape (blocks, K/8), 8 bits to a byte, the first bit highest

Told are the first block and bit that differ (blocks, bits and addresses count
from 0, lines from 1), what is there instead, the blocks that differ (ten in
text, all with --json), and how many blocks and bits do: wrong, undefined (x),
undriven (z) or missing; by K, iterations, stimulus and eighth of the block. A
hint is given when decisions that are inverted, reversed, shifted or those of
other blocks explain it. For a block of a vector set follows the command that
prints the model's trace of it.

The report of --junit is XML for continuous integration, with a test for each
block. It is written whole, whether decisions differ or not, but not when there
is an error.

Example:
  quarzel compare vectors/u2_a1 simulated.hex
)";

MemoryImage readActual(const std::string& file, const ExpectedDecisions& expected) {
    std::ifstream stream = openInput(file);
    return isNpy(stream, file) ? readMemoryNpy(stream, expected.bits.size(), expected.packedSize(), file)
                               : readMemoryText(stream, expected.bits.size(), file);
}

ExitCode compare(const CompareOptions& options, std::ostream& results) {
    if (options.junit) {
        checkJunitFile(*options.junit, {options.expected, options.actual});
    }
    const ExpectedDecisions expected = readExpected(options.expected);
    const MemoryImage actual = readActual(options.actual, expected);
    DecisionComparison comparison = compareDecisions(expected, actual);
    std::optional<DecisionHint> hint = hintOf(expected, actual, comparison);
    const CompareReport report{expected, options.actual, actual, std::move(comparison), std::move(hint)};
    if (options.junit) {
        writeOutput(*options.junit, junitText(report));
    }
    (options.json ? printJson : printText)(results, report);
    return report.comparison.isEqual() ? ExitCode::done : ExitCode::decisionsDiffer;
}

}  // namespace

void addCompareCommand(CLI::App& app, std::ostream& results, ExitCode& exitCode) {
    auto options = std::make_shared<CompareOptions>();
    CLI::App* command = app.add_subcommand("compare", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    command->add_option("EXPECTED", options->expected, "The decisions that are right")
        ->required()
        ->type_name("");
    command->add_option("ACTUAL", options->actual, "The decisions of the simulation")
        ->required()
        ->type_name("");
    command->add_option("--junit", options->junit, "Write a JUnit XML report to this file")
        ->type_name("FILE");
    command->add_flag("--json", options->json, "Print one JSON object instead of text");
    command->callback([options, &results, &exitCode] { exitCode = compare(*options, results); });
}

}  // namespace quarzel::tool
