// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>

#include "options/cli_fwd.hpp"

namespace quarzel::tool {

/// What the user wants traced, and where to.
struct TraceOptions {
    std::optional<std::uint32_t> passes;  ///< counted across blocks; none: no trace
    std::size_t block = 0;                ///< the first block that is traced, from 0
    std::string file = "-";
    std::string form = "text";

    bool isToStandardOutput() const { return file == "-"; }
};

/// Add --trace, --trace-block, --trace-file and --trace-format to a command.
/// @param options  holds the defaults and receives the choice; must outlive the parse
void addTraceOptions(CLI::App& command, TraceOptions& options);

}  // namespace quarzel::tool
