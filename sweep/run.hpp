// SPDX-License-Identifier: MIT
#pragma once

#include "sweep/dispatcher.hpp"
#include "sweep/result.hpp"

namespace quarzel::sweep {

/// Watches a sweep from the thread that runs it.
class Observer {
  public:
    virtual ~Observer() = default;

    /// Called several times a second. To end the sweep early, call the dispatcher's `stop`.
    virtual void tick(Dispatcher&) {}
};

/// Whatever does the tasks of a dispatcher.
class Workers {
  public:
    virtual ~Workers() = default;

    /// Work until the dispatcher has no more tasks and all are completed. The observer is called on this
    /// thread.
    /// @throws what a task, or the observer, throws
    virtual void run(Dispatcher& dispatcher, Observer& observer) = 0;
};

/// Threads of this process.
class ThreadWorkers : public Workers {
  public:
    /// @param threads  at least 1
    explicit ThreadWorkers(unsigned threads) : itsThreads(threads) {}

    void run(Dispatcher& dispatcher, Observer& observer) override;

  private:
    unsigned itsThreads;
};

}  // namespace quarzel::sweep
