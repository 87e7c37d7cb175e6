// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <set>

#include "npy_data.hpp"
#include "quarzel/code.hpp"
#include "run_tool.hpp"
#include "temporary_directory.hpp"
#include "vardel_ip_quarzel.h"
#include "xtensor/xmath.hpp"
#include "xtensor/xview.hpp"

namespace quarzel::test {

namespace {

ToolRun decodeShipped(const std::string& name, const std::string& reference) {
    return runTool({"decode", shipped(name + ".soft.npy"), "--units", "8", "--algorithm", "1", "--iterations",
                    "6", "--reference", shipped(name + '.' + reference + ".npy")});
}

/// The JSON report of a capture of 400 blocks of 40 bits, decoded by default.
std::string jsonFor(const std::string& file, const std::string& errors = "") {
    return "{\"capture\":\"" + file +
           "\",\"block_size\":40,\"units\":2,\"algorithm\":1,\"iterations\":6,\"implementation\":\"" +
           implementations().front() + "\",\"blocks\":400,\"bits\":16000,\"seconds\":T,\"mbit_per_s\":S" +
           errors + "}\n";
}

std::string textFor(const std::string& file, const std::string& rest) {
    return "capture       " + file + '\n' + rest;
}

}  // namespace

TEST(DecodeCommand, DecidesALargeBlockCaptureAsStored) {
    const ToolRun run = decodeShipped("k6144", "decided");
    EXPECT_EQ(maskTimes(run.out), textFor(shipped("k6144.soft.npy"),
                                          "block size    6144 bits\n"
                                          "core          8 units, algorithm 1, 6 iterations\n"
                                          "blocks        24\n"
                                          "bits          147456\n"
                                          "time          T s\n"
                                          "speed         S Mbit/s\n"
                                          "bit errors    0 (BER 0.00e+00)\n"
                                          "block errors  0 (BLER 0.00e+00)\n"));
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 0);
}

TEST(DecodeCommand, DecidesASmallBlockCaptureAsStored) {
    const ToolRun run = decodeShipped("k40", "decided");
    EXPECT_EQ(maskTimes(run.out), textFor(shipped("k40.soft.npy"),
                                          "block size    40 bits\n"
                                          "core          8 units, algorithm 1, 6 iterations\n"
                                          "blocks        400\n"
                                          "bits          16000\n"
                                          "time          T s\n"
                                          "speed         S Mbit/s\n"
                                          "bit errors    0 (BER 0.00e+00)\n"
                                          "block errors  0 (BLER 0.00e+00)\n"));
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 0);
}

TEST(DecodeCommand, CountsTheErrorsOfALargeBlockCapture) {
    const ToolRun run = decodeShipped("k6144", "sent");
    EXPECT_EQ(maskTimes(run.out), textFor(shipped("k6144.soft.npy"),
                                          "block size    6144 bits\n"
                                          "core          8 units, algorithm 1, 6 iterations\n"
                                          "blocks        24\n"
                                          "bits          147456\n"
                                          "time          T s\n"
                                          "speed         S Mbit/s\n"
                                          "bit errors    2 (BER 1.36e-05)\n"
                                          "block errors  2 (BLER 8.33e-02)\n"
                                          "wrong blocks  20, 22, counted from 0\n"));
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 0);
}

TEST(DecodeCommand, CountsTheErrorsOfASmallBlockCapture) {
    const ToolRun run = decodeShipped("k40", "sent");
    EXPECT_EQ(maskTimes(run.out), textFor(shipped("k40.soft.npy"),
                                          "block size    40 bits\n"
                                          "core          8 units, algorithm 1, 6 iterations\n"
                                          "blocks        400\n"
                                          "bits          16000\n"
                                          "time          T s\n"
                                          "speed         S Mbit/s\n"
                                          "bit errors    39 (BER 2.44e-03)\n"
                                          "block errors  6 (BLER 1.50e-02)\n"
                                          "wrong blocks  28, 90, 99, 155, 290, 334, counted from 0\n"));
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 0);
}

TEST(DecodeCommand, TakesTheDefaultsThatItsHelpTells) {
    const ToolRun run = runTool({"decode", shipped("k40.soft.npy")});
    EXPECT_EQ(maskTimes(run.out), textFor(shipped("k40.soft.npy"),
                                          "block size    40 bits\n"
                                          "core          2 units, algorithm 1, 6 iterations\n"
                                          "blocks        400\n"
                                          "bits          16000\n"
                                          "time          T s\n"
                                          "speed         S Mbit/s\n"));
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 0);
}

TEST(DecodeCommand, CountsOneIterationInTheSingular) {
    const ToolRun run = runTool({"decode", shipped("k40.soft.npy"), "--iterations", "1"});
    EXPECT_NE(run.out.find("core          2 units, algorithm 1, 1 iteration\n"), std::string::npos)
        << run.out;
}

TEST(DecodeCommand, PrintsOneJsonObjectWithStableKeys) {
    const ToolRun run =
        runTool({"decode", shipped("k40.soft.npy"), "--json", "--reference", shipped("k40.sent.npy")});
    EXPECT_EQ(maskTimes(run.out),
              jsonFor(shipped("k40.soft.npy"),
                      ",\"bit_errors\":39,\"block_errors\":6,\"bit_error_rate\":0.0024375,"
                      "\"block_error_rate\":0.015,\"wrong_blocks\":["
                      "{\"block\":28,\"bit_errors\":11,\"first_bit\":6},"
                      "{\"block\":90,\"bit_errors\":9,\"first_bit\":14},"
                      "{\"block\":99,\"bit_errors\":3,\"first_bit\":19},"
                      "{\"block\":155,\"bit_errors\":6,\"first_bit\":4},"
                      "{\"block\":290,\"bit_errors\":8,\"first_bit\":16},"
                      "{\"block\":334,\"bit_errors\":2,\"first_bit\":28}]"));
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 0);
}

TEST(DecodeCommand, LeavesTheErrorsOutOfJsonWithoutAReference) {
    const ToolRun run = runTool({"decode", shipped("k40.soft.npy"), "--json"});
    EXPECT_EQ(maskTimes(run.out), jsonFor(shipped("k40.soft.npy")));
    EXPECT_EQ(run.exitCode, 0);
}

TEST(DecodeCommand, TellsTheSpeedOfTheTimeThatItTells) {
    const ToolRun run = runTool({"decode", shipped("k6144.soft.npy"), "--json"});
    const auto report = nlohmann::json::parse(run.out);
    const double seconds = report.at("seconds");
    EXPECT_GT(seconds, 0);
    EXPECT_DOUBLE_EQ(report.at("mbit_per_s").get<double>(), 147456 / seconds / 1e6);
}

TEST(DecodeCommand, ShowsWhatIsNoUtf8InAFileNameAsReplacementCharacter) {
    const TemporaryDirectory directory;
    const std::string file = directory.write("\xff.npy", readFile(shipped("k40.soft.npy")));
    const ToolRun run = runTool({"decode", file, "--json"});
    EXPECT_EQ(nlohmann::json::parse(run.out).at("capture"), directory.path("\xef\xbf\xbd.npy"));
    EXPECT_EQ(run.exitCode, 0);
}

TEST(DecodeCommand, DecodesEveryTypeOfValuesAlike) {
    const TemporaryDirectory directory;
    const xt::xarray<std::int8_t> soft = shippedSoft("k40.soft.npy");
    const xt::xarray<std::int16_t> soft16 = soft;
    const xt::xarray<std::int32_t> soft32 = soft;
    xt::dump_npy(directory.path("int8.npy"), soft);
    xt::dump_npy(directory.path("int16.npy"), soft16);
    xt::dump_npy(directory.path("int32.npy"), soft32);
    const std::string out = directory.path("out.npy");
    for (const char* name : {"int8.npy", "int16.npy", "int32.npy"}) {
        const ToolRun run = runTool({"decode", directory.path(name), "-o", out});
        EXPECT_EQ(readFile(out), readFile(shipped("k40.decided.npy"))) << name;
        EXPECT_EQ(run.err, "") << name;
        EXPECT_EQ(run.exitCode, 0) << name;
    }
}

TEST(DecodeCommand, ReadsANpyHeaderOfEveryFormatVersionKeyOrderAndLength) {
    const TemporaryDirectory directory;
    const std::string data = readFile(shipped("k40.soft.npy")).substr(128);
    const std::string usual = npyHeader("|i1", "(400, 3, 44)");
    const std::vector<std::string> files = {
        rawNpy(usual, data, 2),
        rawNpy(usual, data, 3),
        rawNpy("{'shape': (400, 3, 44,), 'fortran_order': False, 'descr': '|i1'}", data),
        rawNpy(usual.substr(0, usual.size() - 1) + std::string(180, ' ') + '\n', data),
    };
    const std::string out = directory.path("out.npy");
    for (std::size_t i = 0; i < files.size(); ++i) {
        const ToolRun run = runTool({"decode", directory.write("in.npy", files[i]), "-o", out});
        EXPECT_EQ(run.exitCode, 0) << i << ": " << run.err;
        EXPECT_EQ(readFile(out), readFile(shipped("k40.decided.npy"))) << i;
    }
}

TEST(DecodeCommand, TellsAnNpyFileByItsFirstByteWhateverItsName) {
    const TemporaryDirectory directory;
    const std::string file = directory.write("capture", readFile(shipped("k40.soft.npy")));
    const ToolRun run = runTool({"decode", file, "--reference", shipped("k40.decided.npy"), "--json"});
    EXPECT_EQ(nlohmann::json::parse(run.out).at("bit_errors"), 0) << run.err;
}

TEST(DecodeCommand, ConfiguresTheCoreAsItsOptionsSay) {
    const auto capture = shippedSoft("k6144.soft.npy");
    const xt::xarray<int> block = xt::view(capture, xt::range(0, 1), xt::all(), xt::all());
    const TemporaryDirectory directory;
    xt::dump_npy(directory.path("capture.npy"), block);
    std::set<std::string> distinct;
    for (const int units : {2, 4, 8}) {
        for (const int algorithm : {0, 1, 2}) {
            for (const int iterations : {1, 2}) {
                vardel_ip_quarzel_generics generics;
                vardel_ip_quarzel_get_default_generics(&generics);
                generics.C_NUM_PU = units;
                generics.C_ALGORITHM_TYPE = algorithm;
                std::vector<unsigned char> bits(6144);
                vardel_ip_quarzel_outputs outputs{bits.data(), 6144, 0, 0};
                const vardel_ip_quarzel_inputs inputs{
                    block.data(), block.data() + 6148, block.data() + 2 * 6148, 6148, iterations, 0};
                vardel_ip_quarzel_state* state = vardel_ip_quarzel_create_state(generics);
                ASSERT_EQ(vardel_ip_quarzel_bitacc_simulate(state, &outputs, inputs), 0);
                vardel_ip_quarzel_destroy_state(state);
                distinct.emplace(bits.begin(), bits.end());

                const std::string out = directory.path("out.npy");
                const ToolRun run = runTool({"decode", directory.path("capture.npy"), "--units",
                                             std::to_string(units), "--algorithm", std::to_string(algorithm),
                                             "--iterations", std::to_string(iterations), "-o", out});
                ASSERT_EQ(run.exitCode, 0) << run.err;
                const auto packed = xt::load_npy<std::uint8_t>(out);
                ASSERT_EQ(packed.size(), 768U);
                for (std::size_t bit = 0; bit < bits.size(); ++bit) {
                    ASSERT_EQ(packed.flat(bit / 8) >> (7 - bit % 8) & 1, bits[bit])
                        << units << " units, algorithm " << algorithm << ", " << iterations
                        << " iterations, bit " << bit;
                }
            }
        }
    }
    EXPECT_EQ(distinct.size(), 18U) << "every choice must show in the decisions of this block";
}

TEST(DecodeCommand, GivesTheSameWhateverTheNumberOfThreads) {
    const TemporaryDirectory directory;
    xt::xarray<std::int16_t> soft = shippedSoft("k40.soft.npy");
    for (std::size_t block = 100; block < 400; ++block) {
        soft(block, block % 3, block % 44) = 300;
    }
    xt::dump_npy(directory.path("loud.npy"), soft);
    std::set<std::string> outputs;
    for (const char* threads : {"1", "2", "3", "8", "1024"}) {
        const std::string out = directory.path("out.npy");
        const ToolRun run = runTool({"decode", directory.path("loud.npy"), "--threads", threads, "-o", out});
        outputs.insert(readFile(out));
        EXPECT_EQ(
            run.err,
            "WARNING:decoder:RSC1 parity value in position 12 saturated positively, further saturation will "
            "not be reported\n")
            << threads;
        EXPECT_EQ(run.exitCode, 0) << threads;
    }
    EXPECT_EQ(outputs.size(), 1U);
}

TEST(DecodeCommand, DecidesAlikeWithEveryImplementation) {
    const TemporaryDirectory directory;
    const std::string out = directory.path("out.npy");
    ASSERT_EQ(implementations().back(), "literal");
    for (const std::string& name : implementations()) {
        const ToolRun run =
            runTool({"decode", shipped("k40.soft.npy"), "--implementation", name, "-o", out, "--json"});
        EXPECT_EQ(nlohmann::json::parse(run.out).at("implementation"), name) << run.err;
        EXPECT_EQ(readFile(out), readFile(shipped("k40.decided.npy"))) << name;
    }
}

TEST(DecodeCommand, NamesTheImplementationsThatThereAre) {
    std::string names;
    for (const std::string& name : implementations()) {
        names += (names.empty() ? "" : ",") + name;
    }
    const ToolRun run = runTool({"decode", shipped("k40.soft.npy"), "--implementation", "fast"});
    EXPECT_EQ(run.err,
              "quarzel: error: --implementation: fast not in {" + names + "}; see 'quarzel decode --help'\n");
    EXPECT_EQ(run.exitCode, 2);
}

TEST(DecodeCommand, KeepsResultsCleanWhenTheLibraryWarns) {
    const TemporaryDirectory directory;
    xt::xarray<std::int16_t> soft = shippedSoft("k40.soft.npy");
    soft(3, 1, 7) = 300;
    soft(5, 0, 0) = -300;
    const std::string file = directory.path("loud.npy");
    xt::dump_npy(file, soft);
    const ToolRun run = runTool({"decode", file, "--json"});
    EXPECT_EQ(maskTimes(run.out), jsonFor(file));
    EXPECT_EQ(run.err,
              "WARNING:decoder:RSC1 parity value in position 7 saturated positively, further saturation will "
              "not be "
              "reported\n");
    EXPECT_EQ(run.exitCode, 0);
}

}  // namespace quarzel::test
