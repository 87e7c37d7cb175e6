// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <sstream>

#include "captures/capture_file.hpp"
#include "npy_data.hpp"
#include "refusal.hpp"
#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

/// A capture that cannot be decoded, and what the tool says of it after "quarzel: error: ", its path and ":
/// ".
struct BadCapture {
    const char* title;
    std::string name;
    std::string content;
    std::string message;
};

void PrintTo(const BadCapture& bad, std::ostream* stream) {
    *stream << bad.title;
}

std::string npy(const std::string& type, const std::string& shape, std::size_t bytes = 0) {
    return rawNpy(npyHeader(type, shape), std::string(bytes, '\1'));
}

/// A capture in text of so many positions, with an empty line between blocks.
std::string csvLines(int positions, int blockLength) {
    std::string text = "systematic,parity1,parity2\n";
    for (int line = 0; line < positions; ++line) {
        text += line > 0 && line % blockLength == 0 ? "\n1,-2,3\n" : "1,-2,3\n";
    }
    return text;
}

/// Two blocks in text with one line, counted from 1, replaced.
std::string withLine(int number, const std::string& line) {
    std::string text = csvLines(88, 44);
    std::size_t begin = 0;
    for (int i = 1; i < number; ++i) {
        begin = text.find('\n', begin) + 1;
    }
    return text.replace(begin, text.find('\n', begin) - begin, line);
}

const std::string saveAgain = "; save the array again with numpy.save";
const std::string notUnderstood = "has an npy header that cannot be understood" + saveAgain;
const std::string noFormat =
    "has neither an npy header nor the CSV header systematic,parity1,parity2; give a capture in one of these "
    "formats";
const std::string realNumbers =
    "give --llr 4 when they are log-likelihood ratios, --scale S when they are samples";
const std::string wholeNumber =
    "; give a whole number of at most 32 bits, in units of 1/8; for real numbers " + realNumbers;
const std::string everyLine = "; give systematic,parity1,parity2 in every line";
const std::string cutShort = "; copy it again, it was cut short";
const std::string shapeOfCapture =
    "; a capture has shape (blocks, 3, K + 4), with systematic, parity 1, parity 2 in axis 1";
const std::string types =
    "; save soft values as int8, int16 or int32, real numbers as float32 or float64, little-endian";

const std::vector<BadCapture> badCaptures = {
    {"EmptyNpy", "a.npy", "", "ends within its npy header" + saveAgain},
    {"TextNamedNpy", "a.npy", "systematic,parity1,parity2\n", "is not an npy file" + saveAgain},
    {"Version4", "a.npy", rawNpy(npyHeader("|i1", "(1, 3, 44)"), "", 4),
     "has npy format version 4, which is unknown" + saveAgain},
    {"LongHeader", "a.npy", rawNpy(std::string(70000, ' '), "", 2),
     "has an npy header of 70000 bytes" + saveAgain},
    {"EmptyHeader", "a.npy", rawNpy(""), notUnderstood},
    {"HeaderOfSpaces", "a.npy", rawNpy(std::string(60000, ' ')), notUnderstood},
    {"NoShape", "a.npy", rawNpy("{'descr': '|i1', 'fortran_order': False}\n"), notUnderstood},
    {"NoOrder", "a.npy", rawNpy("{'descr': '|i1', 'shape': (1, 3, 44)}\n"), notUnderstood},
    {"NoType", "a.npy", rawNpy("{'fortran_order': False, 'shape': (1, 3, 44)}\n"), notUnderstood},
    {"OrderIsNoTruthValue", "a.npy", rawNpy(npyHeader("|i1", "(1, 3, 44)", "Maybe")), notUnderstood},
    {"TypeNotClosed", "a.npy", rawNpy("{'descr': '|i1"), notUnderstood},
    {"StructuredType", "a.npy", rawNpy("{'descr': [('a', '<i2')], 'fortran_order': False, 'shape': (1,)}\n"),
     "holds values of type 'record'" + types},
    {"NegativeShape", "a.npy", npy("|i1", "(-1, 3, 44)"), notUnderstood},
    {"ShapeBeyond64Bits", "a.npy", npy("|i1", "(99999999999999999999, 3, 44)"), notUnderstood},
    {"ShapeWithoutComma", "a.npy", npy("|i1", "(1 3 44)"), notUnderstood},
    {"ShapeNotClosed", "a.npy", rawNpy("{'descr': '|i1', 'fortran_order': False, 'shape': (1, 3,"),
     notUnderstood},
    {"TextAfterHeader", "a.npy", rawNpy(npyHeader("|i1", "(1, 3, 44)") + 'x'), notUnderstood},
    {"UnknownKey", "a.npy", rawNpy("{'color': 'red', 'descr': '|i1'}\n"), notUnderstood},
    {"Float", "a.npy", npy("<f4", "(1, 3, 44)", 528), "holds values of type '<f4'; " + realNumbers},
    {"Double", "a.npy", npy("<f8", "(1, 3, 44)", 1056), "holds values of type '<f8'; " + realNumbers},
    {"HalfFloat", "a.npy", npy("<f2", "(1, 3, 44)", 264), "holds values of type '<f2'" + types},
    {"BigEndianFloat", "a.npy", npy(">f4", "(1, 3, 44)", 528), "holds values of type '>f4'" + types},
    {"Int64", "a.npy", npy("<i8", "(1, 3, 44)", 1056), "holds values of type '<i8'" + types},
    {"Unsigned", "a.npy", npy("|u1", "(1, 3, 44)", 132), "holds values of type '|u1'" + types},
    {"BigEndian", "a.npy", npy(">i2", "(1, 3, 44)", 264), "holds values of type '>i2'" + types},
    {"FortranOrder", "a.npy", rawNpy(npyHeader("|i1", "(1, 3, 44)", "True"), std::string(132, '\1')),
     "is stored in Fortran order; save numpy.ascontiguousarray of the array"},
    {"NoDimension", "a.npy", npy("|i1", "()", 1), "has shape ()" + shapeOfCapture},
    {"OneDimension", "a.npy", npy("|i1", "(132,)", 132), "has shape (132,)" + shapeOfCapture},
    {"TwoDimensions", "a.npy", npy("|i1", "(3, 44)", 132), "has shape (3, 44)" + shapeOfCapture},
    {"StreamsLast", "a.npy", npy("|i1", "(1, 44, 3)", 132), "has shape (1, 44, 3)" + shapeOfCapture},
    {"FourDimensions", "a.npy", npy("|i1", "(1, 3, 44, 1)", 132), "has shape (1, 3, 44, 1)" + shapeOfCapture},
    {"NoBlocks", "a.npy", npy("|i1", "(0, 3, 44)"), "holds no block; record at least one"},
    {"NoPositions", "a.npy", npy("|i1", "(1, 3, 0)"),
     "blocks of 0 positions fit no block size; the nearest that do: 44 (K = 40)"},
    {"SizeWithoutTail", "a.npy", npy("|i1", "(1, 3, 40)", 120),
     "blocks of 40 positions fit no block size; the nearest that do: 44 (K = 40)"},
    {"SizeBetweenTwo", "a.npy", npy("|i1", "(1, 3, 1030)", 3090),
     "blocks of 1030 positions fit no block size; the nearest that do: 1028 (K = 1024), 1060 (K = 1056)"},
    {"SizeAboveAll", "a.npy", npy("|i1", "(1, 3, 6212)", 18636),
     "blocks of 6212 positions fit no block size; the nearest that do: 6148 (K = 6144)"},
    {"HugeSize", "a.npy", npy("<i4", "(1, 3, 18446744073709551615)"),
     "blocks of 18446744073709551615 positions fit no block size; the nearest that do: 6148 (K = 6144)"},
    {"NoData", "a.npy", npy("|i1", "(1, 3, 44)"), "ends within block 0 of 0 to 0" + cutShort},
    {"HugeNumberOfBlocks", "a.npy", npy("<i4", "(18446744073709551615, 3, 6148)", 100),
     "ends within block 0 of 0 to 18446744073709551614" + cutShort},
    {"OneByteShort", "a.npy", npy("<i2", "(3, 3, 44)", 791), "ends within block 2 of 0 to 2" + cutShort},
    {"OneByteLong", "a.npy", npy("<i2", "(3, 3, 44)", 793),
     "goes on after the end of its array; save one array a file"},
    {"EmptyText", "a.csv", "", noFormat},
    {"NoHeader", "a.csv", "1,2,3\n", noFormat},
    {"HeaderLacksColumn", "a.csv", "systematic,parity1\n1,2\n", noFormat},
    {"HeaderWithExtraColumn", "a.csv", "systematic,parity1,parity2,parity3\n1,2,3,4\n", noFormat},
    {"HeaderTwice", "a.csv", "systematic,systematic,parity1,parity2\n", noFormat},
    {"BinaryFile", "a.bin",
     std::string("\x7f"
                 "ELF\0\0\1",
                 7),
     "is neither an npy file nor text; give a capture in one of these formats"},
    {"ZeroByteInLine", "a.csv", withLine(5, std::string("1,2,3\0x", 7)),
     "is neither an npy file nor text; give a capture in one of these formats"},
    {"HeaderAlone", "a.csv", "systematic,parity1,parity2\n\n\n", "holds no block; record at least one"},
    {"TwoValues", "a.csv", withLine(7, "1,2"), "line 7: fewer than 3 values" + everyLine},
    {"FourValues", "a.csv", withLine(7, "1,2,3,4"), "line 7: more than 3 values" + everyLine},
    {"LongLine", "a.csv", withLine(7, std::string(1 << 24, '1')), "line 7: longer than 16 MiB" + everyLine},
    {"Letters", "a.csv", withLine(2, "1,2,x"), "line 2: parity2 is 'x'" + wholeNumber},
    {"Fraction", "a.csv", withLine(50, "1,0.5,3"), "line 50: parity1 is '0.5'" + wholeNumber},
    {"EmptyField", "a.csv", withLine(45, ",2,3"), "line 45: systematic is ''" + wholeNumber},
    {"Beyond32Bits", "a.csv", withLine(3, "2147483648,2,3"),
     "line 3: systematic is '2147483648'" + wholeNumber},
    {"BelowMinus32Bits", "a.csv", withLine(3, "1,2,-2147483649"),
     "line 3: parity2 is '-2147483649'" + wholeNumber},
    {"LongField", "a.csv", withLine(3, std::string(99, '1') + ",2,3"),
     "line 3: systematic is '11111111111111111111'" + wholeNumber},
    {"ControlCharacters", "a.csv", withLine(3, "1,\x1b[2J\r,3"), "line 3: parity1 is '?[2J?'" + wholeNumber},
    {"FirstBlockShort", "a.csv", csvLines(43, 44),
     "line 2: blocks of 43 positions fit no block size; the nearest that do: 44 (K = 40)"},
    {"SecondBlockShort", "a.csv", csvLines(87, 44),
     "line 47: blocks of 43 positions fit no block size; the nearest that do: 44 (K = 40)"},
    {"SecondBlockOfOtherSize", "a.csv", csvLines(44, 44) + '\n' + csvLines(52, 52).substr(27),
     "line 47: block 1, counted from 0, has 52 positions, the blocks before have 44; give blocks of one size "
     "a file"},
};

class BadCaptureTest : public testing::TestWithParam<BadCapture> {};

}  // namespace

TEST_P(BadCaptureTest, IsRefusedInOneLineThatTellsWhatIsWrong) {
    const BadCapture& bad = GetParam();
    std::istringstream stream(bad.content);
    EXPECT_EQ(refusalOf([&] { tool::readCapture(stream, bad.name); }),
              "quarzel: error: " + bad.name + ": " + bad.message + '\n');
}

INSTANTIATE_TEST_SUITE_P(, BadCaptureTest, testing::ValuesIn(badCaptures),
                         [](const auto& test) { return std::string(test.param.title); });

TEST(BadCapture, IsOneOfRealNumbersThatAreNone) {
    const auto refusal = [](const std::string& name, const std::string& content) {
        std::istringstream stream(content);
        return refusalOf([&] { tool::readCapture(stream, name, 4); });
    };
    const std::string ready = "; integers are soft values already; leave out --llr and --scale\n";
    EXPECT_EQ(refusal("a.npy", npy("|i1", "(1, 3, 44)", 132)),
              "quarzel: error: a.npy: holds values of type '|i1'" + ready);
    const std::string header = npyHeader("<f4", "(2, 3, 44)");
    EXPECT_EQ(
        refusal("a.npy", rawNpy(header, std::string(528, '\1') + std::string(528, '\xff'))),
        "quarzel: error: a.npy: block 1 of 0 to 1 has values that are not a number (NaN); give 0 for a bit "
        "that is unknown\n");
    EXPECT_EQ(refusal("a.npy", rawNpy(header, std::string(1000, '\1'))),
              "quarzel: error: a.npy: ends within block 1 of 0 to 1" + cutShort + '\n');
    for (const std::string field : {"nan", "1.5x", "1e999", ""}) {
        EXPECT_EQ(refusal("a.csv", withLine(3, "1," + field + ",-0.5")),
                  "quarzel: error: a.csv: line 3: parity1 is '" + field +
                      "'; give a real number, 0 for a bit that is unknown\n");
    }
}

TEST(BadCapture, LeavesNoOutputAndTakesNoMemoryForWhatItOnlyClaimsToHold) {
    for (const BadCapture& bad : badCaptures) {
        if (bad.title != std::string("HugeNumberOfBlocks") && bad.title != std::string("LongLine")) {
            continue;
        }
        const TemporaryDirectory directory;
        const std::string file = directory.write(bad.name, bad.content);
        const ToolRun run = runTool({"decode", file, "-o", directory.path("out.npy"), "--json"},
                                    {.memoryLimit = 256UL << 20});
        EXPECT_EQ(run.err, "quarzel: error: " + file + ": " + bad.message + '\n');
        EXPECT_EQ(run.out, "");
        EXPECT_EQ(run.exitCode, 3);
        EXPECT_EQ(directory.names(), std::vector<std::string>{bad.name}) << "no output may be left";
    }
}

TEST(BadCapture, MayNotBeMissing) {
    const TemporaryDirectory directory;
    const std::string file = directory.path("none.npy");
    const ToolRun run = runTool({"decode", file});
    EXPECT_EQ(run.err,
              "quarzel: error: " + file + ": cannot be opened: No such file or directory; check the name\n");
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(run.exitCode, 3);
}

TEST(BadCapture, MayNotBeUnreadable) {
    if (::geteuid() == 0) {
        GTEST_SKIP() << "nothing is unreadable for the superuser";
    }
    const TemporaryDirectory directory;
    const std::string file = directory.write("capture.npy", "");
    std::filesystem::permissions(file, std::filesystem::perms::none);
    const ToolRun run = runTool({"decode", file});
    EXPECT_EQ(run.err,
              "quarzel: error: " + file + ": cannot be opened: Permission denied; make it readable\n");
    EXPECT_EQ(run.exitCode, 3);
}

TEST(BadCapture, MayNotBeADirectory) {
    const TemporaryDirectory directory;
    const ToolRun run = runTool({"decode", directory.path("")});
    EXPECT_EQ(run.err,
              "quarzel: error: " + directory.path("") + ": is a directory; give the name of a file\n");
    EXPECT_EQ(run.exitCode, 3);
}

TEST(BadCapture, IsNamedInOneLineEvenIfItsNameHasTwo) {
    const ToolRun run = runTool({"decode", "two\nlines"});
    EXPECT_EQ(run.err,
              "quarzel: error: two?lines: cannot be opened: No such file or directory; check the name\n");
    EXPECT_EQ(run.exitCode, 3);
}

}  // namespace quarzel::test
