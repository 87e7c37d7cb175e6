// SPDX-License-Identifier: MIT
#include "trace/trace_writer.hpp"

#include "trace/trace_rows.hpp"

namespace quarzel::tool {

namespace {

/// The decoder's own text.
class TextWriter : public TraceWriter {
  public:
    explicit TextWriter(std::ostream& stream) : itsStream(stream) {}

    void writeInputs(const TraceDecoder& decoder) override { decoder.TDecoder3GPU::dumpInput(itsStream); }

    void writePass(TraceDecoder& decoder, unsigned siso) override {
        decoder.TDecoder3GPU::dumpFull(itsStream, siso);
    }

  private:
    std::ostream& itsStream;
};

}  // namespace

std::unique_ptr<TraceWriter> makeTraceWriter(std::string_view form, std::ostream& stream) {
    if (form == "csv") {
        return std::make_unique<TraceRowWriter>(stream, csvRows);
    }
    if (form == "json") {
        return std::make_unique<TraceRowWriter>(stream, jsonRows);
    }
    return std::make_unique<TextWriter>(stream);
}

}  // namespace quarzel::tool
