// SPDX-License-Identifier: MIT
// The stored cases of the decoder with one processing unit, in both layouts.
#include <gtest/gtest.h>

#include "decoder/decoder_3g.hpp"
#include "support/decoder_setup.hpp"
#include "support/vectors.hpp"

namespace quarzel::test {
namespace {

TEST(SingleUnit, GivesTheStoredCountsDecisionsAndSoftValues) {
    const auto cases = readCases("single_unit.jsonl");
    ASSERT_EQ(cases.size(), 40U);
    for (const nlohmann::json& stored : cases) {
        std::string engine = stored["algorithm"];
        if (engine == "MOD#") {
            engine += ":" + stored["points"].dump();
        }
        SCOPED_TRACE(engine + " K " + stored["block_size"].dump() + " 3GPP2 " + stored["is_3gpp2"].dump() +
                     " scale " + stored["extrinsic_scale"].dump());
        OpenDecoder<TDecoder3G> decoder(engine, stored["is_3gpp2"].get<bool>());
        decoder.setExtrinsicScale(stored["extrinsic_scale"]);
        const std::vector<short> soft = stored["soft"];

        std::vector<unsigned long long> bitErrors(4, 0);
        std::vector<unsigned long long> blockErrors(4, 0);
        ASSERT_TRUE(decoder.decode(soft, stored["reference"], bitErrors, blockErrors));
        EXPECT_EQ(bitErrors, stored["bit_errors"].get<std::vector<unsigned long long>>());
        EXPECT_EQ(blockErrors, stored["block_errors"].get<std::vector<unsigned long long>>());

        std::vector<unsigned char> hard;
        ASSERT_TRUE(decoder.decode(soft, hard, stored["iterations"].get<unsigned>()));
        std::string bits;
        for (const unsigned char bit : hard) {
            bits += static_cast<char>('0' + bit);
        }
        EXPECT_EQ(bits, stored["hard"].get<std::string>());
        EXPECT_EQ(decoder.llr(), stored["llr"].get<std::vector<short>>());
        EXPECT_EQ(decoder.extrinsic(), stored["extrinsic"].get<std::vector<short>>());
        EXPECT_EQ(decoder.sisoCount(), stored["siso_count"].get<std::uint64_t>());
        EXPECT_EQ(decoder.decodeCount(), stored["decode_count"].get<std::uint64_t>());
    }
}

}  // namespace
}  // namespace quarzel::test
