// SPDX-License-Identifier: MIT
#include "run_tool.hpp"

#include <fcntl.h>
#include <pty.h>
#include <sys/ioctl.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <regex>
#include <stdexcept>
#include <system_error>

#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

/// After this time a run is killed, so that a tool that hangs fails its test.
constexpr unsigned secondsToLive = 60;

int checked(int result) {
    if (result < 0) {
        throw std::system_error(errno, std::generic_category());
    }
    return result;
}

int openForWriting(const std::string& file) {
    return checked(::open(file.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0666));
}

void limit(decltype(RLIMIT_AS) resource, std::optional<unsigned long> amount) {
    if (amount) {
        const rlimit both{*amount, *amount};
        ::setrlimit(resource, &both);
    }
}

/// In the child: become the tool. Async-signal-safe calls only.
[[noreturn]] void become(char* const* argv, const ToolSetting& setting, int out, int err) {
    ::dup2(out, STDOUT_FILENO);
    ::dup2(err, STDERR_FILENO);
    limit(RLIMIT_FSIZE, setting.fileSizeLimit);
#ifndef __SANITIZE_ADDRESS__
    limit(RLIMIT_AS, setting.memoryLimit);
#endif
    ::alarm(secondsToLive);
    ::execv(argv[0], argv);
    ::_exit(127);
}

/// All that was written to a terminal whose other end is closed.
std::string readTerminal(int master) {
    std::string text;
    std::array<char, 4096> buffer{};
    for (ssize_t count = 0; (count = ::read(master, buffer.data(), buffer.size())) > 0;) {
        text.append(buffer.data(), static_cast<std::size_t>(count));
    }
    return text;
}

}  // namespace

ToolRun runTool(const std::vector<std::string>& arguments, const ToolSetting& setting) {
    const TemporaryDirectory directory;
    std::vector<std::string> words = {setting.program};
    words.insert(words.end(), arguments.begin(), arguments.end());
    std::vector<char*> argv;
    for (std::string& word : words) {
        argv.push_back(word.data());
    }
    argv.push_back(nullptr);

    const std::string outFile =
        setting.standardOutput.empty() ? directory.path("stdout") : setting.standardOutput;
    const int out = openForWriting(outFile);
    int master = -1;
    int err = -1;
    if (setting.terminal) {
        const winsize size{24, 80, 0, 0};
        checked(::openpty(&master, &err, nullptr, nullptr, &size));
    } else {
        err = openForWriting(directory.path("stderr"));
    }
    const pid_t child = checked(::fork());
    if (child == 0) {
        become(argv.data(), setting, setting.outputToTerminal ? err : out, err);
    }
    ::close(out);
    ::close(err);

    ToolRun run;
    if (setting.terminal) {
        run.err = readTerminal(master);
        ::close(master);
    }
    int status = 0;
    checked(::waitpid(child, &status, 0));
    run.exitCode = WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
    if (!setting.terminal) {
        run.err = readFile(directory.path("stderr"));
    }
    if (setting.standardOutput.empty()) {
        run.out = readFile(outFile);
    }
    return run;
}

std::string maskTimes(const std::string& text) {
    static const std::array<std::pair<std::regex, const char*>, 4> masks = {{
        {std::regex("(time +)[0-9]+\\.[0-9]{6} s\n"), "$1T s\n"},
        {std::regex("(speed +)[0-9]+\\.[0-9]{3} Mbit/s\n"), "$1S Mbit/s\n"},
        {std::regex("(\"seconds\":)[-+.e0-9]+"), "$1T"},
        {std::regex("(\"mbit_per_s\":)[-+.e0-9]+"), "$1S"},
    }};
    std::string masked = text;
    for (const auto& [pattern, replacement] : masks) {
        masked = std::regex_replace(masked, pattern, replacement);
    }
    return masked;
}

}  // namespace quarzel::test
