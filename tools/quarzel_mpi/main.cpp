// SPDX-License-Identifier: MIT
// The tool as an MPI job: rank 0 is the tool, the others work for its sweeps.
#define OMPI_SKIP_MPICXX 1
#define MPICH_SKIP_MPICXX 1
#include <mpi.h>

#include <algorithm>
#include <climits>
#include <csignal>
#include <exception>
#include <iostream>
#include <memory>
#include <optional>

#include "mpi_messages.hpp"
#include "mpi_workers.hpp"
#include "options/threads_option.hpp"
#include "run_tool_main.hpp"

namespace {

int rankHere() {
    int rank = 0;
    MPI_Comm_rank(MPI_COMM_WORLD, &rank);
    return rank;
}

/// Threads of each rank, so that all ranks of a machine together have one for each of its cores.
unsigned threadsOfRank() {
    MPI_Comm machine = MPI_COMM_NULL;
    MPI_Comm_split_type(MPI_COMM_WORLD, MPI_COMM_TYPE_SHARED, 0, MPI_INFO_NULL, &machine);
    int ranks = 1;
    MPI_Comm_size(machine, &ranks);
    MPI_Comm_free(&machine);
    return std::max(1U, quarzel::tool::allCores() / static_cast<unsigned>(ranks));
}

/// The other ranks. Signals are for rank 0, which ends the sweep and keeps what is done.
void serve(unsigned usual, unsigned max) {
    std::signal(SIGINT, SIG_IGN);
    std::signal(SIGTERM, SIG_IGN);
    std::signal(SIGHUP, SIG_IGN);
    try {
        quarzel::mpi::serve(usual, max);
    } catch (const std::exception& error) {
        std::cerr << "quarzel-mpi: error: rank " << rankHere() << ": " << error.what() << std::endl;
        MPI_Abort(MPI_COMM_WORLD, 1);
    }
}

}  // namespace

int main(int argc, char** argv) {
    int provided = MPI_THREAD_SINGLE;
    MPI_Init_thread(&argc, &argv, MPI_THREAD_SERIALIZED, &provided);
    const unsigned usual = threadsOfRank();
    int exitCode = 0;
    if (rankHere() == 0) {
        exitCode = quarzel::tool::runToolMain(argc, argv, [usual](unsigned threads) {
            return std::make_unique<quarzel::mpi::MpiWorkers>(threads, usual);
        });
        quarzel::mpi::announce(std::nullopt);
    } else {
        serve(usual, provided >= MPI_THREAD_SERIALIZED ? UINT_MAX : 1);
    }
    MPI_Finalize();
    return exitCode;
}
