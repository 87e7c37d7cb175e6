// SPDX-License-Identifier: MIT
#pragma once

#include <new>
#include <stdexcept>
#include <string>
#include <vector>

#include "message_sink.hpp"

/// What every binding shares. A call of a binding does its work inside `guarded` and turns the outcome into
/// what its host knows: an exception, an error, a status.
namespace quarzel::bindings {

/// Why a call did nothing.
enum class Fault {
    none,
    type,         ///< an argument is of a wrong type
    value,        ///< an argument has a wrong value or shape
    closed,       ///< the core was closed before
    busy,         ///< another thread is using the core
    interrupted,  ///< the user asked for an end
    memory,       ///< there is not enough memory
    model,        ///< the model refused what was thought to be right
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
    std::string text;                   ///< what is wrong and what to do; empty when all went well
    std::vector<std::string> warnings;  ///< of the model, for the host's own channel

    bool done() const noexcept { return fault == Fault::none; }

    /// The text for the user.
    const char* message() const noexcept {
        return fault == Fault::memory ? "there is not enough memory; decode fewer blocks in one call"
                                      : text.c_str();
    }
};

/// Do some work. Whatever it throws, and whatever the model says meanwhile, ends up in the outcome.
template <class Work>
Outcome guarded(Work&& work) noexcept {
    Outcome outcome;
    Messages messages;
    const MessageSink sink(messages);
    try {
        try {
            work(messages);
            if (messages.incomplete) {
                throw std::bad_alloc();
            }
        } catch (const BindingError& error) {
            outcome.fault = error.fault();
            outcome.text = error.what();
        } catch (const std::bad_alloc&) {
            throw;
        } catch (const std::exception& error) {
            outcome.fault = Fault::model;
            outcome.text = error.what();
        } catch (...) {
            outcome.fault = Fault::model;
            outcome.text = "something unknown went wrong";
        }
    } catch (...) {
        outcome.fault = Fault::memory;
    }
    outcome.warnings.swap(messages.warnings);
    return outcome;
}

}  // namespace quarzel::bindings
