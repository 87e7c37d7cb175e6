// SPDX-License-Identifier: MIT
#include "oracle/fault_finder.hpp"

namespace quarzel::oracle {
namespace {

/// Some faults need the block twice.
bool finds(const Design& faulty, bool twice, const Answer& expected, const Streams& streams,
           const CoveringBlock& block) {
    PlainDecoder decoder(faulty);
    if (twice) {
        decoder.decode(streams, block.iterations, block.tag ^ 255U);
    }
    return decoder.decode(streams, block.iterations, block.tag) != expected;
}

}  // namespace

std::vector<Subject> FaultFinder::subjectsOf(std::span<const Fault> faults) const {
    std::vector<Subject> subjects;
    for (const Fault& fault : faults) {
        if ((fault.types >> itsType & 1U) != 0) {
            subjects.push_back({fault, soundDesign(itsUnits, itsType)});
            fault.build(subjects.back().design);
        }
    }
    return subjects;
}

void FaultFinder::tryOn(const CoveringBlock& block, std::size_t number, std::vector<Subject>& subjects,
                        std::size_t enough) {
    const Streams streams = itsSource.make(block, itsUnits);
    const Answer expected =
        PlainDecoder(soundDesign(itsUnits, itsType)).decode(streams, block.iterations, block.tag);
    for (Subject& subject : subjects) {
        if (subject.finders.size() < enough &&
            finds(subject.design, subject.fault.twice, expected, streams, block)) {
            subject.finders.push_back(number);
        }
    }
}

}  // namespace quarzel::oracle
