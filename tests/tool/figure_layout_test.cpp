// SPDX-License-Identifier: MIT
#include "plot/figure_layout.hpp"

#include <fmt/format.h>
#include <gtest/gtest.h>

#include <set>

#include "plot/curve_styles.hpp"
#include "plot/figure_text.hpp"
#include "tool_error.hpp"

namespace quarzel::test {

namespace {

using tool::FigureChoice;
using tool::FigureLayout;
using tool::Picture;

Picture picture(std::size_t curves, std::size_t letters, std::size_t panels = 2) {
    Picture picture{"A title", false, {}};
    for (std::size_t p = 0; p < panels; ++p) {
        tool::Panel& panel = picture.panels.emplace_back(tool::Panel{p == 0 ? "ber" : "bler", {}});
        for (std::size_t i = 0; i < curves; ++i) {
            panel.curves.push_back({fmt::format("{:02}", i) + std::string(letters, 'n'),
                                    tool::CurveKind::measured,
                                    {{0, 0.1, 0.05, 0.2, 10, 1}, {1, 0, 0, 0.1, 10, 0}}});
        }
    }
    return picture;
}

/// Every text of the legend stands in the legend, and the legend in the figure, beside the panels.
void expectWhole(const FigureLayout& layout, double fontSize) {
    const tool::Box& box = layout.legendBox;
    EXPECT_GE(box.left, 0);
    EXPECT_GE(box.bottom, 0);
    EXPECT_LE(box.left + box.width, layout.width);
    EXPECT_LE(box.bottom + box.height, layout.height);
    for (const tool::PlacedEntry& placed : layout.legend.entries) {
        for (const std::string& line : placed.lines) {
            EXPECT_LE(placed.left + (tool::sampleWidth + 0.5 + tool::widthOf(line)) * fontSize,
                      box.width + 1e-6)
                << line;
        }
        const double height = static_cast<double>(placed.lines.size()) * tool::lineHeight * fontSize;
        EXPECT_LE(placed.top + height, box.height + 1e-6);
    }
    for (const tool::Box& panel : layout.panels) {
        EXPECT_GT(panel.left, 0);
        EXPECT_LE(panel.left + panel.width, layout.width);
        const bool isBeside = box.left >= panel.left + panel.width;
        const bool isBelow = box.bottom + box.height <= panel.bottom;
        EXPECT_TRUE(isBeside || isBelow);
    }
}

void expectNoRoom(const Picture& picture, const FigureChoice& choice, const std::string& message) {
    try {
        tool::layoutOf(picture, choice);
        FAIL() << "it was laid out";
    } catch (const tool::ToolError& error) {
        EXPECT_EQ(tool::errorLine(error.what()),
                  "quarzel: error: " + message +
                      "; give a larger --size, a smaller --font-size or --legend none\n");
    }
}

}  // namespace

TEST(FigureLayout, HoldsLegendsOfAnyLengthWhole) {
    for (const std::size_t curves : {1U, 3U, 17U, 40U}) {
        for (const std::size_t letters : {3U, 30U, 300U}) {
            for (const std::size_t panels : {1U, 2U}) {
                SCOPED_TRACE(fmt::format("{} curves, {} letters, {} panels", curves, letters, panels));
                expectWhole(tool::layoutOf(picture(curves, letters, panels), {}), 10);
            }
        }
    }
}

TEST(FigureLayout, KeepsTheSizeThatIsGiven) {
    FigureChoice choice;
    choice.width = 252;
    choice.height = 200;
    choice.fontSize = 8;
    const FigureLayout layout = tool::layoutOf(picture(3, 10, 1), choice);
    EXPECT_EQ(layout.width, 252);
    EXPECT_EQ(layout.height, 200);
    expectWhole(layout, 8);
}

TEST(FigureLayout, SaysWhereThereIsNoRoom) {
    FigureChoice choice;
    choice.width = 252;
    choice.height = 180;
    expectNoRoom(picture(30, 10), choice, "--size: there is no room for the curves");
    choice.legend = "top-left";
    expectNoRoom(picture(30, 10, 1), choice, "--legend: the legend does not fit in the panel");
    choice.width = 504;
    choice.legend = "right";
    expectNoRoom(picture(30, 1, 1), choice, "--legend: the legend is higher than the figure");
}

TEST(CurveStyles, ShareNoColour) {
    for (const std::size_t curves : {1U, 7U, 8U, 24U, 60U}) {
        std::set<std::string> colours;
        for (const tool::CurveStyle& style : tool::stylesOf(picture(curves, 1).panels[0])) {
            colours.insert(style.colour);
            EXPECT_EQ(style.dashes, 1) << "dashes are those of references";
        }
        EXPECT_EQ(colours.size(), curves);
    }
}

}  // namespace quarzel::test
