// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <cstdio>
#include <filesystem>
#include <nlohmann/json.hpp>

#include "npy_data.hpp"
#include "run_tool.hpp"
#include "trace_cases.hpp"

namespace quarzel::test {

namespace {

/// Whether a run of the tool takes long: under the address sanitizer and emulated.
#if defined(__SANITIZE_ADDRESS__) || defined(QUARZEL_EMULATED)
constexpr bool runsTakeLong = true;
#else
constexpr bool runsTakeLong = false;
#endif

using Arguments = std::vector<std::string>;

Arguments operator+(Arguments first, const Arguments& second) {
    first.insert(first.end(), second.begin(), second.end());
    return first;
}

/// A value of a trace, as the rows for other programs give it.
struct Row {
    std::string block;
    std::string pass;
    std::string step;
    std::string signal;
    std::string state;
    int raw;
};

/// The values of a trace, read from its text.
std::vector<Row> rowsOf(const std::string& text) {
    const Arguments streams = {"code1_sys", "code1_par0", "code1_par1",
                               "code2_sys", "code2_par0", "code2_par1"};
    std::vector<Row> rows;
    int block = -1;
    std::size_t stream = streams.size();
    std::string pass;
    Arguments headings;
    for (const std::string& line : linesOf(text)) {
        if (line.starts_with("its")) {
            stream %= streams.size();
            block += stream == 0 ? 1 : 0;
            const std::size_t open = line.find("=[");
            int step = 0;
            for (const std::string& word : wordsOf(line.substr(open + 2, line.size() - open - 3))) {
                rows.push_back({std::to_string(block), "", std::to_string(step++), streams[stream], "",
                                std::stoi(word) / 16});
            }
            ++stream;
        } else if (line.starts_with("decode=")) {
            pass = line.substr(line.find("siso=") + 5);
        } else if (line.starts_with("n ")) {
            headings = wordsOf(line);
        } else if (line[0] != '-') {
            const Arguments words = wordsOf(line);
            for (std::size_t i = 1; i < words.size(); ++i) {
                const bool hasState = headings[i].size() == 2;
                rows.push_back(
                    {std::to_string(block), pass, words[0], hasState ? headings[i].substr(0, 1) : headings[i],
                     hasState ? headings[i].substr(1) : "", static_cast<int>(std::stod(words[i]) * 8)});
            }
        }
    }
    return rows;
}

std::string sixDecimals(int raw) {
    char text[32];
    std::snprintf(text, sizeof text, "%.6f", raw / 8.0);
    return text;
}

const char* const reportOfTwoBlocks =
    "block size    40 bits\n"
    "core          2 units, algorithm 1, 1 iteration\n"
    "blocks        2\n"
    "bits          80\n"
    "time          T s\n"
    "speed         S Mbit/s\n";

}  // namespace

TEST(TraceDecode, WritesEveryStoredTraceByteForByte) {
    const auto cases = traceCases();
    ASSERT_EQ(cases.size(), 8U);
    for (const TraceCase& trace : cases) {
        const TemporaryDirectory directory;
        const ToolRun run = runTool(trace.decodeFrom(directory));
        EXPECT_EQ(run.exitCode, 0) << trace.name << run.err;
        EXPECT_TRUE(run.out == trace.text) << trace.name;
    }
}

TEST(TraceDecode, WritesTheTraceOfACsvCaptureToo) {
    const TraceCase trace = smallTraceCase();
    const TemporaryDirectory directory;
    Arguments arguments = trace.decodeFrom(directory);
    std::string csv = "systematic,parity1,parity2\n";
    for (std::size_t block = 0; block < trace.blocks(); ++block) {
        csv += block > 0 ? "\n" : "";
        for (std::size_t position = 0; position < trace.soft.shape(2); ++position) {
            csv += std::to_string(trace.soft(block, 0, position)) + ',' +
                   std::to_string(trace.soft(block, 1, position)) + ',' +
                   std::to_string(trace.soft(block, 2, position)) + '\n';
        }
    }
    arguments[1] = directory.write("capture.csv", csv);
    EXPECT_EQ(runTool(arguments).out, trace.text);
}

TEST(TraceDecode, LeavesStandardOutputToTheTraceAndReportsOnStandardError) {
    const TraceCase trace = smallTraceCase();
    const TemporaryDirectory directory;
    const Arguments arguments = trace.decodeFrom(directory);
    for (const Arguments& file : {Arguments{}, {"--trace-file", "-"}}) {
        const ToolRun run = runTool(arguments + file);
        EXPECT_EQ(run.out, trace.text);
        EXPECT_EQ(maskTimes(run.err), "capture       " + arguments[1] + '\n' + reportOfTwoBlocks);
        EXPECT_EQ(run.exitCode, 0);
    }
}

TEST(TraceDecode, WritesAFileAndReportsOnStandardOutput) {
    const TraceCase trace = smallTraceCase();
    const TemporaryDirectory directory;
    const Arguments arguments = trace.decodeFrom(directory);
    const ToolRun run = runTool(arguments + Arguments{"--trace-file", directory.path("trace.txt")});
    EXPECT_EQ(readFile(directory.path("trace.txt")), trace.text);
    EXPECT_EQ(maskTimes(run.out), "capture       " + arguments[1] + '\n' + reportOfTwoBlocks);
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(directory.names(), (Arguments{"capture.npy", "trace.txt"})) << "nothing else may be left";
}

TEST(TraceDecode, WritesTheValuesOfTheTextAsCsv) {
    for (const TraceCase& trace : traceCases()) {
        std::string expected = "block,pass,step,signal,state,raw,real\n";
        for (const Row& row : rowsOf(trace.text)) {
            expected += row.block + ',' + row.pass + ',' + row.step + ',' + row.signal + ',' + row.state +
                        ',' + std::to_string(row.raw) + ',' + sixDecimals(row.raw) + '\n';
        }
        const TemporaryDirectory directory;
        const ToolRun run = runTool(trace.decodeFrom(directory) + Arguments{"--trace-format", "csv"});
        EXPECT_TRUE(run.out == expected) << trace.name;
    }
}

TEST(TraceDecode, WritesTheValuesOfTheTextAsJson) {
    const auto orNull = [](const std::string& number) { return number.empty() ? "null" : number; };
    for (const TraceCase& trace : traceCases()) {
        std::string expected;
        for (const Row& row : rowsOf(trace.text)) {
            expected += (expected.empty() ? "[\n" : ",\n");
            expected += "{\"block\":" + row.block + ",\"pass\":" + orNull(row.pass) +
                        ",\"step\":" + row.step + ",\"signal\":\"" + row.signal +
                        "\",\"state\":" + orNull(row.state) + ",\"raw\":" + std::to_string(row.raw) +
                        ",\"real\":" + sixDecimals(row.raw) + '}';
        }
        expected += "\n]\n";
        const TemporaryDirectory directory;
        const ToolRun run = runTool(trace.decodeFrom(directory) + Arguments{"--trace-format", "json"});
        EXPECT_TRUE(run.out == expected) << trace.name;
        EXPECT_TRUE(nlohmann::json::accept(run.out)) << trace.name;
    }
}

TEST(TraceDecode, ShowsAValueInEveryFormAlike) {
    const TraceCase trace = smallTraceCase();
    const TemporaryDirectory directory;
    const Arguments arguments = trace.decodeFrom(directory);
    const std::string csv = runTool(arguments + Arguments{"--trace-format", "csv"}).out;
    const std::string json = runTool(arguments + Arguments{"--trace-format", "json"}).out;
    const Arguments textRow = wordsOf(linesOf(trace.text).at(10));
    EXPECT_EQ(textRow.at(0), "0");
    EXPECT_EQ(textRow.at(1), "+0.750000") << "the intrinsic value of step 0";
    EXPECT_NE(csv.find("\n0,0,0,int,,6,0.750000\n"), std::string::npos);
    EXPECT_NE(json.find("\n{\"block\":0,\"pass\":0,\"step\":0,\"signal\":\"int\",\"state\":null,\"raw\":6,"
                        "\"real\":0.750000},\n"),
              std::string::npos);
}

TEST(TraceDecode, CanBeginAtALaterBlock) {
    const TraceCase trace = smallTraceCase();
    const TemporaryDirectory directory;
    Arguments arguments = trace.decodeFrom(directory);
    arguments.back() = "1";
    const ToolRun run = runTool(arguments + Arguments{"--trace-block", "1"});
    const std::size_t second = trace.text.find(std::string(120, '-') + "\nitsSys", 1);
    ASSERT_NE(second, std::string::npos);
    EXPECT_EQ(run.out, trace.text.substr(second));
    EXPECT_NE(run.out.find("\ndecode=1 siso=0\n"), std::string::npos);
}

TEST(TraceDecode, EndsWithTheCaptureWhenMorePassesAreWanted) {
    const TraceCase trace = smallTraceCase();
    const TemporaryDirectory directory;
    Arguments arguments = trace.decodeFrom(directory);
    arguments.back() = "4294967295";
    const ToolRun run = runTool(arguments);
    EXPECT_EQ(run.exitCode, 0) << run.err;
    EXPECT_TRUE(run.out.starts_with(trace.text));
    EXPECT_NE(run.out.find("\ndecode=1 siso=1\n"), std::string::npos);
}

TEST(TraceDecode, DecidesAsWithoutATrace) {
    const TemporaryDirectory directory;
    const std::string capture = shipped(runsTakeLong ? "k40.soft.npy" : "k6144.soft.npy");
    for (const char* units : {"2", "4", "8"}) {
        for (const char* algorithm : {"0", "1", "2"}) {
            const Arguments arguments = {"decode",      capture,   "--units", units,
                                         "--algorithm", algorithm, "-o",      directory.path("out.npy")};
            ASSERT_EQ(runTool(arguments).exitCode, 0);
            const std::string decided = readFile(directory.path("out.npy"));
            ASSERT_EQ(runTool(arguments + Arguments{"--trace", "1", "--trace-block", "23", "--trace-file",
                                                    directory.path("trace.txt")})
                          .exitCode,
                      0);
            EXPECT_TRUE(readFile(directory.path("out.npy")) == decided)
                << units << " units, algorithm " << algorithm;
        }
    }
}

TEST(TraceDecode, KeepsTheTraceCleanWhenTheLibraryWarns) {
    const TraceCase trace = smallTraceCase();
    const TemporaryDirectory directory;
    const Arguments arguments = trace.decodeFrom(directory);
    xt::xarray<std::int16_t> soft = trace.soft;
    soft(0, 0, 0) = 1000;
    xt::dump_npy(arguments[1], soft);
    const ToolRun run = runTool(arguments);
    EXPECT_TRUE(run.out.starts_with(std::string(120, '-') + "\nitsSys [0]=[2032 ")) << run.out.substr(0, 200);
    EXPECT_EQ(run.out.find("WARNING"), std::string::npos);
    EXPECT_TRUE(
        run.err.starts_with("WARNING:decoder:RSC1 systematic value in position 0 saturated positively"))
        << run.err;
}

TEST(TraceDecode, IsTheSameInEveryLanguageOfItsUser) {
    const TraceCase trace = smallTraceCase();
    const TemporaryDirectory directory;
    Arguments arguments = trace.decodeFrom(directory);
    arguments.insert(arguments.begin(), {"LC_ALL=de_DE.UTF-8", "LANG=tr_TR.UTF-8", QUARZEL_TOOL});
    EXPECT_EQ(runTool(arguments, {.program = "/usr/bin/env"}).out, trace.text);
}

TEST(TraceDecode, HoldsNoTraceInMemory) {
    if (runsTakeLong) {
        GTEST_SKIP() << "no limit of memory holds here";
    }
    const TemporaryDirectory directory;
    const std::string file = directory.path("trace");
    constexpr unsigned long memoryLimit = 48UL << 20;
    for (const auto& [form, passes] :
         {std::pair("text", "36"), {"csv", "14"}, {"json", "5"}, {"vcd", "24"}}) {
        const ToolRun run = runTool({"decode", shipped("k6144.soft.npy"), "--trace", passes, "--trace-file",
                                     file, "--trace-format", form},
                                    {.memoryLimit = memoryLimit});
        EXPECT_EQ(run.exitCode, 0) << run.err;
        EXPECT_GT(std::filesystem::file_size(file), memoryLimit) << form;
    }
}

TEST(TraceDecode, LeavesNoPartOfAFile) {
    const TemporaryDirectory directory;
    const std::string file = directory.write("trace.txt", "old");
    const ToolRun run = runTool({"decode", shipped("k40.soft.npy"), "--trace", "100", "--trace-file", file,
                                 "-o", directory.path("out.npy")},
                                {.fileSizeLimit = 100000});
    EXPECT_EQ(run.err, "quarzel: error: " + file +
                           ": cannot be written: File too large; raise the limit (ulimit -f)\n");
    EXPECT_EQ(run.exitCode, 3);
    EXPECT_EQ(readFile(file), "old");
    EXPECT_EQ(directory.names(), Arguments{"trace.txt"});
}

TEST(TraceDecode, TellsOfAFullDisk) {
    const Arguments arguments = {"decode", shipped("k40.soft.npy"), "--trace", "1", "--trace-format"};
    for (const char* form : {"text", "csv", "json", "vcd"}) {
        const ToolRun toFile = runTool(arguments + Arguments{form, "--trace-file", "/dev/full"});
        EXPECT_EQ(toFile.err,
                  "quarzel: error: /dev/full: cannot be written: No space left on device; free some space\n");
        EXPECT_EQ(toFile.exitCode, 3);
        const ToolRun toOutput = runTool(arguments + Arguments{form}, {.standardOutput = "/dev/full"});
        EXPECT_TRUE(toOutput.err.ends_with(
            "\nquarzel: error: standard output: cannot be written; free some space or send it elsewhere\n"))
            << toOutput.err;
        EXPECT_EQ(toOutput.exitCode, 3);
    }
}

TEST(TraceDecode, RefusesOptionsThatDoNotFit) {
    const TemporaryDirectory directory;
    const std::string capture = shipped("k40.soft.npy");
    const std::string file = directory.path("file");
    const std::vector<std::pair<Arguments, std::string>> cases = {
        {{"--trace", "0"}, "--trace: '0' is not a number from 1 to 4294967295; see 'quarzel decode --help'"},
        {{"--trace", "4294967296"},
         "--trace: '4294967296' is not a number from 1 to 4294967295; see 'quarzel decode --help'"},
        {{"--trace", "1", "--trace-block", "-1"},
         "--trace-block: '-1' is not a whole number; see 'quarzel decode --help'"},
        {{"--trace", "1", "--trace-block", "400"},
         "--trace-block: " + capture + " has no block 400; give a number from 0 to 399"},
        {{"--trace", "1", "--trace-format", "xml"},
         "--trace-format: xml not in {text,csv,json,vcd}; see 'quarzel decode --help'"},
        {{"--trace-file", file}, "--trace-file requires --trace; see 'quarzel decode --help'"},
        {{"--trace-format", "csv"}, "--trace-format requires --trace; see 'quarzel decode --help'"},
        {{"--trace-block", "2"}, "--trace-block requires --trace; see 'quarzel decode --help'"},
        {{"--trace", "1", "--json"},
         "--json: the trace goes to standard output; name a file for it with --trace-file"},
        {{"--trace", "1", "--trace-file", capture},
         "--trace-file: " + capture + " is also read; give another name"},
        {{"--trace", "1", "--trace-file", ""}, "--trace-file: the name of the file is empty; give one"},
        {{"--trace", "1", "--trace-file", file, "-o", directory.path("./file")},
         "--trace-file: " + file + " is also the output of -o; give another name"},
    };
    for (const auto& [options, message] : cases) {
        const ToolRun run = runTool(Arguments{"decode", capture} + options);
        EXPECT_EQ(run.err, "quarzel: error: " + message + '\n');
        EXPECT_EQ(run.out, "");
        EXPECT_EQ(run.exitCode, 2);
    }
    EXPECT_EQ(directory.names(), Arguments{});
}

}  // namespace quarzel::test
