// SPDX-License-Identifier: MIT
// The target of this file owns the headers that all tests read, compiled once; see CMakeLists.txt.
