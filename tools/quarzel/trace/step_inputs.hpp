// SPDX-License-Identifier: MIT
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "trace/trace_comparison.hpp"

namespace quarzel::tool {

/// A trace does not tell what is needed to recompute a value.
struct MissingInput {
    std::string name;
};

/// What the step of a difference is computed of, as A tells it. It remembers what was asked for, to say
/// whether B has the same.
class StepInputs {
  public:
    /// @param difference  must outlive it
    explicit StepInputs(const TraceDifference& difference) : itsDifference(difference) {}

    /// A value of the pass.
    /// @throws MissingInput when A does not tell it
    int value(const char* signal, std::optional<unsigned> number, std::uint32_t step) {
        return take({itsDifference.pass, step, *findColumn(signal, number)});
    }

    /// The same without remembering it.
    /// @throws MissingInput
    int peek(const char* signal, unsigned number, std::uint32_t step) const {
        return known({itsDifference.pass, step, *findColumn(signal, number)});
    }

    /// The soft input "sys", "par0" or "par1" of the step.
    /// @throws MissingInput
    int soft(const char* stream);

    /// A number and how it comes about.
    struct Sum {
        int value;
        std::string text;
    };

    /// Twice the intrinsic value of the step: the systematic value and half the extrinsic value of the pass
    /// before. The trace itself shows half of it, rounded down.
    /// @throws MissingInput
    Sum twiceIntrinsic();

    /// A number as it stands behind a sign.
    static std::string parenthesised(int number);

    /// @name Names of the values asked for; empty when there are none
    /// @{
    std::string notToldByB() const;
    std::string otherInB() const;
    /// @}
    bool any() const { return !itsTaken.empty(); }

  private:
    struct Place {
        std::optional<std::uint32_t> pass;
        std::uint32_t step;
        unsigned column;
    };

    int take(const Place& place);
    int known(const Place& place) const;
    std::string nameOf(const Place& place) const;
    TraceValue valueIn(std::size_t trace, const Place& place) const;
    template <class Is>
    std::string namesOf(Is is) const;

    const TraceDifference& itsDifference;
    std::vector<Place> itsTaken;
};

}  // namespace quarzel::tool
