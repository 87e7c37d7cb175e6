// SPDX-License-Identifier: MIT
#pragma once

#include <fmt/format.h>

#include <string>
#include <utility>

namespace quarzel::tool {

/// The colour of grids and frames that are to stay in the background.
constexpr const char* ruleColour = "#d0d0d0";

/// A script that grows.
class Script {
  public:
    template <class... Values>
    void add(fmt::format_string<Values...> form, Values&&... values) {
        itsText += fmt::format(form, std::forward<Values>(values)...);
    }
    const std::string& text() const { return itsText; }

  private:
    std::string itsText;
};

}  // namespace quarzel::tool
