// SPDX-License-Identifier: MIT
#include "trace/trace_diff_options.hpp"

#include <fmt/format.h>
#include <CLI/CLI.hpp>

#include "options/choices.hpp"
#include "options/list_option.hpp"
#include "options/whole_number.hpp"

namespace quarzel::tool {

namespace {

/// The most passes of a block: two in each of 15 iterations.
constexpr std::uint32_t mostPasses = 30;

/// The passes of an item of the list; none when it is neither a number nor a range.
std::vector<std::uint32_t> passesOf(std::string_view item) {
    const std::vector<std::string_view> ends = itemsOf(item, '-');
    const std::optional<std::uint64_t> first = readWholeNumber(ends.front());
    const std::optional<std::uint64_t> last = readWholeNumber(ends.back());
    std::vector<std::uint32_t> passes;
    if (ends.size() <= 2 && first && last && *last < mostPasses) {
        for (std::uint64_t pass = *first; pass <= *last; ++pass) {
            passes.push_back(static_cast<std::uint32_t>(pass));
        }
    }
    return passes;
}

CLI::Validator passList() {
    return {[](std::string& item) {
                return passesOf(item).empty()
                           ? fmt::format("'{}' is not a pass from 0 to {} or a range of them such as 2-5",
                                         item, mostPasses - 1)
                           : std::string();
            },
            ""};
}

CLI::Validator signalList() {
    return {[](std::string& item) {
                return columnsNamed(item).none()
                           ? fmt::format(
                                 "'{}' is not a signal: int, a, b, g, llr, ext, one of their columns "
                                 "such as a3, or code1_sys to code2_par1",
                                 item)
                           : std::string();
            },
            ""};
}

}  // namespace

TraceMatching TraceDiffOptions::matching() const {
    TraceMatching matching{{}, block, ignoreTermination};
    for (const std::string& name : signals) {
        matching.selection.columns |= columnsNamed(name);
    }
    for (const std::string& item : passes) {
        for (const std::uint32_t pass : passesOf(item)) {
            matching.selection.passes.push_back(pass);
        }
    }
    return matching;
}

std::optional<TraceUnits> TraceDiffOptions::unitsOfB() const {
    if (units.empty()) {
        return std::nullopt;
    }
    return units == "raw" ? TraceUnits::raw : TraceUnits::real;
}

void addTraceDiffOptions(CLI::App& command, TraceDiffOptions& options) {
    command.add_option("A", options.a, "The trace that counts, or - for standard input")
        ->required()
        ->type_name("");
    command.add_option("B", options.b, "The trace to compare with it")->required()->type_name("");
    command
        .add_option("--block", options.block,
                    "Compare this block alone, the first being 0\n(default: all, by their numbers)")
        ->type_name("N")
        ->transform(wholeNumber([](std::uint64_t) { return true; }, "a number from 0 on"));
    addListOption(command, "--signals", options.signals,
                  "Compare these signals alone, such as llr,ext,a3\n(default: all that both tell)", "LIST",
                  signalList());
    addListOption(
        command, "--passes", options.passes,
        "Compare these passes alone, such as 0,2-5, the\nfirst being 0 (default: all from the first "
        "one of\nboth)",
        "LIST", passList());
    command
        .add_option(
            "--units", options.units,
            "What the numbers of B are: raw, integers in units\nof 1/8, or real (default: real in the "
            "text form, else\nraw)")
        ->type_name("UNITS")
        ->check(withChoices(CLI::IsMember({"raw", "real"}).description(""), {"raw", "real"}));
    command.add_flag("--ignore-termination", options.ignoreTermination,
                     "Leave out the termination steps of each pass");
    command.add_option("--junit", options.junit, "Write a JUnit XML report to this file")->type_name("FILE");
    command.add_flag("--json", options.json, "Print one JSON object instead of text");
}

}  // namespace quarzel::tool
