// SPDX-License-Identifier: MIT
#include "capture_file.hpp"

#include "capture_readers.hpp"
#include "input_file.hpp"
#include "npy_header.hpp"

namespace quarzel::tool {

Capture readCapture(const std::string& file) {
    std::ifstream stream = openInput(file);
    Capture capture = isNpy(stream, file) ? readNpyCapture(stream, file) : readCsvCapture(stream, file);
    capture.file = file;
    return capture;
}

}  // namespace quarzel::tool
