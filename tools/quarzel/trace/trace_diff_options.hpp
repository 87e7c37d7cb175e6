// SPDX-License-Identifier: MIT
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "options/cli_fwd.hpp"
#include "trace/trace_comparison.hpp"
#include "trace/trace_value.hpp"

namespace quarzel::tool {

/// What the user wants compared.
struct TraceDiffOptions {
    std::string a;
    std::string b;
    std::optional<std::uint64_t> block;
    std::vector<std::string> signals;
    std::vector<std::string> passes;  ///< numbers, and ranges such as 2-5
    std::string units;                ///< of the numbers in B: "raw", "real", or empty as its form has them
    bool ignoreTermination = false;
    std::optional<std::string> junit;  ///< the file of a report
    bool json = false;

    /// The same for the comparison.
    TraceMatching matching() const;

    /// The units of B; none: as its form has them.
    std::optional<TraceUnits> unitsOfB() const;
};

/// Add the files and options of `quarzel trace-diff` to its command.
/// @param options  receives the choice; must outlive the parse
void addTraceDiffOptions(CLI::App& command, TraceDiffOptions& options);

}  // namespace quarzel::tool
