// SPDX-License-Identifier: MIT
#include "tool_error.hpp"

#include <fmt/format.h>

#include <algorithm>

namespace quarzel::tool {

const char* const exitCodesHelp = R"(Exit codes:
  0  done
  1  decoding or plotting failed; for trace-diff, compare and verify-result:
     there is a difference
  2  the command line is wrong
  3  a file cannot be read, understood or written
  4  interrupted by a signal)";

ToolError::ToolError(ExitCode code, std::string_view subject, std::string_view problem,
                     std::string_view remedy)
    : std::runtime_error(fmt::format("{}{}{}; {}", subject, subject.empty() ? "" : ": ", problem, remedy)),
      itsCode(code) {}

ToolError fileError(std::string_view file, std::string_view problem, std::string_view remedy) {
    return {ExitCode::file, file, problem, remedy};
}

ToolError decodingError(std::string_view file, std::string_view block, const Error& error) {
    const std::string_view said = error.what();
    return {ExitCode::decodingFailed, file,
            fmt::format("{} could not be decoded (status {})", block, error.status()),
            fmt::format("the model says: {}", said.substr(0, said.find('\n')))};
}

std::string errorLine(std::string_view message) {
    std::string line = fmt::format("quarzel: error: {}", message);
    const auto isControl = [](char c) { return static_cast<unsigned char>(c) < ' ' || c == '\x7f'; };
    std::replace_if(line.begin(), line.end(), isControl, '?');
    return line + '\n';
}

}  // namespace quarzel::tool
