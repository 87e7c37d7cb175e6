// SPDX-License-Identifier: MIT
#define CSV_IO_NO_THREAD  // the files are small
#include "plot/reference_curve.hpp"

#include <fmt/format.h>
#include <libfccp/csv.h>

#include <charconv>
#include <cstring>
#include <filesystem>

#include "files/input_file.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

constexpr const char* remedy = "give CSV with the columns ebn0_db and ber, bler or both";

using Reader = io::CSVReader<3, io::trim_chars<' ', '\t', '\r'>, io::no_quote_escape<','>,
                             io::throw_on_overflow, io::single_and_empty_line_comment<'#'>>;

double numberOf(const char* field, const std::string& where) {
    double value = 0;
    const char* const end = field + std::strlen(field);
    const auto [stop, error] = std::from_chars(field, end, value);
    if (error != std::errc() || stop != end) {
        throw fileError(where, fmt::format("'{:.20}' is not a number", field), remedy);
    }
    return value;
}

void append(RatePoints& points, double ebN0, const char* field, const std::string& where) {
    if (field == nullptr || *field == '\0') {
        return;
    }
    const double rate = numberOf(field, where);
    if (!(rate > 0 && rate <= 1)) {
        throw fileError(where, fmt::format("{} is not an error rate on a logarithmic axis", field),
                        "give a number above 0 and up to 1, or leave it out");
    }
    points.emplace_back(ebN0, rate);
}

void readRows(std::istream& stream, const std::string& file, ReferenceCurve& curve) {
    Reader reader(file, stream);
    reader.read_header(io::ignore_missing_column | io::ignore_extra_column, "ebn0_db", "ber", "bler");
    if (!reader.has_column("ebn0_db") || !(reader.has_column("ber") || reader.has_column("bler"))) {
        throw fileError(file, "is missing a column", remedy);
    }
    const char* ebN0 = nullptr;
    const char* ber = nullptr;
    const char* bler = nullptr;
    while (reader.read_row(ebN0, ber, bler)) {
        const std::string where = fmt::format("{}: line {}", file, reader.get_file_line());
        const double x = numberOf(ebN0, where);
        append(curve.ber, x, ber, where);
        append(curve.bler, x, bler, where);
    }
}

}  // namespace

ReferenceCurve readReferenceCurve(const std::string& argument) {
    const std::size_t equals = argument.find('=');
    const bool hasLabel = equals != std::string::npos && !std::filesystem::exists(argument);
    const std::string file = hasLabel ? argument.substr(equals + 1) : argument;
    ReferenceCurve curve{
        hasLabel ? argument.substr(0, equals) : std::filesystem::path(file).stem().string(), {}, {}};
    std::ifstream stream = openInput(file);
    try {
        readRows(stream, file, curve);
    } catch (const io::error::base&) {
        throw fileError(file, "is not a well-formed reference curve", remedy);
    }
    if (curve.ber.empty() && curve.bler.empty()) {
        throw fileError(file, "holds no point", remedy);
    }
    return curve;
}

}  // namespace quarzel::tool
