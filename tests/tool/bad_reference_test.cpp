// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <sstream>

#include "captures/bits_file.hpp"
#include "npy_data.hpp"
#include "refusal.hpp"
#include "run_tool.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

/// A reference that does not go with the shipped capture of 400 small blocks, and what the tool says of it.
struct BadReference {
    const char* title;
    std::string content;
    std::string message;
};

void PrintTo(const BadReference& bad, std::ostream* stream) {
    *stream << bad.title;
}

std::string npy(const std::string& type, const std::string& shape, std::size_t bytes) {
    return rawNpy(npyHeader(type, shape), std::string(bytes, '\1'));
}

const std::string shape = "; for this capture it must be (400, 5), that is (blocks, K/8)";

const std::vector<BadReference> badReferences = {
    {"NoNpy", "1,0,1,0,1,0,1,0\n", "is not an npy file; save the array again with numpy.save"},
    {"SignedType", npy("|i1", "(400, 5)", 2000),
     "holds values of type '|i1'; save bits as uint8 with numpy.packbits(bits, axis=1)"},
    {"FortranOrder", rawNpy(npyHeader("|u1", "(400, 5)", "True"), std::string(2000, '\1')),
     "is stored in Fortran order; save numpy.ascontiguousarray of the array"},
    {"FewerBlocks", npy("|u1", "(399, 5)", 1995), "has shape (399, 5)" + shape},
    {"BitsNotPacked", npy("|u1", "(400, 40)", 16000), "has shape (400, 40)" + shape},
    {"OneDimension", npy("|u1", "(2000,)", 2000), "has shape (2000,)" + shape},
    {"OneByteShort", npy("|u1", "(400, 5)", 1999), "ends within its array; copy it again, it was cut short"},
    {"OneByteLong", npy("|u1", "(400, 5)", 2001),
     "goes on after the end of its array; save one array a file"},
};

class BadReferenceTest : public testing::TestWithParam<BadReference> {};

}  // namespace

TEST_P(BadReferenceTest, IsRefusedInOneLineThatTellsWhatIsWrong) {
    std::istringstream stream(GetParam().content);
    EXPECT_EQ(refusalOf([&] { tool::readBits(stream, "reference.npy", 400, 5); }),
              "quarzel: error: reference.npy: " + GetParam().message + '\n');
}

INSTANTIATE_TEST_SUITE_P(, BadReferenceTest, testing::ValuesIn(badReferences),
                         [](const auto& test) { return std::string(test.param.title); });

TEST(BadReference, LeavesNoOutput) {
    const TemporaryDirectory directory;
    const std::string file = directory.write("reference.npy", npy("|u1", "(399, 5)", 1995));
    const ToolRun run = runTool(
        {"decode", shipped("k40.soft.npy"), "--reference", file, "-o", directory.path("out.npy"), "--json"});
    EXPECT_EQ(run.err, "quarzel: error: " + file + ": has shape (399, 5)" + shape + '\n');
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(run.exitCode, 3);
    EXPECT_EQ(directory.names(), std::vector<std::string>{"reference.npy"}) << "no output may be left";
}

TEST(BadReference, MayNotBeMissing) {
    const ToolRun run = runTool({"decode", shipped("k40.soft.npy"), "--reference", "none.npy"});
    EXPECT_EQ(run.err,
              "quarzel: error: none.npy: cannot be opened: No such file or directory; check the name\n");
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(run.exitCode, 3);
}

}  // namespace quarzel::test
