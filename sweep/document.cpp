// SPDX-License-Identifier: MIT
#include "sweep/document.hpp"

#include <fmt/format.h>

#include "sweep/error.hpp"
#include "sweep/json_text.hpp"
#include "sweep/sha256.hpp"

namespace quarzel::sweep {

namespace {

constexpr int indent = 1;  // in blanks a level
constexpr int checksumIndent = -1;

}  // namespace

Json newDocument(std::string_view format, std::string_view quarzel) {
    return {{"format", format}, {"version", formatVersion}, {"quarzel", quarzel}};
}

std::string textOf(Json document) {
    document["checksum"] = sha256(document.dump(checksumIndent));
    return document.dump(indent) + '\n';
}

bool isOfFormat(std::string_view text, std::string_view format) {
    constexpr std::size_t beginning = 100;  // the format stands first
    return text.substr(0, beginning).find(fmt::format("\"{}\"", format)) != std::string_view::npos;
}

Json readDocument(std::string_view text, std::string_view format, int oldest) {
    Json document = parseJson(text);
    if (!document.is_object() || document.value("format", Json()) != format) {
        throw document.is_discarded() && isOfFormat(text, format)
            ? Error("is truncated or altered: it is not a whole JSON object", "use another copy of it")
            : Error(fmt::format("is not a {}", format), "give the name of one");
    }
    const Json version = document.value("version", Json());
    if (!version.is_number_integer() || version < oldest || version > formatVersion) {
        throw Error(
            fmt::format("has version {} of its format, which this quarzel does not read", version.dump()),
            "use the quarzel that wrote it");
    }
    // Byte for byte: another digit of a number may give the same number.
    document.erase("checksum");
    if (textOf(document) != text) {
        throw Error("has been altered: its checksum does not match", "use another copy of it");
    }
    return document;
}

}  // namespace quarzel::sweep
