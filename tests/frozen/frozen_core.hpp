// SPDX-License-Identifier: MIT
#pragma once

#include <stdexcept>
#include <string>
#include <vector>

#include "frozen/frozen_input.hpp"
#include "support/model.hpp"

namespace quarzel::test {

/// K bytes of 0 or 1 for each block.
using Decisions = std::vector<std::vector<unsigned char>>;

/// A core by one of its implementations.
class FrozenCore {
  public:
    /// @param which  its K is not needed
    FrozenCore(const FrozenCase& which, const std::string& implementation)
        : itsState(
              makeState(genericsOf(static_cast<int>(which.units), 8, static_cast<int>(which.algorithm)))) {
        if (vardel_ip_quarzel_set_implementation(itsState.get(), implementation.c_str()) != 0) {
            throw std::runtime_error("there is no implementation " + implementation);
        }
    }

    Decisions operator()(const std::vector<Block>& blocks) const {
        Decisions decisions;
        std::vector<vardel_ip_quarzel_inputs> inputs;
        std::vector<vardel_ip_quarzel_outputs> outputs;
        for (const Block& block : blocks) {
            const std::size_t K = block.systematic.size() - 4;
            decisions.emplace_back(K, 0xEE);
            inputs.push_back(block.inputs());
            outputs.push_back({decisions.back().data(), static_cast<int>(K), 0, 0});
        }
        if (vardel_ip_quarzel_bitacc_simulate_batch(itsState.get(), outputs.data(), inputs.data(),
                                                    static_cast<int>(blocks.size()), nullptr) != 0) {
            throw std::runtime_error("a block was not decoded");
        }
        return decisions;
    }

  private:
    State itsState;
};

/// The implementations of this machine.
inline std::vector<std::string> implementations() {
    std::vector<std::string> names;
    while (const char* name = vardel_ip_quarzel_get_implementation_name(static_cast<int>(names.size()))) {
        names.emplace_back(name);
    }
    return names;
}

}  // namespace quarzel::test
