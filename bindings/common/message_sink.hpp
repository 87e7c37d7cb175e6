// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

namespace quarzel::bindings {

/// What the model said during one call.
struct Messages {
    std::vector<std::string> errors;    ///< lines, without "ERROR:" and the name of the component
    std::vector<std::string> warnings;  ///< lines, without "WARNING:" and the name of the component
    std::string trace;                  ///< the text of traced passes
    bool incomplete = false;            ///< memory ran out while a message was kept
};

/// While one lives, what the model says on this thread is kept in it instead of going to the standard
/// streams, which a host may not show and which other threads use.
///
/// It takes the place of the library's own text output when the archive is linked: message_sink.cpp defines
/// the functions of fixed/text_output.hpp. So no stream of the process is touched, and no lock is needed.
class MessageSink {
  public:
    /// @param messages  receives the messages; must outlive the sink
    explicit MessageSink(Messages& messages) noexcept;
    MessageSink(const MessageSink&) = delete;
    MessageSink& operator=(const MessageSink&) = delete;
    ~MessageSink();

  private:
    Messages* itsOuter;
};

}  // namespace quarzel::bindings
