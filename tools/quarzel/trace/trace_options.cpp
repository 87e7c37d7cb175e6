// SPDX-License-Identifier: MIT
#include "trace/trace_options.hpp"

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
        .add_option("--trace-block", options.block,
                    "Trace from this block on, the first being 1\n(default 1)")
        ->type_name("N")
        ->transform(wholeNumber([](std::uint64_t n) { return n >= 1; }, "a number from 1 on"))
        ->needs(trace);
    command
        .add_option(
            "--trace-file", options.file,
            "Write the trace to this file (default: to\nstandard output, the report to standard error)")
        ->type_name("FILE")
        ->needs(trace);
    command.add_option("--trace-format", options.form, "text, csv or json (default text)")
        ->type_name("FORM")
        ->check(withChoices(CLI::IsMember({"text", "csv", "json"}).description(""), {"text", "csv", "json"}))
        ->needs(trace);
}

}  // namespace quarzel::tool
