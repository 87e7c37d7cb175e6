// SPDX-License-Identifier: MIT
#include "options/core_options.hpp"

#include <fmt/format.h>

#include <cstdint>

#include "options/choices.hpp"
#include "options/whole_number.hpp"

namespace quarzel::tool {

CLI::Validator unitsCheck() {
    return withChoices(wholeNumber([](std::uint64_t n) { return n == 2 || n == 4 || n == 8; }, "2, 4 or 8"),
                       {"2", "4", "8"});
}

CLI::Validator algorithmCheck() {
    return withChoices(wholeNumber([](std::uint64_t n) { return n <= 2; }, "0, 1 or 2"), {"0", "1", "2"});
}

CLI::Validator iterationsCheck() {
    return wholeNumber([](std::uint64_t n) { return n >= 1 && n <= 15; }, "a number from 1 to 15");
}

Core coreOf(const CoreOptions& options) {
    Core core(CoreSettings{options.units, options.algorithm});
    core.choose(options.implementation);
    return core;
}

void addCoreOptions(CLI::App& command, CoreOptions& options) {
    const auto add = [&command](const char* name, int& value, const char* text, const CLI::Validator& check) {
        command.add_option(name, value, fmt::format("{} (default {})", text, value))
            ->type_name("N")
            ->transform(check);
    };
    add("--units", options.units, "Processing units of the core: 2, 4 or 8", unitsCheck());
    add("--algorithm", options.algorithm,
        "0 max-log, 1 max-log with extrinsic values\nscaled by 0.75, 2 max-star", algorithmCheck());
    add("--iterations", options.iterations, "Iterations, 1 to 15; every one of them runs", iterationsCheck());
    const std::vector<std::string> names = implementations();
    command
        .add_option(
            "--implementation", options.implementation,
            "Instruction set to decode with, or literal: step by\nstep (default: the best of this machine)")
        ->type_name("NAME")
        ->check(withChoices(CLI::IsMember(names).description(""), names));
}

}  // namespace quarzel::tool
