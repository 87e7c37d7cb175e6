// SPDX-License-Identifier: MIT
#include "engine/engine_mod_hash.hpp"

#include <locale>
#include <sstream>

#include "fixed/text_output.hpp"

TCalculationEngineModHash* TCalculationEngineModHash::create(const std::string& properties) {
    std::uint32_t points = 0;
    if (!properties.empty()) {
        std::istringstream stream(properties);
        stream.imbue(std::locale::classic());
        if (!(stream >> points)) {
            quarzel::errorLine("ERROR:TCalculationEngineModHash:Illegal number of points");
            return nullptr;
        }
    }
    return new TCalculationEngineModHash(points);
}

std::string TCalculationEngineModHash::getProperties() const {
    return "MOD#:" + std::to_string(itsPoints);
}

bool TCalculationEngineModHash::initialise() {
    std::vector<unsigned char> table = createLUT(itsPoints, itsStateFormat);
    if (table.empty()) {
        return false;
    }
    itsLUT = std::move(table);
    select(AlgorithmType::ModHash, itsLUT.data() + lutCentre);
    return true;
}
