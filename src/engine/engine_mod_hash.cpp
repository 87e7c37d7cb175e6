// SPDX-License-Identifier: MIT
#include "engine/engine_mod_hash.hpp"

#include <locale>
#include <sstream>

TCalculationEngineModHash* TCalculationEngineModHash::create(const std::string& properties) {
    std::uint32_t points = 0;
    if (!properties.empty()) {
        std::istringstream stream(properties);
        stream.imbue(std::locale::classic());
        if (!(stream >> points)) {
            quarzel::standardStreams.error({"ERROR:TCalculationEngineModHash:Illegal number of points"});
            return nullptr;
        }
    }
    return new TCalculationEngineModHash(points);
}

std::string TCalculationEngineModHash::getProperties() const {
    return "MOD#:" + std::to_string(itsPoints);
}

bool TCalculationEngineModHash::initialise() {
    std::vector<unsigned char> table = createLUT(itsPoints, itsStateFormat, itsMessages);
    if (table.empty()) {
        return false;
    }
    itsLUT = std::move(table);
    itsTableFormat = *itsStateFormat;
    select(AlgorithmType::ModHash, itsLUT.data() + lutCentre);
    return true;
}
