// SPDX-License-Identifier: MIT
#include "options/quantiser_options.hpp"

#include <fmt/format.h>
#include <CLI/CLI.hpp>

#include <string>

#include "quarzel/quantise.hpp"

namespace quarzel::tool {

CLI::Validator scaleCheck() {
    const auto check = [](std::string& text) {
        double scale = 0;
        const bool isGood =
            CLI::detail::lexical_cast(text, scale) && scale > 0 && scale <= link::Quantiser::highestScale;
        return isGood ? std::string()
                      : fmt::format("'{}' is not a number above 0 and up to {}", text,
                                    link::Quantiser::highestScale);
    };
    return {check, ""};
}

void addQuantiserOptions(CLI::App& command, link::Quantiser& quantiser) {
    const auto add = [&](const char* name, link::Quantiser::Kind kind, const std::string& text) {
        const auto choose = [&quantiser, kind](double scale) { quantiser = {kind, scale}; };
        return command.add_option_function<double>(name, choose, text)
            ->type_name("S")
            ->transform(scaleCheck());
    };
    CLI::Option* const scale =
        add("--scale", link::Quantiser::Kind::amplitude, "Soft value round(S y), y = +-1 + noise");
    add("--llr", link::Quantiser::Kind::llr,
        fmt::format("Soft value round(S L), L the log-likelihood ratio\n2 y / sigma^2 (default, with S = {})",
                    quantiser.scale))
        ->excludes(scale);
}

void addRealNumberOptions(CLI::App& command, std::optional<double>& scale) {
    const auto add = [&](const char* name, const std::string& text) {
        return command.add_option(name, scale, text)->type_name("S")->transform(scaleCheck());
    };
    CLI::Option* const samples = add("--scale", "CAPTURE holds samples: soft value round(S y)");
    add("--llr", fmt::format("CAPTURE holds log-likelihood ratios: soft value\nround(S L); {} is the best S",
                             llrScale))
        ->excludes(samples);
}

std::string realNumbersRemedy() {
    return fmt::format("give --llr {} when they are log-likelihood ratios, --scale S when they are samples",
                       llrScale);
}

}  // namespace quarzel::tool
