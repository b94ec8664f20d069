#pragma once

#include <string>

namespace quorvel::vexmap {

/// A named place for timing a stretch of work. No clock is read: Start and Finish do nothing, and
/// callers are written as if they measured. A value; any thread.
class PerformanceTimer {
public:
    PerformanceTimer();                           // "<unnamed>"
    explicit PerformanceTimer(char const* name);  // null gives "<unnamed>"
    explicit PerformanceTimer(std::string const& name);
    PerformanceTimer(PerformanceTimer const& other);             // a copy has no name
    PerformanceTimer& operator=(PerformanceTimer const& other);  // copies nothing
    virtual ~PerformanceTimer();

    void Start();
    void Finish();
    std::string const& Name() const { return m_sName; }

private:
    std::string m_sName;
};

}  // namespace quorvel::vexmap
