// SPDX-License-Identifier: MIT
#include "run_tool_main.hpp"

#include <fcntl.h>
#include <fmt/format.h>

#include <array>
#include <csignal>
#include <exception>
#include <filesystem>
#include <iostream>
#include <new>
#include <string_view>
#include <system_error>

#include "command_line.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

int fail(ExitCode code, std::string_view message) {
    std::cerr << errorLine(message);
    return static_cast<int>(code);
}

/// Give the standard streams that are closed a descriptor that no file can take, so that what is written to
/// them ends up in no output. Reads and writes of standard input and output fail all the same.
void reserveStandardStreams() {
    constexpr std::array modes = {O_WRONLY, O_RDONLY, O_RDWR};
    for (int stream = 0; stream < static_cast<int>(modes.size()); ++stream) {
        if (::fcntl(stream, F_GETFD) < 0) {
            // The lowest free one is this. It is left open on purpose.
            [[maybe_unused]] const int opened = ::open("/dev/null", modes[static_cast<std::size_t>(stream)]);
        }
    }
}

}  // namespace

int runToolMain(int argc, const char* const* argv, const MakeWorkers& makeWorkers) {
    reserveStandardStreams();
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
    } catch (const std::filesystem::filesystem_error& error) {
        return fail(ExitCode::file, fmt::format("{}: {}; check the name and its permissions",
                                                error.path1().string(), error.code().message()));
    } catch (const std::system_error& error) {
        return fail(ExitCode::decodingFailed,
                    fmt::format("the system refuses a thread: {}; raise the limits of processes and memory "
                                "(ulimit -u, ulimit -v)",
                                error.code().message()));
    } catch (const std::exception& error) {
        return fail(ExitCode::decodingFailed,
                    fmt::format("{}; report this with the command line", error.what()));
    }
    if (!std::cout.flush()) {
        return fail(ExitCode::file,
                    "standard output: cannot be written; free some space or send it elsewhere");
    }
    return static_cast<int>(exitCode);
}

}  // namespace quarzel::tool
