// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

#include "options/cli_fwd.hpp"

namespace quarzel::tool {

/// A check that also tells which few values it lets pass, so that a shell can complete them.
CLI::Validator withChoices(CLI::Validator check, const std::vector<std::string>& choices);

/// A check that lets everything pass, for an option whose value is neither a file nor checked otherwise, so
/// that shells offer no files.
CLI::Validator anyText();

/// The values that the checks of an option tell; empty when they tell none.
std::vector<std::string> choicesOf(CLI::Option& option);

/// Whether an option has a check of its values at all. One that names a file has none.
bool isChecked(CLI::Option& option);

}  // namespace quarzel::tool
