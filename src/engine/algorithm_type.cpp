// SPDX-License-Identifier: MIT
#include <istream>
#include <ostream>
#include <string_view>

#include "engine/engine_mod_base.hpp"

using AlgorithmType = TCalculationEngineModBase::AlgorithmType;

std::ostream& operator<<(std::ostream& stream, AlgorithmType type) {
    switch (type) {
        case AlgorithmType::Mod:
            return stream << "MOD";
        case AlgorithmType::ModStar:
            return stream << "MOD*";
        case AlgorithmType::ModHash:
            return stream << "MOD#";
    }
    return stream << "<unknown>";
}

std::istream& operator>>(std::istream& stream, AlgorithmType& type) {
    type = AlgorithmType{};
    for (const std::string_view either : {"Mm", "Oo", "Dd"}) {
        // peek() at the end of a stream would fail it
        if (!stream.good()) {
            return stream;
        }
        const int next = stream.peek();
        if (next != either[0] && next != either[1]) {
            return stream;
        }
        stream.get();
    }
    const int next = stream.peek();
    if (next <= ' ' || next == ':') {
        type = AlgorithmType::Mod;
    } else if (next == '*' || next == '#') {
        stream.get();
        type = next == '*' ? AlgorithmType::ModStar : AlgorithmType::ModHash;
    }
    return stream;
}
