// SPDX-License-Identifier: MIT
#pragma once

#include <CLI/CLI.hpp>
#include <string>
#include <vector>

namespace quarzel::tool {

/// Add an option that takes a list, its values divided by commas.
/// @param name    "--units", for example
/// @param values  receives them; holds the default, must outlive the parse
/// @param text    what it is, for the help
/// @param check   of each value
template <class Value>
CLI::Option* addListOption(CLI::App& command, const std::string& name, std::vector<Value>& values,
                           const std::string& text, const std::string& type, const CLI::Validator& check) {
    return command.add_option(name, values, text)
        ->type_name(type)
        ->delimiter(',')
        ->allow_extra_args(false)
        ->transform(check);
}

}  // namespace quarzel::tool
