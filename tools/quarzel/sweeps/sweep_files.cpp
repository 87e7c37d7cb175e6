// SPDX-License-Identifier: MIT
#include "sweeps/sweep_files.hpp"

#include <iterator>

#include "files/input_file.hpp"

namespace quarzel::tool {

std::string readBytes(const std::string& file) {
    std::ifstream stream = openInput(file);
    std::string bytes{std::istreambuf_iterator<char>(stream), {}};
    if (stream.bad()) {
        throw fileError(file, "cannot be read", "check the disk");
    }
    return bytes;
}

}  // namespace quarzel::tool
