// SPDX-License-Identifier: MIT
#include "run_tool_main.hpp"

#include <csignal>
#include <iostream>
#include <new>

#include "command_line.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

int fail(ExitCode code, const char* message) {
    std::cerr << errorLine(message);
    return static_cast<int>(code);
}

}  // namespace

int runToolMain(int argc, const char* const* argv, const MakeWorkers& makeWorkers) {
    // A write beyond the limit of file sizes then fails with an error that the user is told.
    std::signal(SIGXFSZ, SIG_IGN);
    ExitCode exitCode = ExitCode::done;
    try {
        exitCode = runCommandLine(argc, argv, std::cout, makeWorkers);
    } catch (const ToolError& error) {
        return fail(error.code(), error.what());
    } catch (const std::bad_alloc&) {
        return fail(ExitCode::decodingFailed,
                    "there is not enough memory; cut the capture into smaller files");
    }
    if (!std::cout.flush()) {
        return fail(ExitCode::file,
                    "standard output: cannot be written; free some space or send it elsewhere");
    }
    return static_cast<int>(exitCode);
}

}  // namespace quarzel::tool
