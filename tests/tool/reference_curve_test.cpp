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
using tool::readReferenceCurve;
using tool::ReferenceCurve;

void expectRefused(const std::string& content, const std::string& message) {
    const TemporaryDirectory directory;
    const std::string file = directory.write("ref.csv", content);
    EXPECT_EQ(refusalOf([&] { readReferenceCurve(file); }), "quarzel: error: " + file + message + '\n');
}

const std::string columns = "; give CSV with the columns ebn0_db and ber, bler or both";

}  // namespace

TEST(ReferenceCurve, HasTheRatesOfItsColumns) {
    const TemporaryDirectory directory;
    const std::string file =
        directory.write("theory.csv", "# from a book\nber, ebn0_db,note,bler\n1e-2,-0.5,x,\n,0.25,,0.5\r\n");
    const ReferenceCurve curve = readReferenceCurve(file);
    EXPECT_EQ(curve.label, "theory");
    EXPECT_THAT(curve.ber, ElementsAre(Pair(-0.5, 0.01)));
    EXPECT_THAT(curve.bler, ElementsAre(Pair(0.25, 0.5)));
    EXPECT_EQ(readReferenceCurve("max a posteriori=" + file).label, "max a posteriori");
}

TEST(ReferenceCurve, MayHaveAnEqualsSignInItsName) {
    const TemporaryDirectory directory;
    const std::string file = directory.write("a=b.csv", "ebn0_db,ber\n1,0.1");
    EXPECT_EQ(readReferenceCurve(file).label, "a=b");
}

TEST(ReferenceCurve, IsRefusedWhereItIsNotWellFormed) {
    expectRefused("ebn0_db,per\n1,0.1\n", ": is missing a column" + columns);
    expectRefused("ber,bler\n1,0.1\n", ": is missing a column" + columns);
    expectRefused("", ": is not a well-formed reference curve" + columns);
    expectRefused("ebn0_db,ber\n", ": holds no point" + columns);
    expectRefused("ebn0_db,ber\n1,0.1\n2\n", ": is not a well-formed reference curve" + columns);
    expectRefused("ebn0_db,ber\none,0.1\n", ": line 2: 'one' is not a number" + columns);
    expectRefused(
        "ebn0_db,ber\n1,0\n",
        ": line 2: 0 is not an error rate on a logarithmic axis; give a number above 0 and up to 1, or "
        "leave it out");
}

}  // namespace quarzel::test
