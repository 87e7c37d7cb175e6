// SPDX-License-Identifier: MIT
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdlib>

#include "plot_fixture.hpp"

namespace quarzel::test {

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
          ">Bit error rate<", ">no error: 95 % upper bound<", ">95 % interval<"}) {
        EXPECT_NE(svg.find(text), std::string::npos) << text;
    }
    ASSERT_EQ(plot({"-o", itsSvg, "--algorithm", "1", "--title", "Mine"}).exitCode, 0);
    EXPECT_NE(readFile(itsSvg).find(">Mine<"), std::string::npos);
    EXPECT_EQ(readFile(itsSvg).find(">max-log<"), std::string::npos);
}

TEST_F(PlotCommand, TellsWhatItDrawsInJson) {
    const std::string reference = itsDirectory.write("bound.csv", "ebn0_db,bler\n0.5,0.2\n1,0.1\n");
    const ToolRun run = plot({"-o", itsSvg, "--reference", "theirs=" + reference, "--json"});
    EXPECT_EQ(run.out, "{\"picture\":\"" + itsSvg +
                           "\",\"csv\":null,\"title\":\"K = 40, 2 units, 2 iterations, LLR \u00d7 4\","
                           "\"panels\":[\"ber\",\"bler\"],\"curves\":["
                           "{\"label\":\"max-log\",\"kind\":\"measured\"},"
                           "{\"label\":\"scaled max-log\",\"kind\":\"measured\"},"
                           "{\"label\":\"theirs\",\"kind\":\"reference\"}]}\n");
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 0);
}

TEST_F(PlotCommand, DrawsTheFactorsThatAreAskedFor) {
    sweep::Result result;
    for (const link::Quantiser quantiser : {link::Quantiser{link::Quantiser::Kind::llr, 4},
                                            {link::Quantiser::Kind::llr, 2.5},
                                            {link::Quantiser::Kind::amplitude, 4}}) {
        sweep::PointState& point =
            result.points.emplace(sweep::Setup{40, 2, 0, 2, quantiser, {}, {0}}, 1).first->second;
        point.blocks = 10;
        point.counts.back() = {20, 5};
        point.stoppedBy = sweep::StopReason::blocks;
    }
    itsDirectory.write("result.json", sweep::resultText(result));
    EXPECT_THAT(plot({"-o", itsSvg, "--json"}).out, testing::HasSubstr("amplitude \u00d7 4"));
    EXPECT_THAT(plot({"-o", itsSvg, "--json", "--llr", "4"}).out,
                testing::HasSubstr("\"title\":\"K = 40, 2 units, max-log, 2 iterations, LLR \u00d7 4\","
                                   "\"panels\":[\"ber\",\"bler\"],\"curves\":["
                                   "{\"label\":\"quarzel\",\"kind\":\"measured\"}]"));
    EXPECT_THAT(plot({"-o", itsSvg, "--json", "--llr", "2.5,4"}).out,
                testing::HasSubstr("\"curves\":[{\"label\":\"LLR \u00d7 2.5\",\"kind\":\"measured\"},"
                                   "{\"label\":\"LLR \u00d7 4\",\"kind\":\"measured\"}]"));
    EXPECT_EQ(
        plot({"-o", itsSvg, "--llr", "0"}).err,
        "quarzel: error: --llr: '0' is not a number above 0 and up to 1000000; see 'quarzel plot --help'\n");
}

TEST_F(PlotCommand, DrawsTheIterationsOfOneCurve) {
    itsDirectory.write("result.json", twoCurves(true));
    ASSERT_EQ(plot({"-o", itsSvg, "--per-iteration", "--algorithm", "0"}).exitCode, 0);
    const std::string svg = readFile(itsSvg);
    EXPECT_NE(svg.find(">after 1 iteration<"), std::string::npos);
    EXPECT_NE(svg.find(">after 2 iterations<"), std::string::npos);
    ASSERT_EQ(plot({"-o", itsSvg, "--per-iteration", "--algorithm", "0", "--iterations", "2"}).exitCode, 0);
    EXPECT_EQ(readFile(itsSvg).find(">after 1 iteration<"), std::string::npos);
    EXPECT_NE(readFile(itsSvg).find(">after 2 iterations<"), std::string::npos);
}

TEST_F(PlotCommand, DrawsEveryTextAsItIs) {
    for (const std::string text : {"''it''s' `false` \"$x\" \\n @a {/*2 b}_c^d %s", "a\xff\xc3'"}) {
        const std::string reference = itsDirectory.write("b.csv", "ebn0_db,bler\n1,0.1\n");
        const ToolRun run = plot({"-o", itsSvg, "--title", text, "--reference", text + '=' + reference,
                                  "--x-label", text, "--label", text, "--label", "b"});
        EXPECT_EQ(run.exitCode, 0) << run.err;
        const std::string svg = readFile(itsSvg);
        const std::string shown = text[0] == 'a' ? ">a\uFFFD\uFFFD'<" : "''it''s' `false` ";
        EXPECT_NE(svg.find(shown), std::string::npos) << svg;
    }
}

TEST_F(PlotCommand, DrawsAxesWhereNoErrorWasSeen) {
    const std::string reference = itsDirectory.write("bound.csv", "ebn0_db,ber\n1,0.2\n");
    for (const std::vector<std::string>& options :
         {std::vector<std::string>{"--per-iteration", "--algorithm", "0"}, {"--reference", reference}}) {
        sweep::Result silent;
        sweep::PointState& point =
            silent.points.emplace(sweep::Setup{40, 2, 0, 2, {}, {}, {500000}}, 2).first->second;
        point.blocks = 100;
        point.stoppedBy = sweep::StopReason::blocks;
        itsDirectory.write("result.json", sweep::resultText(silent));
        std::vector<std::string> all = {"-o", itsSvg};
        all.insert(all.end(), options.begin(), options.end());
        const ToolRun run = plot(all);
        EXPECT_EQ(run.exitCode, 0) << run.err;
    }
}

TEST_F(PlotCommand, DoesNotMixTheIterationsOfSeveralCurves) {
    itsDirectory.write("result.json", twoCurves(true));
    expectRefused(
        plot({"-o", itsSvg, "--per-iteration"}),
        "--per-iteration: there are 2 curves; choose one with --block-size, --units, --algorithm and --llr",
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
        "the results have no curve that was asked for; leave out --block-size, --units, --algorithm, "
        "--llr and --iterations",
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
