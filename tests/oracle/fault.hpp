// SPDX-License-Identifier: MIT
#pragma once

#include <span>
#include <vector>

#include "oracle/plain_design.hpp"

namespace quarzel::oracle {

/// Algorithm types whose cores have the circuit, as bits.
enum Types : unsigned { scaledType = 2, starType = 4, unstarredTypes = 3, unscaledTypes = 5, allTypes = 7 };

/// A mistake in the design of a core.
struct Fault {
    const char* name;
    const char* mistake;     ///< what the designer did
    void (*build)(Design&);  ///< makes the mistake in a sound design
    unsigned types = allTypes;
    bool twice = false;  ///< shows in the second one of two blocks alone
};

/// The faults of a part of the core.
std::span<const Fault> inputFaults();
std::span<const Fault> permutationFaults();
std::span<const Fault> exchangeFaults();
std::span<const Fault> recursionFaults();
std::span<const Fault> stuckFaults();
std::span<const Fault> correctionFaults();
std::span<const Fault> segmentFaults();
std::span<const Fault> windowFaults();
std::span<const Fault> terminationFaults();
std::span<const Fault> likelihoodFaults();
std::span<const Fault> outcomeFaults();

/// All of them: what vectors are chosen to find.
std::vector<Fault> catalogue();

/// A fault of the catalogue that no answer of a core of some types can show.
struct Equivalent {
    const char* name;
    const char* reason;
    unsigned types;
};

/// Whether a fault is equivalent to a sound design in cores of a type.
bool isEquivalent(const Fault& fault, int type);

/// Faults that vectors are never chosen for. What a set finds of these is its honest score.
std::span<const Fault> heldOutFaults();

}  // namespace quarzel::oracle
