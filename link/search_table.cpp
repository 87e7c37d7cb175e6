// SPDX-License-Identifier: MIT
#include "link/search_table.hpp"

#include <algorithm>
#include <cstddef>
#include <iterator>
#include <vector>

#include "link/refinement.hpp"

namespace quarzel::link {

namespace {

constexpr std::uint32_t randomNumbers = 1U << 16;
constexpr std::uint16_t highestRandom = 0xffff;

/// So many of 65536 random numbers may be undecided: deciding one takes as long as searching for many.
constexpr std::uint32_t mostUndecided = randomNumbers / 200;

/// Outputs that a search tells apart: random numbers from starts[i] on give output first + i, those from
/// starts.back() on are undecided again.
struct Window {
    int first = 0;
    std::vector<std::uint32_t> starts;

    std::uint32_t randoms() const { return starts.back() - starts.front(); }
};

/// All random numbers round the middle one that are in no cell with many thresholds.
Window wholeWindow(const ChannelThresholds& thresholds, const std::array<std::int32_t, cellCount>& cells) {
    const auto hasMany = [](std::int32_t cell) { return (cell & cellManyThresholds) != 0; };
    const auto middle = cells.begin() + cellCount / 2;
    const auto end = std::find_if(middle, cells.end(), hasMany);
    const auto begin = std::find_if(std::make_reverse_iterator(middle), cells.rend(), hasMany).base();
    const auto randomAt = [&](auto cell) { return static_cast<std::uint32_t>(cell - cells.begin()) * 16; };
    // The outputs that are their own negative when they are clipped are not among them.
    const auto startOf = [&](int output) {
        const std::uint64_t threshold = thresholds[static_cast<std::size_t>(output - lowestOutput - 1)];
        return std::clamp(static_cast<std::uint32_t>(threshold >> refinementBits), randomAt(begin),
                          randomAt(end));
    };
    Window window{lowestOutput + 1, {}};
    for (int output = window.first; output <= highestOutput; ++output) {
        window.starts.push_back(startOf(output));
    }
    return window;
}

/// The likeliest outputs of a window, at most so many.
Window narrowed(const Window& window, std::size_t outputs) {
    const std::size_t count = std::min(outputs, window.starts.size() - 1);
    std::size_t best = 0;
    for (std::size_t i = 0; i + count < window.starts.size(); ++i) {
        if (window.starts[i + count] - window.starts[i] > window.starts[best + count] - window.starts[best]) {
            best = i;
        }
    }
    const auto from = window.starts.begin() + static_cast<std::ptrdiff_t>(best);
    return {window.first + static_cast<int>(best), {from, from + static_cast<std::ptrdiff_t>(count) + 1}};
}

/// The `count` lowest bits in reverse.
std::size_t reversed(std::size_t bits, std::size_t count) {
    std::size_t result = 0;
    for (std::size_t i = 0; i < count; ++i) {
        result = 2 * result + (bits >> i & 1U);
    }
    return result;
}

/// Region i of the random numbers begins at thresholds[i - 1]; region 0 and those from the window's end on
/// are undecided. That end is the start of an even region, as the table wants it.
SearchTable tableOf(const Window& window, std::size_t levels) {
    std::vector<std::uint16_t> thresholds;
    for (const std::uint32_t start : window.starts) {
        thresholds.push_back(static_cast<std::uint16_t>(std::min<std::uint32_t>(start, highestRandom)));
    }
    if (thresholds.size() % 2 != 0) {
        thresholds.push_back(thresholds.back());
    }
    const std::size_t end = thresholds.size();
    thresholds.resize((std::size_t{1} << levels) - 1, highestRandom);
    SearchTable table{};
    table.levels = levels;
    for (std::size_t level = 0; level < levels; ++level) {
        const std::size_t width = std::size_t{1} << (levels - level);
        for (std::size_t place = 0; place < SearchTable::places; ++place) {
            table.thresholds[level][place] = thresholds[reversed(place, level) * width + width / 2 - 1];
        }
    }
    for (std::size_t place = 0; place < SearchTable::places; ++place) {
        const std::size_t region = 2 * reversed(place, levels - 1);
        const bool isOpen = region == 0 || region >= end;
        table.outputs[place] = static_cast<std::int16_t>(
            isOpen ? window.first - 1 : window.first - 1 + static_cast<int>(region));
        table.undecided[place] = isOpen ? highestRandom : thresholds[region - 1];
    }
    return table;
}

}  // namespace

SearchTable makeSearchTable(const ChannelThresholds& thresholds,
                            const std::array<std::int32_t, cellCount>& cells) {
    const Window whole = wholeWindow(thresholds, cells);
    for (std::size_t levels = SearchTable::mostLevels - 1; levels <= SearchTable::mostLevels; ++levels) {
        const Window window = narrowed(whole, (std::size_t{1} << levels) - 3);
        if (window.randoms() >= randomNumbers - mostUndecided) {
            return tableOf(window, levels);
        }
    }
    return {};
}

}  // namespace quarzel::link
