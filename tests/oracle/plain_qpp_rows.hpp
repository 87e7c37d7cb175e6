// SPDX-License-Identifier: MIT
#pragma once

#include <array>

namespace quarzel::oracle {

/// A row of 3GPP TS 36.212, Table 5.1.3-3.
struct QppRow {
    int K, f1, f2;
};

/// The 188 rows, by ascending K.
extern const std::array<QppRow, 188> qppRows;

}  // namespace quarzel::oracle
