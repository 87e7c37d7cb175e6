// SPDX-License-Identifier: MIT
#include "files/input_file.hpp"

#include <cerrno>
#include <cstring>
#include <filesystem>

#include "tool_error.hpp"

namespace quarzel::tool {

std::ifstream openInput(const std::string& file) {
    std::error_code ignored;
    if (!isStandardStream(file) && std::filesystem::is_directory(file, ignored)) {
        throw fileError(file, "is a directory", "give the name of a file");
    }
    std::ifstream stream(isStandardStream(file) ? "/dev/stdin" : file, std::ios::binary);
    if (!stream) {
        const int cause = errno;
        throw fileError(file, std::string("cannot be opened: ") + std::strerror(cause),
                        cause == EACCES ? "make it readable" : "check the name");
    }
    return stream;
}

}  // namespace quarzel::tool
