// SPDX-License-Identifier: MIT
#include <fmt/format.h>

#include "shell/completion.hpp"

namespace quarzel::tool {

namespace {

/// Text between quotes, in which the characters of _arguments have no meaning.
std::string quoted(const std::string& text) {
    std::string result;
    for (const char c : text) {
        result += c == '\''                                       ? "'\\''"
                  : c == ':' || c == '[' || c == ']' || c == '\\' ? '\\' + std::string(1, c)
                                                                  : std::string(1, c);
    }
    return result;
}

/// What _arguments does for a value.
std::string actionOf(const OptionDescription& option) {
    return option.isFile            ? "_files"
           : option.choices.empty() ? " "
                                    : fmt::format("({})", fmt::join(option.choices, " "));
}

std::string argumentsOf(const CommandDescription& command) {
    std::string text;
    for (const OptionDescription& option : command.options) {
        const std::string value =
            option.value.empty() ? "" : fmt::format(":{}:{}", quoted(option.value), actionOf(option));
        for (const std::string& name : option.names) {
            text += fmt::format(" \\\n            '{}[{}]{}'", name, quoted(option.text), value);
        }
    }
    for (const OptionDescription& argument : command.arguments) {
        text += fmt::format(" \\\n            ':{}:{}'", quoted(argument.names[0]), actionOf(argument));
    }
    return text;
}

}  // namespace

std::string zshCompletion(const ToolDescription& description) {
    std::string commands;
    std::string cases;
    for (const CommandDescription& command : description.commands) {
        commands += fmt::format("        '{}:{}'\n", command.name, quoted(command.text));
        cases += fmt::format("        {})\n            _arguments{}\n            ;;\n", command.name,
                             argumentsOf(command));
    }
    return fmt::format(R"(#compdef quarzel
# zsh completion of quarzel, made by 'quarzel completion zsh'

_quarzel() {{
    local context state state_descr line
    typeset -A opt_args
    local -a commands=(
{}    )
    _arguments -C{} \
            '1:command:->command' \
            '*::argument:->argument'
    case $state in
    command) _describe command commands ;;
    argument)
        case $line[1] in
{}        esac
        ;;
    esac
}}

if [[ $funcstack[1] == _quarzel ]]; then
    _quarzel "$@"
else
    compdef _quarzel quarzel
fi
)",
                       commands, argumentsOf(description.tool), cases);
}

}  // namespace quarzel::tool
