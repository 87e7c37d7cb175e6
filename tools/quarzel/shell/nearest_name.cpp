// SPDX-License-Identifier: MIT
#include "shell/nearest_name.hpp"

#include <algorithm>
#include <cstddef>

namespace quarzel::tool {

namespace {

/// The shortest word that is taken for the beginning of a name.
constexpr std::size_t shortestBeginning = 3;

/// The typing errors between two words: the optimal string alignment distance.
std::size_t errorsBetween(std::string_view a, std::string_view b) {
    std::vector<std::vector<std::size_t>> errors(a.size() + 1, std::vector<std::size_t>(b.size() + 1));
    for (std::size_t i = 0; i <= a.size(); ++i) {
        for (std::size_t j = 0; j <= b.size(); ++j) {
            if (i == 0 || j == 0) {
                errors[i][j] = i + j;
                continue;
            }
            errors[i][j] = std::min({errors[i - 1][j] + 1, errors[i][j - 1] + 1,
                                     errors[i - 1][j - 1] + (a[i - 1] == b[j - 1] ? 0 : 1)});
            if (i > 1 && j > 1 && a[i - 1] == b[j - 2] && a[i - 2] == b[j - 1]) {
                errors[i][j] = std::min(errors[i][j], errors[i - 2][j - 2] + 1);
            }
        }
    }
    return errors[a.size()][b.size()];
}

}  // namespace

std::optional<std::string> nearestName(std::string_view word, const std::vector<std::string>& names) {
    std::optional<std::string> nearest;
    std::size_t fewest = std::max<std::size_t>(1, word.size() / 3) + 1;
    for (const std::string& name : names) {
        const bool isBeginning = word.size() >= shortestBeginning && name.starts_with(word);
        const std::size_t errors = isBeginning ? 0 : errorsBetween(word, name);
        if (errors < fewest) {
            fewest = errors;
            nearest = name;
        }
    }
    return nearest;
}

}  // namespace quarzel::tool
