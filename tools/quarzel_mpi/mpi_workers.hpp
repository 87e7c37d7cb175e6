// SPDX-License-Identifier: MIT
#pragma once

#include "sweep/run.hpp"

namespace quarzel::mpi {

/// All ranks of an MPI job, as workers of a sweep that rank 0 runs. Tasks go to whichever rank asks.
class MpiWorkers : public sweep::Workers {
  public:
    /// On rank 0.
    /// @param threads  of each rank; 0: the usual number
    /// @param usual    the usual number of this rank
    MpiWorkers(unsigned threads, unsigned usual) : itsThreads(threads), itsUsual(usual) {}

    void run(sweep::Dispatcher& dispatcher, sweep::Observer& observer) override;

  private:
    unsigned itsThreads;
    unsigned itsUsual;
};

/// On the other ranks: take part in the sweeps of rank 0 until it lets them end.
/// @param usual  threads that this rank usually has
/// @param max    threads that it may have
void serve(unsigned usual, unsigned max);

}  // namespace quarzel::mpi
