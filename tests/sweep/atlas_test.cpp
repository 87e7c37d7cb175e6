// SPDX-License-Identifier: MIT
// The stored atlas: Eb/N0 at which 10 % and 1 % of blocks fail.
#include <fmt/format.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <map>
#include <sstream>
#include <tuple>

#include "quarzel/code.hpp"
#include "tool/run_tool.hpp"
#include "tool/temporary_directory.hpp"

namespace quarzel::test {

namespace {

const char* const thresholds = QUARZEL_ATLAS "/thresholds.csv";
const char* const units = QUARZEL_ATLAS "/units.csv";

/// A row of a table.
struct Row {
    double ebN0;
    double low;
    double high;
};

/// K, units, algorithm, iterations and rate.
using Key = std::tuple<unsigned, unsigned, int, int, double>;

std::map<Key, Row> rowsOf(const std::string& file) {
    std::istringstream text(readFile(file));
    std::string line;
    std::getline(text, line);
    EXPECT_EQ(line, "block_size,units,algorithm,iterations,quantiser,scale,bler,ebn0_db,ebn0_low,ebn0_high");
    std::map<Key, Row> rows;
    while (std::getline(text, line)) {
        unsigned K = 0;
        unsigned U = 0;
        int algorithm = 0;
        int iterations = 0;
        double rate = 0;
        Row row{};
        EXPECT_EQ(std::sscanf(line.c_str(), "%u,%u,%d,%d,llr,4,%lf,%lf,%lf,%lf", &K, &U, &algorithm,
                              &iterations, &rate, &row.ebN0, &row.low, &row.high),
                  8)
            << line;
        EXPECT_TRUE(rows.emplace(Key{K, U, algorithm, iterations, rate}, row).second) << line;
    }
    return rows;
}

/// Check that a table has exactly these block sizes and units with intervals of this half width, and that its
/// numbers are in an order that is possible.
void expectWhole(const std::string& file, const std::vector<unsigned>& sizes,
                 const std::vector<unsigned>& unitsOfCores, double precision) {
    const std::map<Key, Row> rows = rowsOf(file);
    EXPECT_EQ(rows.size(), sizes.size() * unitsOfCores.size() * 18);
    for (const unsigned K : sizes) {
        for (const unsigned U : unitsOfCores) {
            for (const int algorithm : {0, 1, 2}) {
                for (const int iterations : {4, 6, 8}) {
                    const std::string what = fmt::format("{},{},{},{}", K, U, algorithm, iterations);
                    const auto at = [&](int count, double rate) {
                        const auto row = rows.find({K, U, algorithm, count, rate});
                        EXPECT_NE(row, rows.end()) << what;
                        return row == rows.end() ? Row{} : row->second;
                    };
                    for (const double rate : {0.1, 0.01}) {
                        const Row row = at(iterations, rate);
                        EXPECT_LE(row.low, row.ebN0) << what;
                        EXPECT_LE(row.ebN0, row.high) << what;
                        EXPECT_LE(row.high - row.low, 2 * precision + 0.0011) << what << ": 3 decimals";
                        EXPECT_LE(row.ebN0, at(4, rate).ebN0 + 2 * precision) << what;
                    }
                    EXPECT_LT(at(iterations, 0.1).ebN0, at(iterations, 0.01).ebN0) << what;
                }
            }
        }
    }
}

/// Check that what the tool finds now is what a table has.
void expectAgain(const std::string& file, const std::vector<std::string>& options) {
    std::vector<std::string> arguments = {"threshold",     "--iterations", "4,6,8",
                                          "--target-bler", "0.1,0.01",     "--csv"};
    arguments.insert(arguments.end(), options.begin(), options.end());
    const std::string found = runTool(arguments).out;
    const std::string rows = found.substr(found.find('\n'));
    EXPECT_EQ(std::count(rows.begin(), rows.end(), '\n'), 7);
    EXPECT_THAT(readFile(file), testing::HasSubstr(rows));
}

}  // namespace

TEST(Atlas, HasEveryBlockSizeTypeAndNumberOfIterations) {
    std::vector<unsigned> sizes;
    for (const BlockSize& size : blockSizes()) {
        sizes.push_back(size.K);
    }
    expectWhole(thresholds, sizes, {2}, 0.02);
}

TEST(Atlas, HasMoreUnitsAtTenSizes) {
    expectWhole(units, {768, 1024, 1280, 1536, 2048, 2560, 3072, 4096, 5120, 6144}, {2, 4, 8}, 0.014);
}

// Blocks of 768 bits have no more segments than 2 units have threads.
TEST(Atlas, IsTheSameForAllUnitsWhereTheyCutABlockAlike) {
    const std::map<Key, Row> rows = rowsOf(units);
    for (const auto& [key, row] : rows) {
        auto [K, U, algorithm, iterations, rate] = key;
        if (K == 768) {
            const auto same = rows.find({K, 2, algorithm, iterations, rate});
            ASSERT_NE(same, rows.end());
            EXPECT_EQ(row.ebN0, same->second.ebN0) << U;
        }
    }
}

TEST(Atlas, ComesOutAgainByteForByte) {
    expectAgain(thresholds, {"--block-size", "104", "--algorithm", "0"});
}

}  // namespace quarzel::test
