// SPDX-License-Identifier: MIT
#include "temporary_directory.hpp"

#include <gtest/gtest.h>
#include <stdlib.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <stdexcept>

namespace quarzel::test {

TemporaryDirectory::TemporaryDirectory() : itsPath(testing::TempDir() + "quarzel-XXXXXX") {
    if (::mkdtemp(itsPath.data()) == nullptr) {
        throw std::runtime_error("cannot make a directory " + itsPath);
    }
}

TemporaryDirectory::~TemporaryDirectory() {
    std::error_code ignored;
    std::filesystem::remove_all(itsPath, ignored);
}

std::string TemporaryDirectory::write(const std::string& name, std::string_view content) const {
    std::ofstream stream(path(name), std::ios::binary);
    stream << content;
    if (!stream.flush()) {
        throw std::runtime_error("cannot write " + path(name));
    }
    return path(name);
}

std::vector<std::string> TemporaryDirectory::names() const {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(itsPath)) {
        names.push_back(entry.path().filename().string());
    }
    std::sort(names.begin(), names.end());
    return names;
}

std::string readFile(const std::string& file) {
    std::ifstream stream(file, std::ios::binary);
    if (!stream) {
        throw std::runtime_error("cannot read " + file);
    }
    return {std::istreambuf_iterator<char>(stream), {}};
}

}  // namespace quarzel::test
