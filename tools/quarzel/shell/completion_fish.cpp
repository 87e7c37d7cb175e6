// SPDX-License-Identifier: MIT
#include <fmt/format.h>

#include "shell/completion.hpp"

namespace quarzel::tool {

namespace {

std::string quoted(const std::string& text) {
    std::string result = "'";
    for (const char c : text) {
        result += c == '\'' || c == '\\' ? '\\' + std::string(1, c) : std::string(1, c);
    }
    return result + '\'';
}

/// What is offered for the value of an option or argument.
std::string valueOf(const OptionDescription& option) {
    return option.isFile            ? " -r -F"
           : option.choices.empty() ? " -x"
                                    : fmt::format(" -x -a '{}'", fmt::join(option.choices, " "));
}

/// @param condition  when the options are offered
std::string optionsOf(const CommandDescription& command, const std::string& condition) {
    std::string text;
    for (const OptionDescription& option : command.options) {
        text += fmt::format("complete -c quarzel -n {}", quoted(condition));
        for (const std::string& name : option.names) {
            text += name.starts_with("--") ? " -l " + name.substr(2) : " -s " + name.substr(1);
        }
        text += option.value.empty() ? "" : valueOf(option);
        text += fmt::format(" -d {}\n", quoted(option.text));
    }
    for (const OptionDescription& argument : command.arguments) {
        if (argument.isFile) {
            text += fmt::format("complete -c quarzel -n {} -F\n", quoted(condition));
        } else if (!argument.choices.empty()) {
            text += fmt::format("complete -c quarzel -n {} -a '{}'\n", quoted(condition),
                                fmt::join(argument.choices, " "));
        }
    }
    return text;
}

}  // namespace

std::string fishCompletion(const ToolDescription& description) {
    std::string text =
        "# fish completion of quarzel, made by 'quarzel completion fish'\n\ncomplete -c quarzel -f\n";
    const std::string noCommand = "__fish_use_subcommand";
    text += optionsOf(description.tool, noCommand);
    for (const CommandDescription& command : description.commands) {
        text += fmt::format("complete -c quarzel -n {} -a {} -d {}\n", noCommand, command.name,
                            quoted(command.text));
        text += optionsOf(command, "__fish_seen_subcommand_from " + command.name);
    }
    return text;
}

}  // namespace quarzel::tool
