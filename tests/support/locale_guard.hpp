// SPDX-License-Identifier: MIT
#pragma once

#include <locale>
#include <string>

namespace quarzel::test {

/// While it lives, numbers in the global locale are grouped as in "1,234".
class GroupingLocale {
  public:
    GroupingLocale() : itsPrevious(std::locale::global(std::locale(std::locale::classic(), new Grouping))) {}
    ~GroupingLocale() { std::locale::global(itsPrevious); }
    GroupingLocale(const GroupingLocale&) = delete;
    GroupingLocale& operator=(const GroupingLocale&) = delete;

  private:
    struct Grouping : std::numpunct<char> {
        char do_thousands_sep() const override { return ','; }
        std::string do_grouping() const override { return "\1"; }
    };

    std::locale itsPrevious;
};

}  // namespace quarzel::test
