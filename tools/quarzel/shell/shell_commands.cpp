// SPDX-License-Identifier: MIT
#include "shell/shell_commands.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <memory>
#include <string>
#include <vector>

#include "options/choices.hpp"
#include "shell/completion.hpp"
#include "shell/manual_page.hpp"
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
}

}  // namespace quarzel::tool
