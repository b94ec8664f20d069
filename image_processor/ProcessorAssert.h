#pragma once

#include <cstdio>
#include <cstdlib>

/// A check that aborts with an assertion message in every build type, release included: a caller
/// that breaks the processor's limits must never get a wrong picture instead.
inline void ProcessorAssert(bool holds, char const* condition, char const* source, unsigned line,
                            char const* function) {
    if (!holds) {
        fprintf(stderr, "%s:%u: %s: Assertion `%s' failed.\n", source, line, function, condition);
        abort();
    }
}
