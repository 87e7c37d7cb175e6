// SPDX-License-Identifier: MIT
#include "coverage/coverage_report.hpp"

#include <fmt/format.h>

#include <nlohmann/json.hpp>
#include <numeric>

#include "report_text.hpp"

namespace quarzel::tool {

namespace {

using Json = nlohmann::ordered_json;

/// What a core reaches of an event.
struct Reach {
    const EventFacts& facts;
    std::size_t reached = 0;
    std::size_t of = 0;
    std::size_t times = 0;
    std::vector<std::string> missing{};
    Json counts = Json::object();  ///< by position
};

std::vector<Reach> reachOf(const CoverageReport& core) {
    std::vector<Reach> reaches;
    for (std::size_t i = 0; i < eventFacts().size(); ++i) {
        const EventFacts& facts = eventFacts()[i];
        if (!hasCircuit(facts, core.algorithm)) {
            continue;
        }
        Reach reach{facts};
        const std::vector<std::size_t>& counts = core.counts.of(static_cast<Event>(i));
        reach.of = counts.size();
        for (std::size_t position = 0; position < counts.size(); ++position) {
            const std::string& name = facts.positions[position];
            reach.counts[name] = counts[position];
            reach.reached += counts[position] != 0 ? 1 : 0;
            reach.times += counts[position];
            if (counts[position] == 0) {
                reach.missing.push_back(name);
            }
        }
        reaches.push_back(std::move(reach));
    }
    return reaches;
}

std::size_t total(const std::vector<Reach>& reaches, std::size_t Reach::*member) {
    return std::accumulate(reaches.begin(), reaches.end(), std::size_t{0},
                           [member](std::size_t sum, const Reach& reach) { return sum + reach.*member; });
}

std::string textOf(const CoverageReport& core) {
    const std::vector<Reach> reaches = reachOf(core);
    std::string text;
    reportLine(text, "core",
               fmt::format("{}, {} units, algorithm {}", core.name, core.units, core.algorithm));
    reportLine(text, "blocks", std::to_string(core.blocks));
    reportLine(text, "positions",
               fmt::format("{} of {} reached", total(reaches, &Reach::reached), total(reaches, &Reach::of)));
    text += fmt::format("\n{:<18}{:>8}  {:>10}  not reached\n", "event", "reached", "times");
    for (const Reach& reach : reaches) {
        std::string line = fmt::format("{:<18}{:>8}  {:>10}  {}", reach.facts.name,
                                       fmt::format("{}/{}", reach.reached, reach.of), reach.times,
                                       fmt::join(reach.missing, " "));
        text += line.erase(line.find_last_not_of(' ') + 1) + '\n';
    }
    return text;
}

}  // namespace

void printText(std::ostream& stream, const std::vector<CoverageReport>& cores) {
    const char* separator = "";
    for (const CoverageReport& core : cores) {
        stream << separator << textOf(core);
        separator = "\n";
    }
}

void printJson(std::ostream& stream, const std::vector<CoverageReport>& cores) {
    Json list = Json::array();
    for (const CoverageReport& core : cores) {
        const std::vector<Reach> reaches = reachOf(core);
        Json events = Json::object();
        for (const Reach& reach : reaches) {
            events[reach.facts.name] = reach.counts;
        }
        list.push_back({{"core", core.name},
                        {"units", core.units},
                        {"algorithm", core.algorithm},
                        {"blocks", core.blocks},
                        {"reached", total(reaches, &Reach::reached)},
                        {"of", total(reaches, &Reach::of)},
                        {"events", std::move(events)}});
    }
    stream << Json{{"cores", std::move(list)}}.dump() << '\n';
}

}  // namespace quarzel::tool
