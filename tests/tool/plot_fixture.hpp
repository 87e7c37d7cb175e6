// SPDX-License-Identifier: MIT
#pragma once

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "run_tool.hpp"
#include "sweep/result.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

/// A result of two curves of two points, the second without an error.
inline std::string twoCurves(bool perIteration) {
    sweep::Result result;
    for (const int algorithm : {0, 1}) {
        for (const std::uint64_t errors : {algorithm == 0 ? 10U : 8U, 0U}) {
            sweep::PointState point(perIteration ? 2 : 1);
            point.blocks = 100;
            point.counts.front() = {5 * errors, 2 * errors};
            point.counts.back() = {3 * errors, errors};
            point.bitErrorSquares = 9 * errors;
            point.stoppedBy = sweep::StopReason::blocks;
            const link::Decibels ebN0 = {errors != 0 ? 500000 : 1000000};
            result.points.emplace(sweep::Setup{40, 2, algorithm, 2, {}, {}, ebN0}, point);
        }
    }
    return sweep::resultText(result);
}

/// A directory with that result, which is drawn.
class PlotCommand : public testing::Test {
  protected:
    ToolRun plot(const std::vector<std::string>& options) {
        std::vector<std::string> arguments = {"plot", itsResult};
        arguments.insert(arguments.end(), options.begin(), options.end());
        return runTool(arguments);
    }

    void expectRefused(const ToolRun& run, const std::string& message, int exitCode) {
        EXPECT_EQ(run.err, "quarzel: error: " + message + '\n');
        EXPECT_EQ(run.out, "");
        EXPECT_EQ(run.exitCode, exitCode);
        EXPECT_EQ(itsDirectory.names(), std::vector<std::string>{"result.json"}) << "nothing may be left";
    }

    TemporaryDirectory itsDirectory;
    std::string itsResult = itsDirectory.write("result.json", twoCurves(false));
    std::string itsSvg = itsDirectory.path("out.svg");
};

}  // namespace quarzel::test
