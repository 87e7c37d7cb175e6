// SPDX-License-Identifier: MIT
#pragma once

#include <optional>
#include <string>

#include "link/channel_thresholds.hpp"
#include "options/cli_fwd.hpp"

namespace quarzel::tool {

/// The check of the scale of a quantiser.
CLI::Validator scaleCheck();

/// Add --scale and --llr, of which one may be given.
/// @param quantiser  holds the default and receives the choice; must outlive the parse
void addQuantiserOptions(CLI::App& command, link::Quantiser& quantiser);

/// Add --llr and --scale of a command that reads real numbers, of which one may be given.
/// @param scale  receives the choice; must outlive the parse
void addRealNumberOptions(CLI::App& command, std::optional<double>& scale);

/// What to do about real numbers without one of these options.
std::string realNumbersRemedy();

}  // namespace quarzel::tool
