// SPDX-License-Identifier: MIT
#include "vectors/manifest.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <iterator>
#include <nlohmann/json.hpp>

#include "files/input_file.hpp"
#include "sweep/json_text.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

using Json = nlohmann::ordered_json;

constexpr const char* format = "quarzel test vectors";
constexpr int version = 1;

/// Arrays of objects, and objects that hold an array or an object, are spread over lines; all else is kept on
/// one, so that the text can be read and compared line by line.
void appendLines(std::string& text, const Json& value, const std::string& indent) {
    const auto isStructured = [](const Json& member) { return member.is_structured(); };
    const auto isObject = [](const Json& member) { return member.is_object(); };
    const bool isSpread = value.is_object()
                              ? std::any_of(value.begin(), value.end(), isStructured)
                              : value.is_array() && std::any_of(value.begin(), value.end(), isObject);
    if (!isSpread) {
        text += value.dump();
        return;
    }
    const std::string inner = indent + ' ';
    text += value.is_object() ? '{' : '[';
    const char* separator = "\n";
    for (const auto& [key, member] : value.items()) {
        text += separator + inner + (value.is_object() ? Json(key).dump() + ": " : "");
        appendLines(text, member, inner);
        separator = ",\n";
    }
    text += '\n' + indent + (value.is_object() ? '}' : ']');
}

Json toJson(const VectorCore& core) {
    Json blocks = Json::array();
    for (const VectorBlock& block : core.blocks) {
        blocks.push_back({{"block", blocks.size() + 1},
                          {"block_size", block.blockSize},
                          {"iterations", block.iterations},
                          {"stimulus", block.stimulus},
                          {"capture", block.capture},
                          {"row", block.row}});
    }
    return {{"directory", core.directory},
            {"units", core.units},
            {"algorithm", core.algorithm},
            {"blocks", std::move(blocks)}};
}

VectorCore coreFrom(const Json& object) {
    VectorCore core{object.at("directory"), object.at("units"), object.at("algorithm"), {}};
    for (const Json& block : object.at("blocks")) {
        core.blocks.push_back({block.at("block_size"), block.at("iterations"), block.at("stimulus"),
                               block.at("capture"), block.at("row")});
    }
    return core;
}

}  // namespace

std::string manifestText(const Json& configuration, const Json& coverage, const VectorContent& content) {
    Json cores = Json::array();
    for (const VectorCore& core : content.cores) {
        cores.push_back(toJson(core));
    }
    Json files = Json::array();
    for (const VectorFile& file : content.files) {
        files.push_back({{"name", file.name}, {"bytes", file.bytes}, {"sha256", file.sha256}});
    }
    Json manifest = {{"format", format},           {"version", version},
                     {"quarzel", QUARZEL_VERSION}, {"configuration", configuration},
                     {"coverage", coverage},       {"cores", std::move(cores)},
                     {"files", std::move(files)}};
    for (const VectorStage& stage : content.stages) {
        manifest["stages"].push_back(
            {{"file", stage.file}, {"holds", stage.holds}, {"word", stage.word}, {"clause", stage.clause}});
    }
    std::string text;
    appendLines(text, manifest, "");
    return text + '\n';
}

VectorContent readManifest(const std::string& directory) {
    const std::string file = directory + '/' + manifestName;
    std::ifstream stream = openInput(file);
    const std::string text(std::istreambuf_iterator<char>(stream), {});
    constexpr const char* remedy = "make the set again with 'quarzel vectors'";
    try {
        const Json manifest = sweep::parseJson(text);
        if (manifest.at("format") != format) {
            throw fileError(file, "is not a manifest of test vectors", remedy);
        }
        if (manifest.at("version") != version) {
            throw fileError(
                file, fmt::format("has version {}, not {}", manifest.at("version").dump(), version), remedy);
        }
        VectorContent content;
        for (const Json& core : manifest.at("cores")) {
            content.cores.push_back(coreFrom(core));
        }
        for (const Json& entry : manifest.at("files")) {
            content.files.push_back({entry.at("name"), entry.at("bytes"), entry.at("sha256")});
        }
        return content;
    } catch (const Json::exception&) {
        throw fileError(file, "is not a well-formed manifest", remedy);
    }
}

}  // namespace quarzel::tool
