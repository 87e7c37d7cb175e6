// SPDX-License-Identifier: MIT
#define CSV_IO_NO_THREAD  // the files are small
#include "plot/reference_rows.hpp"

#include <fmt/format.h>
#include <libfccp/csv.h>

#include <charconv>
#include <cmath>
#include <limits>
#include <string_view>

#include "options/whole_number.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

const char* const referenceRemedy = "give CSV with the columns ebn0_db and ber, bler or both";

namespace {

using Reader = io::CSVReader<13, io::trim_chars<' ', '\t', '\r'>, io::double_quote_escape<',', '"'>,
                             io::throw_on_overflow, io::single_and_empty_line_comment<'#'>>;

/// The fields of a row; none where the file has no such column.
struct Fields {
    std::array<const char*, referenceColumns> setup = {};
    const char* ebN0 = nullptr;
    const char* blocks = nullptr;
    const char* bitErrors = nullptr;
    const char* blockErrors = nullptr;
    const char* ber = nullptr;
    const char* bler = nullptr;
};

bool isEmpty(const char* field) {
    return field == nullptr || *field == '\0';
}

double numberOf(std::string_view field, const std::string& where) {
    double value = 0;
    const char* const end = field.data() + field.size();
    const auto [stop, error] = std::from_chars(field.data(), end, value);
    if (error != std::errc() || stop != end || !std::isfinite(value)) {
        throw fileError(where, fmt::format("'{:.20}' is not a number", field), referenceRemedy);
    }
    return value;
}

double rateOf(std::string_view field, const std::string& where) {
    const double rate = numberOf(field, where);
    if (!(rate > 0 && rate <= 1)) {
        throw fileError(where, fmt::format("{} is not an error rate on a logarithmic axis", field),
                        "give a number above 0 and up to 1, or leave it out");
    }
    return rate;
}

/// A rate from its own column or from counts. A field of counts may also be a rate and say so: "0.13 (rate)".
std::optional<double> rateFrom(const char* rate, const char* errors, const char* blocks,
                               const std::string& bitsPerBlock, const std::string& where) {
    if (!isEmpty(rate)) {
        return rateOf(rate, where);
    }
    if (isEmpty(errors)) {
        return std::nullopt;
    }
    std::string_view field = errors;
    constexpr std::string_view mark = " (rate)";
    if (field.ends_with(mark)) {
        field.remove_suffix(mark.size());
        return rateOf(field, where);
    }
    const double count = numberOf(field, where);
    const double trials = static_cast<double>(countFrom(isEmpty(blocks) ? "" : blocks, where)) *
                          static_cast<double>(countFrom(bitsPerBlock, where));
    if (!(count >= 0 && count <= trials)) {
        throw fileError(where, fmt::format("{} is not a count of errors in {:.0f}", field, trials),
                        referenceRemedy);
    }
    return count == 0 ? std::nullopt : std::optional(count / trials);
}

ReferenceRow rowFrom(const Fields& fields, const std::string& where) {
    ReferenceRow row{{}, numberOf(isEmpty(fields.ebN0) ? "" : fields.ebN0, where), {}, {}};
    for (std::size_t i = 0; i < referenceColumns; ++i) {
        row.setup[i] = fields.setup[i] == nullptr ? "" : fields.setup[i];
    }
    row.ber = rateFrom(fields.ber, fields.bitErrors, fields.blocks, row.setup[referenceK], where);
    row.bler = rateFrom(fields.bler, fields.blockErrors, fields.blocks, "1", where);
    return row;
}

std::vector<ReferenceRow> rowsOf(std::istream& stream, const std::string& file) {
    std::vector<ReferenceRow> rows;
    Reader reader(file, stream);
    reader.read_header(io::ignore_missing_column | io::ignore_extra_column, "K", "decoder", "iterations",
                       "modulation", "channel", "code_bits", "source", "ebn0_db", "blocks", "bit_errors",
                       "block_errors", "ber", "bler");
    const auto has = [&](const char* name) { return reader.has_column(name); };
    const bool hasBer = has("ber") || (has("bit_errors") && has("blocks") && has("K"));
    const bool hasBler = has("bler") || (has("block_errors") && has("blocks"));
    if (!has("ebn0_db") || !(hasBer || hasBler)) {
        throw fileError(file, "is missing a column", referenceRemedy);
    }
    Fields f;
    auto& s = f.setup;
    while (reader.read_row(s[0], s[1], s[2], s[3], s[4], s[5], s[6], f.ebN0, f.blocks, f.bitErrors,
                           f.blockErrors, f.ber, f.bler)) {
        const std::string where = fmt::format("{}: line {}", file, reader.get_file_line());
        if (!hasBer) {
            f.bitErrors = nullptr;
        }
        rows.push_back(rowFrom(f, where));
    }
    return rows;
}

}  // namespace

std::uint32_t countFrom(const std::string& field, const std::string& where) {
    const std::optional<std::uint64_t> count = readWholeNumber(field);
    if (!count || *count == 0 || *count > std::numeric_limits<std::uint32_t>::max()) {
        throw fileError(where, fmt::format("'{:.20}' is not a count", field), referenceRemedy);
    }
    return static_cast<std::uint32_t>(*count);
}

std::vector<ReferenceRow> readReferenceRows(std::istream& stream, const std::string& file) {
    try {
        return rowsOf(stream, file);
    } catch (const io::error::base&) {
        throw fileError(file, "is not a well-formed reference curve", referenceRemedy);
    }
}

}  // namespace quarzel::tool
