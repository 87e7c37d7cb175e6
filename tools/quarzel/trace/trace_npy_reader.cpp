// SPDX-License-Identifier: MIT
#include "trace/trace_npy_reader.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <cstring>

#include "captures/npy_header.hpp"
#include "tool_error.hpp"
#include "trace/trace_signals.hpp"

namespace quarzel::tool {

namespace {

template <class Number>
double readNumber(const char* bytes) {
    Number number;
    std::memcpy(&number, bytes, sizeof number);
    return static_cast<double>(number);
}

struct Type {
    const char* name;
    std::size_t size;
    double (*read)(const char* bytes);
};

template <class Number>
constexpr Type typeOf(const char* name) {
    return {name, sizeof(Number), &readNumber<Number>};
}

constexpr std::array<Type, 10> types = {
    {typeOf<std::int8_t>("|i1"), typeOf<std::uint8_t>("|u1"), typeOf<std::int16_t>("<i2"),
     typeOf<std::uint16_t>("<u2"), typeOf<std::int32_t>("<i4"), typeOf<std::uint32_t>("<u4"),
     typeOf<std::int64_t>("<i8"), typeOf<std::uint64_t>("<u8"), typeOf<float>("<f4"), typeOf<double>("<f8")}};

constexpr const char* fieldsRemedy =
    "save a structured array with the fields step, pass and the signals' names, such as llr";

/// The columns that a field of so many values holds: one by its heading, or all of a signal.
std::vector<unsigned> columnsOf(const std::string& name, std::size_t count) {
    std::vector<unsigned> columns;
    const TraceColumnSet set = columnsNamed(name);
    for (unsigned column = 0; column < set.size(); ++column) {
        if (set[column]) {
            columns.push_back(column);
        }
    }
    return columns.size() == count ? columns : std::vector<unsigned>();
}

}  // namespace

TraceNpyReader::TraceNpyReader(std::istream& stream, const std::string& name, TraceUnits units)
    : TraceRowReader(name, "row"), itsStream(stream), itsUnits(units) {
    const NpyHeader header = readNpyHeader(stream, name);
    if (header.fields.empty()) {
        throw fileError(name, fmt::format("holds values of type '{}' without fields", header.type),
                        fieldsRemedy);
    }
    if (header.shape.size() != 1) {
        throw fileError(name, "has shape " + shapeText(header.shape), "save one element for each step");
    }
    itsElements = header.shape[0];
    for (const NpyField& field : header.fields) {
        constexpr std::uint64_t mostValues = 8;
        std::size_t count = 1;
        for (const std::uint64_t extent : field.shape) {
            count = std::min(count * std::min(extent, mostValues + 1), mostValues + 1);
        }
        addField(field.name, field.type, count);
    }
    const auto has = [this](Item::Role role) {
        return std::ranges::find(itsItems, role, &Item::role) != itsItems.end();
    };
    const bool needsPass = std::ranges::any_of(
        itsItems, [](const Item& item) { return item.role == Item::Role::column && !isInput(item.column); });
    if (!has(Item::Role::step) || !has(Item::Role::column) || (needsPass && !has(Item::Role::pass))) {
        throw fileError(name,
                        fmt::format("has no field {}", !has(Item::Role::step)     ? "step"
                                                       : !has(Item::Role::column) ? "of a signal"
                                                                                  : "pass"),
                        fieldsRemedy);
    }
}

void TraceNpyReader::addField(const std::string& name, const std::string& type, std::size_t count) {
    const auto known = std::ranges::find_if(types, [&type](const Type& each) { return type == each.name; });
    if (known == types.end()) {
        throw fileError(this->name(), fmt::format("holds values of type '{}' in its field {}", type, name),
                        "save numbers of at most 64 bits, little-endian");
    }
    const std::vector<unsigned> columns = columnsOf(name, count);
    const auto add = [&](Item::Role role, unsigned column) {
        itsItems.push_back({role, column, itsElement.size(), known->read, name});
        itsElement.resize(itsElement.size() + known->size);
    };
    if (!columns.empty()) {
        for (const unsigned column : columns) {
            add(Item::Role::column, column);
        }
    } else if (count == 1 && (name == "block" || name == "pass" || name == "step")) {
        add(name == "block" ? Item::Role::block : name == "pass" ? Item::Role::pass : Item::Role::step, 0);
    } else {
        throw fileError(this->name(), fmt::format("has a field '{}' of {} values", name, count),
                        fieldsRemedy);
    }
}

bool TraceNpyReader::next(TraceRow& row) {
    if (itsRead == itsElements) {
        requireEnd(itsStream, name());
        return false;
    }
    if (!itsStream.read(itsElement.data(), static_cast<std::streamsize>(itsElement.size()))) {
        throw fileError(name(), fmt::format("ends within row {}", itsRead),
                        fmt::format("expected {} rows", itsElements));
    }
    row.block.reset();
    row.pass.reset();
    row.line = itsRead++;
    row.values.clear();
    for (const Item& item : itsItems) {
        takeItem(item, item.read(itsElement.data() + item.offset), row);
    }
    return true;
}

void TraceNpyReader::takeItem(const Item& item, double number, TraceRow& row) const {
    const auto fail = [&](std::string_view expected) {
        throw fileError(name(), fmt::format("row {}, {} is {}", row.line, item.name, number),
                        fmt::format("expected {}", expected));
    };
    if (item.role == Item::Role::column) {
        const std::optional<TraceValue> value =
            std::isnan(number) ? TraceValue::unknown() : TraceValue::ofNumber(number, itsUnits);
        if (!value) {
            fail(expectedValue(itsUnits));
        }
        row.values.emplace_back(item.column, *value);
        return;
    }
    constexpr double highest = 4294967295.0;
    if (!(number >= 0 && number <= highest) || number != std::floor(number)) {
        fail("a whole number from 0 on");
    }
    const auto whole = static_cast<std::uint32_t>(number);
    switch (item.role) {
        case Item::Role::block:
            row.block = whole;
            break;
        case Item::Role::pass:
            row.pass = whole;
            break;
        default:
            row.step = whole;
    }
}

}  // namespace quarzel::tool
