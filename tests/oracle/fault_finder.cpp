// SPDX-License-Identifier: MIT
#include "oracle/fault_finder.hpp"

namespace quarzel::oracle {
namespace {

/// Some faults need the block twice.
bool finds(const Design& faulty, bool twice, const Answer& expected, const Streams& streams,
           const tool::CoveringBlock& block) {
    PlainDecoder decoder(faulty);
    if (twice) {
        decoder.decode(streams, block.planned.iterations, block.tag ^ 255U);
    }
    return decoder.decode(streams, block.planned.iterations, block.tag) != expected;
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

void FaultFinder::tryOn(const tool::CoveringBlock& block, std::size_t number, std::vector<Subject>& subjects,
                        std::size_t enough) const {
    const Streams streams = streamsOf(block, itsUnits);
    const Answer expected =
        PlainDecoder(soundDesign(itsUnits, itsType)).decode(streams, block.planned.iterations, block.tag);
    for (Subject& subject : subjects) {
        if (subject.finders.size() < enough &&
            finds(subject.design, subject.fault.twice, expected, streams, block)) {
            subject.finders.push_back(number);
        }
    }
}

void FaultFinder::runSet(std::span<const tool::CoveringBlock> blocks, std::vector<Subject>& subjects) const {
    PlainDecoder sound(soundDesign(itsUnits, itsType));
    std::vector<Streams> streams;
    std::vector<Answer> expected;
    for (const tool::CoveringBlock& block : blocks) {
        streams.push_back(streamsOf(block, itsUnits));
        expected.push_back(sound.decode(streams.back(), block.planned.iterations, block.tag));
    }
    for (Subject& subject : subjects) {
        PlainDecoder faulty(subject.design);
        for (std::size_t i = 0; i < blocks.size() && subject.finders.empty(); ++i) {
            if (faulty.decode(streams[i], blocks[i].planned.iterations, blocks[i].tag) != expected[i]) {
                subject.finders.push_back(i);
            }
        }
    }
}

}  // namespace quarzel::oracle
