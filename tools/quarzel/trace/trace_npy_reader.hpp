// SPDX-License-Identifier: MIT
#pragma once

#include <istream>
#include <string>
#include <vector>

#include "trace/trace_row_reader.hpp"

namespace quarzel::tool {

/// Reads a trace as a structured array of numpy, an element for each trellis step of a pass: the fields step
/// and, for signals of passes, pass, maybe block, and those of the signals, each under the heading of its
/// column or, for all states of a signal, under its name. Real numbers that are not numbers are unknown
/// values.
class TraceNpyReader : public TraceRowReader {
  public:
    /// @param stream  must outlive it
    /// @param units   of the values
    TraceNpyReader(std::istream& stream, const std::string& name, TraceUnits units);

    bool next(TraceRow& row) override;

  private:
    /// A number in each element.
    struct Item {
        enum class Role { block, pass, step, column };
        Role role;
        unsigned column;  ///< where the role is `column`
        std::size_t offset;
        double (*read)(const char* bytes);
        std::string name;
    };

    void addField(const std::string& name, const std::string& type, std::size_t count);
    void takeItem(const Item& item, double number, TraceRow& row) const;

    std::istream& itsStream;
    TraceUnits itsUnits;
    std::vector<Item> itsItems;
    std::string itsElement;  ///< the bytes of one
    std::size_t itsElements = 0;
    std::size_t itsRead = 0;  ///< of these
};

}  // namespace quarzel::tool
