// SPDX-License-Identifier: MIT
#pragma once

#include <algorithm>
#include <array>
#include <cstdint>
#include <iterator>
#include <vector>

#include "engine/t8.hpp"

namespace quarzel::test {

/// A record in a form that the test framework compares and prints.
using Row = std::array<std::int16_t, 8>;

inline Row row(const T8& record) {
    Row result{};
    std::copy(std::begin(record.element), std::end(record.element), result.begin());
    return result;
}

inline std::vector<Row> rows(const std::vector<T8>& records) {
    std::vector<Row> result(records.size());
    std::transform(records.begin(), records.end(), result.begin(), row);
    return result;
}

}  // namespace quarzel::test
