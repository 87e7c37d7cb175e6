// SPDX-License-Identifier: MIT
#include "plot_fixture.hpp"

namespace quarzel::test {

TEST_F(PlotCommand, WritesThePointsThatItDraws) {
    const std::string reference = itsDirectory.write("r.csv", "K,code_bits,ebn0_db,bler\n40,132,0.5,0.2\n");
    const std::string csv = itsDirectory.path("out.csv");
    ASSERT_EQ(plot({"-o", itsSvg, "--csv", csv, "--panel", "bler", "--reference", "a \"b\"=" + reference,
                    "--algorithm", "0", "--label", "mine, yours"})
                  .exitCode,
              0);
    EXPECT_EQ(readFile(csv),
              "rate,curve,kind,ebn0_db,value,low,high,blocks,errors\n"
              "bler,\"mine, yours\",measured,0.5,0.1,0.055229137060675094,0.17436566150491348,100,10\n"
              "bler,\"mine, yours\",measured,1,0,0,0.03699349820698568,100,0\n"
              "bler,\"a \"\"b\"\"\",reference,0.5,0.2,,,,\n");
    ASSERT_EQ(plot({"-o", itsSvg, "--csv", csv, "--panel", "bler", "--x", "esn0", "--x-range", "-5:-4.2",
                    "--reference", reference})
                  .exitCode,
              0);
    EXPECT_EQ(readFile(csv),
              "rate,curve,kind,esn0_db,value,low,high,blocks,errors\n"
              "bler,\"max-log\",measured,-4.27121255,0.1,0.055229137060675094,0.17436566150491348,100,10\n"
              "bler,\"scaled max-log\",measured,-4.27121255,0.08,0.04109346148438062,0.14998107700948732,"
              "100,8\n"
              "bler,\"r\",reference,-4.6851394,0.2,,,,\n");
}

TEST_F(PlotCommand, DrawsUncodedBpsk) {
    const std::string csv = itsDirectory.path("out.csv");
    ASSERT_EQ(plot({"-o", itsSvg, "--csv", csv, "--panel", "ber", "--uncoded", "--x-range", "0:4"}).exitCode,
              0);
    const std::string text = readFile(csv);
    EXPECT_NE(text.find("ber,\"uncoded BPSK\",uncoded,0,0.0786496035251425"), std::string::npos) << text;
    EXPECT_NE(text.find("ber,\"uncoded BPSK\",uncoded,4,0.0125008180407375"), std::string::npos) << text;
}

TEST_F(PlotCommand, DrawsOnePanelInTheSizeWanted) {
    const std::string pdf = itsDirectory.path("out.pdf");
    for (const auto& [size, box] : std::vector<std::pair<std::string, std::string>>{
             {"3.5x2.5in", "/MediaBox [ 0 0 252 180 ]"}, {"127x63.5mm", "/MediaBox [ 0 0 360 180 ]"}}) {
        const ToolRun run = plot({"-o", pdf, "--panel", "bler", "--size", size, "--font-size", "8",
                                  "--legend", "top-right", "--title", "", "--y-label", "FER"});
        EXPECT_EQ(run.exitCode, 0) << run.err;
        EXPECT_NE(readFile(pdf).find(box), std::string::npos) << size;
    }
}

TEST_F(PlotCommand, DrawsTwoRangesAsOneCurve) {
    sweep::Result lower;
    sweep::PointState& point = lower.points.emplace(sweep::Setup{40, 2, 0, 2, {}, {}, {0}}, 1).first->second;
    point.blocks = 10;
    point.counts.back() = {20, 5};
    point.stoppedBy = sweep::StopReason::blocks;
    const std::string other = itsDirectory.write("lower.json", sweep::resultText(lower));
    const std::string csv = itsDirectory.path("out.csv");
    ASSERT_EQ(plot({other, "-o", itsSvg, "--csv", csv, "--panel", "bler", "--algorithm", "0"}).exitCode, 0);
    EXPECT_EQ(readFile(csv),
              "rate,curve,kind,ebn0_db,value,low,high,blocks,errors\n"
              "bler,\"quarzel\",measured,0,0.5,0.236593090512564,0.763406909487436,10,5\n"
              "bler,\"quarzel\",measured,0.5,0.1,0.055229137060675094,0.17436566150491348,100,10\n"
              "bler,\"quarzel\",measured,1,0,0,0.03699349820698568,100,0\n");
}

TEST_F(PlotCommand, RefusesWrongOptionsInOneLine) {
    const std::vector<std::pair<std::vector<std::string>, std::string>> cases = {
        {{"--size", "3.5"},
         "--size: '3.5' has no unit; give one as 3.5in, 3.5x2.6in or 89x66mm, of 1 to 40 inches"},
        {{"--size", "3x2x1in"},
         "--size: '3x2x1in' is not a size; give one as 3.5in, 3.5x2.6in or 89x66mm, of 1 to 40 inches"},
        {{"--size", "nanin"},
         "--size: 'nanin' is not a size; give one as 3.5in, 3.5x2.6in or 89x66mm, of 1 to 40 inches"},
        {{"--size", "41in"},
         "--size: '41in' is not a size; give one as 3.5in, 3.5x2.6in or 89x66mm, of 1 to 40 inches"},
        {{"--size", "2x1in"},
         "--size: there is no room for the curves; give a larger --size, a smaller --font-size or --legend "
         "none"},
        {{"--font-size", "3"}, "--font-size: '3' is not a size; give a number of points from 4 to 72"},
        {{"--x-range", "1:0"},
         "--x-range: '1:0' is not a range; give two numbers of dB in ascending order, as 0:1.5"},
        {{"--y-range", "0:1"},
         "--y-range: '0:1' is not a range; give two rates in ascending order, as 1e-6:1"},
        {{"--y-range", "0.1"},
         "--y-range: '0.1' is not a range; give two rates in ascending order, as 1e-6:1"},
        {{"--y-label", "a"}, "--y-label: there are two vertical axes; choose one with --panel"},
        {{"--label", "a"},
         "--label: 1 label for 2 curves; give one for each curve, in the order of the legend"},
        {{"--csv", itsResult}, "--csv: " + itsResult + " is also read; give another name"},
        {{"--csv", itsSvg}, "--csv: " + itsSvg + " is also the picture; give another name"},
    };
    for (const auto& [options, message] : cases) {
        std::vector<std::string> all = {"-o", itsSvg};
        all.insert(all.end(), options.begin(), options.end());
        expectRefused(plot(all), message, 2);
    }
    itsDirectory.write("result.json", twoCurves(true));
    expectRefused(plot({"-o", itsSvg, "--per-iteration", "--algorithm", "0", "--iterations", "2,3"}),
                  "--iterations: the curve has no iteration 3; give numbers up to 2", 2);
}

TEST_F(PlotCommand, RefusesEsN0OfAReferenceWithoutACodeRate) {
    const std::string reference = itsDirectory.write("r.csv", "ebn0_db,bler\n0.5,0.2\n");
    const ToolRun run = plot({"-o", itsSvg, "--x", "esn0", "--reference", reference});
    EXPECT_EQ(run.err,
              "quarzel: error: --x: the reference 'r' does not tell its code rate; give it the columns K and "
              "code_bits\n");
    EXPECT_EQ(run.exitCode, 2);
}

}  // namespace quarzel::test
