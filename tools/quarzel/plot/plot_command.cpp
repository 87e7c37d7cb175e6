// SPDX-License-Identifier: MIT
#include "plot/plot_command.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "files/output_file.hpp"
#include "options/choices.hpp"
#include "options/core_options.hpp"
#include "options/list_option.hpp"
#include "options/whole_number.hpp"
#include "plot/gnuplot.hpp"
#include "plot/plot_script.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

struct PlotOptions {
    std::vector<std::string> results;
    std::string output;
    std::vector<std::string> references;
    std::vector<std::uint32_t> blockSizes;
    std::vector<int> units;
    std::vector<int> algorithms;
    std::vector<int> iterations;
    bool perIteration = false;
    std::string title;
};

constexpr const char* description = "Draw the error rates of stored sweeps";

constexpr const char* footer =
    R"(The picture shows bit and block error rate over Eb/N0 on logarithmic axes, with
intervals that hold the true rate with a probability of 95 %. Where no error was
seen, a triangle stands at the upper end of the interval, and no line leads
there. The legend tells in what the curves differ, the title what they share.

  RESULT     what 'quarzel sweep -o' wrote; the curves of all are drawn together
  OUT        its ending tells the format: .svg, .png or .pdf. It is written
             whole or not at all
  REFERENCE  FILE or LABEL=FILE: CSV with a header and the columns ebn0_db and
             ber, bler or both; drawn as a dashed line. Lines that begin with #
             are comments

With --per-iteration a single curve is drawn, with a line for each iteration;
the sweep must have counted them (quarzel sweep --per-iteration). Points without
an error are left out there.

gnuplot draws the picture and must be installed (Debian: gnuplot-nox).

Examples:
  quarzel plot result.json -o curves.svg
  quarzel plot a.json b.json --block-size 40 --reference theory=ml.csv -o k.png
  quarzel plot result.json --algorithm 1 --per-iteration -o gain.pdf
)";

/// The format that the ending of a file stands for.
std::string terminalOf(const std::string& file) {
    const std::string ending = std::filesystem::path(file).extension().string();
    if (ending != ".svg" && ending != ".png" && ending != ".pdf") {
        throw ToolError(ExitCode::usage, "-o", fmt::format("'{}' tells no format", file),
                        "give a name that ends with .svg, .png or .pdf");
    }
    return ending.substr(1);
}

template <class Value>
bool isWanted(const std::vector<Value>& wanted, Value value) {
    return wanted.empty() || std::find(wanted.begin(), wanted.end(), value) != wanted.end();
}

/// The curves of all results that the user wants.
std::vector<SweepCurve> readCurves(const PlotOptions& options) {
    std::vector<SweepCurve> curves;
    for (const std::string& result : options.results) {
        for (SweepCurve& curve : readSweepCurves(result)) {
            if (isWanted(options.blockSizes, curve.blockSize) && isWanted(options.units, curve.units) &&
                isWanted(options.algorithms, curve.algorithm) &&
                isWanted(options.iterations, curve.iterations)) {
                curves.push_back(std::move(curve));
            }
        }
    }
    if (curves.empty()) {
        throw ToolError(ExitCode::usage, "", "the results have no curve that was asked for",
                        "leave out --block-size, --units, --algorithm and --iterations");
    }
    return curves;
}

Picture pictureOf(const PlotOptions& options, const std::vector<SweepCurve>& curves) {
    std::vector<ReferenceCurve> references;
    for (const std::string& reference : options.references) {
        references.push_back(readReferenceCurve(reference));
    }
    if (!options.perIteration) {
        return ratesPicture(curves, references);
    }
    if (curves.size() > 1) {
        throw ToolError(ExitCode::usage, "--per-iteration", fmt::format("there are {} curves", curves.size()),
                        "choose one with --block-size, --units, --algorithm and --iterations");
    }
    const std::vector<MeasuredPoint>& points = curves.front().points;
    if (std::any_of(points.begin(), points.end(),
                    [](const MeasuredPoint& point) { return point.berAfter.empty(); })) {
        throw fileError(curves.front().file, "has no error rates per iteration",
                        "make it with 'quarzel sweep --per-iteration'");
    }
    return iterationsPicture(curves.front(), references);
}

void plot(const PlotOptions& options) {
    const std::string terminal = terminalOf(options.output);
    const std::vector<std::string>& results = options.results;
    if (std::any_of(results.begin(), results.end(),
                    [&](const std::string& result) { return isSameFile(result, options.output); })) {
        throw ToolError(ExitCode::usage, "-o", fmt::format("{} is also read", options.output),
                        "give another name");
    }
    probeOutput(options.output);
    Picture picture = pictureOf(options, readCurves(options));
    if (!options.title.empty()) {
        picture.title = options.title;
    }
    writeOutput(options.output, runGnuplot(plotScript(picture, terminal)));
}

}  // namespace

void addPlotCommand(CLI::App& app) {
    auto options = std::make_shared<PlotOptions>();
    CLI::App* command = app.add_subcommand("plot", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    command->add_option("RESULT", options->results, "Results of sweeps")->required()->type_name("");
    command->add_option("-o,--output", options->output, "Write the picture to this file")
        ->required()
        ->type_name("OUT");
    command->add_option("--reference", options->references, "Draw a curve from elsewhere too; repeatable")
        ->type_name("REFERENCE")
        ->allow_extra_args(false);
    addListOption(*command, "--block-size", options->blockSizes, "Draw only curves of these block sizes",
                  "K,...", wholeNumber([](std::uint64_t n) { return n <= 6144; }, "a block size"));
    addListOption(*command, "--units", options->units, "Draw only curves of these numbers of units", "N,...",
                  unitsCheck());
    addListOption(*command, "--algorithm", options->algorithms, "Draw only curves of these algorithms",
                  "N,...", algorithmCheck());
    addListOption(*command, "--iterations", options->iterations,
                  "Draw only curves of these numbers of\niterations", "N,...", iterationsCheck());
    command->add_flag("--per-iteration", options->perIteration,
                      "Draw a line for each iteration of one curve");
    command->add_option("--title", options->title, "Title (default: what the curves share)")
        ->type_name("TEXT")
        ->check(anyText());
    command->callback([options] { plot(*options); });
}

}  // namespace quarzel::tool
