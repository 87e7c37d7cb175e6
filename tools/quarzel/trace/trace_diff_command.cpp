// SPDX-License-Identifier: MIT
#include "trace/trace_diff_command.hpp"

#include <fstream>
#include <iostream>
#include <memory>
#include <string>

#include "files/input_file.hpp"
#include "trace/trace_diff_report.hpp"

namespace quarzel::tool {

namespace {

struct TraceDiffOptions {
    std::string a;
    std::string b;
    bool ignoreTermination = false;
    bool json = false;
};

constexpr const char* description = "Tell where two traces first differ";

constexpr const char* footer = R"(Traces:
  A and B are texts as 'quarzel decode --trace' writes them, the model's or one
  of a hardware simulation in the same form; - for one of them is standard
  input. They are compared in the order of the text, up to the first difference:
  soft inputs of a block, then its passes, step by step. Numbers count by their
  value: +0.5 equals +0.500000.

  Told are the block (decode), the pass (siso; an even one decodes constituent
  code 2 in interleaved order, an odd one code 1 in natural order), step, signal
  and state, both values, as real numbers and in units of 1/8 (raw), how many
  further values differ in that pass, and the signal around that step, with '*'
  before the values of B that differ.

  Hardware does not compute the three termination steps at the end of a pass.
  With --ignore-termination they may differ, or be missing.

Example:
  quarzel decode capture.npy --units 8 --trace 12 --trace-block 5 |
    quarzel trace-diff - simulation.txt --ignore-termination
)";

/// A trace that is open for reading.
class OpenTrace {
  public:
    OpenTrace(const std::string& file, bool terminationOptional)
        : itsFile(file == "-" ? std::ifstream() : openInput(file)),
          itsReader(file == "-" ? std::cin : itsFile, nameOf(file), terminationOptional) {}

    TraceReader& reader() { return itsReader; }

    static std::string nameOf(const std::string& file) { return file == "-" ? "standard input" : file; }

  private:
    std::ifstream itsFile;
    TraceReader itsReader;
};

ExitCode compare(const TraceDiffOptions& options, std::ostream& results) {
    if (options.a == "-" && options.b == "-") {
        throw ToolError(ExitCode::usage, "B", "standard input is already read as A", "name a file");
    }
    OpenTrace a(options.a, options.ignoreTermination);
    OpenTrace b(options.b, options.ignoreTermination);
    TraceDiffReport report{OpenTrace::nameOf(options.a), OpenTrace::nameOf(options.b), 0, 0, {}};
    report.comparison = compareTraces(a.reader(), b.reader(), options.ignoreTermination);
    report.linesA = a.reader().linesRead();
    report.linesB = b.reader().linesRead();
    (options.json ? printJson : printText)(results, report);
    return report.comparison.first ? ExitCode::tracesDiffer : ExitCode::done;
}

}  // namespace

void addTraceDiffCommand(CLI::App& app, std::ostream& results, ExitCode& exitCode) {
    auto options = std::make_shared<TraceDiffOptions>();
    CLI::App* command = app.add_subcommand("trace-diff", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    command->add_option("A", options->a, "A trace, or - for standard input")->required()->type_name("");
    command->add_option("B", options->b, "The trace to compare it with")->required()->type_name("");
    command->add_flag("--ignore-termination", options->ignoreTermination,
                      "Leave out the termination steps of each pass");
    command->add_flag("--json", options->json, "Print one JSON object instead of text");
    command->callback([options, &results, &exitCode] { exitCode = compare(*options, results); });
}

}  // namespace quarzel::tool
