// SPDX-License-Identifier: MIT
#include "shell/shell_commands.hpp"

#include <fmt/format.h>
#include <CLI/CLI.hpp>

#include <algorithm>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "options/choices.hpp"
#include "shell/completion.hpp"
#include "shell/manual_page.hpp"
#include "shell/nearest_name.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

constexpr const char* manualFooter = R"(The page that 'man quarzel' shows where the tool is installed.

Example:
  quarzel manual | man -l -
)";

constexpr const char* completionFooter =
    R"(An installed tool has the scripts where the shells look for them. Without an
installation:
  source <(quarzel completion bash)
  source <(quarzel completion zsh)
  quarzel completion fish | source
)";

const std::vector<std::string> shells = {"bash", "zsh", "fish"};

constexpr const char* helpFooter = R"(The same as 'quarzel COMMAND --help'.

Example:
  quarzel help sweep
)";

std::vector<std::string> commandNames(const CLI::App& app) {
    std::vector<std::string> names;
    for (const CLI::App* command : app.get_subcommands([](const CLI::App*) { return true; })) {
        names.push_back(command->get_name());
    }
    return names;
}

/// The help of a command, or of the tool when the name is empty.
std::string helpOf(const std::string& name, const CLI::App& app) {
    if (name.empty()) {
        return app.get_formatter()->make_help(&app, app.get_name(), CLI::AppFormatMode::Normal);
    }
    const std::vector<std::string> names = commandNames(app);
    if (std::find(names.begin(), names.end(), name) == names.end()) {
        const std::optional<std::string> nearest = nearestName(name, names);
        throw ToolError(
            ExitCode::usage, "", fmt::format("'{}' is not understood", name),
            (nearest ? fmt::format("did you mean '{}'? ", *nearest) : "") + "see 'quarzel --help'");
    }
    return app.get_subcommand(name)->help(app.get_name());
}

CLI::Validator shellCheck() {
    const auto check = [](std::string& text) {
        const bool isShell = std::find(shells.begin(), shells.end(), text) != shells.end();
        return isShell ? std::string() : fmt::format("'{}' is none of {}", text, fmt::join(shells, ", "));
    };
    return withChoices({check, ""}, shells);
}

std::string completionFor(const std::string& shell, CLI::App& app) {
    const ToolDescription description = describe(app);
    return shell == "bash"  ? bashCompletion(description)
           : shell == "zsh" ? zshCompletion(description)
                            : fishCompletion(description);
}

}  // namespace

void addShellCommands(CLI::App& app, std::ostream& results) {
    CLI::App* manual = app.add_subcommand("manual", "Print the manual page")->group("Commands");
    manual->footer(std::string(manualFooter) + '\n' + exitCodesHelp);
    manual->callback([&app, &results] { results << manualPage(describe(app)); });

    auto shell = std::make_shared<std::string>();
    CLI::App* completion =
        app.add_subcommand("completion", "Print the script that completes command lines in a shell")
            ->group("Commands");
    completion->footer(std::string(completionFooter) + '\n' + exitCodesHelp);
    completion->add_option("SHELL", *shell, "bash, zsh or fish")
        ->required()
        ->type_name("")
        ->check(shellCheck());
    completion->callback([&app, &results, shell] { results << completionFor(*shell, app); });

    auto name = std::make_shared<std::string>();
    CLI::App* help = app.add_subcommand("help", "Print the help of a command")->group("Commands");
    help->footer(std::string(helpFooter) + '\n' + exitCodesHelp);
    help->add_option("COMMAND", *name, "One of the commands (default: an overview)")
        ->type_name("")
        ->check(withChoices(anyText(), commandNames(app)));
    help->callback([&app, &results, name] { results << helpOf(*name, app); });
}

}  // namespace quarzel::tool
