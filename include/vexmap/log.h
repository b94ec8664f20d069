#pragma once

#include <atomic>
#include <cstdarg>
#include <string>

#include "vexmap/dewarp_types.h"

namespace quorvel::vexmap {

/// The engine's only way out for diagnostics: each line goes, as a prefixed printf format with
/// its arguments unexpanded, to the one sink the host installs. Without a sink, or below the level,
/// a call costs a test and builds nothing. Level and sink are process-wide and unlocked by design;
/// they are atomics only so that concurrent logging is free of data races. Any thread may log.
class Log {
public:
    static constexpr _DEWARP_LOG_LEVEL MinLevel = DEWARP_LOG_LEVEL_ERROR;
    static constexpr _DEWARP_LOG_LEVEL MaxLevel = DEWARP_LOG_LEVEL_INFO;

    Log();
    Log(Log const& other);
    Log& operator=(Log const& other);
    virtual ~Log();

    // The level functions take the caller's line, file and function, which reach no line.
    static void err(int line, char const* file, char const* function, char const* format, ...)
        __attribute__((format(printf, 4, 5)));
    static void warn(int line, char const* file, char const* function, char const* format, ...)
        __attribute__((format(printf, 4, 5)));
    static void info(int line, char const* file, char const* function, char const* format, ...)
        __attribute__((format(printf, 4, 5)));
    static void debug(int line, char const* file, char const* function, char const* format, ...)
        __attribute__((format(printf, 4, 5)));
    static void entry(int line, char const* file, char const* function, char const* format, ...)
        __attribute__((format(printf, 4, 5)));
    static void exit(int line, char const* file, char const* function, char const* format, ...)
        __attribute__((format(printf, 4, 5)));

    static bool check_level(_DEWARP_LOG_LEVEL level);

    /// Reach the sink at any level, with the prefix "VEXMAP: - ".
    static void printf(char const* format, ...) __attribute__((format(printf, 1, 2)));
    static void vprintf(char const* format, va_list arguments);
    /// Hands the format to the sink as it is, with no prefix.
    static void log(char const* format, va_list arguments);

    /// Installs the sink and the level, clamped to MinLevel..MaxLevel; returns what was in force.
    static _DEWARP_LOG_SETTINGS set_logging(_DEWARP_LOG_SETTINGS const& settings);

    static std::string reformat(char const* format);
    static std::string reformat(int line, char const* file, char const* function,
                                char const* format);
    /// A level outside 0..4 gets no level word, only "- " and the format.
    static std::string reformat(_DEWARP_LOG_LEVEL level, int line, char const* file,
                                char const* function, char const* format);
    static std::string reformat(_DEWARP_LOG_LEVEL level, int line, char const* file,
                                char const* function, char const* detail, char const* format);

    static std::atomic<_DEWARP_LOG_LEVEL> m_eLevel;
    static std::atomic<_DEWARP_LOG_FUNCTION> m_fnLogger;

private:
    static bool Wants(_DEWARP_LOG_LEVEL least_level);
    static void Deliver(std::string const& full_format, va_list arguments);
};

}  // namespace quorvel::vexmap
