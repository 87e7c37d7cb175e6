// SPDX-License-Identifier: MIT
#include "link/quantised_channel.hpp"

#include <algorithm>
#include <bit>

#include "link/search_table.hpp"

namespace quarzel::link {

namespace {

constexpr std::size_t groupsAtOnce = 8;
constexpr std::size_t valuesPerGroup = 2 * wordsPerGroup;
constexpr std::size_t valuesAtOnce = groupsAtOnce * valuesPerGroup;

/// The 16 random bits of a value, as the look-up takes them.
std::uint32_t halfWordOf(const std::uint32_t* words, std::size_t value) {
    constexpr std::size_t half = valuesPerLookUp / 2;
    const std::uint32_t word = words[value / valuesPerLookUp * half + value % half];
    return value % valuesPerLookUp < half ? word & 0xffffU : word >> 16;
}

}  // namespace

QuantisedChannel::QuantisedChannel(const Quantiser& quantiser, Decibels ebN0, CodeRate rate,
                                   const DrawFunctions& draw)
    : itsDraw(draw), itsThresholds(channelThresholds(quantiser, ebN0, rate)) {
    makeCells();
    itsSearch = makeSearchTable(itsThresholds, itsCells);
}

/// The upper 16 bits of a random number decide its output unless a threshold lies inside the 2^32 numbers
/// that share them.
void QuantisedChannel::makeCells() {
    for (std::size_t cell = 0; cell < cellCount; ++cell) {
        const auto startOf = [cell](std::uint64_t low) {
            return ((static_cast<std::uint64_t>(cell) << 4) + low) << refinementBits;
        };
        const int first = outputOf(startOf(0));
        const int last = outputOf(startOf(16) - 1);
        std::int32_t place = cellNoThreshold;
        if (last == first + 1) {
            // The place where it rises. A threshold at the very start of a range leaves nothing undecided in
            // it; to take it for undecided costs time but gives the same outputs.
            for (std::int32_t low = 0; low < 16; ++low) {
                if (outputOf(startOf(static_cast<std::uint64_t>(low) + 1) - 1) == last) {
                    place = low;
                    break;
                }
            }
        } else if (last > first) {
            place |= cellManyThresholds;
        }
        itsCells[cell] = first * (1 << cellValueShift) + place;
    }
}

int QuantisedChannel::outputOf(std::uint64_t random) const {
    const auto above = std::upper_bound(itsThresholds.begin(), itsThresholds.end(), random);
    return lowestOutput + static_cast<int>(above - itsThresholds.begin());
}

/// The output for 16 random bits that may leave it open, and further ones if they do.
std::int8_t QuantisedChannel::decide(std::uint32_t random, bool codeBit, Refinement& refinement) const {
    const std::int32_t cell = itsCells[random >> 4];
    const bool isOpen =
        (cell & cellManyThresholds) != 0 || static_cast<std::int32_t>(random & 15U) == (cell & cellLowMask);
    const std::uint64_t all = std::uint64_t{random} << refinementBits | (isOpen ? refinement.next() : 0);
    int output = cell >> cellValueShift;
    while (output < highestOutput && itsThresholds[static_cast<std::size_t>(output - lowestOutput)] <= all) {
        ++output;
    }
    return static_cast<std::int8_t>(std::min(codeBit ? output : -output, 127));
}

/// The outputs that 16 random bits decide, and which are still open.
void QuantisedChannel::draw(const std::uint32_t* words, const std::uint8_t* codeBits, unsigned lane,
                            std::size_t count, std::int8_t* soft, std::uint32_t* undecided) const {
    if (itsDraw.search != nullptr && itsSearch.levels != 0) {
        itsDraw.search(words, codeBits, lane, itsSearch, count, soft, undecided);
        return;
    }
    const std::size_t times = count / valuesPerLookUp;
    const std::size_t rest = count % valuesPerLookUp;
    itsDraw.lookUp(words, codeBits, lane, itsCells.data(), times, soft, undecided);
    if (rest != 0) {
        std::array<std::uint8_t, valuesPerLookUp> lastBits{};
        std::array<std::int8_t, valuesPerLookUp> lastSoft;
        const std::size_t at = times * valuesPerLookUp;
        std::copy_n(codeBits + at, rest, lastBits.begin());
        itsDraw.lookUp(words + at / 2, lastBits.data(), lane, itsCells.data(), 1, lastSoft.data(),
                       undecided + times);
        undecided[times] &= (std::uint32_t{1} << rest) - 1;
        std::copy_n(lastSoft.begin(), rest, soft + at);
    }
}

/// The outputs that words decide, and those that need further ones.
void QuantisedChannel::receive(const std::uint32_t* words, const std::uint8_t* codeBits, unsigned lane,
                               std::size_t count, std::int8_t* soft, Refinement& refinement) const {
    std::array<std::uint32_t, valuesAtOnce / valuesPerLookUp> undecided;
    draw(words, codeBits, lane, count, soft, undecided.data());
    for (std::size_t start = 0; start < count; start += valuesPerLookUp) {
        for (std::uint32_t bits = undecided[start / valuesPerLookUp]; bits != 0; bits &= bits - 1) {
            const std::size_t at = start + static_cast<std::size_t>(std::countr_zero(bits));
            soft[at] = decide(halfWordOf(words, at), (codeBits[at] >> lane & 1U) != 0, refinement);
        }
    }
}

/// @param start  the first value, a multiple of valuesPerGroup
void QuantisedChannel::send(const RandomSource& source, const std::uint8_t* codeBits, unsigned lane,
                            std::size_t start, std::size_t end, std::int8_t* soft,
                            Refinement& refinement) const {
    std::array<std::uint32_t, groupsAtOnce * wordsPerGroup> words;
    for (; start < end; start += valuesAtOnce) {
        const std::size_t size = std::min(valuesAtOnce, end - start);
        source.words(Purpose::noise, static_cast<std::uint32_t>(start / valuesPerGroup),
                     (size + valuesPerGroup - 1) / valuesPerGroup, words.data());
        receive(words.data(), codeBits + start, lane, size, soft + start, refinement);
    }
}

void QuantisedChannel::transmit(const RandomSource& source, const std::uint8_t* codeBits, unsigned lane,
                                std::size_t count, std::int8_t* soft) const {
    Refinement refinement(source, Purpose::refinement);
    send(source, codeBits, lane, 0, count, soft, refinement);
}

/// The last values of the blocks of an octet, so few that the words of a group are too many.
class QuantisedChannel::LastValues {
  public:
    static constexpr std::size_t most = valuesPerLookUp / 2;

    LastValues(const QuantisedChannel& channel, const RandomSource& source, const std::uint8_t* codeBits,
               std::size_t start, std::size_t count)
        : itsChannel(channel), itsCount(count) {
        const OctetWords drawn =
            source.octetWords(Purpose::noise, static_cast<std::uint32_t>(start / valuesPerGroup), count);
        // A look-up takes those of two blocks: they are decided by the low halves of their words.
        for (unsigned lane = 0; lane < blocksPerOctet; ++lane) {
            for (std::size_t i = 0; i < count; ++i) {
                itsWords[lane / 2 * most + i] |= (drawn.of(lane)[i] & 0xffffU) << 16 * (lane % 2);
                itsCodeBits[lane * most + i] = codeBits[start + i] >> lane & 1U;
            }
        }
        channel.draw(itsWords.data(), itsCodeBits.data(), 0, valuesPerGroup, itsSoft.data(),
                     itsUndecided.data());
    }

    void receive(unsigned lane, std::int8_t* soft, Refinement& refinement) const {
        for (std::size_t i = 0; i < itsCount; ++i) {
            const std::size_t value = lane * most + i;
            const bool isUndecided = (itsUndecided[lane / 2] >> value % valuesPerLookUp & 1U) != 0;
            soft[i] = isUndecided ? itsChannel.decide(halfWordOf(itsWords.data(), value),
                                                      itsCodeBits[value] != 0, refinement)
                                  : itsSoft[value];
        }
    }

  private:
    const QuantisedChannel& itsChannel;
    std::size_t itsCount;
    std::array<std::uint32_t, wordsPerGroup> itsWords{};
    std::array<std::uint8_t, valuesPerGroup> itsCodeBits{};
    std::array<std::int8_t, valuesPerGroup> itsSoft;
    std::array<std::uint32_t, valuesPerGroup / valuesPerLookUp> itsUndecided;
};

void QuantisedChannel::transmitOctet(const RandomSource& source, const std::uint8_t* codeBits,
                                     std::size_t count, std::int8_t* soft) const {
    const std::size_t last = count % valuesPerGroup;
    const std::size_t start = count - last;
    if (start == 0 || last == 0 || last > LastValues::most) {
        Channel::transmitOctet(source, codeBits, count, soft);
        return;
    }
    const OctetWords first = source.octetWords(Purpose::noise, 0, wordsPerGroup);
    const LastValues lastValues(*this, source, codeBits, start, last);
    for (unsigned lane = 0; lane < blocksPerOctet; ++lane, soft += count) {
        const RandomSource own = source.ofLane(lane);
        Refinement refinement(own, Purpose::refinement);
        receive(first.of(lane), codeBits, lane, valuesPerGroup, soft, refinement);
        send(own, codeBits, lane, valuesPerGroup, start, soft, refinement);
        lastValues.receive(lane, soft + start, refinement);
    }
}

double QuantisedChannel::probability(int soft, bool codeBit) const {
    constexpr double unit = 1.0 / static_cast<double>(std::uint64_t{1} << channelBits);
    const auto below = [this](int output) -> double {  // of an output for code bit 1
        if (output <= lowestOutput) {
            return 0;
        }
        return output > highestOutput
                   ? 1
                   : static_cast<double>(itsThresholds[static_cast<std::size_t>(output - lowestOutput - 1)]) *
                         unit;
    };
    const int first = codeBit ? soft : (soft == 127 ? lowestOutput : -soft);
    const int last = codeBit ? (soft == 127 ? highestOutput : soft) : -soft;
    return below(last + 1) - below(first);
}

}  // namespace quarzel::link
