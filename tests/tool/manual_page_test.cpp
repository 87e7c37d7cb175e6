// SPDX-License-Identifier: MIT
#include "shell/manual_page.hpp"

#include <gtest/gtest.h>

#include "run_tool.hpp"

namespace quarzel::test {

TEST(ManualPage, TellsOfCommandsWithTheirArgumentsOptionsAndDetails) {
    const tool::ToolDescription description = {
        {"", "A tool", {}, {{{"-h", "--help"}, "", "Print help", false, {}, false}}, "Some text\n.start"},
        {{"decode",
          "Decode it",
          {{{"FILE"}, "", "What to 'decode'", true, {}, true}},
          {{{"--units"}, "N", "How many", false, {"2"}, false}},
          "A back\\slash and -dashes"}}};
    const std::string expected = ".TH QUARZEL 1 \"\" \"quarzel " QUARZEL_TOOL_VERSION
                                 "\" \"User Commands\"\n"
                                 ".SH NAME\n"
                                 "quarzel \\- A tool\n"
                                 ".SH SYNOPSIS\n"
                                 "\\fBquarzel\\fR [\\fIoptions\\fR] \\fIcommand\\fR ...\n"
                                 ".br\n"
                                 "\\fBquarzel decode\\fR [\\fIoptions\\fR] \\fIFILE\\fR\n"
                                 ".SH DESCRIPTION\n"
                                 ".PP\n.EX\nSome text\n\\&.start\n.EE\n"
                                 ".SH OPTIONS\n"
                                 ".TP\n\\fB\\-h\\fR, \\fB\\-\\-help\\fR\nPrint help\n"
                                 ".SH COMMANDS\n"
                                 ".SS quarzel decode\n"
                                 "Decode it.\n"
                                 ".PP\n"
                                 "\\fBquarzel decode\\fR [\\fIoptions\\fR] \\fIFILE\\fR\n"
                                 ".TP\n\\fIFILE\\fR\nWhat to \\(aqdecode\\(aq\n"
                                 ".TP\n\\fB\\-\\-units\\fR \\fIN\\fR\nHow many\n"
                                 ".PP\n.EX\nA back\\eslash and \\-dashes\n.EE\n"
                                 ".SH EXIT STATUS\n.PP\n.EX\nExit codes:\n  0  done\n";
    EXPECT_EQ(tool::manualPage(description).substr(0, expected.size()), expected);
}

TEST(ManualPage, IsPrintedWithEveryCommand) {
    const ToolRun run = runTool({"manual"});
    EXPECT_EQ(run.exitCode, 0);
    for (const char* const heading : {".SH NAME\n", ".SS quarzel decode\n", ".SS quarzel vectors\n",
                                      ".SS quarzel completion\n", ".SH EXIT STATUS\n"}) {
        EXPECT_NE(run.out.find(heading), std::string::npos) << heading;
    }
}

}  // namespace quarzel::test
