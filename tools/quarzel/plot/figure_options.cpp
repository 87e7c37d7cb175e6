// SPDX-License-Identifier: MIT
#include "plot/figure_options.hpp"

#include <fmt/format.h>
#include <CLI/CLI.hpp>

#include <charconv>
#include <cmath>
#include <functional>
#include <string>
#include <string_view>

#include "options/choices.hpp"
#include "options/text_items.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

constexpr double pointsPerInch = 72;
constexpr double millimetresPerInch = 25.4;

/// A finite number, or NaN when the text is anything else.
double numberIn(std::string_view text) {
    double value = 0;
    const auto [stop, error] = std::from_chars(text.data(), text.data() + text.size(), value);
    const bool isNumber = error == std::errc() && stop == text.data() + text.size() && std::isfinite(value);
    return isNumber ? value : std::nan("");
}

void readSize(const std::string& text, FigureChoice& choice) {
    const auto fail = [&](std::string_view why) {
        return ToolError(ExitCode::usage, "--size", fmt::format("'{:.40}' {}", text, why),
                         "give one as 3.5in, 3.5x2.6in or 89x66mm, of 1 to 40 inches");
    };
    const bool isInches = text.ends_with("in");
    if (!isInches && !text.ends_with("mm")) {
        throw fail("has no unit");
    }
    const double unit = isInches ? pointsPerInch : pointsPerInch / millimetresPerInch;
    const std::vector<std::string_view> parts =
        itemsOf(std::string_view(text).substr(0, text.size() - 2), 'x');
    const auto length = [&](std::string_view part) {
        const double points = numberIn(part) * unit;
        if (!(points >= pointsPerInch && points <= 40 * pointsPerInch)) {
            throw fail("is not a size");
        }
        return points;
    };
    if (parts.size() > 2) {
        throw fail("is not a size");
    }
    choice.width = length(parts[0]);
    if (parts.size() == 2) {
        choice.height = length(parts[1]);
    }
}

Range rangeIn(const std::string& option, const std::string& text, const std::string& remedy, double above) {
    const std::vector<std::string_view> parts = itemsOf(text, ':');
    if (parts.size() == 2) {
        const Range range = {numberIn(parts[0]), numberIn(parts[1])};
        if (range.first < range.last && range.first > above) {
            return range;
        }
    }
    throw ToolError(ExitCode::usage, option, fmt::format("'{:.40}' is not a range", text), remedy);
}

}  // namespace

void addFigureOptions(CLI::App& command, FigureChoice& choice) {
    const auto add = [&command](const char* name, const char* type, const char* text,
                                const std::function<void(const std::string&)>& read) {
        command.add_option_function<std::string>(name, read, text)->type_name(type)->check(anyText());
    };
    add("--size", "SIZE", "Width, or width and height, in inches or\nmillimetres",
        [&](const std::string& text) { readSize(text, choice); });
    add("--font-size", "POINTS", "Size of the text (default 10)", [&](const std::string& text) {
        choice.fontSize = numberIn(text);
        if (!(choice.fontSize >= 4 && choice.fontSize <= 72)) {
            throw ToolError(ExitCode::usage, "--font-size", fmt::format("'{:.40}' is not a size", text),
                            "give a number of points from 4 to 72");
        }
    });
    add("--font", "NAME", "Font of the text (default: one without serifs)",
        [&](const std::string& text) { choice.font = text; });
    const std::vector<std::string> places(legendPlaces.begin(), legendPlaces.end());
    command.add_option("--legend", choice.legend, "Where the legend stands")
        ->type_name("PLACE")
        ->check(withChoices(CLI::IsMember(places).description(""), places));
    add("--x-range", "RANGE", "What the horizontal axis shows, in dB", [&](const std::string& text) {
        choice.x = rangeIn("--x-range", text, "give two numbers of dB in ascending order, as 0:1.5", -1000);
    });
    add("--y-range", "RANGE", "What the vertical axis shows", [&](const std::string& text) {
        choice.y = rangeIn("--y-range", text, "give two rates in ascending order, as 1e-6:1", 0);
    });
    add("--x-label", "TEXT", "Label of the horizontal axis",
        [&](const std::string& text) { choice.xLabel = text; });
    add("--y-label", "TEXT", "Label of the vertical axis of a single panel",
        [&](const std::string& text) { choice.yLabel = text; });
}

}  // namespace quarzel::tool
