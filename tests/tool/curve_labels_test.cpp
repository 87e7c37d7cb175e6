// SPDX-License-Identifier: MIT
#include "plot/curve_labels.hpp"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace quarzel::test {

namespace {

using testing::ElementsAre;
using tool::CurveLabels;
using tool::labelsOf;
using tool::SweepCurve;

SweepCurve curve(std::uint32_t K, int algorithm, int iterations = 8) {
    return {"runs/a.json", false, K, 2, algorithm, iterations, {link::Quantiser::Kind::llr, 8}, "", 7,
            1.0 / 3,       {}};
}

}  // namespace

TEST(CurveLabels, TellWhatDiffersAndTheTitleWhatIsShared) {
    const CurveLabels labels = labelsOf({curve(40, 1), curve(1024, 1, 1), curve(1024, 2)});
    EXPECT_EQ(labels.title, "2 units, LLR \u00d7 8");
    EXPECT_THAT(labels.labels,
                ElementsAre("K = 40, scaled max-log, 8 iterations", "K = 1024, scaled max-log, 1 iteration",
                            "K = 1024, max-star, 8 iterations"));
}

TEST(CurveLabels, HaveAllInTheTitleForASingleCurve) {
    const CurveLabels labels = labelsOf({curve(40, 0)});
    EXPECT_EQ(labels.title, "K = 40, 2 units, max-log, 8 iterations, LLR \u00d7 8");
    EXPECT_THAT(labels.labels, ElementsAre("quarzel"));
}

TEST(CurveLabels, TellTransportBlocksFromCodeBlocks) {
    SweepCurve transport = curve(40, 0);
    transport.isTransportBlock = true;
    transport.sending = "132 coded bits";
    EXPECT_THAT(labelsOf({curve(40, 0), transport}).labels, ElementsAre("K = 40", "A = 40, 132 coded bits"));
}

TEST(CurveLabels, TellSeedOrFileWhereNothingElseDiffers) {
    SweepCurve other = curve(40, 0);
    other.seed = 8;
    EXPECT_THAT(labelsOf({curve(40, 0), other}).labels, ElementsAre("seed 7", "seed 8"));
    other = curve(40, 0);
    other.file = "runs/b.json";
    EXPECT_THAT(labelsOf({curve(40, 0), other}).labels, ElementsAre("a", "b"));
    EXPECT_THAT(labelsOf({curve(40, 0), other, curve(40, 1)}).labels,
                ElementsAre("max-log, a", "max-log, b", "scaled max-log, a"));
}

}  // namespace quarzel::test
