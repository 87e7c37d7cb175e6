// SPDX-License-Identifier: MIT
#include "vectors/manifest.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <iterator>
#include <nlohmann/json.hpp>
#include <stdexcept>

#include "files/input_file.hpp"
#include "quarzel/code.hpp"
#include "sweep/json_text.hpp"
#include "sweep/sha256.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

using Json = nlohmann::ordered_json;

constexpr const char* format = "quarzel test vectors";
constexpr int version = 2;  // in version 1 blocks counted from 1, which no reader here looks at

/// Arrays of objects, and objects that hold an array or an object, are spread over lines; all else is kept on
/// one, so that the text can be read and compared line by line.
void appendLines(std::string& text, const Json& value, const std::string& indent) {
    const auto isStructured = [](const Json& member) { return member.is_structured(); };
    const auto isObject = [](const Json& member) { return member.is_object(); };
    const bool isSpread = value.is_object()
                              ? std::any_of(value.begin(), value.end(), isStructured)
                              : value.is_array() && std::any_of(value.begin(), value.end(), isObject);
    if (!isSpread) {
        // A file name need not be UTF-8; what is not becomes U+FFFD.
        text += value.dump(-1, ' ', false, Json::error_handler_t::replace);
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
        blocks.push_back({{"block", blocks.size()},
                          {"block_size", block.blockSize},
                          {"iterations", block.iterations},
                          {"stimulus", block.stimulus},
                          {"capture", block.capture},
                          {"row", block.row}});
        if (block.tag) {
            blocks.back()["tag"] = *block.tag;
        }
    }
    return {{"directory", core.directory},
            {"units", core.units},
            {"algorithm", core.algorithm},
            {"blocks", std::move(blocks)}};
}

VectorCore coreFrom(const Json& object) {
    VectorCore core{object.at("directory"),
                    sweep::wholeNumber<int>(object.at("units")),
                    sweep::wholeNumber<int>(object.at("algorithm")),
                    {}};
    for (const Json& block : object.at("blocks")) {
        core.blocks.push_back({sweep::wholeNumber<std::uint32_t>(block.at("block_size")),
                               sweep::wholeNumber<int>(block.at("iterations")), block.at("stimulus"),
                               block.at("capture"), sweep::wholeNumber<std::size_t>(block.at("row"))});
        if (!findBlockSize(core.blocks.back().blockSize)) {
            throw std::invalid_argument("it has a block size that LTE has not");
        }
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

VectorContent contentOf(const std::string& text, const std::string& file) {
    constexpr const char* remedy = "make the set again with 'quarzel vectors'";
    const Json manifest = sweep::parseJson(text);
    if (manifest.is_discarded()) {
        throw fileError(file, "is truncated or altered: it is not a whole JSON object", remedy);
    }
    try {
        if (manifest.at("format") != format) {
            throw fileError(file, "is not a manifest of test vectors", remedy);
        }
        if (manifest.at("version") != version && manifest.at("version") != 1) {
            throw fileError(
                file, fmt::format("has version {}, not 1 or {}", manifest.at("version").dump(), version),
                remedy);
        }
        VectorContent content;
        for (const Json& core : manifest.at("cores")) {
            content.cores.push_back(coreFrom(core));
        }
        for (const Json& entry : manifest.at("files")) {
            content.files.push_back(
                {entry.at("name"), sweep::wholeNumber<std::size_t>(entry.at("bytes")), entry.at("sha256")});
        }
        return content;
    } catch (const Json::exception&) {
        throw fileError(file, "is not a well-formed manifest", remedy);
    } catch (const std::invalid_argument& error) {
        throw fileError(file, fmt::format("is not a well-formed manifest: {}", error.what()), remedy);
    }
}

VectorContent readManifest(const std::string& directory) {
    const std::string file = directory + '/' + manifestName;
    std::ifstream stream = openInput(file);
    return contentOf({std::istreambuf_iterator<char>(stream), {}}, file);
}

std::string readUnaltered(const std::string& directory, const std::string& name,
                          const VectorContent& content) {
    const std::string file = directory + '/' + name;
    std::ifstream stream = openInput(file);
    std::string bytes(std::istreambuf_iterator<char>(stream), {});
    const auto entry = std::find_if(content.files.begin(), content.files.end(),
                                    [&name](const VectorFile& candidate) { return candidate.name == name; });
    if (entry == content.files.end() || entry->sha256 != sweep::sha256(bytes)) {
        throw fileError(file, "is not the file that was made with this set: its SHA-256 differs",
                        "make the set again with 'quarzel vectors'");
    }
    return bytes;
}

}  // namespace quarzel::tool
