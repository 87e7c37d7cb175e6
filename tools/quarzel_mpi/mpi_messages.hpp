// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "sweep/dispatcher.hpp"

/// The messages between ranks. Rank 0 has the dispatcher; the others ask it for tasks.
namespace quarzel::mpi {

/// The work that rank 0 announces to all.
struct Announcement {
    sweep::Plan plan;  ///< its rules are for rank 0 alone
    unsigned threads;  ///< of each rank; 0: the usual number
};

/// On rank 0: begin a sweep with all ranks; or, without one, let them end.
void announce(const std::optional<Announcement>& announcement);

/// On the others: wait for the announcement.
std::optional<Announcement> awaitAnnouncement();

/// A task and its blocks in error.
struct Outcome {
    sweep::Task task;
    sweep::ErrorList errors;
};

/// On the other ranks: hand in an outcome, if there is one, and receive a task, unless none is left.
std::optional<sweep::Task> exchange(const std::optional<Outcome>& outcome);

/// On rank 0: what a rank has handed in.
struct Request {
    int rank;
    std::optional<Outcome> outcome;
};

/// On rank 0: take a request, if one has come.
std::optional<Request> pollRequest();

/// On rank 0: answer a request.
void answer(int rank, const std::optional<sweep::Task>& task);

}  // namespace quarzel::mpi
