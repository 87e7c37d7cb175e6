// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "npy_data.hpp"
#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

/// Two blocks of 40 bits that are expected, and the directory for what is compared with them.
class CompareCommand : public testing::Test {
  protected:
    CompareCommand() {
        xt::xarray<std::uint8_t> packed = {{0xa5, 0, 0xff, 0x0f, 1}, {0x80, 0x40, 0x20, 0x10, 8}};
        xt::dump_npy(itsExpected, packed);
        for (const std::uint8_t byte : packed) {
            for (unsigned shift = 8; shift-- > 0;) {
                itsBits.push_back(byte >> shift & 1U);
            }
        }
    }

    /// The expected bits as a memory text, one a line.
    std::vector<std::string> words() const {
        std::vector<std::string> words;
        for (const unsigned bit : itsBits) {
            words.push_back(std::to_string(bit));
        }
        return words;
    }

    ToolRun compare(const std::vector<std::string>& words, const std::vector<std::string>& options = {}) {
        std::string text;
        for (const std::string& word : words) {
            text += word + '\n';
        }
        return compareFile(itsDirectory.write("sim.hex", text), options);
    }

    ToolRun compareFile(const std::string& file, const std::vector<std::string>& options = {}) {
        std::vector<std::string> arguments = {"compare", itsExpected, file};
        arguments.insert(arguments.end(), options.begin(), options.end());
        return runTool(arguments);
    }

    void expectRefused(const ToolRun& run, const std::string& message) {
        EXPECT_EQ(run.err, "quarzel: error: " + message + '\n');
        EXPECT_EQ(run.out, "");
        EXPECT_EQ(run.exitCode, 3);
    }

    /// What begins the report when the decisions differ.
    std::string reportOf(const std::string& file) const {
        return "expected      " + itsExpected + "\nactual        " + itsDirectory.path(file) + '\n';
    }

    TemporaryDirectory itsDirectory;
    std::string itsExpected = itsDirectory.path("expected.npy");
    std::vector<unsigned> itsBits;
};

}  // namespace

TEST_F(CompareCommand, FindsEqualDecisionsEqualInEveryForm) {
    const std::string equal = "result        the decisions are equal\ncompared      2 blocks, 80 bits\n";
    const ToolRun text = compare(words());
    EXPECT_EQ(text.out, reportOf("sim.hex") + equal);
    EXPECT_EQ(text.err, "");
    EXPECT_EQ(text.exitCode, 0);

    const std::array<std::size_t, 1> flat = {80};
    const std::array<std::size_t, 2> byBlock = {2, 40};
    xt::dump_npy(itsDirectory.path("bytes.npy"), xt::cast<std::uint8_t>(xt::adapt(itsBits, byBlock)));
    xt::dump_npy(itsDirectory.path("longs.npy"), xt::cast<std::int64_t>(xt::adapt(itsBits, flat)));
    xt::dump_npy(itsDirectory.path("bools.npy"), xt::cast<bool>(xt::adapt(itsBits, flat)));
    for (const char* const file : {"expected.npy", "bytes.npy", "longs.npy", "bools.npy"}) {
        const ToolRun run = compareFile(itsDirectory.path(file));
        EXPECT_EQ(run.out, reportOf(file) + equal) << run.err;
        EXPECT_EQ(run.exitCode, 0);
    }
}

TEST_F(CompareCommand, NamesTheFirstBlockAndBitThatDifferAndCounts) {
    std::vector<std::string> wrong = words();
    wrong[47] = "1";
    wrong[48] = "xx";
    wrong[60] = "z";
    const ToolRun run = compare(wrong);
    EXPECT_EQ(run.out, reportOf("sim.hex") +
                           "result        the decisions differ\n"
                           "block         1 of 0 to 1 (K = 40)\n"
                           "bit           7 of 0 to 39\n"
                           "expected bit  0\n"
                           "actual bit    1, address @2f, line 48\n"
                           "blocks        1 of 2 differ: 1\n"
                           "bits          3 of 80 differ: 1 wrong, 1 undefined (x), 1 undriven (z)\n"
                           "by K          40: 1 of 2\n"
                           "by place      0 2 0 0 1 0 0 0 bits in the eighths of a block\n");
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.exitCode, 1);
}

TEST_F(CompareCommand, NamesWhatStandsInThePlaceOfABit) {
    for (const auto& [word, text] : std::vector<std::pair<std::string, std::string>>{
             {"0x", "x, undefined"}, {"Z", "z, undriven"}, {"1f", "1f (hexadecimal), which is not a bit"}}) {
        std::vector<std::string> wrong = words();
        wrong[3] = word;
        const ToolRun run = compare(wrong);
        EXPECT_NE(run.out.find("bit           3 of 0 to 39\n"
                               "expected bit  0\n"
                               "actual bit    " +
                               text + ", address @3, line 4\n"),
                  std::string::npos)
            << run.out;
        EXPECT_EQ(run.exitCode, 1);
    }
}

TEST_F(CompareCommand, CountsDecisionsThatAreMissing) {
    std::vector<std::string> fewer = words();
    fewer.resize(38);
    const ToolRun run = compare(fewer);
    EXPECT_EQ(run.out, reportOf("sim.hex") +
                           "result        the decisions differ\n"
                           "block         0 of 0 to 1 (K = 40)\n"
                           "bit           38 of 0 to 39\n"
                           "expected bit  0\n"
                           "actual bit    missing, address @26\n"
                           "blocks        2 of 2 differ: 0, 1\n"
                           "bits          42 of 80 differ: 42 missing\n"
                           "by K          40: 2 of 2\n"
                           "by place      5 5 5 5 5 5 5 7 bits in the eighths of a block\n");
    EXPECT_EQ(run.exitCode, 1);
}

TEST_F(CompareCommand, DoesNotAcceptDecisionsThatAreTooMany) {
    std::vector<std::string> more = words();
    more.emplace_back("0");
    const ToolRun run = compare(more);
    EXPECT_EQ(run.out, reportOf("sim.hex") +
                           "result        the decisions are equal, but go on after the last\n"
                           "blocks        0 of 2 differ\n"
                           "bits          0 of 80 differ\n"
                           "too many      1 word after the last decision expected\n");
    EXPECT_EQ(run.exitCode, 1);
}

TEST_F(CompareCommand, TellsTheSameInJson) {
    std::vector<std::string> wrong = words();
    wrong[47] = "x";
    const ToolRun run = compare(wrong, {"--json"});
    EXPECT_EQ(run.exitCode, 1);
    const nlohmann::json object = nlohmann::json::parse(run.out);
    EXPECT_EQ(object.at("equal"), false);
    EXPECT_EQ(object.at("bits_differing"), 1);
    EXPECT_EQ(object.at("undefined"), 1);
    EXPECT_EQ(object.at("first"), nlohmann::json::parse(R"({"block": 1, "block_size": 40, "about": null,
        "bit": 7, "value_expected": 0, "value_actual": "x", "address": 47, "line": 48,
        "trace_command": null})"));
    EXPECT_EQ(nlohmann::json::parse(compare(words(), {"--json"}).out).at("first"), nullptr);
}

TEST_F(CompareCommand, RefusesWhatItCannotRead) {
    const std::string text = itsDirectory.write("sim.hex", "1\nno\n");
    expectRefused(compareFile(text), text +
                                         ": line 2: holds 'n', which is not a hexadecimal digit; write the "
                                         "memory with $writememh, a decision a word");
    const std::string npy = itsDirectory.path("reals.npy");
    xt::dump_npy(npy, xt::xarray<float>::from_shape({80}));
    expectRefused(compareFile(npy), npy +
                                        ": holds values of type '<f4'; save truth values or little-endian "
                                        "integers, with numpy's astype('u1') for example");
    const std::string cut = itsDirectory.write("cut.npy", rawNpy(npyHeader("|u1", "(80,)"), "1"));
    expectRefused(compareFile(cut), cut + ": ends within its array; copy it again, it was cut short");
    const std::string huge =
        itsDirectory.write("huge.npy", rawNpy(npyHeader("|u1", "(4294967296, 4294967296, 4294967296)"), "1"));
    expectRefused(compareFile(huge),
                  huge +
                      ": has shape (4294967296, 4294967296, 4294967296); save the array again with "
                      "numpy.save");
}

TEST_F(CompareCommand, RefusesAnExpectationThatIsNone) {
    const std::string actual = itsDirectory.write("sim.hex", "0");
    const std::string remedy = "; name the directory of a core that 'quarzel vectors' made";
    expectRefused(runTool({"compare", actual, actual}),
                  actual + ": is neither packed bits (.npy) nor a memory of a vector set" + remedy);
    const std::string directory = itsDirectory.path(".");
    expectRefused(runTool({"compare", directory, actual}),
                  directory + ": is not part of a vector set" + remedy);
    const std::string npy =
        itsDirectory.write("odd.npy", rawNpy(npyHeader("|u1", "(1, 131)"), std::string(131, 0)));
    expectRefused(
        runTool({"compare", npy, actual}),
        npy +
            ": has shape (1, 131); expected bits have shape (blocks, K/8), 8 to a byte, as 'quarzel "
            "decode -o' makes them");
}

}  // namespace quarzel::test
