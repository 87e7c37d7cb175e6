// SPDX-License-Identifier: MIT
#include "trace_file.hpp"

#include <cerrno>
#include <cstdio>
#include <cstring>

#include "outcome.hpp"

namespace quarzel::bindings {

void writeTrace(const std::string& name, const std::string& text) {
    std::FILE* const file = std::fopen(name.c_str(), "w");
    bool isWritten = file != nullptr && std::fwrite(text.data(), 1, text.size(), file) == text.size();
    int error = errno;
    if (file != nullptr && std::fclose(file) != 0 && isWritten) {
        isWritten = false;
        error = errno;
    }
    if (!isWritten && error == ENOMEM) {
        throw std::bad_alloc();
    }
    if (!isWritten) {
        throw BindingError(Fault::value, name + " cannot be written: " + std::strerror(error) +
                                             "; choose another file for the trace");
    }
}

}  // namespace quarzel::bindings
