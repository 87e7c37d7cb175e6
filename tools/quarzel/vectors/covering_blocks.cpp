// SPDX-License-Identifier: MIT
#include "vectors/covering_blocks.hpp"

#include <algorithm>
#include <cstdlib>
#include <sstream>
#include <string>

#include "vectors/covering_tables.hpp"
#include "vectors/stimulus_source.hpp"

namespace quarzel::tool {

namespace {

/// The cells of a row, one after the other.
class Cells {
  public:
    explicit Cells(const std::string& row) : itsRow(row) {}

    std::string text() {
        std::string cell;
        std::getline(itsRow, cell, ',');
        return cell;
    }

    int number() { return std::atoi(text().c_str()); }
    std::size_t count() { return static_cast<std::size_t>(number()); }

  private:
    std::istringstream itsRow;
};

/// Call a function with the cells, from the third on, of each row of a table that is about a core.
template <class Take>
void forEachRow(const char* table, int units, int algorithm, const Take& take) {
    std::istringstream rows(table);
    std::string row;
    std::getline(rows, row);
    while (std::getline(rows, row)) {
        Cells cells(row);
        const bool isOfUnits = cells.number() == units;
        if (cells.number() == algorithm && isOfUnits) {
            take(cells);
        }
    }
}

Stimulus stimulusOf(const std::string& name) {
    const auto found = std::find(stimulusNames.begin(), stimulusNames.end(), name);
    return static_cast<Stimulus>(found - stimulusNames.begin());
}

}  // namespace

std::vector<CoveringBlock> coveringBlocks(int units, int algorithm) {
    std::vector<CoveringBlock> blocks;
    forEachRow(coveringBlocksTable, units, algorithm, [&blocks](Cells& cells) {
        CoveringBlock block{};
        block.planned.blockSize = static_cast<std::uint32_t>(cells.number());
        block.planned.iterations = cells.number();
        block.planned.stimulus = stimulusOf(cells.text());
        block.decibels = cells.number();
        block.planned.number = static_cast<std::uint32_t>(cells.number());
        block.tag = static_cast<unsigned>(cells.number());
        blocks.push_back(block);
    });
    return blocks;
}

CoveringScore coveringScore(int units, int algorithm) {
    CoveringScore score{};
    forEachRow(coveringScoresTable, units, algorithm, [&score](Cells& cells) {
        for (std::size_t* const count :
             {&score.found, &score.of, &score.equivalent, &score.heldOutFound, &score.heldOutOf}) {
            *count = cells.count();
        }
    });
    return score;
}

std::vector<std::int8_t> softValuesOf(const CoveringBlock& block, int units) {
    VectorRequest request;
    request.ebN0.micro = block.decibels * 1000000;
    return StimulusSource(request).make(block.planned, static_cast<std::uint32_t>(units));
}

}  // namespace quarzel::tool
