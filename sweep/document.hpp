// SPDX-License-Identifier: MIT
#pragma once

#include <nlohmann/json.hpp>
#include <string>
#include <string_view>

#include "vardel_ip_quarzel.h"

/// The files of a sweep: JSON objects that begin with their format and end with a checksum of all the rest.
namespace quarzel::sweep {

using Json = nlohmann::ordered_json;

/// The version of the format that is written.
constexpr int formatVersion = 2;

/// A document that has nothing yet but "format", "version" (of the format) and "quarzel".
/// @param quarzel  the version of quarzel that writes it, for people: any version reads it
Json newDocument(std::string_view format, std::string_view quarzel);

/// The text of a document, with its checksum.
std::string textOf(Json document);

/// Whether a text looks like a document of a format.
bool isOfFormat(std::string_view text, std::string_view format);

/// Read a document.
/// @param oldest  the oldest version of the format that is read
/// @throws Error when it is truncated, altered, of another format or of another version of the format
Json readDocument(std::string_view text, std::string_view format, int oldest);

}  // namespace quarzel::sweep
