// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace quarzel::test {

/// A directory for the files of one test; gone when the test is.
class TemporaryDirectory {
  public:
    TemporaryDirectory();
    TemporaryDirectory(const TemporaryDirectory&) = delete;
    TemporaryDirectory& operator=(const TemporaryDirectory&) = delete;
    ~TemporaryDirectory();

    /// The path of a file in it.
    std::string path(const std::string& name) const { return itsPath + '/' + name; }

    /// Write a file and return its path.
    std::string write(const std::string& name, std::string_view content) const;

    /// The names in it, sorted.
    std::vector<std::string> names() const;

  private:
    std::string itsPath;
};

/// The content of a file; throws when it cannot be read.
std::string readFile(const std::string& file);

}  // namespace quarzel::test
