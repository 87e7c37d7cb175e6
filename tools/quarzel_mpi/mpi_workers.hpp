// SPDX-License-Identifier: MIT
#pragma once

#include "sweep/run.hpp"

namespace quarzel::mpi {

/// All ranks of an MPI job, as workers of a sweep that rank 0 runs. The blocks go to whoever asks.
class MpiWorkers : public sweep::Workers {
  public:
    /// On rank 0.
    /// @param threads  of each rank; 0: as is usual
    /// @param usual    threads of this rank that are usual
    MpiWorkers(unsigned threads, unsigned usual) : itsThreads(threads), itsUsual(usual) {}

    void run(sweep::Dispatcher& dispatcher, sweep::Observer& observer) override;

  private:
    unsigned itsThreads;
    unsigned itsUsual;
};

/// On the other ranks: take part in the sweeps of rank 0 until it lets them end.
/// @param usual  threads of this rank that are usual
/// @param most   threads that may be
void serve(unsigned usual, unsigned most);

}  // namespace quarzel::mpi
