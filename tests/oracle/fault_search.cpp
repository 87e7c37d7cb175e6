// SPDX-License-Identifier: MIT
// Finds a small set of blocks whose answers give away the faults of the catalogue, for one core:
//   fault_search UNITS TYPE CANDIDATES SEED TABLE
// Rows go to the end of TABLE. What is printed: the score of the set on the catalogue, which it was chosen
// for, and on the faults held out, which it was not; and the faults that no candidate found.
#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <iostream>
#include <numeric>

#include "oracle/fault_finder.hpp"

namespace quarzel::oracle {
namespace {

/// Again and again the candidate that finds most of what has not been found; of equals the smallest.
std::vector<std::size_t> chooseGreedily(const std::vector<Subject>& subjects,
                                        const std::vector<CoveringBlock>& candidates) {
    std::vector<std::size_t> chosen;
    std::vector<bool> found(subjects.size());
    while (true) {
        std::vector<int> gains(candidates.size());
        for (std::size_t i = 0; i < subjects.size(); ++i) {
            for (const std::size_t finder : subjects[i].finders) {
                gains[finder] += found[i] ? 0 : 1;
            }
        }
        std::vector<std::size_t> order(candidates.size());
        std::iota(order.begin(), order.end(), 0);
        const auto work = [&](std::size_t i) { return candidates[i].K * candidates[i].iterations; };
        const std::size_t best =
            *std::min_element(order.begin(), order.end(), [&](std::size_t a, std::size_t b) {
                return gains[a] != gains[b] ? gains[a] > gains[b] : work(a) < work(b);
            });
        if (gains[best] == 0) {
            return chosen;
        }
        chosen.push_back(best);
        for (std::size_t i = 0; i < subjects.size(); ++i) {
            const auto& finders = subjects[i].finders;
            found[i] = found[i] || std::find(finders.begin(), finders.end(), best) != finders.end();
        }
    }
}

void printScore(const char* name, const std::vector<Subject>& subjects, int type) {
    const auto found = std::count_if(subjects.begin(), subjects.end(),
                                     [](const Subject& subject) { return !subject.finders.empty(); });
    const auto equivalent = std::count_if(subjects.begin(), subjects.end(), [type](const Subject& subject) {
        return isEquivalent(subject.fault, type);
    });
    std::cout << name << ": " << found << " of " << static_cast<long>(subjects.size()) - equivalent
              << " found, " << equivalent << " equivalent\n";
    for (const Subject& subject : subjects) {
        if (subject.finders.empty() && !isEquivalent(subject.fault, type)) {
            std::cout << "  not found: " << subject.fault.name << '\n';
        }
    }
}

}  // namespace

int run(int units, int type, int count, unsigned seed, const char* table) {
    constexpr std::size_t enough = 6;  // candidates that find a fault; it is not tried on more of them
    FaultFinder finder(units, type);
    std::vector<CoveringBlock> candidates;
    std::vector<Subject> subjects = finder.subjectsOf(catalogue());
    std::mt19937 random(seed);
    for (int i = 0; i < count; ++i) {
        candidates.push_back(drawBlock(random));
        finder.tryOn(candidates.back(), static_cast<std::size_t>(i), subjects, enough);
    }
    const std::vector<std::size_t> chosen = chooseGreedily(subjects, candidates);

    std::vector<Subject> scored = finder.subjectsOf(catalogue());
    std::vector<Subject> heldOut = finder.subjectsOf(heldOutFaults());
    std::ofstream rows(table, std::ios::app);
    long positions = 0;
    for (const std::size_t candidate : chosen) {
        finder.tryOn(candidates[candidate], candidate, scored, 1);
        finder.tryOn(candidates[candidate], candidate, heldOut, 1);
        rows << rowOf(candidates[candidate], units, type) << '\n';
        positions += candidates[candidate].K;
    }
    std::cout << units << " units, type " << type << ": " << chosen.size() << " blocks of " << count
              << " candidates, " << positions << " bits, seed " << seed << '\n';
    printScore("catalogue", scored, type);
    printScore("held out", heldOut, type);
    return rows.flush() ? EXIT_SUCCESS : EXIT_FAILURE;
}

}  // namespace quarzel::oracle

int main(int count, char** arguments) {
    if (count != 6) {
        std::cerr << "fault_search UNITS TYPE CANDIDATES SEED TABLE\n";
        return EXIT_FAILURE;
    }
    return quarzel::oracle::run(std::atoi(arguments[1]), std::atoi(arguments[2]), std::atoi(arguments[3]),
                                static_cast<unsigned>(std::atoi(arguments[4])), arguments[5]);
}
