// SPDX-License-Identifier: MIT
#include "shell/tool_description.hpp"

#include <CLI/CLI.hpp>
#include <algorithm>

#include "options/choices.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

std::string onOneLine(std::string text) {
    std::replace(text.begin(), text.end(), '\n', ' ');
    return text;
}

OptionDescription describe(CLI::Option& option) {
    OptionDescription described;
    if (option.get_positional()) {
        described.names = {option.get_name(true)};
    }
    for (const std::string& name : option.get_snames()) {
        described.names.push_back('-' + name);
    }
    for (const std::string& name : option.get_lnames()) {
        described.names.push_back("--" + name);
    }
    const bool isFlag = !option.get_positional() && option.get_items_expected_max() == 0;
    described.value = isFlag ? "" : option.get_type_name();
    described.text = onOneLine(option.get_description());
    described.isRequired = option.get_required();
    described.choices = choicesOf(option);
    described.isFile = !isFlag && !isChecked(option);
    return described;
}

std::string detailsOf(const CLI::App& command) {
    std::string details = command.get_footer();
    if (details.ends_with(exitCodesHelp)) {
        details.resize(details.size() - std::string(exitCodesHelp).size());
    }
    while (details.ends_with('\n')) {
        details.pop_back();
    }
    return details;
}

CommandDescription describeCommand(CLI::App& command) {
    CommandDescription described{command.get_name(), command.get_description(), {}, {}, detailsOf(command)};
    for (CLI::Option* const option : command.get_options()) {
        (option->get_positional() ? described.arguments : described.options).push_back(describe(*option));
    }
    return described;
}

}  // namespace

ToolDescription describe(CLI::App& app) {
    ToolDescription description{describeCommand(app), {}};
    description.tool.name.clear();
    for (CLI::App* const command : app.get_subcommands([](const CLI::App*) { return true; })) {
        description.commands.push_back(describeCommand(*command));
    }
    return description;
}

}  // namespace quarzel::tool
