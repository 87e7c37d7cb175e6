// SPDX-License-Identifier: MIT
#include "mpi_messages.hpp"

#define OMPI_SKIP_MPICXX 1
#define MPICH_SKIP_MPICXX 1
#include <mpi.h>

#include "sweep/point_json.hpp"

namespace quarzel::mpi {

namespace {

constexpr int requestTag = 1;
constexpr int answerTag = 2;
using Words = std::vector<std::uint64_t>;

void appendTask(Words& words, const sweep::Task& task) {
    words.insert(words.end(), {task.point, task.firstOctet, task.octets});
}

/// Task, number of blocks in error, their numbers, their bit errors.
Words wordsOf(const std::optional<Outcome>& outcome) {
    Words words;
    if (outcome) {
        const sweep::ErrorList& errors = outcome->errors;
        appendTask(words, outcome->task);
        words.push_back(errors.size());
        words.insert(words.end(), errors.blocks.begin(), errors.blocks.end());
        words.insert(words.end(), errors.bitErrors.begin(), errors.bitErrors.end());
    }
    return words;
}

std::optional<Outcome> outcomeOf(const Words& words) {
    if (words.empty()) {
        return std::nullopt;
    }
    Outcome outcome{{words.at(0), words.at(1), words.at(2)}, {}};
    const auto blocks = words.begin() + 4;
    const auto bitErrors = blocks + static_cast<std::ptrdiff_t>(words.at(3));
    outcome.errors.blocks.assign(blocks, bitErrors);
    for (auto count = bitErrors; count != words.end(); ++count) {
        outcome.errors.bitErrors.push_back(static_cast<std::uint32_t>(*count));
    }
    return outcome;
}

void send(const Words& words, int rank, int tag) {
    MPI_Send(words.data(), static_cast<int>(words.size()), MPI_UINT64_T, rank, tag, MPI_COMM_WORLD);
}

/// Receive the message that was probed.
Words receive(MPI_Status status) {
    int size = 0;
    MPI_Get_count(&status, MPI_UINT64_T, &size);
    Words words(static_cast<std::size_t>(size));
    MPI_Recv(words.data(), size, MPI_UINT64_T, status.MPI_SOURCE, status.MPI_TAG, MPI_COMM_WORLD,
             MPI_STATUS_IGNORE);
    return words;
}

/// What the ranks that simulate blocks need of a plan.
std::string textOf(const sweep::Plan& plan) {
    sweep::Json points = sweep::Json::array();
    for (const sweep::PlannedPoint& point : plan.points) {
        points.push_back(
            {sweep::curveJson(point.setup), sweep::pointJson(point.setup, point.start.emptied())});
    }
    return sweep::Json{plan.seed, plan.shard.index, plan.shard.count, std::move(points)}.dump();
}

sweep::Plan planFrom(const std::string& text) {
    const sweep::Json json = sweep::Json::parse(text);
    sweep::Plan plan{json.at(0), {}, 0, {json.at(1), json.at(2)}, 0};
    for (const sweep::Json& point : json.at(3)) {
        auto [setup, start] = sweep::pointFrom(point.at(0), point.at(1));
        plan.points.push_back({setup, {}, std::move(start)});
    }
    return plan;
}

/// Give the text of rank 0 to all.
void broadcast(std::string& text) {
    int size = static_cast<int>(text.size());
    MPI_Bcast(&size, 1, MPI_INT, 0, MPI_COMM_WORLD);
    text.resize(static_cast<std::size_t>(size));
    MPI_Bcast(text.data(), size, MPI_CHAR, 0, MPI_COMM_WORLD);
}

}  // namespace

void announce(const std::optional<Announcement>& announcement) {
    std::string text = announcement ? textOf(announcement->plan) : std::string();
    broadcast(text);
    Words threads = {announcement ? announcement->threads : 0};
    MPI_Bcast(threads.data(), 1, MPI_UINT64_T, 0, MPI_COMM_WORLD);
}

std::optional<Announcement> awaitAnnouncement() {
    std::string text;
    broadcast(text);
    Words threads = {0};
    MPI_Bcast(threads.data(), 1, MPI_UINT64_T, 0, MPI_COMM_WORLD);
    if (text.empty()) {
        return std::nullopt;
    }
    return Announcement{planFrom(text), static_cast<unsigned>(threads.front())};
}

std::optional<sweep::Task> exchange(const std::optional<Outcome>& outcome) {
    send(wordsOf(outcome), 0, requestTag);
    MPI_Status status;
    MPI_Probe(0, answerTag, MPI_COMM_WORLD, &status);
    const Words words = receive(status);
    return words.empty() ? std::nullopt : std::optional(sweep::Task{words.at(0), words.at(1), words.at(2)});
}

std::optional<Request> pollRequest() {
    int hasCome = 0;
    MPI_Status status;
    MPI_Iprobe(MPI_ANY_SOURCE, requestTag, MPI_COMM_WORLD, &hasCome, &status);
    if (hasCome == 0) {
        return std::nullopt;
    }
    return Request{status.MPI_SOURCE, outcomeOf(receive(status))};
}

void answer(int rank, const std::optional<sweep::Task>& task) {
    Words words;
    if (task) {
        appendTask(words, *task);
    }
    send(words, rank, answerTag);
}

}  // namespace quarzel::mpi
