// SPDX-License-Identifier: MIT
#include "plot/sweep_curves.hpp"

#include <fmt/format.h>

#include <iterator>

#include "files/input_file.hpp"
#include "sweep/error.hpp"
#include "sweep/result.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

/// BPSK, and the code rate is taken as 1/3.
constexpr double bitsPerSymbol = 1.0 / 3;

std::string quantiserText(const link::Quantiser& quantiser) {
    return fmt::format("{} \u00d7 {}", quantiser.kind == link::Quantiser::Kind::llr ? "LLR" : "amplitude",
                       quantiser.scale);
}

}  // namespace

std::vector<SweepCurve> readSweepCurves(const std::string& file) {
    std::ifstream stream = openInput(file);
    const std::string text(std::istreambuf_iterator<char>(stream), {});
    try {
        const sweep::Result result = sweep::readResult(text);
        std::vector<SweepCurve> curves;
        const sweep::Setup* last = nullptr;
        for (const auto& [setup, point] : result.points) {
            if (last == nullptr || !sweep::isSameCurve(setup, *last)) {
                curves.push_back({file,
                                  setup.blockSize,
                                  setup.units,
                                  setup.algorithm,
                                  setup.iterations,
                                  quantiserText(setup.quantiser),
                                  result.seed,
                                  bitsPerSymbol,
                                  {}});
            }
            curves.back().points.push_back({setup.ebN0.value(), point});
            last = &setup;
        }
        return curves;
    } catch (const sweep::Error& error) {
        throw fileError(file, error.problem(), error.remedy());
    }
}

}  // namespace quarzel::tool
