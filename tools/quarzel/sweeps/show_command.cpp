// SPDX-License-Identifier: MIT
#include "sweeps/show_command.hpp"

#include <CLI/CLI.hpp>
#include <memory>
#include <string>

#include "sweeps/sweep_files.hpp"
#include "sweeps/sweep_table.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

struct Options {
    std::string file;
    SweepForm form = SweepForm::table;
};

constexpr const char* description = "Print a stored result of a sweep";

constexpr const char* footer =
    R"(RESULT is a file that 'quarzel sweep -o' or 'quarzel merge -o' has written, or
the checkpoint of an interrupted sweep, whose last points have not ended. With
--json a result in an older format is printed in the present one.

Examples:
  quarzel show result.json
  quarzel show result.json --csv > result.csv
)";

}  // namespace

void addShowCommand(CLI::App& app, std::ostream& results) {
    auto options = std::make_shared<Options>();
    CLI::App* command = app.add_subcommand("show", description)->group("Commands");
    command->footer(std::string(footer) + '\n' + exitCodesHelp);
    command->add_option("RESULT", options->file, "The result of a sweep")->required()->type_name("");
    addFormOptions(*command, options->form);
    command->callback([options, &results] {
        const std::string text = readBytes(options->file);
        printSweep(results, aboutFile(options->file, [&text] { return sweep::readResult(text); }),
                   options->form);
    });
}

}  // namespace quarzel::tool
