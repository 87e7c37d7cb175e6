// SPDX-License-Identifier: MIT
#include <fmt/format.h>

#include <vector>

#include "junit_report.hpp"
#include "report_text.hpp"
#include "vectors/compare_report.hpp"

namespace quarzel::tool {

namespace {

JunitCase::Failure failureOf(const CompareReport& report, const BlockDifference& difference) {
    const ExpectedBlock& block = report.expected.blocks[difference.block];
    const std::size_t address = report.firstAddress(difference);
    const std::string& command = block.traceCommand;
    return {fmt::format("{} of {} bits differ; bit {} (from 0) is {}, expected {}", difference.bits.count(),
                        block.blockSize, difference.firstBit, valueText(report.actual.words[address]),
                        report.expected.bits[address]),
            command.empty() ? "" : "The model's trace of this block:\n" + command};
}

}  // namespace

std::string junitText(const CompareReport& report) {
    std::vector<JunitCase> cases;
    auto failing = report.comparison.failing.begin();
    for (std::size_t i = 0; i < report.expected.blocks.size(); ++i) {
        const ExpectedBlock& block = report.expected.blocks[i];
        const std::string about = block.about();
        cases.push_back(
            {report.expected.name,
             fmt::format("block {} (K = {}{}{})", i, block.blockSize, about.empty() ? "" : ", ", about),
             {}});
        if (failing != report.comparison.failing.end() && failing->block == i) {
            cases.back().failure = failureOf(report, *failing++);
        }
    }
    if (report.comparison.beyond > 0) {
        cases.push_back({report.expected.name, "the end",
                         JunitCase::Failure{counted(report.comparison.beyond, "word", "words") +
                                                " after the last decision expected",
                                            ""}});
    }
    return junitText("quarzel compare", cases);
}

}  // namespace quarzel::tool
