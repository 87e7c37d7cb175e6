// SPDX-License-Identifier: MIT
#pragma once

#include <new>
#include <stdexcept>
#include <string>
#include <vector>

#include "quarzel/core.hpp"

/// What every binding shares. A call of a binding does its work inside `guarded` and turns the outcome into
/// what its host knows: an exception, an error, a status.
namespace quarzel::bindings {

/// Why a call failed.
enum class Fault {
    none,
    type,         ///< an argument is of a wrong type
    value,        ///< an argument has a wrong value or shape
    closed,       ///< the core was closed before
    busy,         ///< another thread is using the core
    interrupted,  ///< the user asked to stop
    memory,       ///< there is not enough memory
    model,        ///< the model refused what passed the checks of the binding
};

/// A fault on its way to `guarded`.
class BindingError : public std::runtime_error {
  public:
    /// @param text  what is wrong and what to do, for the user of the host
    BindingError(Fault fault, const std::string& text) : std::runtime_error(text), itsFault(fault) {}

    Fault fault() const { return itsFault; }

  private:
    Fault itsFault;
};

/// How a call ended.
struct Outcome {
    Fault fault = Fault::none;
    std::string text;                   ///< what is wrong and what to do; empty when nothing is
    std::vector<std::string> warnings;  ///< of the model, for the host's own channel
    std::string trace;                  ///< the text of the passes that were traced

    bool done() const noexcept { return fault == Fault::none; }

    /// The text for the user.
    const char* message() const noexcept {
        return fault == Fault::memory ? "there is not enough memory; decode fewer blocks in one call"
                                      : text.c_str();
    }
};

/// Do some work and note in the outcome what it throws.
template <class Work>
void guard(Outcome& outcome, Work&& work) noexcept {
    constexpr int outOfMemory = 99;
    try {
        try {
            work();
        } catch (const BindingError& error) {
            outcome.fault = error.fault();
            outcome.text = error.what();
        } catch (const Error& error) {
            outcome.fault = error.status() == outOfMemory ? Fault::memory : Fault::model;
            outcome.text = error.what();
        } catch (const std::bad_alloc&) {
            throw;
        } catch (const std::invalid_argument& error) {
            outcome.fault = Fault::value;
            outcome.text = error.what();
        } catch (const std::exception& error) {
            outcome.fault = Fault::model;
            outcome.text = error.what();
        } catch (...) {
            outcome.fault = Fault::model;
            outcome.text = "an unknown exception was thrown";
        }
    } catch (...) {
        outcome.fault = Fault::memory;
    }
}

/// Pass on what went wrong in a call inside another one.
/// @throws BindingError unless the call has done its work
inline void requireDone(const Outcome& outcome) {
    if (!outcome.done()) {
        throw BindingError(outcome.fault, outcome.message());
    }
}

/// The outcome of some work.
template <class Work>
Outcome guarded(Work&& work) noexcept {
    Outcome outcome;
    guard(outcome, work);
    return outcome;
}

}  // namespace quarzel::bindings
