// SPDX-License-Identifier: MIT
#include "options/choices.hpp"

#include <fmt/format.h>
#include <CLI/CLI.hpp>

#include <utility>

namespace quarzel::tool {

namespace {

/// CLI11 keeps a name with each check and shows it nowhere: the place for the choices.
constexpr const char* prefix = "choices:";

}  // namespace

CLI::Validator withChoices(CLI::Validator check, const std::vector<std::string>& choices) {
    check.name(fmt::format("{}{}", prefix, fmt::join(choices, ",")));
    return check;
}

CLI::Validator anyText() {
    return {[](std::string&) { return std::string(); }, ""};
}

std::vector<std::string> choicesOf(CLI::Option& option) {
    if (!isChecked(option)) {
        return {};
    }
    const std::string name = option.get_validator(0)->get_name();
    return name.starts_with(prefix) ? CLI::detail::split(name.substr(std::string(prefix).size()), ',')
                                    : std::vector<std::string>();
}

bool isChecked(CLI::Option& option) {
    try {
        return option.get_validator(0) != nullptr;
    } catch (const CLI::OptionNotFound&) {
        return false;
    }
}

}  // namespace quarzel::tool
