// SPDX-License-Identifier: MIT
#pragma once

#include <CLI/CLI.hpp>
#include <algorithm>
#include <string>
#include <string_view>
#include <vector>

#include "options/text_items.hpp"

namespace quarzel::tool {

/// A check of every item of a list.
CLI::Validator eachItem(const CLI::Validator& check);

/// Add an option that takes a list, its items divided by commas; given again, it takes more of them.
/// @param name    "--units", for example
/// @param values  receives its items in their order, each once; holds the default, must outlive the parse
/// @param text    what it is, for the help
/// @param check   of each item
template <class Value>
CLI::Option* addListOption(CLI::App& command, const std::string& name, std::vector<Value>& values,
                           const std::string& text, const std::string& type, const CLI::Validator& check) {
    const auto read = [&values](const std::vector<std::string>& lists) {
        values.clear();
        for (const std::string& list : lists) {
            for (const std::string_view item : itemsOf(list, ',')) {
                Value value{};
                CLI::detail::lexical_cast(std::string(item), value);
                if (std::find(values.begin(), values.end(), value) == values.end()) {
                    values.push_back(value);
                }
            }
        }
    };
    return command.add_option_function<std::vector<std::string>>(name, read, text)
        ->type_name(type)
        ->allow_extra_args(false)
        ->transform(eachItem(check));
}

}  // namespace quarzel::tool
