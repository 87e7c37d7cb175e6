// SPDX-License-Identifier: MIT
#pragma once

#include <vector>

#include "decoder/decoder_3g.hpp"
#include "engine/engine.hpp"
#include "interface/block_call.hpp"
#include "interleaver/interleaver.hpp"

namespace quarzel {

/// While it lives, the components that decode are ready for a literal decode: their lines go where those of
/// the state go, their work storage is what literal decodes of all blocks before would have left, and passes
/// reach those who wait for them.
class LiteralCall : private PassListener {
  public:
    LiteralCall(vardel_ip_quarzel_state& state, const BlockCall& call);
    ~LiteralCall() override;
    LiteralCall(const LiteralCall&) = delete;
    LiteralCall& operator=(const LiteralCall&) = delete;

    /// Write the decisions after every iteration but the last, where these are wanted.
    void writeIterations(const BlockCall& call) const;

  private:
    void passEnded(const TDecoder3G& decoder, unsigned siso) override;

    /// Sends the lines of a component elsewhere, and back at the end: it may outlive the state.
    template <class Component>
    class Redirection {
      public:
        Redirection(Component& component, const Messages& messages)
            : itsComponent(component), itsFormer(component.messages()) {
            itsComponent.setMessages(messages);
        }
        Redirection(const Redirection&) = delete;
        Redirection& operator=(const Redirection&) = delete;
        ~Redirection() { itsComponent.setMessages(itsFormer); }

      private:
        Component& itsComponent;
        Messages itsFormer;
    };

    vardel_ip_quarzel_state& itsState;
    TDecoder3G* itsDecoder;  ///< null when the state's decoder is of another kind
    bool itsKeeps;           ///< decisions after every iteration are wanted
    std::vector<std::vector<unsigned char>> itsDecisions;
    Redirection<TDecoder> itsDecoderLines;
    Redirection<TInterleaver> itsInterleaverLines;
    Redirection<TCalculationEngine> itsEngineLines;
};

}  // namespace quarzel
