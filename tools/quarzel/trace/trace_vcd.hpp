// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "trace/trace_writer.hpp"

namespace quarzel::tool {

/// Writes passes as waves, a step each 10 ns: block, pass, code and step, the step's soft inputs, and every
/// signal as an integer in units of 1/8.
class TraceVcd : public TraceWriter {
  public:
    explicit TraceVcd(Write write);

    void add(const vardel_ip_quarzel_pass& pass) override;
    void end() override;

  private:
    void change(std::size_t variable, std::int64_t value);
    void startStep();

    Write itsWrite;
    std::vector<std::optional<std::int64_t>> itsValues;  ///< of each variable, none before the first step
    std::vector<std::string> itsBits;                    ///< of each value of 12 bits, less the lowest one
    std::uint64_t itsTime = 0;
    std::string itsText;
};

}  // namespace quarzel::tool
