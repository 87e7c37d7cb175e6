// SPDX-License-Identifier: MIT
#pragma once

#include <string>

namespace quarzel::bindings {

/// Write the text of a trace to a file, in the place of what was there.
/// @throws BindingError  with the reason when the file cannot be written whole
/// @throws std::bad_alloc
void writeTrace(const std::string& name, const std::string& text);

}  // namespace quarzel::bindings
