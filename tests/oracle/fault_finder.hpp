// SPDX-License-Identifier: MIT
#pragma once

#include <span>
#include <vector>

#include "oracle/candidate_block.hpp"
#include "oracle/fault.hpp"

namespace quarzel::oracle {

/// A fault, built into a core, and the blocks that found it.
struct Subject {
    Fault fault;
    Design design;
    std::vector<std::size_t> finders{};  ///< the numbers that they were tried with
};

/// Tries blocks on the faults of a core. A fault is found by other decisions or another tag.
class FaultFinder {
  public:
    FaultFinder(int units, int type) : itsUnits(units), itsType(type) {}

    /// The faults that a core of this type can have.
    std::vector<Subject> subjectsOf(std::span<const Fault> faults) const;

    /// Note the block with those that it finds by itself, and that fewer than `enough` have found before.
    void tryOn(const tool::CoveringBlock& block, std::size_t number, std::vector<Subject>& subjects,
               std::size_t enough) const;

    /// Note with each subject the first block that finds it when a core runs all of them in their order.
    void runSet(std::span<const tool::CoveringBlock> blocks, std::vector<Subject>& subjects) const;

  private:
    int itsUnits, itsType;
};

}  // namespace quarzel::oracle
