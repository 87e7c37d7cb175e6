// SPDX-License-Identifier: MIT
#include <fmt/format.h>

#include "shell/completion.hpp"

namespace quarzel::tool {

namespace {

constexpr const char* start = R"(# bash completion of quarzel, made by 'quarzel completion bash'

_quarzel() {
    local cur=${COMP_WORDS[COMP_CWORD]} prev=${COMP_WORDS[COMP_CWORD - 1]} command= options= words= files= i
    COMPREPLY=()
    # "--units=8" comes as three words.
    if [[ $cur == "=" ]]; then
        cur=
    elif [[ $prev == "=" ]]; then
        prev=${COMP_WORDS[COMP_CWORD - 2]}
    fi
    for ((i = 1; i < COMP_CWORD; ++i)); do
        if [[ ${COMP_WORDS[i]} != -* ]]; then
            command=${COMP_WORDS[i]}
            break
        fi
    done
)";

constexpr const char* end = R"(    if [[ $cur == -* && -z $words && -z $files ]]; then
        words=$options
    fi
    if [[ -n $words ]]; then
        mapfile -t COMPREPLY < <(compgen -W "$words" -- "$cur")
    elif [[ -n $files ]]; then
        compopt -o filenames 2>/dev/null
        mapfile -t COMPREPLY < <(compgen -f -- "$cur")
    fi
}
complete -F _quarzel quarzel
)";

std::string namesOf(const CommandDescription& command) {
    std::string names;
    for (const OptionDescription& option : command.options) {
        names += fmt::format("{}{}", names.empty() ? "" : " ", fmt::join(option.names, " "));
    }
    return names;
}

/// What to offer for a value: files, words or nothing.
std::string offerOf(const OptionDescription& option) {
    return option.isFile            ? "files=1"
           : option.choices.empty() ? "return"
                                    : fmt::format("words='{}'", fmt::join(option.choices, " "));
}

std::string caseOf(const CommandDescription& command) {
    std::string text =
        fmt::format("    {})\n        options='{}'\n        case $prev in\n", command.name, namesOf(command));
    for (const OptionDescription& option : command.options) {
        if (!option.value.empty()) {
            text += fmt::format("        {}) {} ;;\n", fmt::join(option.names, " | "), offerOf(option));
        }
    }
    const std::string argument = command.arguments.empty() ? "" : offerOf(command.arguments.front());
    if (!argument.empty() && argument != "return") {
        text += fmt::format("        *) [[ $cur == -* ]] || {} ;;\n", argument);
    }
    return text + "        esac\n        ;;\n";
}

}  // namespace

std::string bashCompletion(const ToolDescription& description) {
    std::vector<std::string> commands;
    std::string text = std::string(start) + "    case $command in\n";
    for (const CommandDescription& command : description.commands) {
        commands.push_back(command.name);
        text += caseOf(command);
    }
    text += fmt::format(
        "    '')\n        options='{}'\n        [[ $cur == -* ]] || words='{}'\n        ;;\n    esac\n",
        namesOf(description.tool), fmt::join(commands, " "));
    return text + end;
}

}  // namespace quarzel::tool
