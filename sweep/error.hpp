// SPDX-License-Identifier: MIT
#pragma once

#include <stdexcept>
#include <string>
#include <utility>

namespace quarzel::sweep {

/// Why a sweep cannot be run, read or joined, in words for its user.
class Error : public std::runtime_error {
  public:
    /// @param problem  what is wrong
    /// @param remedy   what the user can do
    Error(std::string problem, std::string remedy)
        : std::runtime_error(problem + "; " + remedy),
          itsProblem(std::move(problem)),
          itsRemedy(std::move(remedy)) {}

    const std::string& problem() const { return itsProblem; }
    const std::string& remedy() const { return itsRemedy; }

  private:
    std::string itsProblem;
    std::string itsRemedy;
};

}  // namespace quarzel::sweep
