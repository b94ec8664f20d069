#pragma once

#include <algorithm>
#include <ctime>
#include <limits>

// Comparisons that can be believed on a shared machine: two timed loops run at different moments
// drift apart (rows doing the same work have measured 2.56 and 4.31 ms), so the two sides are run
// in turns, one after the other, and the fastest run of each is kept.
namespace quorvel::vexmap::bench {

/// The thread's processor time, as the benchmark library counts it, so that a busy machine does
/// not load one side of a comparison more than the other.
inline double ThreadMilliseconds() {
    timespec now{};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &now);
    return double(now.tv_sec) * 1e3 + double(now.tv_nsec) * 1e-6;
}

struct Turns {
    double first_ms = std::numeric_limits<double>::infinity();
    double second_ms = std::numeric_limits<double>::infinity();
    double Ratio() const { return first_ms / second_ms; }  // first's time over second's
};

/// Runs `first` then `second`, `rounds` times, and keeps the fastest run of each.
template <typename First, typename Second>
Turns InTurns(int rounds, First&& first, Second&& second) {
    Turns turns;
    for (int round = 0; round < rounds; ++round) {
        double const start = ThreadMilliseconds();
        first();
        double const middle = ThreadMilliseconds();
        second();
        double const end = ThreadMilliseconds();
        turns.first_ms = std::min(turns.first_ms, middle - start);
        turns.second_ms = std::min(turns.second_ms, end - middle);
    }
    return turns;
}

}  // namespace quorvel::vexmap::bench
