// SPDX-License-Identifier: MIT
// A decode with the component classes, every one from its factory.
#include <decoder/decoder.hpp>
#include <engine/engine.hpp>
#include <fixed/number_format.hpp>
#include <interleaver/interleaver.hpp>
#include <iostream>
#include <memory>

int main() {
    const std::unique_ptr<TNumberFormat> state(TNumberFormat::create("Fix_12_3"));
    const std::unique_ptr<TNumberFormat> branch(TNumberFormat::create("Fix_8_3"));
    const std::unique_ptr<TInterleaver> interleaver(TInterleaver::create("3GPPLTE"));
    const std::unique_ptr<TCalculationEngine> engine(TCalculationEngine::create("MOD"));
    engine->setFormats(branch.get(), state.get(), branch.get());
    const std::unique_ptr<TDecoder> decoder(TDecoder::create("3GPPPU:2"));
    if (!engine->initialise()) {
        return 1;
    }
    decoder->connect(interleaver.get(), engine.get());
    std::vector<unsigned char> hard;
    if (!decoder->decode(std::vector<short>(3 * 44, -128), hard, 6)) {
        return 1;
    }
    std::cout << "status 0, " << hard.size() << " bits, first bit " << int{hard[0]} << ", tag 1\n";
}
