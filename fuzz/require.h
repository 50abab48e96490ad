#ifndef MORVEL_FUZZ_REQUIRE_H
#define MORVEL_FUZZ_REQUIRE_H

#include <cstdlib>

// A property every input must keep: its failure is a finding, as a crash is.
inline void require(bool condition)
{
    if (!condition)
        std::abort();
}

#endif
