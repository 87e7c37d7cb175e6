// SPDX-License-Identifier: MIT
#pragma once

#include <CLI/CLI.hpp>
#include <ostream>
#include <string>

#include "sweep/result.hpp"

/// The forms in which a sweep's result is printed.
namespace quarzel::tool {

/// "K 1024, 2 units, algorithm 1, 8 iterations".
std::string curveText(const sweep::Curve& curve);

/// The headings of the columns, and a point below them.
extern const char* const sweepHeadings;
std::string rowText(const sweep::PointState& point, link::Decibels ebN0, const sweep::Curve& curve);

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
