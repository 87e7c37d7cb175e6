// SPDX-License-Identifier: MIT
#pragma once

#include <nlohmann/json.hpp>
#include <string>
#include <string_view>

#include "sweep/configuration.hpp"

/// The files of a sweep: JSON objects that begin with what they are and end with a checksum of the rest.
namespace quarzel::sweep {

using Json = nlohmann::ordered_json;

/// A document that has "format", "version" and "quarzel" alone.
Json newDocument(std::string_view format);

/// The text of a document, with its checksum.
/// @param indent  as in nlohmann::json::dump
std::string textOf(Json document, int indent);

/// Read a document.
/// @param indent  with which it was written
/// @throws Error when it is truncated, altered, of another format, or of another version of quarzel
Json readDocument(std::string_view text, std::string_view format, int indent);

Json toJson(const Configuration& configuration);

/// @throws Error or nlohmann::json::exception when it is none
Configuration configurationFrom(const Json& json);

}  // namespace quarzel::sweep
