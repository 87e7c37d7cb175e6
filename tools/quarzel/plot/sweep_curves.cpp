// SPDX-License-Identifier: MIT
#include "plot/sweep_curves.hpp"

#include <iterator>

#include "files/input_file.hpp"
#include "sweep/error.hpp"
#include "sweep/result.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

/// The code rate is taken as 1/3 where each code bit of a code block alone is sent once.
double bitsPerSymbol(const sweep::Setup& setup) {
    const unsigned bits = link::bitsOfSymbol(setup.sending.modulation);
    return setup.sending.codedBits == 0
               ? bits / 3.0
               : static_cast<double>(setup.informationBits()) / setup.codedBits() * bits;
}

/// Without the size of transport blocks, and without the comma that comes before it elsewhere.
std::string sendingOf(sweep::Sending sending) {
    sending.transportBlock = 0;
    const std::string text = sweep::sendingText(sending);
    return text.empty() ? text : text.substr(2);
}

/// What is drawn of a point: after the last transmission.
sweep::PointState drawnState(const sweep::Setup& setup, sweep::PointState point) {
    if (setup.transmissions() > 1) {
        point.counts = {point.last()};
    }
    return point;
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
                                  setup.sending.transportBlock != 0,
                                  setup.informationBits(),
                                  setup.units,
                                  setup.algorithm,
                                  setup.iterations,
                                  setup.quantiser,
                                  sendingOf(setup.sending),
                                  result.seed,
                                  bitsPerSymbol(setup),
                                  {}});
            }
            curves.back().points.push_back({setup.ebN0.value(), drawnState(setup, point)});
            last = &setup;
        }
        return curves;
    } catch (const sweep::Error& error) {
        throw fileError(file, error.problem(), error.remedy());
    }
}

}  // namespace quarzel::tool
