// SPDX-License-Identifier: MIT
#include "sweep/result.hpp"

#include "sweep/document.hpp"
#include "sweep/error.hpp"
#include "sweep/statistics.hpp"

namespace quarzel::sweep {

namespace {

Json intervalJson(const Interval& interval) {
    return Json::array({interval.low, interval.high});
}

Json pointJson(const PointState& point, link::Decibels ebN0, const Curve& curve, bool perIteration) {
    const Rates rates = ratesOf(point, curve.blockSize);
    Json json = {
        {"ebn0_db", ebN0.value()},
        {"blocks", point.blocks},
        {"bits", point.blocks * curve.blockSize},
        {"bit_errors", point.last().bitErrors},
        {"block_errors", point.last().blockErrors},
        {"bit_error_squares", point.bitErrorSquares},
        {"ber", rates.ber},
        {"bler", rates.bler},
        {"ber_interval", intervalJson(rates.berInterval)},
        {"bler_interval", intervalJson(rates.blerInterval)},
        {"stopped_by", nameOf(point.stoppedBy.value())},
    };
    if (perIteration) {
        json["per_iteration"] = Json::array();
        for (const ErrorCount& count : point.counts) {
            json["per_iteration"].push_back(
                {{"bit_errors", count.bitErrors}, {"block_errors", count.blockErrors}});
        }
    }
    return json;
}

ErrorCount countFrom(const Json& json) {
    return {json.at("bit_errors").get<std::uint64_t>(), json.at("block_errors").get<std::uint64_t>()};
}

PointState pointFrom(const Json& json) {
    PointState point;
    point.blocks = json.at("blocks").get<std::uint64_t>();
    point.bitErrorSquares = json.at("bit_error_squares").get<std::uint64_t>();
    point.stoppedBy = stopReasonOf(json.at("stopped_by").get<std::string>()).value();
    point.counts = {countFrom(json)};
    if (json.contains("per_iteration")) {
        point.counts.clear();
        for (const Json& count : json.at("per_iteration")) {
            point.counts.push_back(countFrom(count));
        }
    }
    return point;
}

}  // namespace

std::string pointText(const Configuration& configuration, std::size_t number, const PointState& point) {
    const std::size_t points = configuration.ebN0.size();
    return pointJson(point, configuration.ebN0.at(number % points),
                     configuration.curves().at(number / points), configuration.perIteration)
        .dump();
}

std::string resultText(const Result& result) {
    const Configuration& configuration = result.configuration;
    Json document = newDocument(resultFormat, result.quarzel);
    document["configuration"] = toJson(configuration);
    document["curves"] = Json::array();
    std::size_t next = 0;
    for (const Curve& curve : configuration.curves()) {
        Json points = Json::array();
        for (const link::Decibels& ebN0 : configuration.ebN0) {
            points.push_back(pointJson(result.points.at(next++), ebN0, curve, configuration.perIteration));
        }
        document["curves"].push_back({{"block_size", curve.blockSize},
                                      {"units", curve.units},
                                      {"algorithm", curve.algorithm},
                                      {"iterations", curve.iterations},
                                      {"points", std::move(points)}});
    }
    return textOf(std::move(document), resultIndent);
}

Result readResult(std::string_view text) {
    const Json document = readDocument(text, resultFormat, resultIndent);
    try {
        Result result{configurationFrom(document.at("configuration")), {}, document.at("quarzel")};
        for (const Json& curve : document.at("curves")) {
            for (const Json& point : curve.at("points")) {
                result.points.push_back(pointFrom(point));
            }
        }
        if (result.points.size() != result.configuration.points()) {
            throw Error("does not hold the points of its configuration", "use another copy of it");
        }
        return result;
    } catch (const std::exception& error) {
        throw Error(std::string("is not understood: ") + error.what(), "use another copy of it");
    }
}

}  // namespace quarzel::sweep
