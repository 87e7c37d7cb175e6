// SPDX-License-Identifier: MIT
#include "plot/plot_inputs.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <tuple>
#include <utility>

#include "plot/joined_curves.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

template <class Value>
bool isWanted(const std::vector<Value>& wanted, Value value) {
    return wanted.empty() || std::find(wanted.begin(), wanted.end(), value) != wanted.end();
}

bool isWantedQuantiser(const std::vector<double>& llrScales, const link::Quantiser& quantiser) {
    return isWanted(llrScales, quantiser.scale) &&
           (llrScales.empty() || quantiser.kind == link::Quantiser::Kind::llr);
}

/// Leave out the curves that differ from the longest in their iterations alone, which it contains.
void keepLongest(std::vector<SweepCurve>& curves) {
    const auto setupOf = [](const SweepCurve& curve) {
        return std::tie(curve.isTransportBlock, curve.blockSize, curve.units, curve.algorithm,
                        curve.quantiser, curve.sending, curve.seed);
    };
    const SweepCurve longest = *std::max_element(
        curves.begin(), curves.end(),
        [](const SweepCurve& a, const SweepCurve& b) { return a.iterations < b.iterations; });
    std::erase_if(curves, [&](const SweepCurve& curve) {
        return curve.iterations < longest.iterations && setupOf(curve) == setupOf(longest);
    });
}

std::vector<SweepCurve> allCurves(const PlotOptions& options) {
    std::vector<SweepCurve> curves;
    for (const std::string& result : options.results) {
        for (SweepCurve& curve : readSweepCurves(result)) {
            if (isWanted(options.blockSizes, curve.blockSize) && isWanted(options.units, curve.units) &&
                isWanted(options.algorithms, curve.algorithm) &&
                isWantedQuantiser(options.llrScales, curve.quantiser) &&
                (options.picture.perIteration || isWanted(options.iterations, curve.iterations))) {
                curves.push_back(std::move(curve));
            }
        }
    }
    if (curves.empty()) {
        throw ToolError(ExitCode::usage, "", "the results have no curve that was asked for",
                        "leave out --block-size, --units, --algorithm, --llr and --iterations");
    }
    return joinedCurves(std::move(curves));
}

/// Check that the iterations of one curve can be drawn as wanted.
void checkIterations(const PlotOptions& options, const std::vector<SweepCurve>& curves) {
    if (curves.size() > 1) {
        throw ToolError(ExitCode::usage, "--per-iteration", fmt::format("there are {} curves", curves.size()),
                        "choose one with --block-size, --units, --algorithm and --llr");
    }
    const SweepCurve& curve = curves.front();
    for (const int iteration : options.iterations) {
        if (iteration > curve.iterations) {
            throw ToolError(ExitCode::usage, "--iterations",
                            fmt::format("the curve has no iteration {}", iteration),
                            fmt::format("give numbers up to {}", curve.iterations));
        }
    }
    const auto count = static_cast<std::size_t>(curve.iterations);
    if (std::any_of(curve.points.begin(), curve.points.end(),
                    [count](const MeasuredPoint& point) { return point.state.counts.size() != count; })) {
        throw fileError(curve.file, "has no error rates per iteration",
                        "make it with 'quarzel sweep --per-iteration'");
    }
}

}  // namespace

std::vector<SweepCurve> readCurves(const PlotOptions& options) {
    std::vector<SweepCurve> curves = allCurves(options);
    if (options.picture.perIteration) {
        keepLongest(curves);
        checkIterations(options, curves);
    }
    return curves;
}

std::vector<ReferenceCurve> readReferences(const PlotOptions& options) {
    std::vector<ReferenceCurve> references;
    for (const std::string& reference : options.references) {
        for (ReferenceCurve& curve : readReferenceCurves(reference)) {
            if (!curve.blockSize || isWanted(options.blockSizes, *curve.blockSize)) {
                references.push_back(std::move(curve));
            }
        }
    }
    return references;
}

}  // namespace quarzel::tool
