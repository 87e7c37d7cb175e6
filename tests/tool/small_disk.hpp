// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

#include "temporary_directory.hpp"

namespace quarzel::test {

/// A disk with room for a few files, which only this process and those that it starts see.
class SmallDisk {
  public:
    /// Mount it, which needs the rights of the superuser.
    /// @param kibibytes  its size
    /// @throws std::system_error when that fails
    explicit SmallDisk(int kibibytes);
    SmallDisk(const SmallDisk&) = delete;
    SmallDisk& operator=(const SmallDisk&) = delete;
    ~SmallDisk();

    /// Leave no room on it, with a file named "ballast".
    void fill() const;

    /// Remove the ballast.
    void makeRoom() const;

    std::string path(const std::string& name) const { return itsDirectory.path(name); }
    std::string write(const std::string& name, std::string_view content) const {
        return itsDirectory.write(name, content);
    }
    std::vector<std::string> names() const { return itsDirectory.names(); }

  private:
    TemporaryDirectory itsDirectory;
};

}  // namespace quarzel::test
