// SPDX-License-Identifier: MIT
#pragma once

#include <stdexcept>
#include <string>
#include <string_view>

#include "quarzel/core.hpp"

namespace quarzel::tool {

/// How the tool ends; a part of its interface.
enum class ExitCode {
    done = 0,
    decodingFailed = 1,
    plottingFailed = 1,
    tracesDiffer = 1,
    decisionsDiffer = 1,
    resultsDiffer = 1,
    usage = 2,
    file = 3,
    interrupted = 4,
};

/// The same for the user, to be shown in every help.
extern const char* const exitCodesHelp;

/// Why the tool cannot go on, in one line for its user, with the exit code that it ends with.
class ToolError : public std::runtime_error {
  public:
    /// @param subject  the file or option that is at fault; may be empty
    /// @param problem  what is wrong with it
    /// @param remedy   what the user can do
    ToolError(ExitCode code, std::string_view subject, std::string_view problem, std::string_view remedy);

    ExitCode code() const { return itsCode; }

  private:
    ExitCode itsCode;
};

/// A file that cannot be read, understood or written.
ToolError fileError(std::string_view file, std::string_view problem, std::string_view remedy);

/// A block that the model has refused.
/// @param block  which one
ToolError decodingError(std::string_view file, std::string_view block, const Error& error);

/// The line that the user sees. Control characters, which a file name may hold, are shown as '?', so that it
/// is one line whatever happens.
std::string errorLine(std::string_view message);

}  // namespace quarzel::tool
