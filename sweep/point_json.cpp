// SPDX-License-Identifier: MIT
#include "sweep/point_json.hpp"

#include <algorithm>
#include <cmath>
#include <stdexcept>
#include <string>

#include "sweep/statistics.hpp"

namespace quarzel::sweep {

namespace {

template <class Value>
Json valueJson(const Value& value) {
    return value;
}

Json valueJson(link::Quantiser::Kind kind) {
    return nameOf(kind);
}

template <class Value>
void readValue(const Json& json, Value& value) {
    json.get_to(value);
}

void readValue(const Json& json, link::Quantiser::Kind& kind) {
    kind = quantiserKindOf(json.get<std::string>()).value();
}

Json intervalJson(const Interval& interval) {
    return Json::array({interval.low, interval.high});
}

Json countJson(const ErrorCount& count) {
    return {{"bit_errors", count.bitErrors}, {"block_errors", count.blockErrors}};
}

ErrorCount countFrom(const Json& json) {
    return {json.at("bit_errors").get<std::uint64_t>(), json.at("block_errors").get<std::uint64_t>()};
}

void requirePossible(const PointState& point, const Setup& setup) {
    constexpr std::uint64_t mostBlocks = std::uint64_t{1} << 40;
    const bool isPossible =
        point.blocks <= mostBlocks &&
        std::all_of(point.counts.begin(), point.counts.end(), [&](const ErrorCount& count) {
            return count.blockErrors <= point.blocks && count.bitErrors <= point.blocks * setup.blockSize;
        });
    if (!isPossible) {
        throw std::runtime_error("a point has more errors or blocks than there can be");
    }
}

}  // namespace

Json curveJson(const Setup& setup) {
    Json json = Json::object();
    forEachField(setup, [&json](const char* name, const auto& value) { json[name] = valueJson(value); });
    return json;
}

Json pointJson(const Setup& setup, const PointState& point) {
    const Rates rates = ratesOf(point, setup.blockSize);
    Json json = {
        {"ebn0_db", setup.ebN0.value()},
        {"blocks", point.blocks},
        {"bits", point.blocks * setup.blockSize},
        {"bit_errors", point.last().bitErrors},
        {"block_errors", point.last().blockErrors},
        {"bit_error_squares", point.bitErrorSquares},
        {"ber", rates.ber},
        {"bler", rates.bler},
        {"ber_interval", intervalJson(rates.berInterval)},
        {"bler_interval", intervalJson(rates.blerInterval)},
        {"stopped_by", point.stoppedBy ? Json(nameOf(*point.stoppedBy)) : Json()},
    };
    if ((!point.stoppedBy || point.stoppedBy == StopReason::time) && point.seconds > 0) {
        json["seconds"] = point.seconds;
    }
    if (point.counts.size() > 1) {
        json["per_iteration"] = Json::array();
        for (const ErrorCount& count : point.counts) {
            json["per_iteration"].push_back(countJson(count));
        }
    }
    return json;
}

std::pair<Setup, PointState> pointFrom(const Json& curve, const Json& json) {
    Setup setup;
    forEachField(setup, [&curve](const char* name, auto& value) { readValue(curve.at(name), value); });
    if (!(std::abs(json.at("ebn0_db").get<double>()) < 1000)) {
        throw std::runtime_error("an Eb/N0 is not a number of decibels");
    }
    setup.ebN0 = {static_cast<std::int32_t>(std::lround(json.at("ebn0_db").get<double>() * 1e6))};
    setup.check();
    PointState point;
    json.at("blocks").get_to(point.blocks);
    json.at("bit_error_squares").get_to(point.bitErrorSquares);
    if (const Json& reason = json.at("stopped_by"); !reason.is_null()) {
        point.stoppedBy = stopReasonOf(reason.get<std::string>()).value();
    }
    point.seconds = json.value("seconds", 0.0);
    point.counts = {countFrom(json)};
    if (json.contains("per_iteration")) {
        point.counts.clear();
        for (const Json& count : json.at("per_iteration")) {
            point.counts.push_back(countFrom(count));
        }
        if (point.counts.size() != static_cast<std::size_t>(setup.iterations)) {
            throw std::runtime_error("a point does not have a count for each iteration");
        }
    }
    requirePossible(point, setup);
    return {setup, std::move(point)};
}

}  // namespace quarzel::sweep
