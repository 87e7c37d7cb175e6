// SPDX-License-Identifier: MIT
#include "sweep/part.hpp"

#include <algorithm>

#include "sweep/document.hpp"
#include "sweep/error.hpp"

namespace quarzel::sweep {

namespace {

constexpr std::string_view format = "quarzel sweep part";
constexpr int indent = -1;  // one line: there can be very many blocks in error

Json errorsJson(const ErrorList& errors, std::size_t counts) {
    Json json = Json::array();
    for (std::size_t i = 0; i < errors.size(); ++i) {
        Json row = Json::array({errors.blocks[i]});
        for (std::size_t column = 0; column < counts; ++column) {
            row.push_back(errors.row(i, counts)[column]);
        }
        json.push_back(std::move(row));
    }
    return json;
}

ErrorList errorsFrom(const Json& json, std::size_t counts) {
    ErrorList errors;
    for (const Json& row : json) {
        if (row.size() != counts + 1) {
            throw Error("a block in error does not have " + std::to_string(counts) + " counts", "");
        }
        errors.blocks.push_back(row.at(0).get<std::uint64_t>());
        for (std::size_t column = 0; column < counts; ++column) {
            errors.bitErrors.push_back(row.at(column + 1).get<std::uint32_t>());
        }
    }
    return errors;
}

Json pointJson(const PointState& point, const Part& part) {
    Json counts = Json::array();
    for (const ErrorCount& count : point.counts) {
        counts.push_back(Json::array({count.bitErrors, count.blockErrors}));
    }
    Json json = {
        {"blocks", point.blocks},
        {"errors", std::move(counts)},
        {"bit_error_squares", point.bitErrorSquares},
        {"stopped_by", point.stoppedBy ? Json(nameOf(*point.stoppedBy)) : Json()},
    };
    if (!part.shard.isWhole()) {
        json["blocks_in_error"] = errorsJson(point.errors, point.counts.size());
    }
    if (part.configuration.maxSeconds != 0 && !point.stoppedBy) {
        json["seconds"] = point.seconds;
    }
    return json;
}

PointState pointFrom(const Json& json, std::size_t counts, bool isWhole) {
    PointState point(counts);
    json.at("blocks").get_to(point.blocks);
    if (json.at("errors").size() != counts) {
        throw Error("a point does not have " + std::to_string(counts) + " counts", "");
    }
    for (std::size_t i = 0; i < counts; ++i) {
        const Json& count = json.at("errors").at(i);
        point.counts[i] = {count.at(0).get<std::uint64_t>(), count.at(1).get<std::uint64_t>()};
    }
    json.at("bit_error_squares").get_to(point.bitErrorSquares);
    if (!json.at("stopped_by").is_null()) {
        point.stoppedBy = stopReasonOf(json.at("stopped_by").get<std::string>()).value();
    }
    if (!isWhole) {
        point.errors = errorsFrom(json.at("blocks_in_error"), counts);
    }
    point.seconds = json.value("seconds", 0.0);
    return point;
}

}  // namespace

bool Part::isComplete() const {
    return std::all_of(points.begin(), points.end(),
                       [](const PointState& point) { return point.stoppedBy.has_value(); });
}

Part freshPart(const Configuration& configuration, const Shard& shard) {
    Part part{configuration, shard, {}};
    for (const Curve& curve : configuration.curves()) {
        part.points.insert(part.points.end(), configuration.ebN0.size(),
                           PointState(configuration.countsOf(curve)));
    }
    return part;
}

std::string partText(const Part& part) {
    Json document = newDocument(format);
    document["configuration"] = toJson(part.configuration);
    document["shard"] = {{"index", part.shard.index + 1}, {"count", part.shard.count}};
    document["complete"] = part.isComplete();
    document["points"] = Json::array();
    for (const PointState& point : part.points) {
        document["points"].push_back(pointJson(point, part));
    }
    return textOf(std::move(document), indent);
}

Part readPart(std::string_view text) {
    const Json document = readDocument(text, format, indent);
    try {
        Part part{configurationFrom(document.at("configuration")), {}, {}};
        part.shard = {document.at("shard").at("index").get<std::uint64_t>() - 1,
                      document.at("shard").at("count").get<std::uint64_t>()};
        const std::vector<Curve> curves = part.configuration.curves();
        for (const Json& point : document.at("points")) {
            const std::size_t curve = part.points.size() / part.configuration.ebN0.size();
            part.points.push_back(
                pointFrom(point, part.configuration.countsOf(curves.at(curve)), part.shard.isWhole()));
        }
        if (part.points.size() != part.configuration.points() || part.shard.index >= part.shard.count) {
            throw Error("its points or its shard are not those of its configuration", "");
        }
        return part;
    } catch (const std::exception& error) {
        throw Error(std::string("is not understood: ") + error.what(), "use another copy of it");
    }
}

std::string differenceOf(const Configuration& found, const Configuration& expected) {
    const Json foundJson = toJson(found);
    const Json expectedJson = toJson(expected);
    for (const auto& [name, value] : foundJson.items()) {
        if (value != expectedJson.at(name)) {
            return name + ' ' + value.dump() + " instead of " + expectedJson.at(name).dump();
        }
    }
    return "";
}

void requireSameRun(const Part& part, const Configuration& configuration, const Shard& shard) {
    const std::string difference = differenceOf(part.configuration, configuration);
    if (!difference.empty()) {
        throw Error("belongs to another sweep: it has " + difference,
                    "give the same options as before, or remove it to begin anew");
    }
    if (part.shard != shard) {
        throw Error("belongs to shard " + std::to_string(part.shard.index + 1) + '/' +
                        std::to_string(part.shard.count),
                    "give the same options as before, or remove it to begin anew");
    }
}

}  // namespace quarzel::sweep
