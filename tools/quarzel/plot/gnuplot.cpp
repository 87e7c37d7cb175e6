// SPDX-License-Identifier: MIT
#include "plot/gnuplot.hpp"

#include <fmt/format.h>
#include <spawn.h>
#include <sys/mman.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <memory>

#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

ToolError gnuplotError(const std::string& problem, const std::string& remedy) {
    return {ExitCode::plottingFailed, "gnuplot", problem, remedy};
}

/// A file in memory. Files instead of pipes: neither side ever waits for the other.
using MemoryFile = std::unique_ptr<std::FILE, int (*)(std::FILE*)>;

MemoryFile memoryFile() {
    const int descriptor = ::memfd_create("quarzel-plot", MFD_CLOEXEC);
    if (descriptor < 0) {
        throw gnuplotError(fmt::format("has no memory: {}", std::strerror(errno)), "free some");
    }
    return {::fdopen(descriptor, "w+"), &std::fclose};
}

std::string contentOf(const MemoryFile& file) {
    std::string text;
    std::rewind(file.get());
    for (int c = 0; (c = std::getc(file.get())) != EOF;) {
        text += static_cast<char>(c);
    }
    return text;
}

/// Start gnuplot on these three standard streams.
pid_t start(const MemoryFile& in, const MemoryFile& out, const MemoryFile& err) {
    posix_spawn_file_actions_t actions;
    ::posix_spawn_file_actions_init(&actions);
    ::posix_spawn_file_actions_adddup2(&actions, ::fileno(in.get()), STDIN_FILENO);
    ::posix_spawn_file_actions_adddup2(&actions, ::fileno(out.get()), STDOUT_FILENO);
    ::posix_spawn_file_actions_adddup2(&actions, ::fileno(err.get()), STDERR_FILENO);
    std::array<char, 8> program = {"gnuplot"};
    // Without the settings of the user, which would make another picture.
    std::array<char, 3> noSettings = {"-d"};
    std::array<char, 2> standardInput = {"-"};  // named, so that an error in the script ends the run
    const std::array<char*, 4> arguments = {program.data(), noSettings.data(), standardInput.data(), nullptr};
    pid_t child = 0;
    const int error = ::posix_spawnp(&child, program.data(), &actions, nullptr, arguments.data(), environ);
    ::posix_spawn_file_actions_destroy(&actions);
    if (error != 0) {
        throw gnuplotError(fmt::format("cannot be started: {}", std::strerror(error)),
                           "install it (on Debian: apt-get install gnuplot-nox)");
    }
    return child;
}

}  // namespace

std::string runGnuplot(const std::string& script) {
    const MemoryFile in = memoryFile();
    const MemoryFile out = memoryFile();
    const MemoryFile err = memoryFile();
    if (std::fputs(script.c_str(), in.get()) == EOF || std::fflush(in.get()) != 0) {
        throw gnuplotError(fmt::format("cannot be given its script: {}", std::strerror(errno)),
                           "free some memory");
    }
    std::rewind(in.get());
    const pid_t child = start(in, out, err);
    int status = 0;
    while (::waitpid(child, &status, 0) < 0 && errno == EINTR) {
    }
    std::string picture = contentOf(out);
    if (!WIFEXITED(status) || WEXITSTATUS(status) != 0 || picture.empty()) {
        throw gnuplotError(fmt::format("failed: {}", contentOf(err)), "check that it can draw this format");
    }
    return picture;
}

}  // namespace quarzel::tool
