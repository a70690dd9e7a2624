// The shape of a fuzzer: a function of a text, called by libFuzzer.
#pragma once

#include <cstdlib>
#include <iostream>
#include <string_view>

namespace fuzz {

/// Tries one input. Defined by each fuzzer.
void tryOne(std::string_view input);

/// What a parser promises. Broken, it ends the run, and libFuzzer keeps the input.
inline void promise(bool kept, const char* what) {
  if (!kept) {
    std::cerr << "broken: " << what << '\n';
    std::abort();
  }
}

}  // namespace fuzz
