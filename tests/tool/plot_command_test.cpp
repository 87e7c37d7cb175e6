// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <cstdlib>

#include "run_tool.hpp"
#include "sweep/result.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

/// A result of two curves of two points, the second without an error.
std::string result(bool perIteration) {
    sweep::Result result;
    result.configuration.blockSizes = {40};
    result.configuration.algorithms = {0, 1};
    result.configuration.iterations = {2};
    result.configuration.ebN0 = {{500000}, {1000000}};
    result.configuration.perIteration = perIteration;
    for (const std::uint64_t errors : {10U, 0U, 8U, 0U}) {
        sweep::PointState point(perIteration ? 2 : 1);
        point.blocks = 100;
        point.counts.front() = {5 * errors, 2 * errors};
        point.counts.back() = {3 * errors, errors};
        point.bitErrorSquares = 9 * errors;
        point.stoppedBy = sweep::StopReason::blocks;
        result.points.push_back(point);
    }
    return sweep::resultText(result);
}

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
    std::string itsResult = itsDirectory.write("result.json", result(false));
    std::string itsSvg = itsDirectory.path("out.svg");
};

}  // namespace

TEST_F(PlotCommand, DrawsInTheFormatThatTheNameTells) {
    for (const auto& [name, start] : std::vector<std::pair<std::string, std::string>>{
             {"a.svg", "<?xml"}, {"a.png", "\x89PNG"}, {"a.pdf", "%PDF"}}) {
        const ToolRun run = plot({"-o", itsDirectory.path(name)});
        EXPECT_EQ(run.exitCode, 0) << run.err;
        EXPECT_EQ(run.out + run.err, "");
        EXPECT_TRUE(readFile(itsDirectory.path(name)).starts_with(start)) << name;
    }
}

TEST_F(PlotCommand, NamesTheCurvesInALegend) {
    const std::string reference = itsDirectory.write("bound.csv", "ebn0_db,bler\n0.5,0.2\n1,0.1\n");
    ASSERT_EQ(plot({"-o", itsSvg, "--reference", "a & bound=" + reference}).exitCode, 0);
    const std::string svg = readFile(itsSvg);
    for (const char* const text :
         {">max-log<", ">scaled max-log<", ">a &amp; bound<", ">K = 40, 2 units, 2 iterations, LLR \u00d7 4<",
          ">Bit error rate<", ">no error: 95 % upper bound<"}) {
        EXPECT_NE(svg.find(text), std::string::npos) << text;
    }
    ASSERT_EQ(plot({"-o", itsSvg, "--algorithm", "1", "--title", "Mine"}).exitCode, 0);
    EXPECT_NE(readFile(itsSvg).find(">Mine<"), std::string::npos);
    EXPECT_EQ(readFile(itsSvg).find(">max-log<"), std::string::npos);
}

TEST_F(PlotCommand, DrawsTheIterationsOfOneCurve) {
    itsDirectory.write("result.json", result(true));
    ASSERT_EQ(plot({"-o", itsSvg, "--per-iteration", "--algorithm", "0"}).exitCode, 0);
    const std::string svg = readFile(itsSvg);
    EXPECT_NE(svg.find(">after 1 iteration<"), std::string::npos);
    EXPECT_NE(svg.find(">after 2 iterations<"), std::string::npos);
}

TEST_F(PlotCommand, DrawsAxesWhereNoErrorWasSeen) {
    const std::string reference = itsDirectory.write("bound.csv", "ebn0_db,ber\n1,0.2\n");
    for (const std::vector<std::string>& options :
         {std::vector<std::string>{"--per-iteration", "--algorithm", "0"}, {"--reference", reference}}) {
        sweep::Result silent;
        silent.configuration.blockSizes = {40};
        silent.configuration.algorithms = {0};
        silent.configuration.iterations = {2};
        silent.configuration.ebN0 = {{500000}};
        silent.configuration.perIteration = true;
        silent.points.emplace_back(2);
        silent.points.back().blocks = 100;
        silent.points.back().stoppedBy = sweep::StopReason::blocks;
        itsDirectory.write("result.json", sweep::resultText(silent));
        std::vector<std::string> all = {"-o", itsSvg};
        all.insert(all.end(), options.begin(), options.end());
        const ToolRun run = plot(all);
        EXPECT_EQ(run.exitCode, 0) << run.err;
    }
}

TEST_F(PlotCommand, DoesNotMixTheIterationsOfSeveralCurves) {
    itsDirectory.write("result.json", result(true));
    expectRefused(
        plot({"-o", itsSvg, "--per-iteration"}),
        "--per-iteration: there are 2 curves; choose one with --block-size, --units, --algorithm and "
        "--iterations",
        2);
}

TEST_F(PlotCommand, RefusesIterationsThatWereNotCounted) {
    expectRefused(
        plot({"-o", itsSvg, "--per-iteration", "--algorithm", "0"}),
        itsResult + ": has no error rates per iteration; make it with 'quarzel sweep --per-iteration'", 3);
}

TEST_F(PlotCommand, RefusesAnAlteredResult) {
    std::string text = readFile(itsResult);
    text[text.find("\"bit_errors\": ") + 14] = '9';
    itsDirectory.write("result.json", text);
    expectRefused(plot({"-o", itsSvg}),
                  itsResult + ": has been altered: its checksum does not match; use another copy of it", 3);
}

TEST_F(PlotCommand, RefusesAnOutputThatCannotBe) {
    expectRefused(plot({"-o", itsDirectory.path("out.gif")}),
                  "-o: '" + itsDirectory.path("out.gif") +
                      "' tells no format; give a name that ends with .svg, .png or .pdf",
                  2);
    expectRefused(plot({"-o", itsDirectory.path("none/out.svg")}),
                  itsDirectory.path("none/out.svg") +
                      ": cannot be written: No such file or directory; create its directory first",
                  3);
    expectRefused(
        plot({"-o", itsSvg, "--units", "8"}),
        "the results have no curve that was asked for; leave out --block-size, --units, --algorithm "
        "and --iterations",
        2);
}

TEST_F(PlotCommand, SaysWhatToInstallWhereGnuplotIsMissing) {
#ifdef QUARZEL_EMULATED
    GTEST_SKIP() << "an emulated posix_spawn does not tell that there is no such program";
#endif
    const std::string path = std::getenv("PATH");
    ::setenv("PATH", itsDirectory.path("").c_str(), 1);
    const ToolRun run = plot({"-o", itsSvg});
    ::setenv("PATH", path.c_str(), 1);
    expectRefused(run,
                  "gnuplot: cannot be started: No such file or directory; install it (on Debian: apt-get "
                  "install gnuplot-nox)",
                  1);
}

}  // namespace quarzel::test
