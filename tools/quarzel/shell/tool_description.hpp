// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

#include "options/cli_fwd.hpp"

namespace quarzel::tool {

/// An option or argument, as the tool itself describes it.
struct OptionDescription {
    std::vector<std::string> names;  ///< "-o", "--output"; the name alone for an argument
    std::string value;               ///< what its value is called; empty for a flag
    std::string text;                ///< on one line
    bool isRequired;
    std::vector<std::string> choices;  ///< its values, where they are few
    bool isFile;                       ///< its value is a file or directory
};

struct CommandDescription {
    std::string name;  ///< empty for the tool itself
    std::string text;
    std::vector<OptionDescription> arguments;
    std::vector<OptionDescription> options;
    std::string details;  ///< what its help tells after the options, without the exit codes
};

/// Everything that the command line understands, taken from the object that parses it.
struct ToolDescription {
    CommandDescription tool;
    std::vector<CommandDescription> commands;
};

ToolDescription describe(CLI::App& app);

}  // namespace quarzel::tool
