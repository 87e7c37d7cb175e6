// SPDX-License-Identifier: MIT
#include <iostream>
#include <string>

#include "decoder/decoder_3g.hpp"
#include "engine/dump_columns.hpp"
#include "engine/engine.hpp"
#include "fixed/text_output.hpp"

using quarzel::appendReal;
using quarzel::writeText;

namespace {

constexpr const char* passHeader =
    "n    int           a0          a1          a2          a3          a4          a5          a6          "
    "a7"
    "            b0          b1          b2          b3          b4          b5          b6          b7"
    "            g4          g5          g6          g7            llr         ext\n";

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

void TDecoder3G::dumpInput() const {
    writeText(std::cout, std::string(120, '-') + "\n" +               //
                             inputLine("itsSys [0]=[", itsSys[0]) +   //
                             inputLine("itsPar0[0]=[", itsPar0[0]) +  //
                             inputLine("itsPar1[0]=[", itsPar1[0]) +  //
                             inputLine("itsSys [1]=[", itsSys[1]) +   //
                             inputLine("itsPar0[1]=[", itsPar0[1]) +  //
                             inputLine("itsPar1[1]=[", itsPar1[1]));
}

void TDecoder3G::dumpFull(std::ostream& stream, unsigned siso) {
    const TNumberFormat& format = *itsEngine->stateFormat();
    std::string row = std::string(289, '-') + "\ndecode=" + std::to_string(itsDecodeCount) +
                      " siso=" + std::to_string(siso) + "\n" + passHeader;
    writeText(stream, row);
    for (std::uint32_t step = 0; step < itsBlockSize; ++step) {
        row.clear();
        quarzel::appendStep(row, step);
        appendReal(row, itsIntrinsic[step], format);
        row += "  ";
        quarzel::appendStateMetrics(row, itsAlpha[step], format);
        row += "  ";
        quarzel::appendStateMetrics(row, itsBeta[step], format);
        row += "  ";
        quarzel::appendBranchMetrics(row, itsGamma[step], format);
        row += "  ";
        appendReal(row, itsLLR[step], format);
        appendReal(row, itsExtrinsic[step], format);
        row += '\n';
        writeText(stream, row);
    }
}
