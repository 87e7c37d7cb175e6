// SPDX-License-Identifier: MIT
#include "trace/trace_diff_command.hpp"

#include <CLI/CLI.hpp>
#include <fstream>
#include <iostream>
#include <memory>
#include <sstream>
#include <string>

#include "files/input_file.hpp"
#include "files/output_file.hpp"
#include "junit_report.hpp"
#include "trace/trace_cause.hpp"
#include "trace/trace_diff_options.hpp"
#include "trace/trace_diff_report.hpp"

namespace quarzel::tool {

namespace {

constexpr const char* description = "Tell where two traces first differ, and why";

constexpr const char* footer = R"(Traces:
  A is the trace of the model, B that of a hardware simulation, each in a form
  of its own; - for one of them is standard input. Every form that 'quarzel
  decode --trace-format' writes is read, and of a simulation:
  text     with the columns, passes and rows that it has, in any order
  CSV      a header of names, then rows in any order: step, pass and maybe
           block, and a value with its signal, state and raw (or real), or a
           column for each value: a0 to a7, b0 to b7, g4 to g7, int, llr, ext,
           code1_sys to code2_par1
  JSON     an object on a line, with the same names; "a", "b" and "g" may be
           arrays
  npy      a structured array of numpy with fields of the same names
  x and z, in any digit of a number, are unknown values; they differ from all
  numbers. Blocks, passes and steps count from 0.

  Values are matched by block, pass, step, signal and state. What only one
  trace tells does not count: signals, soft inputs, and blocks and passes before
  the first ones of the other trace. All else that is missing does.

  Told are the first difference in the order in which the core computes (soft
  inputs, int, g, a from the first step up, b from the last one down, llr,
  ext), how many values differ by signal and by pass, what the value is
  computed of, and the signal around that step in units of 1/8 (raw), with '*'
  before the values of B that differ.

  Hardware does not compute the three termination steps at the end of a pass.
  With --ignore-termination they may differ, or be missing.

Examples:
  quarzel decode capture.npy --units 8 --trace 12 --trace-file model.txt
  quarzel trace-diff model.txt simulation.txt --ignore-termination
  quarzel trace-diff model.txt llr.csv --signals llr,ext --passes 2-5
)";

std::string nameOf(const std::string& file) {
    return isStandardStream(file) ? "standard input" : file;
}

/// A trace that is open for reading.
class OpenTrace {
  public:
    OpenTrace(const std::string& file, std::optional<TraceUnits> units)
        : itsFile(isStandardStream(file) ? std::ifstream() : openInput(file)),
          itsReader(makeTraceReader(isStandardStream(file) ? std::cin : itsFile, nameOf(file), units)) {}

    TraceBlockReader& reader() { return itsReader; }

  private:
    std::ifstream itsFile;
    TraceBlockReader itsReader;
};

/// Write a JUnit XML report of one test.
void writeJunit(const std::string& file, const TraceDiffReport& report) {
    JunitCase test{report.files[0], "equals " + report.files[1], {}};
    if (report.comparison.first) {
        std::ostringstream text;
        printText(text, report);
        test.failure = {"the traces differ", text.str()};
    }
    writeOutput(file, junitText("quarzel trace-diff", {test}));
}

ExitCode compare(const TraceDiffOptions& options, std::ostream& results) {
    if (isStandardStream(options.a) && isStandardStream(options.b)) {
        throw ToolError(ExitCode::usage, "B", "standard input is already read as A", "name a file");
    }
    if (options.junit) {
        checkJunitFile(*options.junit, {options.a, options.b});
    }
    OpenTrace a(options.a, std::nullopt);
    OpenTrace b(options.b, options.unitsOfB());
    TraceDiffReport report{{nameOf(options.a), nameOf(options.b)},
                           {a.reader().rows().unit(), b.reader().rows().unit()},
                           compareTraces(a.reader(), b.reader(), options.matching()),
                           {}};
    if (report.comparison.first) {
        report.cause = causeOf(*report.comparison.first);
    }
    if (options.junit) {
        writeJunit(*options.junit, report);
    }
    (options.json ? printJson : printText)(results, report);
    return report.comparison.first ? ExitCode::tracesDiffer : ExitCode::done;
}

}  // namespace

void addTraceDiffCommand(CLI::App& app, std::ostream& results, ExitCode& exitCode) {
    auto options = std::make_shared<TraceDiffOptions>();
    CLI::App* command = app.add_subcommand("trace-diff", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    addTraceDiffOptions(*command, *options);
    command->callback([options, &results, &exitCode] { exitCode = compare(*options, results); });
}

}  // namespace quarzel::tool
