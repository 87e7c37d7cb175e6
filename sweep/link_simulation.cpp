// SPDX-License-Identifier: MIT
#include "sweep/link_simulation.hpp"

#include <algorithm>
#include <limits>
#include <numeric>

namespace quarzel::sweep {

namespace {

std::uint32_t entryOf(const link::Verdict& verdict) {
    if (verdict.isAccepted) {
        return verdict.wrongBits == 0 ? 0 : verdict.wrongBits | undetectedMark;
    }
    return verdict.wrongBits == 0 ? rejectedMark : verdict.wrongBits;
}

/// What a receiver makes of a decoded block, and after how many iterations.
struct Decision {
    link::Verdict verdict;
    std::uint32_t iterations;
};

/// @param kept  iterations whose decisions are kept
Decision decisionOn(link::LinkRun& run, std::size_t i, std::size_t kept) {
    Decision decision{{0, false}, 0};
    while (!decision.verdict.isAccepted && decision.iterations < kept) {
        decision.verdict = run.verdict(i, decision.iterations++);
    }
    return decision;
}

void erase(std::vector<std::size_t>& places, const std::vector<std::uint8_t>& isKept) {
    std::size_t kept = 0;
    for (std::size_t i = 0; i < places.size(); ++i) {
        if (isKept[i] != 0) {
            places[kept++] = places[i];
        }
    }
    places.resize(kept);
}

/// A row for each block.
class Rows {
  public:
    Rows(const link::LinkRun& run, std::size_t columns)
        : itsColumns(columns), itsEntries(run.size() * columns) {
        for (std::size_t i = 0; i < run.size(); ++i) {
            itsBlocks.push_back(run.number(i));
        }
    }

    std::uint32_t* row(std::size_t place) { return itsEntries.data() + place * itsColumns; }

    ErrorList errors() {
        ErrorList list;
        for (std::size_t place = 0; place < itsBlocks.size(); ++place) {
            const std::uint32_t* const entries = row(place);
            if (std::any_of(entries, entries + itsColumns, [](std::uint32_t entry) { return entry != 0; })) {
                list.append(itsBlocks[place], entries, itsColumns);
            }
        }
        return list;
    }

  private:
    std::size_t itsColumns;
    std::vector<std::uint64_t> itsBlocks;
    std::vector<std::uint32_t> itsEntries;
};

}  // namespace

std::vector<std::uint8_t> bitsOfLane(std::span<const std::uint8_t> bits, unsigned lane) {
    std::vector<std::uint8_t> own(bits.size());
    std::transform(bits.begin(), bits.end(), own.begin(),
                   [lane](std::uint8_t byte) { return static_cast<std::uint8_t>(byte >> lane & 1U); });
    return own;
}

ErrorList simulateLink(const Setup& setup, std::size_t counts, link::LinkRun& run,
                       const link::Channel& channel, Core& core, const std::vector<std::uint64_t>& octets) {
    const std::size_t transmissions = setup.transmissions();
    const bool stops = setup.sending.stop == Stop::crc;
    const bool isPerIteration = counts > transmissions;
    run.begin(setup.ebN0, octets, std::numeric_limits<std::uint64_t>::max());
    Rows rows(run, counts + (stops ? transmissions : 0));
    std::vector<std::size_t> places(run.size());  // of the rows of the blocks that wait
    std::iota(places.begin(), places.end(), std::size_t{0});
    for (std::size_t t = 0; t < transmissions && run.size() != 0; ++t) {
        run.transmit(channel, static_cast<std::uint32_t>(t));
        run.decode(core, setup.iterations, stops || isPerIteration);
        std::vector<std::uint8_t> isRejected(run.size());
        for (std::size_t i = 0; i < run.size(); ++i) {
            std::uint32_t* const row = rows.row(places[i]);
            if (isPerIteration) {
                for (std::size_t count = 0; count < counts; ++count) {
                    row[count] = entryOf(run.verdict(i, count));
                }
                continue;
            }
            const Decision decision =
                decisionOn(run, i, stops ? static_cast<std::size_t>(setup.iterations) : 1);
            // It stays like this unless another transmission alters it.
            std::fill(row + t, row + counts, entryOf(decision.verdict));
            if (stops) {
                row[counts + t] = decision.iterations;
            }
            isRejected[i] = decision.verdict.isAccepted ? 0 : 1;
        }
        if (t + 1 < transmissions) {
            run.retain(isRejected);
            erase(places, isRejected);
        }
    }
    return rows.errors();
}

std::vector<SentBlock> sendOverLink(const Setup& setup, const link::CodedLink& link, link::LinkRun& run,
                                    const link::Channel& channel, Core& core, std::uint64_t number) {
    const bool stops = setup.sending.stop == Stop::crc;
    const std::vector<std::uint64_t> octets = {number / blocksPerOctet};
    run.begin(setup.ebN0, octets, std::numeric_limits<std::uint64_t>::max());
    std::vector<std::uint8_t> isWanted(run.size());
    isWanted.at(number % blocksPerOctet) = 1;
    run.retain(isWanted);
    for (std::size_t t = 0; t < setup.transmissions(); ++t) {
        run.transmit(channel, static_cast<std::uint32_t>(t));
        if (t + 1 == setup.transmissions()) {
            break;
        }
        run.decode(core, setup.iterations, stops);
        if (decisionOn(run, 0, stops ? static_cast<std::size_t>(setup.iterations) : 1).verdict.isAccepted) {
            break;
        }
    }
    std::vector<SentBlock> blocks;
    for (std::size_t r = 0; r < link.segmentation().C; ++r) {
        const std::span<const std::int8_t> soft = run.soft(0, r);
        blocks.push_back(
            {bitsOfLane(run.bits(0).subspan(link.bitsBefore(r), link.segmentation().size(r)), run.lane(0)),
             {soft.begin(), soft.end()}});
    }
    return blocks;
}

}  // namespace quarzel::sweep
