// SPDX-License-Identifier: MIT
#include "engine/engine_mod.hpp"

TCalculationEngineMod* TCalculationEngineMod::create(const std::string& properties) {
    if (!properties.empty()) {
        quarzel::standardStreams.error({"ERROR:TCalculationEngineMod:Unexpected properties:", properties});
        return nullptr;
    }
    return new TCalculationEngineMod;
}

std::string TCalculationEngineMod::getProperties() const {
    return "MOD";
}

bool TCalculationEngineMod::initialise() {
    select(AlgorithmType::Mod, nullptr);
    return true;
}
