// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <span>

namespace quarzel::bindings {

/// Arrays of one size in the memory of a host, one after another.
template <class Value>
class Rows {
  public:
    /// @param first  the first value of the first array
    /// @param count  arrays
    /// @param size   values of an array
    Rows(Value* first, std::size_t count, std::size_t size)
        : itsFirst(first), itsCount(count), itsSize(size) {}

    std::size_t count() const { return itsCount; }
    std::size_t size() const { return itsSize; }

    /// The values of all arrays.
    std::span<Value> all() const { return {itsFirst, itsCount * itsSize}; }

    std::span<Value> operator[](std::size_t i) const { return all().subspan(i * itsSize, itsSize); }

  private:
    Value* itsFirst;
    std::size_t itsCount;
    std::size_t itsSize;
};

}  // namespace quarzel::bindings
