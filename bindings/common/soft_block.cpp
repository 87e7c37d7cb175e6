// SPDX-License-Identifier: MIT
#include "soft_block.hpp"

#include <algorithm>
#include <cstdint>
#include <iterator>
#include <limits>

#include "outcome.hpp"

namespace quarzel::bindings {

namespace {

template <class Value>
void append(const void* values, std::size_t count, std::vector<int>& ints) {
    const auto* const first = static_cast<const Value*>(values);
    ints.insert(ints.end(), first, first + count);
}

int wholeNumber(double value) {
    // What is no number fails the comparisons.
    if (value >= std::numeric_limits<int>::min() && value <= std::numeric_limits<int>::max()) {
        const int whole = static_cast<int>(value);
        if (whole == value) {
            return whole;
        }
    }
    throw BindingError(Fault::value,
                       "a soft value is no whole number of the unit 1/8; round first, "
                       "for instance int8(round(8 * llr))");
}

}  // namespace

void widen(const void* values, SoftType type, std::size_t count, std::vector<int>& ints) {
    switch (type) {
        case SoftType::int8:
            return append<std::int8_t>(values, count, ints);
        case SoftType::int16:
            return append<std::int16_t>(values, count, ints);
        case SoftType::int32:
            return append<std::int32_t>(values, count, ints);
        case SoftType::float64:
            const auto* const first = static_cast<const double*>(values);
            std::transform(first, first + count, std::back_inserter(ints), wholeNumber);
    }
}

}  // namespace quarzel::bindings
