// SPDX-License-Identifier: MIT
#include "trace/trace_options.hpp"

#include <CLI/CLI.hpp>
#include <limits>

#include "options/choices.hpp"
#include "options/whole_number.hpp"

namespace quarzel::tool {

void addTraceOptions(CLI::App& command, TraceOptions& options) {
    CLI::Option* trace =
        command
            .add_option("--trace", options.passes,
                        "Trace this many passes, two an iteration,\ncounted on across blocks")
            ->type_name("PASSES")
            ->transform(wholeNumber(
                [](std::uint64_t n) { return n >= 1 && n <= std::numeric_limits<std::uint32_t>::max(); },
                "a number from 1 to 4294967295"));
    command
        .add_option("--trace-block", options.block, "Trace from this block on, counted from 0 (default 0)")
        ->type_name("N")
        ->transform(wholeNumber([](std::uint64_t) { return true; }, "a whole number"))
        ->needs(trace);
    command
        .add_option(
            "--trace-file", options.file,
            "Write the trace to this file (default: to\nstandard output, the report to standard error)")
        ->type_name("FILE")
        ->needs(trace);
    command
        .add_option("--trace-format", options.form,
                    "text, csv, json or vcd, waves for a viewer\n(default text)")
        ->type_name("FORM")
        ->check(withChoices(CLI::IsMember({"text", "csv", "json", "vcd"}).description(""),
                            {"text", "csv", "json", "vcd"}))
        ->needs(trace);
}

}  // namespace quarzel::tool
