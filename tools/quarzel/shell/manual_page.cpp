// SPDX-License-Identifier: MIT
#include "shell/manual_page.hpp"

#include <fmt/format.h>

#include <string_view>

#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

/// Text as roff takes it: no character has a meaning.
std::string roff(std::string_view text) {
    std::string escaped;
    for (const char c : text) {
        const bool isLineStart = escaped.empty() || escaped.back() == '\n';
        if (isLineStart && (c == '.' || c == '\'')) {
            escaped += "\\&";
        }
        escaped += c == '\\'   ? "\\e"
                   : c == '-'  ? "\\-"
                   : c == '\'' ? "\\(aq"
                   : c == '`'  ? "\\(ga"
                   : c == '^'  ? "\\(ha"
                   : c == '~'  ? "\\(ti"
                               : std::string(1, c);
    }
    return escaped;
}

/// Lines that stay as they are.
std::string verbatim(std::string_view text) {
    return text.empty() ? "" : fmt::format(".PP\n.EX\n{}\n.EE\n", roff(text));
}

std::string usageOf(const CommandDescription& command) {
    std::string usage = fmt::format("\\fBquarzel {}\\fR [\\fIoptions\\fR]", roff(command.name));
    for (const OptionDescription& argument : command.arguments) {
        const std::string name = "\\fI" + roff(argument.names[0]) + "\\fR";
        usage += argument.isRequired ? ' ' + name : " [" + name + ']';
    }
    return usage;
}

std::string optionText(const OptionDescription& option, bool isArgument) {
    std::string names;
    for (const std::string& name : option.names) {
        names += names.empty() ? "" : ", ";
        names += (isArgument ? "\\fI" : "\\fB") + roff(name) + "\\fR";
    }
    const bool hasValue = !isArgument && !option.value.empty();
    return fmt::format(".TP\n{}{}\n{}\n", names, hasValue ? " \\fI" + roff(option.value) + "\\fR" : "",
                       roff(option.text));
}

std::string optionsOf(const CommandDescription& command) {
    std::string text;
    for (const OptionDescription& argument : command.arguments) {
        text += optionText(argument, true);
    }
    for (const OptionDescription& option : command.options) {
        text += optionText(option, false);
    }
    return text;
}

}  // namespace

std::string manualPage(const ToolDescription& description) {
    std::string page = fmt::format(
        ".TH QUARZEL 1 \"\" \"quarzel {}\" \"User Commands\"\n"
        ".SH NAME\nquarzel \\- {}\n"
        ".SH SYNOPSIS\n\\fBquarzel\\fR [\\fIoptions\\fR] \\fIcommand\\fR ...\n",
        roff(QUARZEL_VERSION), roff(description.tool.text));
    for (const CommandDescription& command : description.commands) {
        page += ".br\n" + usageOf(command) + '\n';
    }
    page += ".SH DESCRIPTION\n" + verbatim(description.tool.details);
    page += ".SH OPTIONS\n" + optionsOf(description.tool);
    page += ".SH COMMANDS\n";
    for (const CommandDescription& command : description.commands) {
        page += fmt::format(".SS quarzel {}\n{}.\n.PP\n{}\n", roff(command.name), roff(command.text),
                            usageOf(command));
        page += optionsOf(command) + verbatim(command.details);
    }
    page += ".SH EXIT STATUS\n" + verbatim(exitCodesHelp);
    return page;
}

}  // namespace quarzel::tool
