// SPDX-License-Identifier: MIT
#include "interruption.hpp"

namespace quarzel::tool {

namespace {

volatile std::sig_atomic_t signalHasCome = 0;

}  // namespace

Interruption::Interruption() {
    signalHasCome = 0;
    struct sigaction action {};
    action.sa_handler = [](int) { signalHasCome = 1; };
    action.sa_flags = static_cast<int>(SA_RESETHAND) | SA_RESTART;
    ::sigaction(SIGINT, &action, &itsFormerInterrupt);
    ::sigaction(SIGTERM, &action, &itsFormerTermination);
}

Interruption::~Interruption() {
    ::sigaction(SIGINT, &itsFormerInterrupt, nullptr);
    ::sigaction(SIGTERM, &itsFormerTermination, nullptr);
}

bool Interruption::hasCome() const {
    return signalHasCome != 0;
}

}  // namespace quarzel::tool
