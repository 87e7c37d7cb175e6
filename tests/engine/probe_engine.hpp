// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <utility>
#include <vector>

#include "engine/engine_mod_base.hpp"
#include "fixed/number_format.hpp"

namespace quarzel::test {

using AlgorithmType = TCalculationEngineModBase::AlgorithmType;

/// A correction table: 65536 bytes, that of difference 0 in the middle.
using Table = std::vector<unsigned char>;

inline const TNumberFormat coreState(12, 3);
inline const TNumberFormat coreBranch(8, 3);

/// An engine with formats and tables of its own whose algorithm types, table pointers and processor flag a
/// test sets as it likes.
class ProbeEngine : public TCalculationEngineModBase {
  public:
    explicit ProbeEngine(const TNumberFormat& state = coreState, const TNumberFormat& branch = coreBranch)
        : itsState(state), itsBranch(branch) {
        setFormats(&itsBranch, &itsState, &itsBranch);
    }

    /// All recursions by one type, with one table.
    ProbeEngine(AlgorithmType type, Table table) : ProbeEngine() { use(type, std::move(table)); }

    void use(AlgorithmType type, Table table) {
        itsTable = std::move(table);
        select(type, itsTable.data() + lutCentre);
    }

    std::string getProperties() const override { return "probe"; }

    using TCalculationEngine::itsSSE2;
    using TCalculationEngineModBase::itsAlphaAlgorithm;
    using TCalculationEngineModBase::itsAlphaLUT;
    using TCalculationEngineModBase::itsBetaAlgorithm;
    using TCalculationEngineModBase::itsBetaLUT;
    using TCalculationEngineModBase::itsLLRAlgorithm;
    using TCalculationEngineModBase::itsLLRLUT;

  private:
    TNumberFormat itsState;
    TNumberFormat itsBranch;
    Table itsTable;
};

}  // namespace quarzel::test
