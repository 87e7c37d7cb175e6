// SPDX-License-Identifier: MIT
#include "sweep/point_json.hpp"

#include <algorithm>
#include <cmath>
#include <stdexcept>
#include <string>
#include <vector>

#include "sweep/json_text.hpp"
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

Json valueJson(link::Modulation modulation) {
    return nameOf(modulation);
}

Json valueJson(link::Fading fading) {
    return link::channelNames.at(static_cast<std::size_t>(fading));
}

Json valueJson(link::Demapping demapping) {
    return link::demappingNames.at(static_cast<std::size_t>(demapping));
}

Json valueJson(Stop stop) {
    return nameOf(stop);
}

void readValue(const Json& json, double& value) {
    json.get_to(value);
}

template <std::integral Value>
void readValue(const Json& json, Value& value) {
    value = wholeNumber<Value>(json);
}

void readValue(const Json& json, std::vector<unsigned>& values) {
    values = wholeNumbers<unsigned>(json);
}

void readValue(const Json& json, link::Quantiser::Kind& kind) {
    kind = quantiserKindOf(json.get<std::string>()).value();
}

void readValue(const Json& json, link::Modulation& modulation) {
    modulation = link::modulationOf(json.get<std::string>());
}

void readValue(const Json& json, link::Fading& fading) {
    fading = link::fadingOf(json.get<std::string>());
}

void readValue(const Json& json, link::Demapping& demapping) {
    demapping = link::demappingOf(json.get<std::string>());
}

void readValue(const Json& json, Stop& stop) {
    stop = stopOf(json.get<std::string>()).value();
}

/// The fields of how blocks are sent, as JSON; of the default or another one.
std::vector<Json> sendingFields(const Sending& sending) {
    std::vector<Json> fields;
    forEachSendingField(sending,
                        [&fields](const char*, const auto& value) { fields.push_back(valueJson(value)); });
    return fields;
}

Json intervalJson(const Interval& interval) {
    return Json::array({interval.low, interval.high});
}

Json countJson(const Setup& setup, const ErrorCount& count) {
    Json json = {{"bit_errors", count.bitErrors}, {"block_errors", count.blockErrors}};
    if (setup.sending.transportBlock != 0) {
        json["undetected_errors"] = count.undetected;
    }
    return json;
}

/// What a point has beside the rates when its blocks are coded.
void appendSending(Json& json, const Setup& setup, const PointState& point) {
    if (setup.sending.isPlain()) {
        return;
    }
    if (setup.sending.transportBlock != 0) {
        json["undetected_errors"] = point.last().undetected;
    }
    json["throughput"] = throughput(setup, point, point.counts.size() - 1);
    if (!point.iterationsUsed.empty()) {
        json["mean_iterations"] = meanIterations(point);
        json["iterations_used"] = point.iterationsUsed;
    }
    for (std::size_t t = 0; setup.transmissions() > 1 && t < point.counts.size(); ++t) {
        Json count = countJson(setup, point.counts[t]);
        count["blocks_sent"] = blocksSent(point, t);
        count["throughput"] = throughput(setup, point, t);
        json["transmissions"].push_back(std::move(count));
    }
}

ErrorCount countFrom(const Json& json) {
    return {wholeNumber<std::uint64_t>(json.at("bit_errors")),
            wholeNumber<std::uint64_t>(json.at("block_errors")),
            wholeNumber<std::uint64_t>(json.value("undetected_errors", Json(0U)))};
}

void requirePossible(const PointState& point, const Setup& setup) {
    constexpr std::uint64_t mostBlocks = std::uint64_t{1} << 40;
    const bool isPossible =
        point.blocks <= mostBlocks &&
        std::all_of(point.counts.begin(), point.counts.end(), [&](const ErrorCount& count) {
            const bool hasCrc = setup.sending.transportBlock != 0;
            return count.blockErrors <= point.blocks &&
                   count.undetected <= (hasCrc ? count.blockErrors : 0) &&
                   count.bitErrors <= point.blocks * setup.informationBits();
        });
    if (!isPossible) {
        throw std::runtime_error("a point has more errors or blocks than there can be");
    }
}

}  // namespace

Json curveJson(const Setup& setup) {
    Json json = Json::object();
    forEachField(setup, [&json](const char* name, const auto& value) { json[name] = valueJson(value); });
    const std::vector<Json> usual = sendingFields(Sending{});
    std::size_t i = 0;
    forEachSendingField(setup.sending, [&](const char* name, const auto& value) {
        if (Json field = valueJson(value); field != usual[i++]) {
            json[name] = std::move(field);
        }
    });
    return json;
}

Json pointJson(const Setup& setup, const PointState& point) {
    const Rates rates = ratesOf(point, setup.informationBits());
    Json json = {
        {"ebn0_db", setup.ebN0.value()},
        {"blocks", point.blocks},
        {"bits", point.blocks * setup.informationBits()},
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
    appendSending(json, setup, point);
    if (point.counts.size() > setup.transmissions()) {
        json["per_iteration"] = Json::array();
        for (const ErrorCount& count : point.counts) {
            json["per_iteration"].push_back(countJson(setup, count));
        }
    }
    return json;
}

std::pair<Setup, PointState> pointFrom(const Json& curve, const Json& json) {
    Setup setup;
    forEachField(setup, [&curve](const char* name, auto& value) { readValue(curve.at(name), value); });
    forEachSendingField(setup.sending, [&curve](const char* name, auto& value) {
        if (curve.contains(name)) {
            readValue(curve.at(name), value);
        }
    });
    if (!(std::abs(json.at("ebn0_db").get<double>()) < 1000)) {
        throw std::runtime_error("an Eb/N0 is not a number of decibels");
    }
    setup.ebN0 = {static_cast<std::int32_t>(std::lround(json.at("ebn0_db").get<double>() * 1e6))};
    setup.check();
    PointState point;
    readValue(json.at("blocks"), point.blocks);
    readValue(json.at("bit_error_squares"), point.bitErrorSquares);
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
    if (setup.transmissions() > 1) {
        point.counts.clear();
        for (const Json& count : json.at("transmissions")) {
            point.counts.push_back(countFrom(count));
        }
        if (point.counts.size() != setup.transmissions()) {
            throw std::runtime_error("a point does not have a count for each transmission");
        }
    }
    if (setup.sending.stop != Stop::none) {
        point.iterationsUsed = wholeNumbers<std::uint64_t>(json.at("iterations_used"));
        if (point.iterationsUsed.size() != static_cast<std::size_t>(setup.iterations)) {
            throw std::runtime_error("a point does not tell how often each number of iterations was used");
        }
    }
    requirePossible(point, setup);
    return {setup, std::move(point)};
}

}  // namespace quarzel::sweep
