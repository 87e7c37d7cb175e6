// SPDX-License-Identifier: MIT
#pragma once

#include <CLI/CLI.hpp>

namespace quarzel::tool {

/// Add `quarzel plot`, which draws the error rates of stored sweeps.
void addPlotCommand(CLI::App& app);

}  // namespace quarzel::tool
