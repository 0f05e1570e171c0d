#pragma once

#include <cstdio>
#include <cstdlib>

namespace kestrum::fuzz {

/// Ends the run if the condition is false, so that the fuzzer keeps the input.
inline void require(bool condition, const char* what)
{
    if (condition)
        return;
    std::fprintf(stderr, "%s\n", what);
    std::abort();
}

} // namespace kestrum::fuzz
