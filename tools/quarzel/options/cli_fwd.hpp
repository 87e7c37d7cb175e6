// SPDX-License-Identifier: MIT
// What headers name of the library of the command line. Its own header costs every file that reads it
// seconds.
#pragma once

namespace CLI {
class App;
class Option;
class Validator;
}  // namespace CLI
