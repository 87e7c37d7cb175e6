// SPDX-License-Identifier: MIT
#include "trace_cases.hpp"

#include <algorithm>
#include <sstream>
#include <stdexcept>
#include <xtensor/xnpy.hpp>

#include "support/vectors.hpp"

namespace quarzel::test {

std::vector<std::string> TraceCase::decodeFrom(const TemporaryDirectory& directory) const {
    const std::string file = directory.path("capture.npy");
    xt::dump_npy(file, soft);
    return {"decode",       file, "--units", std::to_string(units), "--algorithm", std::to_string(algorithm),
            "--iterations", "1",  "--trace", std::to_string(passes)};
}

std::vector<TraceCase> traceCases() {
    std::vector<TraceCase> cases;
    for (const nlohmann::json& stored : readCases("decode.jsonl")) {
        if (stored.at("dump_count") == 0) {
            continue;
        }
        const nlohmann::json& calls = stored.at("calls");
        const std::size_t positions = calls[0].at("rsc1_sys").size();
        TraceCase trace{stored.at("name"),
                        stored.at("num_pu"),
                        stored.at("algorithm_type"),
                        stored.at("dump_count"),
                        {},
                        {}};
        trace.soft.resize({calls.size(), 3, positions});
        auto next = trace.soft.begin();
        for (const nlohmann::json& call : calls) {
            for (const char* stream : {"rsc1_sys", "rsc1_par", "rsc2_par"}) {
                const auto values = call.at(stream).get<std::vector<std::int16_t>>();
                next = std::copy(values.begin(), values.end(), next);
            }
            trace.text += call.at("stdout").get<std::string>();
        }
        cases.push_back(trace);
    }
    return cases;
}

TraceCase smallTraceCase() {
    for (const TraceCase& trace : traceCases()) {
        if (trace.name == "dump-k40-pu2-alg1") {
            return trace;
        }
    }
    throw std::runtime_error("the stored trace of a small block is missing");
}

std::vector<std::string> linesOf(const std::string& text) {
    std::vector<std::string> lines;
    std::istringstream stream(text);
    for (std::string line; std::getline(stream, line);) {
        lines.push_back(line);
    }
    return lines;
}

std::string textOf(const std::vector<std::string>& lines) {
    std::string text;
    for (const std::string& line : lines) {
        text += line + '\n';
    }
    return text;
}

std::vector<std::string> wordsOf(const std::string& line) {
    std::istringstream stream(line);
    return {std::istream_iterator<std::string>(stream), {}};
}

}  // namespace quarzel::test
