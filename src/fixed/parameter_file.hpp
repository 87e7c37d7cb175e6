// SPDX-License-Identifier: MIT
#pragma once

#include <iosfwd>
#include <map>
#include <string>

#pragma GCC visibility push(default)  // the shared library offers these functions

/// Read parameter lines "key = value" into a map.
///
/// "//" and "#" begin a comment that reaches to the end of its line. The key is what stands before the first
/// "=" of the rest and the value what stands after it, both with their white space normalised by `stripws`;
/// either may be empty. A line without "=" is skipped. Of several lines with the same key the last one
/// counts.
///
/// @param stream      lines ended by line feeds, read to the end of the stream; the last one may lack its
///                    own. The stream is then at its end and has not failed. One that has failed before is
///                    neither read nor changed
/// @param parameters  the map. A value that is there already is replaced
/// @param addKeys     whether keys that are not in the map are added to it. If not, each line with such a key
/// is
///                    an error, and the lines after it are read all the same
/// @return            true when no line was an error. Each error is a line on the standard error stream, with
///                    a line number that counts all lines of the stream from 1:
///
///   ERROR:3:Parameter name 'key' is invalid
bool parse(std::istream& stream, std::map<std::string, std::string>& parameters, bool addKeys);

/// Read parameter lines from a file; see above.
///
/// @param fileName  the name of the file
/// @return          as above; also false when the file cannot be opened or is a directory, after
///
///   ERROR:Could not open input file 'fileName'
bool parse(const std::string& fileName, std::map<std::string, std::string>& parameters, bool addKeys);

#pragma GCC visibility pop
