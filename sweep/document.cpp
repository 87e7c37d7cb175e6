// SPDX-License-Identifier: MIT
#include "sweep/document.hpp"

#include <cmath>

#include "sweep/error.hpp"
#include "sweep/sha256.hpp"

namespace quarzel::sweep {

namespace {

constexpr int version = 1;
constexpr int checksumIndent = -1;

Json ebN0Json(const std::vector<link::Decibels>& list) {
    Json json = Json::array();
    for (const link::Decibels& ebN0 : list) {
        json.push_back(ebN0.value());
    }
    return json;
}

std::vector<link::Decibels> ebN0From(const Json& json) {
    std::vector<link::Decibels> list;
    for (const double value : json.get<std::vector<double>>()) {
        list.push_back({static_cast<std::int32_t>(std::lround(value * 1e6))});
    }
    return list;
}

}  // namespace

Json newDocument(std::string_view format, std::string_view quarzel) {
    return {{"format", format}, {"version", version}, {"quarzel", quarzel}};
}

std::string textOf(Json document, int indent) {
    document["checksum"] = sha256(document.dump(checksumIndent));
    return document.dump(indent) + '\n';
}

Json readDocument(std::string_view text, std::string_view format, int indent) {
    Json document = Json::parse(text, nullptr, false);
    if (!document.is_object() || document.value("format", Json()) != format) {
        const bool isTruncated = document.is_discarded() && text.find(format) != std::string_view::npos;
        throw isTruncated
            ? Error("is truncated or altered: it is not a whole JSON object", "use another copy of it")
            : Error("is not a " + std::string(format), "give the name of one");
    }
    if (document.value("version", Json()) != version) {
        throw Error("has version " + document.value("version", Json()).dump() + " of its format, not " +
                        std::to_string(version),
                    "use the quarzel that wrote it");
    }
    // Byte for byte: another digit of a number may give the same number.
    document.erase("checksum");
    if (textOf(document, indent) != text) {
        throw Error("has been altered: its checksum does not match", "use another copy of it");
    }
    return document;
}

Json toJson(const Configuration& configuration) {
    return {
        {"seed", configuration.seed},
        {"max_blocks", configuration.maxBlocks},
        {"max_block_errors", configuration.maxBlockErrors},
        {"max_seconds", configuration.maxSeconds},
        {"per_iteration", configuration.perIteration},
        {"quantiser",
         {{"kind", configuration.quantiser.kind == link::Quantiser::Kind::llr ? "llr" : "scale"},
          {"scale", configuration.quantiser.scale}}},
        {"block_size", configuration.blockSizes},
        {"units", configuration.units},
        {"algorithm", configuration.algorithms},
        {"iterations", configuration.iterations},
        {"ebn0_db", ebN0Json(configuration.ebN0)},
    };
}

Configuration configurationFrom(const Json& json) {
    Configuration configuration;
    json.at("seed").get_to(configuration.seed);
    json.at("max_blocks").get_to(configuration.maxBlocks);
    json.at("max_block_errors").get_to(configuration.maxBlockErrors);
    json.at("max_seconds").get_to(configuration.maxSeconds);
    json.at("per_iteration").get_to(configuration.perIteration);
    const Json& quantiser = json.at("quantiser");
    configuration.quantiser = {
        quantiser.at("kind") == "llr" ? link::Quantiser::Kind::llr : link::Quantiser::Kind::amplitude,
        quantiser.at("scale").get<double>()};
    json.at("block_size").get_to(configuration.blockSizes);
    json.at("units").get_to(configuration.units);
    json.at("algorithm").get_to(configuration.algorithms);
    json.at("iterations").get_to(configuration.iterations);
    configuration.ebN0 = ebN0From(json.at("ebn0_db"));
    configuration.check();
    return configuration;
}

}  // namespace quarzel::sweep
