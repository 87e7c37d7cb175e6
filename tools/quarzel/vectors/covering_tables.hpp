// SPDX-License-Identifier: MIT
#pragma once

/// The tables of covering blocks as text: covering_blocks.csv and covering_scores.csv.
namespace quarzel::tool {

extern const char* const coveringBlocksTable;
extern const char* const coveringScoresTable;

}  // namespace quarzel::tool
