// SPDX-License-Identifier: MIT
#include "plot/plot_command.hpp"

#include <fmt/format.h>
#include <CLI/CLI.hpp>

#include <algorithm>
#include <filesystem>
#include <functional>
#include <memory>
#include <nlohmann/json.hpp>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

#include "files/output_file.hpp"
#include "options/choices.hpp"
#include "options/core_options.hpp"
#include "options/list_option.hpp"
#include "options/quantiser_options.hpp"
#include "options/whole_number.hpp"
#include "plot/figure_options.hpp"
#include "plot/gnuplot.hpp"
#include "plot/picture_csv.hpp"
#include "plot/plot_inputs.hpp"
#include "plot/plot_script.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

constexpr const char* description = "Draw the error rates of stored sweeps";

constexpr const char* footer =
    R"(The picture shows bit and block error rate over Eb/N0 on logarithmic axes, with
intervals that hold the true rate with a probability of 95 %. Where no error was
seen, a triangle stands at the upper end of the interval, and no line leads
there. The bound of the bit error rate takes a wrong block to have as many wrong
bits as at the nearest point with errors. The legend tells in what the curves
differ, the title what they share. Curves that were measured alike over several
ranges of Eb/N0 are one line.

  RESULT     what 'quarzel sweep -o' wrote; the curves of all are drawn together
  OUT        its ending tells the format: .svg, .png (300 dots per inch) or .pdf
             (fonts embedded). It is written whole or not at all
  REFERENCE  FILE or LABEL=FILE: CSV with a header and the columns ebn0_db and
             ber, bler or both, or in their place K, blocks, bit_errors and
             block_errors; drawn as a dashed line with marks. Rows that differ
             in source, K, code_bits, channel, modulation, decoder or iterations
             are curves of their own; --block-size chooses among those with a K.
             Lines that begin with # are comments
  SIZE       WIDTHin, WIDTHmm, WIDTHxHEIGHTin or WIDTHxHEIGHTmm
  RANGE      FIRST:LAST
  PLACE      right, below, top-left, top-right, bottom-left, bottom-right, none;
             without it right or below, as there is room

With --per-iteration a single curve is drawn, with a line for each iteration, or
for those that --iterations names; the sweep must have counted them (quarzel
sweep --per-iteration). Of curves that differ in the iterations alone the
longest is taken. Points without an error are left out there.

Es/N0 is that of a symbol of the channel. A reference must tell its code rate
for it, by K and code_bits.

gnuplot draws the picture and must be installed (Debian: gnuplot-nox).

Examples:
  quarzel plot result.json -o curves.svg
  quarzel plot a.json b.json --block-size 40 --reference theory=ml.csv -o k.png
  quarzel plot result.json --algorithm 1 --per-iteration -o gain.pdf
  quarzel plot result.json --panel bler --size 3.5x2.6in --font-size 8 \
      --title '' --legend bottom-left -o paper.pdf
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

/// Check that no output is an input or another output.
void checkOutputs(const PlotOptions& options) {
    for (const auto& [option, output] : {std::pair("-o", options.output), std::pair("--csv", options.csv)}) {
        if (!output.empty() && std::any_of(options.results.begin(), options.results.end(),
                                           [&output = output](const std::string& result) {
                                               return isSameFile(result, output);
                                           })) {
            throw ToolError(ExitCode::usage, option, fmt::format("{} is also read", output),
                            "give another name");
        }
    }
    if (!options.csv.empty() && isSameFile(options.csv, options.output)) {
        throw ToolError(ExitCode::usage, "--csv", fmt::format("{} is also the picture", options.csv),
                        "give another name");
    }
}

/// Tell what is drawn. All panels have the same curves.
void printJson(std::ostream& stream, const PlotOptions& options, const Picture& picture) {
    using Json = nlohmann::ordered_json;
    Json object = {{"picture", options.output},
                   {"csv", options.csv.empty() ? Json() : Json(options.csv)},
                   {"title", picture.title},
                   {"panels", options.picture.panels},
                   {"curves", Json::array()}};
    for (const DrawnCurve& curve : picture.panels.front().curves) {
        object["curves"].push_back({{"label", curve.label}, {"kind", nameOf(curve.kind)}});
    }
    // Names and labels need not be UTF-8; what is not becomes U+FFFD.
    stream << object.dump(-1, ' ', false, Json::error_handler_t::replace) << '\n';
}

void plot(PlotOptions& options, std::ostream& results) {
    const std::string terminal = terminalOf(options.output);
    if (options.figure.yLabel && options.picture.panels.size() > 1) {
        throw ToolError(ExitCode::usage, "--y-label", "there are two vertical axes",
                        "choose one with --panel");
    }
    checkOutputs(options);
    probeOutput(options.output);
    if (!options.csv.empty()) {
        probeOutput(options.csv);
    }
    options.picture.x = options.figure.x;
    options.picture.iterations = options.iterations;
    const std::vector<SweepCurve> curves = readCurves(options);
    const Picture picture = pictureOf(options.picture, curves, readReferences(options));
    const std::string drawn = runGnuplot(plotScript(picture, options.figure, terminal));
    if (!options.csv.empty()) {
        writeOutput(options.csv, pictureCsv(picture, axesOf(picture, options.figure)));
    }
    writeOutput(options.output, drawn);
    if (options.json) {
        printJson(results, options, picture);
    }
}

}  // namespace

void addPlotCommand(CLI::App& app, std::ostream& results) {
    auto options = std::make_shared<PlotOptions>();
    CLI::App* command = app.add_subcommand("plot", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    command->add_option("RESULT", options->results, "Results of sweeps")->required()->type_name("");
    command->add_option("-o,--output", options->output, "Write the picture to this file")
        ->required()
        ->type_name("OUT");
    command->add_option("--csv", options->csv, "Write the points that are drawn to this file")
        ->type_name("FILE");
    command->add_option("--reference", options->references, "Draw a curve from elsewhere too; repeatable")
        ->type_name("REFERENCE")
        ->allow_extra_args(false);
    addListOption(*command, "--block-size", options->blockSizes, "Draw only curves of these block sizes",
                  "K,...", wholeNumber([](std::uint64_t n) { return n <= 6144; }, "a block size"));
    addListOption(*command, "--units", options->units, "Draw only curves of these numbers of units", "N,...",
                  unitsCheck());
    addListOption(*command, "--algorithm", options->algorithms, "Draw only curves of these algorithms",
                  "N,...", algorithmCheck());
    addListOption(*command, "--llr", options->llrScales, "Draw only curves of these factors of --llr",
                  "S,...", scaleCheck());
    addListOption(*command, "--iterations", options->iterations,
                  "Draw only curves of these numbers of\niterations; with --per-iteration, only these lines",
                  "N,...", iterationsCheck());
    command->add_flag("--per-iteration", options->picture.perIteration,
                      "Draw a line for each iteration of one curve");
    const auto addChoice = [&](const char* name, const char* text, const std::vector<std::string>& choices,
                               const std::function<void(const std::string&)>& read) {
        command->add_option_function<std::string>(name, read, text)
            ->type_name("NAME")
            ->check(withChoices(CLI::IsMember(choices).description(""), choices));
    };
    PictureChoice& picture = options->picture;
    picture.panels = {"ber", "bler"};
    addChoice("--panel", "Draw the bit error rate (ber), the block error rate\n(bler) or both (default both)",
              {"ber", "bler", "both"}, [&picture](const std::string& name) {
                  if (name != "both") {
                      picture.panels = {name};
                  }
              });
    addChoice("--x", "Draw over ebn0 or esn0 (default ebn0)", {"ebn0", "esn0"},
              [&picture](const std::string& name) { picture.isOverEsN0 = name == "esn0"; });
    command->add_flag("--uncoded", picture.uncoded, "Draw BPSK without a code too");
    command->add_option("--title", picture.title, "Title (default: what the curves share)")
        ->type_name("TEXT")
        ->check(anyText());
    command
        ->add_option("--label", picture.labels,
                     "Label of a curve; repeat it for each, in the order of\nthe legend")
        ->type_name("TEXT")
        ->allow_extra_args(false)
        ->check(anyText());
    addFigureOptions(*command, options->figure);
    command->add_flag("--json", options->json, "Print what is drawn as one JSON object");
    command->callback([options, &results] { plot(*options, results); });
}

}  // namespace quarzel::tool
