// SPDX-License-Identifier: MIT
#pragma once

#include <optional>
#include <string>
#include <vector>

namespace quarzel::test {

/// How a run of the tool ended and what it printed.
struct ToolRun {
    int exitCode = -1;  ///< minus the signal when one killed it
    std::string out;
    std::string err;
};

/// The circumstances of a run.
struct ToolSetting {
    std::string program = QUARZEL_TOOL;
    std::string standardOutput = {};                  ///< a file to write it to instead of catching it
    std::optional<unsigned long> fileSizeLimit = {};  ///< in bytes
    std::optional<unsigned long> memoryLimit = {};  ///< in bytes; the address sanitizer cannot live with one
    bool terminal = false;                          ///< standard error is a terminal, of 80 columns
    bool outputToTerminal = false;                  ///< standard output is the same terminal
};

/// Run the tool with these arguments and wait for its end.
ToolRun runTool(const std::vector<std::string>& arguments, const ToolSetting& setting = {});

/// A text of `quarzel decode` with its times and speeds, which no two runs share, replaced by "T" and "S".
std::string maskTimes(const std::string& text);

}  // namespace quarzel::test
