// SPDX-License-Identifier: MIT
#include "sweeps/sweep_files.hpp"

#include <fmt/format.h>

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

sweep::NamedResult readSweepFile(const std::string& file) {
    return {file, aboutFile(file, [&file] { return sweep::readResultOrPart(readBytes(file)); })};
}

void joinSweepFile(sweep::NamedResult& known, const std::string& file) {
    const sweep::NamedResult found = readSweepFile(file);
    if (found.result.seed != known.result.seed) {
        throw fileError(file, fmt::format("has seed {}, not {}", found.result.seed, known.result.seed),
                        fmt::format("give --seed {} or another name", found.result.seed));
    }
    if (found.result.part != known.result.part) {
        throw fileError(file, "is not of this part of this sweep",
                        "give the same options as before, or another name");
    }
    try {
        sweep::join(known, found);
    } catch (const sweep::Error& error) {
        throw fileError("", error.problem(), error.remedy());
    }
}

}  // namespace quarzel::tool
