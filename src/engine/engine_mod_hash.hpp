// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "engine/engine_mod_base.hpp"

/// The max-star engine with a correction table whose corrections are applied one level late, "MOD#".
class TCalculationEngineModHash : public TCalculationEngineModBase {
  public:
    /// @param properties  what follows "MOD#:": the number of table points in decimal, or nothing for a table
    ///                    of full resolution. Its value is checked by `initialise`.
    /// @return a new engine that the caller deletes, or null after a line on the standard error stream
    static TCalculationEngineModHash* create(const std::string& properties);

    /// "MOD#:" and the number of points, 0 when none was given.
    std::string getProperties() const override;

    /// Build the correction table for the state format and select the deferred max-star kernels.
    /// @return false, with the engine as it was, when there is no such table
    bool initialise() override;

    std::uint32_t points() const { return itsPoints; }

    /// The state format that `initialise` built the table for; none before.
    const std::optional<TNumberFormat>& tableFormat() const { return itsTableFormat; }

  private:
    explicit TCalculationEngineModHash(std::uint32_t points) : itsPoints(points) {}

    std::uint32_t itsPoints;
    std::vector<unsigned char> itsLUT;  ///< 65536 entries after `initialise`, empty before
    std::optional<TNumberFormat> itsTableFormat;
};
