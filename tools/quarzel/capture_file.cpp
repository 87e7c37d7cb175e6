// SPDX-License-Identifier: MIT
#include "capture_file.hpp"

#include "capture_readers.hpp"
#include "input_file.hpp"
#include "npy_header.hpp"

namespace quarzel::tool {

Capture readCapture(const std::string& file) {
    std::ifstream stream = openInput(file);
    const bool isNpy =
        file.ends_with(".npy") || stream.peek() == std::char_traits<char>::to_int_type(npyFirstByte);
    Capture capture = isNpy ? readNpyCapture(stream, file) : readCsvCapture(stream, file);
    capture.file = file;
    return capture;
}

}  // namespace quarzel::tool
