// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace quarzel::tool {

/// What can happen in the arithmetic of a core and is worth to have happened. Each has positions: states,
/// signs, entries of a table.
enum class Event : std::uint8_t {
    branchAbove,
    branchBelow,
    aPrioriFloor,
    extrinsicFloor,
    extrinsicAbove,
    extrinsicBelow,
    zeroRatio,
    alphaTie,
    alphaOrder,
    alphaWrap,
    alphaCorrection,
    alphaPending,
    alphaMask,
    alphaNextPass,
    betaTie,
    betaOrder,
    betaWrap,
    betaCorrection,
    betaPending,
    betaMask,
    tailMask,
    betaNextPass,
    betaSamePass,
    pathWrap,
    firstTie,
    firstOrder,
    firstCorrection,
    pairWrap,
    secondTie,
    secondOrder,
    secondCorrection,
    thirdTie,
    thirdOrder,
    thirdCorrection,
    ratioWrap,
};

/// What is known of an event.
struct EventFacts {
    const char* name;
    const char* text;  ///< what happens, for people
    std::vector<std::string> positions;
    unsigned types = 7;  ///< algorithm types whose cores have the circuit, as bits
};

/// All events, in the order of the enumeration.
const std::vector<EventFacts>& eventFacts();

/// Whether a core has the circuit in which an event happens. Where it has, each position can be reached: the
/// covering blocks of every core reach them all.
inline bool hasCircuit(const EventFacts& facts, int algorithm) {
    return (facts.types >> algorithm & 1U) != 0;
}

}  // namespace quarzel::tool
