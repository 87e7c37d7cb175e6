// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <regex>
#include <sstream>

#include "npy_data.hpp"
#include "refusal.hpp"
#include "run_tool.hpp"
#include "support/random.hpp"
#include "trace/trace_comparison.hpp"
#include "trace_cases.hpp"

namespace quarzel::test {

namespace {

/// The small trace in the forms that the tool writes, and what a simulation may give in its place.
class TraceFormsCompared : public testing::Test {
  protected:
    /// The trace as the tool writes it.
    std::string traceAs(const std::string& form) const {
        std::vector<std::string> arguments = smallTraceCase().decodeFrom(itsDirectory);
        arguments.insert(arguments.end(), {"--trace-format", form});
        return runTool(arguments).out;
    }

    /// Compare the text with a trace in another form.
    ToolRun compareWith(const std::string& other, std::vector<std::string> options = {}) const {
        itsDirectory.write("b", other);
        options.insert(options.begin(), {"trace-diff", a, b});
        return runTool(options);
    }

    nlohmann::json reportOf(const std::string& other, std::vector<std::string> options = {}) const {
        options.emplace_back("--json");
        const ToolRun run = compareWith(other, options);
        EXPECT_EQ(run.err, "");
        return nlohmann::json::parse(run.out, nullptr, false);
    }

    void expectRefused(const std::string& other, const std::string& problem) const {
        const ToolRun run = compareWith(other);
        EXPECT_EQ(run.err, "quarzel: error: " + b + ": " + problem + '\n');
        EXPECT_EQ(run.out, "");
        EXPECT_EQ(run.exitCode, 3);
    }

    /// Some rows of the CSV form of block 0.
    std::vector<std::string> rows(const std::string& pass, const std::string& signal) const {
        std::vector<std::string> chosen;
        for (const std::string& row : linesOf(itsCsv)) {
            if (row.starts_with("0," + pass + ',') && row.find(',' + signal + ',') != std::string::npos) {
                chosen.push_back(row);
            }
        }
        return chosen;
    }

    /// The raw values of a signal in a pass of block 0.
    std::vector<int> valuesOf(const std::string& pass, const std::string& signal) const {
        std::vector<int> values;
        for (const std::string& row : rows(pass, signal)) {
            const std::string front = row.substr(0, row.rfind(','));
            values.push_back(std::stoi(front.substr(front.rfind(',') + 1)));
        }
        return values;
    }

    const TemporaryDirectory itsDirectory;
    const std::string itsText = smallTraceCase().text;
    const std::string itsCsv = traceAs("csv");
    const std::string a = itsDirectory.write("a", itsText);
    const std::string b = itsDirectory.path("b");
    const std::string header = linesOf(itsCsv)[0] + '\n';
};

}  // namespace

TEST_F(TraceFormsCompared, AreEqualWhateverTheForms) {
    for (const char* formOfA : {"text", "csv", "json", "vcd"}) {
        const std::string first = itsDirectory.write("first", traceAs(formOfA));
        for (const char* formOfB : {"text", "csv", "json", "vcd"}) {
            const std::string second = itsDirectory.write("second", traceAs(formOfB));
            const ToolRun run = runTool({"trace-diff", first, second});
            EXPECT_TRUE(
                run.out.ends_with("\nresult        the traces are equal\n"
                                  "compared      2 blocks, 3 passes: soft inputs, int, g, a, b, llr, ext\n"))
                << formOfA << ' ' << formOfB << run.out << run.err;
        }
    }
}

TEST_F(TraceFormsCompared, TakeRowsInAnyOrder) {
    std::mt19937 random = seededRandom();
    std::vector<std::string> rows = linesOf(itsCsv);
    std::vector<std::string> block0;
    for (const std::string& row : rows) {
        if (row.starts_with("0,")) {
            block0.push_back(row);
        }
    }
    std::shuffle(block0.begin(), block0.end(), random);
    const nlohmann::json report = reportOf(header + textOf(block0), {"--block", "0"});
    EXPECT_EQ(report["equal"], true);
    EXPECT_EQ(report["values"], 6 * 43 + 2 * 23 * 43);
}

TEST_F(TraceFormsCompared, CompareTheSignalsAndPassesThatBothTell) {
    const nlohmann::json report =
        reportOf("step,pass,llr\n" +
                     [this] {
                         std::string csv;
                         const std::vector<int> values = valuesOf("1", "llr");
                         for (std::size_t step = values.size(); step-- > 0;) {
                             csv += std::to_string(step) + ",1, " + std::to_string(values[step]) + '\n';
                         }
                         return csv;
                     }(),
                 {"--block", "0"});
    EXPECT_EQ(report["equal"], true);
    EXPECT_EQ(report["passes"], 1);
    EXPECT_EQ(report["values"], 43);
}

TEST_F(TraceFormsCompared, ReadJsonLinesWithArrays) {
    std::string lines;
    const std::vector<int> a0 = valuesOf("1", "a");
    const std::vector<int> ext = valuesOf("1", "ext");
    for (std::size_t step = 0; step < 43; ++step) {
        const nlohmann::json row = {
            {"block", 0},
            {"pass", 1},
            {"step", step},
            {"a", std::vector<int>(a0.begin() + 8 * static_cast<std::ptrdiff_t>(step),
                                   a0.begin() + 8 * static_cast<std::ptrdiff_t>(step + 1))},
            {"ext", ext[step]}};
        lines += row.dump() + '\n';
    }
    const nlohmann::json report = reportOf(lines, {"--block", "0"});
    EXPECT_EQ(report["equal"], true);
    EXPECT_EQ(report["values"], 9 * 43);
}

TEST_F(TraceFormsCompared, ReadStructuredArrays) {
    std::string data;
    const std::vector<int> llr = valuesOf("0", "llr");
    const std::vector<int> g = valuesOf("0", "g");
    const auto append = [&data](int value) {
        data += static_cast<char>(value & 0xff);
        data += static_cast<char>(value >> 8 & 0xff);
    };
    for (std::size_t step = 43; step-- > 0;) {
        append(0);
        append(static_cast<int>(step));
        for (std::size_t i = 0; i < 4; ++i) {
            append(g[4 * step + i]);
        }
        append(llr[step]);
    }
    const std::string npy = rawNpy(
        "{'descr': [('pass', '<u2'), ('step', '<u2'), ('g', '<i2', (4,)), ('llr', '<i2')], "
        "'fortran_order': False, 'shape': (43,), }\n");
    const nlohmann::json report = reportOf(npy + data, {"--block", "0", "--passes", "0"});
    EXPECT_EQ(report["equal"], true);
    EXPECT_EQ(report["values"], 5 * 43);
    expectRefused(npy + data.substr(0, data.size() - 1), "ends within row 42; expected 43 rows");
    expectRefused(npy + data + "x", "goes on after the end of its array; save one array a file");
    expectRefused(
        rawNpy("{'descr': [('pass', '<u2'), ('llr', '<i2')], 'fortran_order': False, 'shape': (1,), }"),
        "has no field step; save a structured array with the fields step, pass and the signals' names, "
        "such as llr");
    expectRefused(
        rawNpy(npyHeader("<i2", "(43, 23)")),
        "holds values of type '<i2' without fields; save a structured array with the fields step, pass "
        "and the signals' names, such as llr");
}

TEST_F(TraceFormsCompared, ShowUnknownValuesAndTakeThemForDifferent) {
    const std::vector<std::pair<std::string, std::string>> unknown = {
        {"x", "x"},   {"X", "x"}, {"xxxxxxxxx", "x"}, {"12'hxxx", "x"}, {"0110xx01", "x"},
        {"zx1", "x"}, {"z", "z"}, {"ZZZ", "z"},       {"'z", "z"}};
    const std::vector<std::string> original = rows("0", "llr");
    for (const auto& [text, shown] : unknown) {
        std::vector<std::string> changed = original;
        changed[7] = "0,0,7,llr,," + text + ",";
        const nlohmann::json report = reportOf(header + textOf(changed), {"--block", "0", "--passes", "0"});
        EXPECT_EQ(report["step"], 7) << text;
        EXPECT_EQ(report["value_b"]["raw"], shown) << text;
        EXPECT_EQ(report["differ"], 1) << text;
        EXPECT_EQ(report["recomputed"][0],
                  "llr of step 7 is " + shown + " instead of " + std::to_string(valuesOf("0", "llr")[7]));
    }
    std::vector<std::string> lines = linesOf(itsText);
    lines[12] = std::regex_replace(lines[12], std::regex("[+-][0-9.]+ *$"), "xxxxxxxxx");
    const nlohmann::json report = reportOf(textOf(lines));
    EXPECT_EQ(report["signal"], "ext");
    EXPECT_EQ(report["value_b"]["raw"], "x");
    EXPECT_EQ(report["value_b"]["line"], 13);
}

TEST_F(TraceFormsCompared, ReadNumbersAsRawOrRealOnDemand) {
    std::string raw = "pass,step,llr\n";
    std::string real = raw;
    const std::vector<int> values = valuesOf("0", "llr");
    for (std::size_t step = 0; step < values.size(); ++step) {
        raw += "0," + std::to_string(step) + ',' + std::to_string(values[step]) + '\n';
        real += "0," + std::to_string(step) + ',' + std::to_string(values[step] / 8.0) + '\n';
    }
    EXPECT_EQ(reportOf(raw, {"--block", "0", "--passes", "0"})["equal"], true);
    EXPECT_EQ(reportOf(raw, {"--block", "0", "--passes", "0", "--units", "raw"})["equal"], true);
    EXPECT_EQ(reportOf(real, {"--block", "0", "--passes", "0", "--units", "real"})["equal"], true);
    std::vector<std::string> lines = linesOf(itsText);
    for (std::string& line : lines) {
        std::smatch match;
        std::string changed;
        while (std::regex_search(line, match, std::regex("[+-][0-9]+\\.[0-9]+"))) {
            changed += match.prefix().str() + std::to_string(static_cast<int>(std::stod(match.str()) * 8));
            line = match.suffix();
        }
        line = changed + line;
    }
    EXPECT_EQ(reportOf(textOf(lines), {"--units", "raw"})["equal"], true);
}

TEST_F(TraceFormsCompared, ChooseBlocksSignalsAndPasses) {
    std::vector<std::string> lines = linesOf(itsText);
    lines[20] = std::regex_replace(lines[20], std::regex("\\+"), "-");
    const std::string changed = textOf(lines);
    EXPECT_EQ(reportOf(changed)["equal"], false);
    EXPECT_EQ(reportOf(changed, {"--block", "1"})["equal"], true);
    EXPECT_EQ(reportOf(changed, {"--passes", "1", "--block", "0"})["equal"], true);
    const nlohmann::json one = reportOf(changed, {"--signals", "b3,ext", "--passes", "0-1", "--block", "0"});
    EXPECT_EQ(one["signal"], "b");
    EXPECT_EQ(one["state"], 3);
    EXPECT_EQ(one["values"], 4 * 43);
}

TEST_F(TraceFormsCompared, MatchASingleBlockWhateverItsNumber) {
    std::vector<std::string> lines = linesOf(itsText);
    lines.resize(99);
    itsDirectory.write("a", textOf(lines));
    for (const std::size_t heading : {8U, 54U}) {
        lines[heading].replace(0, 8, "decode=5");
    }
    const nlohmann::json report = reportOf(textOf(lines));
    EXPECT_EQ(report["equal"], true);
    EXPECT_EQ(report["blocks"], 1);
}

TEST_F(TraceFormsCompared, RefuseWhatIsNoTraceOrNotWhole) {
    const std::string rest = "expected steps 0 to 42, with the termination steps";
    std::vector<std::string> llr = rows("0", "llr");
    llr.erase(llr.begin() + 12);
    const std::vector<std::pair<std::string, std::string>> faults = {
        {header, "holds no value; expected rows of a trace"},
        {header + textOf(llr), "lines 2 to 43 hold pass 0 of block 0 without llr of step 12; " + rest},
        {header + "0,0,50,llr,,3,\n", "lines 2 to 2 hold pass 0 of block 0 with step 50; " + rest},
        {header + "0,0,9000,llr,,3,\n", "line 2 is of step 9000; expected a step from 0 to 6146"},
        {header + "0,0,1,llr,,3,\n0,0,1,llr,,4,\n",
         "line 3 tells llr of step 1 in pass 0 of block 0 again, with another value; expected each value "
         "once"},
        {header + "0,0,1,llr,,3\n", "line 2 is a row of 6 values; expected 7, as in the header"},
        {header + "0,0,1,llr,,3,",
         "line 2 is cut short after '0,0,1,llr,,3,'; expected 7 values and a line end"},
        {header + "0,0,1,llr,,1.5,\n",
         "line 2, column 6 is '1.5'; expected a whole number from -2048 to 2047, x or z"},
        {header + "0,0,1,llr,,2048,\n",
         "line 2, column 6 is '2048'; expected a whole number from -2048 to 2047, x or z"},
        {header + "0,0,1,llr,,0x1f,\n",
         "line 2, column 6 is '0x1f'; expected a whole number from -2048 to 2047, x or z"},
        {header + "0,0,-1,llr,,3,\n", "line 2, column 3 is '-1'; expected a whole number from 0 on"},
        {header + "0,0,1,lr,,3,\n",
         "line 2, column 4 is 'lr'; expected int, a, b, g, llr, ext or code1_sys to code2_par1"},
        {header + "0,0,1,a,8,3,\n",
         "line 2 has no state 8 of signal a; give step, pass, and signal and value, or columns named as "
         "signals"},
        {header + "0,,1,llr,,3,\n",
         "line 2 has no pass; give step, pass, and signal and value, or columns named as signals"},
        {"pass,step,lr\n",
         "line 1, column 3 is 'lr'; expected one of block, pass, step, signal, state, raw, real, value, int, "
         "a0 "
         "to a7, b0 to b7, g4 to g7, llr, ext, code1_sys to code2_par1"},
        {"{\"pass\":0,\"step\":1,\"lr\":2}\n",
         "line 1 is an object with a member 'lr'; expected one of block, pass, step, signal, state, raw, "
         "real, "
         "value, int, a0 to a7, b0 to b7, g4 to g7, llr, ext, code1_sys to code2_par1"},
        {"{\"pass\":0,\"step\":1,\"llr\":2\n",
         "line 1 is '{\"pass\":0,\"step\":1,\"llr\":2'; expected an object with step and value on a line"},
        {"[\n{\"pass\":0,\"step\":1,\"llr\":2}\n",
         "ends before line 3; expected an object with step and value, or the end of the array, on a line"},
        {"$timescale 1ns $end\n", "ends before line 2; expected $enddefinitions $end"},
        {"$enddefinitions $end\n#0\n",
         "has no variable pass; expected waves as 'quarzel decode --trace-format vcd' writes them"},
    };
    for (const auto& [content, problem] : faults) {
        expectRefused(content, problem);
    }
}

TEST_F(TraceFormsCompared, NeverTakeATraceThatIsCutOffForAWholeOne) {
    for (const char* form : {"text", "csv", "json", "vcd"}) {
        const std::string whole = traceAs(form);
        for (std::size_t size = 0; size < whole.size(); size += 997) {
            std::istringstream streamA(itsText);
            std::istringstream streamB(whole.substr(0, size));
            bool isEqual = false;
            const std::string refusal = refusalOf([&] {
                tool::TraceBlockReader readerA(tool::makeTraceReader(streamA, "a", std::nullopt));
                tool::TraceBlockReader readerB(tool::makeTraceReader(streamB, "b", std::nullopt));
                isEqual = !tool::compareTraces(readerA, readerB, {}).first;
            });
            EXPECT_FALSE(isEqual) << form << ' ' << size;
            EXPECT_EQ(std::count(refusal.begin(), refusal.end(), '\n'), refusal.empty() ? 0 : 1);
        }
    }
}

TEST_F(TraceFormsCompared, RefuseOptionsThatDoNotFit) {
    const std::vector<std::pair<std::vector<std::string>, std::string>> wrong = {
        {{"--signals", "lr"},
         "--signals: 'lr' is not a signal: int, a, b, g, llr, ext, one of their columns such as a3, or "
         "code1_sys to "
         "code2_par1"},
        {{"--passes", "3-"}, "--passes: '3-' is not a pass from 0 to 29 or a range of them such as 2-5"},
        {{"--passes", "30"}, "--passes: '30' is not a pass from 0 to 29 or a range of them such as 2-5"},
        {{"--units", "bits"}, "--units: bits not in {raw,real}"},
        {{"--block", "-1"}, "--block: '-1' is not a number from 0 on"},
    };
    for (const auto& [options, message] : wrong) {
        const ToolRun run = compareWith(itsText, options);
        EXPECT_EQ(run.err, "quarzel: error: " + message + "; see 'quarzel trace-diff --help'\n");
        EXPECT_EQ(run.exitCode, 2);
    }
    const std::vector<std::pair<std::vector<std::string>, std::string>> absent = {
        {{"--block", "2"}, a + ": holds no block 2; give a block that it holds; they count from 0"},
        {{"--passes", "1"}, a + ": has no pass 1 of block 1; give passes that both traces have"},
    };
    for (const auto& [options, message] : absent) {
        const ToolRun run = compareWith(itsText, options);
        EXPECT_EQ(run.err, "quarzel: error: " + message + '\n');
        EXPECT_EQ(run.exitCode, 3);
    }
}

}  // namespace quarzel::test
