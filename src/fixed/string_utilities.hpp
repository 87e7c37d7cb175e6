// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

#pragma GCC visibility push(default)  // the shared library offers these functions

/// Text helpers around the model's property strings and parameter files. Characters are bytes and letters are
/// those of ASCII: no locale is asked. None of these functions fails or writes anything.

/// Normalise white space: none at either end, one blank for every run of it inside.
///
/// Every byte with a code below 33, taken as a signed char, is white space. That includes zero and the bytes
/// 128 to 255.
std::string stripws(const std::string& text);

/// Split a text into its tokens, in their order.
///
/// @param text        the text
/// @param separators  characters that end a token and vanish
/// @param kept        characters that end a token and are tokens themselves, of one character each; one that
///                    is in both sets is kept
/// @return            the tokens, none of them empty: neighbouring separators count as one, and a text of
///                    nothing else has no tokens
std::vector<std::string> stringtok(const std::string& text, const std::string& separators,
                                   const std::string& kept);

/// Make a text fit for a file name, character by character.
///
/// White space (as for `stripws`) becomes "_", "<" becomes "[", ">" becomes "]", "," becomes "c", "-" becomes
/// "m", "+" and "%" become "p", "=" becomes "e" and "." becomes "d". Everything else stays, "/" included.
std::string toFilename(const std::string& text);

/// Replace every tab by the blanks that reach from it to the next tab position.
///
/// @param text          the text; columns count bytes from 0 and start again after a line feed
/// @param tabPositions  columns, ascending
/// @return              the text without tabs; one past the last position is a single blank
std::string expandTabs(const std::string& text, const std::vector<unsigned>& tabPositions);

/// Whether two texts are equal but for the case of the letters A to Z.
bool nocase_compare(const std::string& x, const std::string& y);

/// Whether two characters are equal but for the case of the letters A to Z.
bool nocase_compare(char x, char y);

#pragma GCC visibility pop
