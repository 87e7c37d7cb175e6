// SPDX-License-Identifier: MIT
#include "oracle/candidate_block.hpp"

#include <algorithm>
#include <array>
#include <sstream>

#include "oracle/plain_qpp_rows.hpp"

namespace quarzel::oracle {
namespace {

int from(std::mt19937& random, int least, int most) {
    return std::uniform_int_distribution<int>(least, most)(random);
}

int drawSize(std::mt19937& random) {
    static constexpr std::array edges = {40,   64,   72,   96,   104,  120,  128, 136,  192,
                                         248,  256,  264,  376,  504,  512,  528, 1008, 1024,
                                         1056, 1536, 2048, 2112, 4032, 4096, 4608};
    const int kind = from(random, 0, 19);
    const int row = kind < 12   ? from(random, 0, 59)
                    : kind < 14 ? from(random, 60, 140)
                                : from(random, 141, 187);
    return kind < 15 ? qppRows[static_cast<std::size_t>(row)].K
                     : edges[static_cast<std::size_t>(from(random, 0, static_cast<int>(edges.size()) - 1))];
}

}  // namespace

std::string rowOf(const tool::CoveringBlock& block, int units, int type) {
    const tool::PlannedBlock& planned = block.planned;
    std::ostringstream row;
    row << units << ',' << type << ',' << planned.blockSize << ',' << planned.iterations << ','
        << tool::nameOf(planned.stimulus) << ',' << block.decibels << ',' << planned.number << ','
        << block.tag;
    return row.str();
}

tool::CoveringBlock drawBlock(std::mt19937& random) {
    tool::CoveringBlock block{};
    tool::PlannedBlock& planned = block.planned;
    const int K = drawSize(random);
    planned.blockSize = static_cast<std::uint32_t>(K);
    planned.iterations = K <= 1024 && from(random, 0, 4) == 0 ? 15 : from(random, 1, 4);
    planned.stimulus = static_cast<tool::Stimulus>(from(random, 0, 6));
    block.decibels = from(random, -3, 6);
    planned.number = static_cast<std::uint32_t>(from(random, 0, 9999));
    block.tag = static_cast<unsigned>(from(random, 0, 255));
    return block;
}

Streams streamsOf(const tool::CoveringBlock& block, int units) {
    const std::vector<std::int8_t> soft = tool::softValuesOf(block, units);
    const auto positions = static_cast<std::ptrdiff_t>(soft.size() / 3);
    Streams streams;
    for (std::size_t stream = 0; stream < 3; ++stream) {
        const auto begin = soft.begin() + static_cast<std::ptrdiff_t>(stream) * positions;
        streams[stream].assign(begin, begin + positions);
    }
    return streams;
}

}  // namespace quarzel::oracle
