// SPDX-License-Identifier: MIT
#include <algorithm>
#include <iterator>
#include <ostream>
#include <string>

#include "decoder/decoder_3g.hpp"
#include "engine/dump_columns.hpp"
#include "engine/engine.hpp"

namespace {

constexpr const char* passHeader =
    "n    int           a0          a1          a2          a3          a4          a5          a6          "
    "a7"
    "            b0          b1          b2          b3          b4          b5          b6          b7"
    "            g4          g5          g6          g7            llr         ext\n";

/// In one write, which no setting of the stream changes. Its error state is as after any output.
void write(std::ostream& stream, const std::string& text) {
    stream.write(text.data(), static_cast<std::streamsize>(text.size()));
}

std::string inputLine(const char* label, const std::vector<short>& values) {
    std::string line = label;
    const char* separator = "";
    for (const short value : values) {
        line.append(separator).append(std::to_string(value));
        separator = " ";
    }
    return line + "]\n";
}

}  // namespace

void TDecoder3G::dumpInput(std::ostream& stream) const {
    write(stream, std::string(120, '-') + "\n" +               //
                      inputLine("itsSys [0]=[", itsSys[0]) +   //
                      inputLine("itsPar0[0]=[", itsPar0[0]) +  //
                      inputLine("itsPar1[0]=[", itsPar1[0]) +  //
                      inputLine("itsSys [1]=[", itsSys[1]) +   //
                      inputLine("itsPar0[1]=[", itsPar0[1]) +  //
                      inputLine("itsPar1[1]=[", itsPar1[1]));
}

quarzel::TraceRow TDecoder3G::traceRow(unsigned step) const {
    quarzel::TraceRow row{};
    auto next = row.begin();
    *next++ = itsIntrinsic[step];
    next = std::copy(std::begin(itsAlpha[step].element), std::end(itsAlpha[step].element), next);
    next = std::copy(std::begin(itsBeta[step].element), std::end(itsBeta[step].element), next);
    for (const std::size_t element : quarzel::branchColumns) {
        *next++ = itsGamma[step][element];
    }
    *next++ = itsLLR[step];
    *next = itsExtrinsic[step];
    return row;
}

void TDecoder3G::dumpFull(std::ostream& stream, unsigned siso) {
    if (itsEngine == nullptr || itsEngine->stateFormat() == nullptr) {
        return;
    }
    const TNumberFormat& format = *itsEngine->stateFormat();
    write(stream, std::string(289, '-') + "\ndecode=" + std::to_string(itsDecodeCount) +
                      " siso=" + std::to_string(siso) + "\n" + passHeader);
    std::string text;
    for (std::uint32_t step = 0; step < itsBlockSize; ++step) {
        const quarzel::TraceRow row = traceRow(step);
        text.clear();
        quarzel::appendStep(text, step);
        for (std::size_t column = 0; column < row.size(); ++column) {
            if (quarzel::traceColumns[column].firstOfGroup) {
                text += "  ";
            }
            quarzel::appendReal(text, row[column], format);
        }
        text += '\n';
        write(stream, text);
    }
    stream.flush();
}
