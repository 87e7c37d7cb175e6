// SPDX-License-Identifier: MIT
#pragma once

#include "engine/engine_mod_base.hpp"

/// The max-log engine, "MOD".
class TCalculationEngineMod : public TCalculationEngineModBase {
  public:
    /// @param properties  what follows "MOD:"; must be empty
    /// @return a new engine that the caller deletes, or null after a line on the standard error stream
    static TCalculationEngineMod* create(const std::string& properties);

    std::string getProperties() const override;
    bool initialise() override;
};
