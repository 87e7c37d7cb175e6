// SPDX-License-Identifier: MIT
#pragma once

#include <string>

#include "options/cli_fwd.hpp"
#include "quarzel/core.hpp"

namespace quarzel::tool {

/// What the user of a core chooses.
struct CoreOptions {
    int units = 2;
    int algorithm = 1;
    int iterations = 6;
    std::string implementation = implementations().front();
};

/// A core as chosen.
Core coreOf(const CoreOptions& options);

/// The checks of these options, for commands that take lists of them.
CLI::Validator unitsCheck();
CLI::Validator algorithmCheck();
CLI::Validator iterationsCheck();

/// Add --units, --algorithm and --iterations to a command.
/// @param options  holds the defaults and receives the choice; must outlive the parse
void addModelOptions(CLI::App& command, CoreOptions& options);

/// Add the same and --implementation to a command.
/// @param options  holds the defaults and receives the choice; must outlive the parse
void addCoreOptions(CLI::App& command, CoreOptions& options);

}  // namespace quarzel::tool
