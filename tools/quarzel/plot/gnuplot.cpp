// SPDX-License-Identifier: MIT
#include "plot/gnuplot.hpp"

#include <fcntl.h>
#include <fmt/format.h>
#include <spawn.h>
#include <sys/mman.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstring>

#include "tool_error.hpp"

extern char** environ;

namespace quarzel::tool {

namespace {

ToolError gnuplotError(const std::string& problem, const std::string& remedy) {
    return {ExitCode::plottingFailed, "gnuplot", problem, remedy};
}

/// A file in memory. Files instead of pipes: neither side ever waits for the other.
class MemoryFile {
  public:
    MemoryFile() : itsDescriptor(::memfd_create("quarzel-plot", MFD_CLOEXEC)) {
        if (itsDescriptor < 0) {
            throw gnuplotError(fmt::format("has no memory: {}", std::strerror(errno)), "free some");
        }
    }
    MemoryFile(const MemoryFile&) = delete;
    MemoryFile& operator=(const MemoryFile&) = delete;
    ~MemoryFile() { ::close(itsDescriptor); }

    int descriptor() const { return itsDescriptor; }

    void put(const std::string& text) {
        for (std::size_t done = 0; done < text.size();) {
            const ssize_t count =
                ::pwrite(itsDescriptor, text.data() + done, text.size() - done, static_cast<off_t>(done));
            if (count < 0) {
                throw gnuplotError(fmt::format("cannot be given its script: {}", std::strerror(errno)),
                                   "free some memory");
            }
            done += static_cast<std::size_t>(count);
        }
    }

    std::string content() const {
        std::string text;
        std::array<char, 65536> buffer{};
        for (ssize_t count = 0; (count = ::pread(itsDescriptor, buffer.data(), buffer.size(),
                                                 static_cast<off_t>(text.size()))) > 0;) {
            text.append(buffer.data(), static_cast<std::size_t>(count));
        }
        return text;
    }

  private:
    int itsDescriptor;
};

/// Start gnuplot on these three standard streams.
pid_t start(const MemoryFile& in, const MemoryFile& out, const MemoryFile& err) {
    posix_spawn_file_actions_t actions;
    ::posix_spawn_file_actions_init(&actions);
    ::posix_spawn_file_actions_adddup2(&actions, in.descriptor(), STDIN_FILENO);
    ::posix_spawn_file_actions_adddup2(&actions, out.descriptor(), STDOUT_FILENO);
    ::posix_spawn_file_actions_adddup2(&actions, err.descriptor(), STDERR_FILENO);
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
    MemoryFile in;
    MemoryFile out;
    MemoryFile err;
    in.put(script);
    const pid_t child = start(in, out, err);
    int status = 0;
    while (::waitpid(child, &status, 0) < 0 && errno == EINTR) {
    }
    std::string picture = out.content();
    if (!WIFEXITED(status) || WEXITSTATUS(status) != 0 || picture.empty()) {
        throw gnuplotError(fmt::format("failed: {}", err.content()), "check that it can draw this format");
    }
    return picture;
}

}  // namespace quarzel::tool
