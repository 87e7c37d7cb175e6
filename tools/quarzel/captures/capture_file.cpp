// SPDX-License-Identifier: MIT
#include "captures/capture_file.hpp"

#include "captures/capture_readers.hpp"
#include "captures/npy_header.hpp"

namespace quarzel::tool {

Capture readCapture(std::istream& stream, const std::string& file, std::optional<double> scale) {
    Capture capture =
        isNpy(stream, file) ? readNpyCapture(stream, file, scale) : readCsvCapture(stream, file, scale);
    capture.file = file;
    return capture;
}

}  // namespace quarzel::tool
