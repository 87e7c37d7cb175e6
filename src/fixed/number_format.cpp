// SPDX-License-Identifier: MIT
#include "fixed/number_format.hpp"

#include <limits>
#include <locale>
#include <ostream>
#include <sstream>

#include "fixed/messages.hpp"
#include "fixed/properties.hpp"

using quarzel::standardStreams;

namespace {

/// A 32-bit shift by the low five bits of the count.
constexpr std::uint32_t shiftLeft(std::uint32_t value, std::uint32_t count) {
    return value << (count & 31U);
}

}  // namespace

TNumberFormat::TNumberFormat(std::uint32_t nbits_, std::uint32_t binpt_)
    : nbits(nbits_), binpt(binpt_), shift(16U - nbits_), scale(shiftLeft(1, binpt_)) {
    const std::uint32_t half = shiftLeft(1, nbits - 1U);
    maxQ = static_cast<std::int32_t>(half - 1U);
    minQ = static_cast<std::int32_t>(0U - half);
    max = toWord(maxQ);
    min = toWord(minQ);
    mask = static_cast<std::int16_t>(max | min);
}

TNumberFormat* TNumberFormat::create(const std::string& properties) {
    const auto [head, rest] = splitString(properties, "_");
    std::istringstream stream(rest);
    stream.imbue(std::locale::classic());
    // Signed and wider than the fields, so that a negative number does not wrap into their range.
    std::int64_t nbits = 0;
    std::int64_t binpt = 0;
    constexpr std::int64_t most = std::numeric_limits<std::uint32_t>::max();
    char separator = '\0';
    stream >> nbits >> separator >> binpt;
    if (head != "Fix" || stream.fail() || separator != '_' || nbits > most || binpt > most) {
        standardStreams.error({"ERROR:TNumberFormat:Unexpected property string:", properties});
        return nullptr;
    }
    if (nbits < 1 || nbits > 16) {
        standardStreams.error({"ERROR:TNumberFormat:nbits must be in range [1:16]"});
        return nullptr;
    }
    if (binpt < 1 || binpt > 16 || binpt >= nbits) {
        standardStreams.error({"ERROR:TNumberFormat:binpt must be in range [1:16] and <nbits"});
        return nullptr;
    }
    return new TNumberFormat(static_cast<std::uint32_t>(nbits), static_cast<std::uint32_t>(binpt));
}

std::string TNumberFormat::getProperties() const {
    return "Fix_" + std::to_string(nbits) + "_" + std::to_string(binpt);
}

std::ostream& operator<<(std::ostream& stream, const TNumberFormat& format) {
    return stream << "NBITS=" << format.nbits << " BINPT=" << format.binpt << " Shift=" << format.shift
                  << " Scale=" << format.scale << " Min=" << format.min << " Max=" << format.max
                  << " MinQ=" << format.minQ << " MaxQ=" << format.maxQ << " Mask=" << format.mask;
}
