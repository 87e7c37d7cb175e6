// SPDX-License-Identifier: MIT
#pragma once

#include <memory>
#include <string>

#include "engine/engine.hpp"
#include "fixed/number_format.hpp"

namespace quarzel::test {

/// An engine with formats of its own, ready for use.
struct EngineSetup {
    std::unique_ptr<TNumberFormat> state;
    std::unique_ptr<TNumberFormat> branch;
    std::unique_ptr<TCalculationEngine> engine;

    explicit EngineSetup(const std::string& properties = "MOD", const std::string& stateFormat = "Fix_12_3",
                         const std::string& branchFormat = "Fix_8_3")
        : state(TNumberFormat::create(stateFormat)),
          branch(TNumberFormat::create(branchFormat)),
          engine(TCalculationEngine::create(properties)) {
        engine->setFormats(branch.get(), state.get(), branch.get());
        engine->initialise();
    }
};

}  // namespace quarzel::test
