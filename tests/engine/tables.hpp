// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <random>

#include "engine/probe_engine.hpp"

namespace quarzel::test {

inline constexpr std::size_t tableSize = 65536;

/// A table without any correction.
inline Table zeroTable() {
    return Table(tableSize, 0);
}

/// A table whose every entry is its own: it shows which entry was read.
inline Table randomTable(std::mt19937& random) {
    Table table(tableSize);
    for (unsigned char& entry : table) {
        entry = static_cast<unsigned char>(random());
    }
    return table;
}

/// The table of an engine "MOD#:16" in the core's state format.
inline Table coreTable() {
    return TCalculationEngineModBase::createLUT(16, &coreState);
}

}  // namespace quarzel::test
