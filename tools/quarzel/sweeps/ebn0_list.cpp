// SPDX-License-Identifier: MIT
#include "sweeps/ebn0_list.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <cstddef>
#include <optional>
#include <string_view>

#include "options/text_items.hpp"
#include "options/whole_number.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

constexpr std::int64_t maxValues = 10000;
constexpr std::size_t decimals = 6;

/// A decimal number in millionths.
std::int64_t readDecibels(const std::string& option, std::string_view text) {
    const auto fail = [&](std::string_view why) {
        return ToolError(ExitCode::usage, option, fmt::format("'{}' {}", text, why),
                         "give numbers as 0.5 or ranges as 0:0.1:1.5, separated by commas");
    };
    std::string_view rest = text;
    const bool isNegative = rest.starts_with('-');
    if (isNegative || rest.starts_with('+')) {
        rest.remove_prefix(1);
    }
    const std::size_t point = std::min(rest.find('.'), rest.size());
    const std::string_view whole = rest.substr(0, point);
    std::string fraction(rest.substr(std::min(point + 1, rest.size())));
    if (whole.empty() && fraction.empty()) {
        throw fail("is not a number of dB");
    }
    if (fraction.size() > decimals) {
        throw fail("has more than 6 decimals");
    }
    fraction.resize(decimals, '0');
    const std::optional<std::uint64_t> decibels = whole.empty() ? 0 : readWholeNumber(whole);
    const std::optional<std::uint64_t> millionths = readWholeNumber(fraction);
    if (!decibels || !millionths) {
        throw fail("is not a number of dB");
    }
    if (*decibels > 1000) {
        throw fail("lies outside -20 to 40 dB");
    }
    const auto value = static_cast<std::int64_t>(*decibels * 1'000'000 + *millionths);
    return isNegative ? -value : value;
}

void appendRange(const std::string& option, std::string_view item, const std::vector<std::string_view>& parts,
                 std::vector<link::Decibels>& list) {
    const auto fail = [&](std::string_view why, std::string_view remedy) {
        return ToolError(ExitCode::usage, option, fmt::format("the range '{}' {}", item, why), remedy);
    };
    if (parts.size() != 3) {
        throw fail("does not have three parts", "write FIRST:STEP:LAST");
    }
    const std::int64_t first = readDecibels(option, parts[0]);
    const std::int64_t step = readDecibels(option, parts[1]);
    const std::int64_t last = readDecibels(option, parts[2]);
    if (step == 0) {
        throw fail("never ends: its step is 0", "give a step above 0");
    }
    if ((last > first && step < 0) || (last < first && step > 0)) {
        throw fail("never ends: its step leads away from its last value", "give a step with the other sign");
    }
    if ((last - first) / step >= maxValues) {
        throw fail(fmt::format("has {} values, more than {}", (last - first) / step + 1, maxValues),
                   "make it shorter or its step larger");
    }
    for (std::int64_t i = 0; i <= (last - first) / step; ++i) {
        list.push_back({static_cast<std::int32_t>(first + i * step)});
    }
}

}  // namespace

std::vector<link::Decibels> readEbN0List(const std::string& option, const std::string& text) {
    std::vector<link::Decibels> list;
    for (const std::string_view item : itemsOf(text, ',')) {
        const std::vector<std::string_view> parts = itemsOf(item, ':');
        if (parts.size() > 1) {
            appendRange(option, item, parts, list);
        } else {
            list.push_back({static_cast<std::int32_t>(readDecibels(option, item))});
        }
    }
    std::sort(list.begin(), list.end());
    list.erase(std::unique(list.begin(), list.end()), list.end());
    return list;
}

}  // namespace quarzel::tool
