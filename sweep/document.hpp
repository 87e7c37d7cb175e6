// SPDX-License-Identifier: MIT
#pragma once

#include <nlohmann/json.hpp>
#include <string>
#include <string_view>

#include "sweep/configuration.hpp"
#include "vardel_ip_quarzel.h"

/// The files of a sweep: JSON objects that begin with their format and end with a checksum of all the rest.
namespace quarzel::sweep {

using Json = nlohmann::ordered_json;

/// A document that has nothing yet but "format", "version" (of the format) and "quarzel".
/// @param quarzel  the version of quarzel that writes it, for people: any version reads it
Json newDocument(std::string_view format, std::string_view quarzel = VARDEL_IP_QUARZEL_VERSION);

/// The text of a document, with its checksum.
/// @param indent  as in nlohmann::json::dump
std::string textOf(Json document, int indent);

/// Read a document.
/// @param indent  that it was written with
/// @throws Error when it is truncated, altered, of another format or of another version of the format
Json readDocument(std::string_view text, std::string_view format, int indent);

Json toJson(const Configuration& configuration);

/// @throws Error or nlohmann::json::exception when it is not a configuration
Configuration configurationFrom(const Json& json);

}  // namespace quarzel::sweep
