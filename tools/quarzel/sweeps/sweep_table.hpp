// SPDX-License-Identifier: MIT
#pragma once

#include <ostream>
#include <string>

#include "options/cli_fwd.hpp"
#include "sweep/result.hpp"

/// The forms in which a sweep's result is printed.
namespace quarzel::tool {

/// The row of a point; it fits 80 columns.
std::string rowText(const sweep::Setup& setup, const sweep::PointState& point);

/// Print a point of a table.
/// @param isFirst  of its curve: headings come before it
void printPoint(std::ostream& stream, const sweep::Setup& setup, const sweep::PointState& point,
                bool isFirst);

/// The columns of CSV that tell a curve, each followed by a comma: their names, and what they hold.
void printFieldNames(std::ostream& stream);
void printFields(std::ostream& stream, const sweep::Setup& curve);

void printTable(std::ostream& stream, const sweep::Result& result);

/// A line for each point; with error rates per iteration one for each iteration.
void printCsv(std::ostream& stream, const sweep::Result& result);

/// How a command prints a result.
enum class SweepForm { table, csv, json };
void printSweep(std::ostream& stream, const sweep::Result& result, SweepForm form);

/// Add --json and --csv to a command.
/// @param form  receives the choice; must outlive the parse
void addFormOptions(CLI::App& command, SweepForm& form);

}  // namespace quarzel::tool
