// SPDX-License-Identifier: MIT
#include "engine/engine.hpp"

#include "engine/cpu_features.hpp"
#include "engine/engine_mod.hpp"
#include "engine/engine_mod_hash.hpp"
#include "fixed/properties.hpp"

TCalculationEngine::TCalculationEngine() : itsSSE2(hasSSE2()) {}

TCalculationEngine* TCalculationEngine::create(const std::string& properties) {
    const auto [type, rest] = splitString(properties, ":");
    if (type == "MOD") {
        return TCalculationEngineMod::create(rest);
    }
    if (type == "MOD#") {
        return TCalculationEngineModHash::create(rest);
    }
    quarzel::standardStreams.error({"ERROR:TCalculationEngine:Unrecognised type:", type});
    return nullptr;
}

std::vector<std::string> TCalculationEngine::getNames() {
    return {"MOD"};
}

bool TCalculationEngine::initialise() {
    const std::int16_t mask = itsStateFormat->mask;
    if (mask == mask / 2) {
        itsMessages.warning(
            {"WARNING:The state number format is set to maximum bit width. Note that this will cause a 1-bit "
             "truncation during intrinsic calculations"});
    }
    return true;
}
