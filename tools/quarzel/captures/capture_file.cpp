// SPDX-License-Identifier: MIT
#include "captures/capture_file.hpp"

#include "captures/capture_readers.hpp"
#include "captures/npy_header.hpp"
#include "files/input_file.hpp"

namespace quarzel::tool {

Capture readCapture(const std::string& file) {
    std::ifstream stream = openInput(file);
    Capture capture = isNpy(stream, file) ? readNpyCapture(stream, file) : readCsvCapture(stream, file);
    capture.file = file;
    return capture;
}

}  // namespace quarzel::tool
