// SPDX-License-Identifier: MIT
#include "sweep/result.hpp"

#include <stdexcept>

#include "sweep/document.hpp"
#include "sweep/error.hpp"
#include "sweep/json_text.hpp"
#include "sweep/point_json.hpp"
#include "sweep/sha256.hpp"

namespace quarzel::sweep {

namespace {

constexpr std::string_view resultFormat = "quarzel sweep result";
constexpr std::string_view partFormat = "quarzel sweep part";

Json curvesJson(const Points& points) {
    Json curves = Json::array();
    const Setup* last = nullptr;
    for (const auto& [setup, point] : points) {
        if (last == nullptr || !isSameCurve(setup, *last)) {
            curves.push_back(curveJson(setup));
            curves.back()["points"] = Json::array();
        }
        curves.back()["points"].push_back(pointJson(setup, point));
        last = &setup;
    }
    return curves;
}

/// Version 1 had one quantiser for all curves, in the configuration of its sweep.
void upgrade(Json& document) {
    const Json& configuration = document.at("configuration");
    const Json quantiser = configuration.at("quantiser");
    document["seed"] = configuration.at("seed");
    for (Json& curve : document.at("curves")) {
        curve["quantiser"] = quantiser.at("kind");
        curve["scale"] = quantiser.at("scale");
    }
}

Result resultFrom(Json document) {
    if (document.at("version") == 1) {
        upgrade(document);
    }
    Result result;
    result.seed = wholeNumber<std::uint64_t>(document.at("seed"));
    document.at("quarzel").get_to(result.quarzel);
    for (const Json& curve : document.at("curves")) {
        for (const Json& json : curve.at("points")) {
            auto [setup, point] = pointFrom(curve, json);
            if (!result.points.emplace(setup, std::move(point)).second) {
                throw std::runtime_error("it holds a point twice: " + setupText(setup));
            }
        }
    }
    if (document.contains("part")) {
        const Json& part = document.at("part");
        result.part = {
            {wholeNumber<std::uint64_t>(part.at("index")) - 1, wholeNumber<std::uint64_t>(part.at("count"))},
            part.at("sweep").get<std::string>()};
        if (result.part->shard.index >= result.part->shard.count ||
            result.part->shard.count > Shard::highestCount) {
            throw std::runtime_error("its part is not one of a sweep");
        }
    }
    return result;
}

Result read(std::string_view text, std::string_view format) {
    // Parts of version 1 divided blocks, with a list of those in error.
    Json document = readDocument(text, format, format == partFormat ? 2 : 1);
    try {
        return resultFrom(std::move(document));
    } catch (const std::exception& error) {
        throw Error(std::string("is not understood: ") + error.what(), "use another copy of it");
    }
}

}  // namespace

std::optional<Part> partOf(const Configuration& configuration, const Shard& shard) {
    if (shard.isWhole()) {
        return std::nullopt;
    }
    Json json = {configuration.seed, configuration.perIteration, configuration.stopRule.maxBlocks,
                 configuration.stopRule.maxBlockErrors};
    for (const Setup& setup : configuration.setups()) {
        json.push_back({curveJson(setup), setup.ebN0.micro});
    }
    return Part{shard, sha256(json.dump())};
}

std::string resultText(const Result& result) {
    Json document = newDocument(result.part ? partFormat : resultFormat, result.quarzel);
    document["seed"] = result.seed;
    if (result.part) {
        document["part"] = {{"index", result.part->shard.index + 1},
                            {"count", result.part->shard.count},
                            {"sweep", result.part->sweep}};
    }
    document["curves"] = curvesJson(result.points);
    return textOf(std::move(document));
}

std::string pointText(const Setup& setup, const PointState& point) {
    return curvesJson({{setup, point}}).front().dump();
}

Result readResult(std::string_view text) {
    if (isOfFormat(text, partFormat)) {
        throw Error("is a part of a sweep", "join all its parts with 'quarzel merge'");
    }
    return read(text, resultFormat);
}

Result readResultOrPart(std::string_view text) {
    return read(text, isOfFormat(text, partFormat) ? partFormat : resultFormat);
}

}  // namespace quarzel::sweep
