// SPDX-License-Identifier: MIT
#include "options/list_option.hpp"

#include <fmt/format.h>
#include <CLI/CLI.hpp>

namespace quarzel::tool {

CLI::Validator eachItem(const CLI::Validator& check) {
    const auto checkAll = [check](std::string& list) {
        std::vector<std::string> items;
        for (const std::string_view part : itemsOf(list, ',')) {
            std::string item(part);
            if (std::string problem = check(item); !problem.empty()) {
                return problem;
            }
            items.push_back(item);
        }
        list = fmt::format("{}", fmt::join(items, ","));
        return std::string();
    };
    return CLI::Validator(checkAll, "").name(check.get_name());
}

}  // namespace quarzel::tool
