#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdlib>

/// One input of a fuzzer or of a corpus.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

/// What must hold for every input.
#define FUZZ_EXPECT(condition)                                                                               \
    do {                                                                                                     \
        if (!(condition))                                                                                    \
            std::abort();                                                                                    \
    } while (0)
