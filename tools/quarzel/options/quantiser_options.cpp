// SPDX-License-Identifier: MIT
#include "options/quantiser_options.hpp"

#include <fmt/format.h>

#include <string>

namespace quarzel::tool {

namespace {

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

}  // namespace

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

}  // namespace quarzel::tool
