#include "vexmap/performance_timer.h"

#include "vexmap/log.h"

namespace quorvel::vexmap {
namespace {
constexpr char const* UNNAMED = "<unnamed>";
}  // namespace

PerformanceTimer::PerformanceTimer() : m_sName(UNNAMED) {}

PerformanceTimer::PerformanceTimer(char const* name) : m_sName(name == nullptr ? UNNAMED : name) {}

PerformanceTimer::PerformanceTimer(std::string const& name) : m_sName(name) {}

// A copy of a timer measures nothing of the original, so it takes no name.
PerformanceTimer::PerformanceTimer(PerformanceTimer const&) {}

PerformanceTimer& PerformanceTimer::operator=(PerformanceTimer const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__,
                  "PerformanceTimer::operator=", "Self assignment of %s object\n",
                  "PerformanceTimer");
    }
    return *this;
}

PerformanceTimer::~PerformanceTimer() = default;

void PerformanceTimer::Start() {}

void PerformanceTimer::Finish() {}

}  // namespace quorvel::vexmap
