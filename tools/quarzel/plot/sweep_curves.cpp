// SPDX-License-Identifier: MIT
#include "plot/sweep_curves.hpp"

#include <fmt/format.h>

#include <iterator>

#include "files/input_file.hpp"
#include "sweep/document.hpp"
#include "sweep/error.hpp"
#include "sweep/result.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

using sweep::Json;

MeasuredRate rateFrom(const Json& point, const std::string& name) {
    const Json& interval = point.at(name + "_interval");
    return {point.at(name), interval.at(0), interval.at(1)};
}

MeasuredPoint pointFrom(const Json& json) {
    MeasuredPoint point{json.at("ebn0_db"), rateFrom(json, "ber"), rateFrom(json, "bler"), {}, {}};
    if (const auto counts = json.find("per_iteration"); counts != json.end()) {
        for (const Json& count : *counts) {
            point.berAfter.push_back(count.at("bit_errors").get<double>() / json.at("bits").get<double>());
            point.blerAfter.push_back(count.at("block_errors").get<double>() /
                                      json.at("blocks").get<double>());
        }
    }
    return point;
}

std::string quantiserText(const Json& quantiser) {
    return fmt::format("{} \u00d7 {}", quantiser.at("kind") == "llr" ? "LLR" : "amplitude",
                       quantiser.at("scale").get<double>());
}

}  // namespace

std::vector<SweepCurve> readSweepCurves(const std::string& file) {
    std::ifstream stream = openInput(file);
    const std::string text(std::istreambuf_iterator<char>(stream), {});
    try {
        const Json document = sweep::readDocument(text, sweep::resultFormat, sweep::resultIndent);
        const Json& configuration = document.at("configuration");
        std::vector<SweepCurve> curves;
        for (const Json& json : document.at("curves")) {
            SweepCurve& curve = curves.emplace_back(SweepCurve{file,
                                                               json.at("block_size"),
                                                               json.at("units"),
                                                               json.at("algorithm"),
                                                               json.at("iterations"),
                                                               quantiserText(configuration.at("quantiser")),
                                                               configuration.at("seed"),
                                                               {}});
            for (const Json& point : json.at("points")) {
                curve.points.push_back(pointFrom(point));
            }
        }
        return curves;
    } catch (const sweep::Error& error) {
        throw fileError(file, error.problem(), error.remedy());
    } catch (const Json::exception&) {
        throw fileError(file, "is not a well-formed sweep result",
                        "give a file that 'quarzel sweep -o' wrote");
    }
}

}  // namespace quarzel::tool
