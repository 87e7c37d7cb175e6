// SPDX-License-Identifier: MIT
#include "engine/engine_mod.hpp"

#include "fixed/text_output.hpp"

TCalculationEngineMod* TCalculationEngineMod::create(const std::string& properties) {
    if (!properties.empty()) {
        quarzel::errorLine("ERROR:TCalculationEngineMod:Unexpected properties:" + properties);
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
