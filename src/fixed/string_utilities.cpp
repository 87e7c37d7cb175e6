// SPDX-License-Identifier: MIT
#include "fixed/string_utilities.hpp"

#include <algorithm>

namespace {

bool isWhiteSpace(char c) {
    return static_cast<signed char>(c) < 33;
}

char toUpper(char c) {
    return c >= 'a' && c <= 'z' ? static_cast<char>(c - 'a' + 'A') : c;
}

bool contains(const std::string& set, char c) {
    return set.find(c) != std::string::npos;
}

char fileNameCharacter(char c) {
    switch (c) {
        case '<':
            return '[';
        case '>':
            return ']';
        case ',':
            return 'c';
        case '-':
            return 'm';
        case '+':
        case '%':
            return 'p';
        case '=':
            return 'e';
        case '.':
            return 'd';
        default:
            return isWhiteSpace(c) ? '_' : c;
    }
}

}  // namespace

std::string stripws(const std::string& text) {
    std::string result;
    bool gap = false;
    for (const char c : text) {
        if (isWhiteSpace(c)) {
            gap = true;
            continue;
        }
        if (gap && !result.empty()) {
            result += ' ';
        }
        gap = false;
        result += c;
    }
    return result;
}

std::vector<std::string> stringtok(const std::string& text, const std::string& separators,
                                   const std::string& kept) {
    std::vector<std::string> tokens;
    std::string token;
    const auto finishToken = [&] {
        if (!token.empty()) {
            tokens.push_back(token);
            token.clear();
        }
    };
    for (const char c : text) {
        if (contains(kept, c)) {
            finishToken();
            tokens.emplace_back(1, c);
        } else if (contains(separators, c)) {
            finishToken();
        } else {
            token += c;
        }
    }
    finishToken();
    return tokens;
}

std::string toFilename(const std::string& text) {
    std::string result;
    for (const char c : text) {
        result += fileNameCharacter(c);
    }
    return result;
}

std::string expandTabs(const std::string& text, const std::vector<unsigned>& tabPositions) {
    std::string result;
    std::size_t lineStart = 0;
    for (const char c : text) {
        if (c == '\t') {
            const std::size_t column = result.size() - lineStart;
            const auto next = std::find_if(tabPositions.begin(), tabPositions.end(),
                                           [column](unsigned position) { return position > column; });
            result.append(next == tabPositions.end() ? 1 : *next - column, ' ');
            continue;
        }
        result += c;
        if (c == '\n') {
            lineStart = result.size();
        }
    }
    return result;
}

bool nocase_compare(const std::string& x, const std::string& y) {
    return std::equal(x.begin(), x.end(), y.begin(), y.end(),
                      [](char a, char b) { return nocase_compare(a, b); });
}

bool nocase_compare(char x, char y) {
    return toUpper(x) == toUpper(y);
}
