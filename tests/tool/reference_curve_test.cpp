// SPDX-License-Identifier: MIT
#include "plot/reference_curve.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "refusal.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

namespace {

using testing::ElementsAre;
using testing::Pair;
using tool::readReferenceCurves;
using tool::ReferenceCurve;

void expectRefused(const std::string& content, const std::string& message) {
    const TemporaryDirectory directory;
    const std::string file = directory.write("ref.csv", content);
    EXPECT_EQ(refusalOf([&] { readReferenceCurves(file); }), "quarzel: error: " + file + message + '\n');
}

const std::string columns = "; give CSV with the columns ebn0_db and ber, bler or both";

}  // namespace

TEST(ReferenceCurve, HasTheRatesOfItsColumns) {
    const TemporaryDirectory directory;
    const std::string file =
        directory.write("theory.csv", "# from a book\nber, ebn0_db,note,bler\n1e-2,-0.5,x,\n,0.25,,0.5\r\n");
    const ReferenceCurve curve = readReferenceCurves(file).front();
    EXPECT_EQ(curve.label, "theory");
    EXPECT_THAT(curve.ber, ElementsAre(Pair(-0.5, 0.01)));
    EXPECT_THAT(curve.bler, ElementsAre(Pair(0.25, 0.5)));
    EXPECT_EQ(readReferenceCurves("max a posteriori=" + file).front().label, "max a posteriori");
}

TEST(ReferenceCurve, MayHaveAnEqualsSignInItsName) {
    const TemporaryDirectory directory;
    const std::string file = directory.write("a=b.csv", "ebn0_db,ber\n1,0.1");
    EXPECT_EQ(readReferenceCurves(file).front().label, "a=b");
}

TEST(ReferenceCurve, MayHaveALabelThatNoFileNameCouldBe) {
    const TemporaryDirectory directory;
    const std::string file = directory.write("a.csv", "ebn0_db,ber\n1,0.1\n");
    const std::string label(5000, 'x');
    EXPECT_EQ(readReferenceCurves(label + '=' + file).front().label, label);
}

TEST(ReferenceCurve, IsMadeOfCounts) {
    const TemporaryDirectory directory;
    const std::string file =
        directory.write("a.csv",
                        "K,code_bits,modulation,ebn0_db,blocks,bit_errors,block_errors\n"
                        "40,120,QPSK,0,100,40,20\n40,120,QPSK,1,1000,0,0\n40,120,QPSK,2,,,0.001 (rate)\n");
    const std::vector<ReferenceCurve> curves = readReferenceCurves(file);
    ASSERT_EQ(curves.size(), 1U);
    EXPECT_THAT(curves[0].ber, ElementsAre(Pair(0, 0.01)));
    EXPECT_THAT(curves[0].bler, ElementsAre(Pair(0, 0.2), Pair(2, 0.001)));
    EXPECT_EQ(curves[0].blockSize, 40U);
    EXPECT_DOUBLE_EQ(curves[0].bitsPerSymbol.value(), 2.0 / 3);
}

TEST(ReferenceCurve, IsOneOfAFileWhoseRowsDiffer) {
    const TemporaryDirectory directory;
    const std::string file =
        directory.write("a.csv",
                        "source,K,decoder,ebn0_db,bler\n\"a, \"\"b\"\"\",40,\"max-log, 8 bits\",0,0.5\n"
                        "other,1024,max-log,0,0.4\nother,40,exact,1,0.3\nother,1024,max-log,1,0.2\n");
    const std::vector<ReferenceCurve> curves = readReferenceCurves("theirs=" + file);
    ASSERT_EQ(curves.size(), 3U);
    EXPECT_EQ(curves[0].label, "theirs, K = 40, max-log, 8 bits");
    EXPECT_EQ(curves[1].label, "theirs, K = 1024, max-log");
    EXPECT_EQ(curves[2].label, "theirs, K = 40, exact");
    EXPECT_THAT(curves[1].bler, ElementsAre(Pair(0, 0.4), Pair(1, 0.2)));
}

TEST(ReferenceCurve, IsRefusedWhereItIsNotWellFormed) {
    expectRefused("ebn0_db,per\n1,0.1\n", ": is missing a column" + columns);
    expectRefused("ber,bler\n1,0.1\n", ": is missing a column" + columns);
    expectRefused("", ": is not a well-formed reference curve" + columns);
    expectRefused("ebn0_db,ber\n", ": holds no point" + columns);
    expectRefused("ebn0_db,ber\n1,0.1\n2\n", ": is not a well-formed reference curve" + columns);
    expectRefused("ebn0_db,ber\none,0.1\n", ": line 2: 'one' is not a number" + columns);
    for (const std::string value : {"inf", "nan", "-inf"}) {
        expectRefused("ebn0_db,ber\n" + value + ",0.1\n",
                      ": line 2: '" + value + "' is not a number" + columns);
        expectRefused("ebn0_db,ber\n1," + value + "\n",
                      ": line 2: '" + value + "' is not a number" + columns);
    }
    expectRefused("ebn0_db,blocks,block_errors\n1,10,11\n",
                  ": line 2: 11 is not a count of errors in 10" + columns);
    expectRefused("ebn0_db,blocks,block_errors\n1,,1\n", ": line 2: '' is not a count" + columns);
    expectRefused("ebn0_db,blocks,bit_errors\n1,10,1\n", ": is missing a column" + columns);
    expectRefused("K,code_bits,modulation,ebn0_db,ber\n40,132,FSK,1,0.1\n",
                  ": 'FSK' is not a modulation; give BPSK, QPSK, 16QAM, 64QAM or 256QAM");
    expectRefused("K,decoder,ebn0_db,ber\n40,\"open,1,0.1\n",
                  ": is not a well-formed reference curve" + columns);
    expectRefused(
        "ebn0_db,ber\n1,0\n",
        ": line 2: 0 is not an error rate on a logarithmic axis; give a number above 0 and up to 1, or "
        "leave it out");
}

}  // namespace quarzel::test
