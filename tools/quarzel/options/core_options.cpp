// SPDX-License-Identifier: MIT
#include "options/core_options.hpp"

#include <fmt/format.h>
#include <CLI/CLI.hpp>

#include <algorithm>
#include <cstdint>
#include <vector>

#include "options/choices.hpp"
#include "options/whole_number.hpp"

namespace quarzel::tool {

CLI::Validator unitsCheck() {
    return withChoices(wholeNumber([](std::uint64_t n) { return n == 2 || n == 4 || n == 8; }, "2, 4 or 8"),
                       {"2", "4", "8"});
}

CLI::Validator algorithmCheck() {
    static const std::vector<std::string> names = {"max-log", "scaled-max-log", "max-star"};
    const CLI::Validator number = wholeNumber([](std::uint64_t n) { return n <= 2; }, "");
    const auto check = [number](std::string& text) {
        const auto found = std::find(names.begin(), names.end(), text);
        if (found != names.end()) {
            text = std::to_string(found - names.begin());
            return std::string();
        }
        return number(text).empty() ? std::string()
                                    : fmt::format("'{}' is not 0, 1, 2, {}", text, fmt::join(names, ", "));
    };
    std::vector<std::string> choices = {"0", "1", "2"};
    choices.insert(choices.end(), names.begin(), names.end());
    return withChoices({check, ""}, choices);
}

CLI::Validator iterationsCheck() {
    return wholeNumber([](std::uint64_t n) { return n >= 1 && n <= 15; }, "a number from 1 to 15");
}

Core coreOf(const CoreOptions& options) {
    Core core(CoreSettings{options.units, options.algorithm});
    core.choose(options.implementation);
    return core;
}

void addModelOptions(CLI::App& command, CoreOptions& options) {
    const auto add = [&command](const char* name, int& value, const char* text, const CLI::Validator& check) {
        command.add_option(name, value, fmt::format("{} (default {})", text, value))
            ->type_name("N")
            ->transform(check);
    };
    add("--units", options.units, "Processing units of the core: 2, 4 or 8", unitsCheck());
    add("--algorithm", options.algorithm,
        "0 max-log, 1 scaled-max-log (extrinsic values\nscaled by 0.75), 2 max-star; number or name",
        algorithmCheck());
    add("--iterations", options.iterations, "Iterations, 1 to 15; every one of them runs", iterationsCheck());
}

void addCoreOptions(CLI::App& command, CoreOptions& options) {
    addModelOptions(command, options);
    const std::vector<std::string> names = implementations();
    command
        .add_option(
            "--implementation", options.implementation,
            "Instruction set to decode with, or literal: step by\nstep (default: the best of this machine)")
        ->type_name("NAME")
        ->check(withChoices(CLI::IsMember(names).description(""), names));
}

}  // namespace quarzel::tool
