#include "vexmap/log.h"

#include "vexmap/defaults.h"

namespace quorvel::vexmap {
namespace {

constexpr char const* PREFIX = "VEXMAP: ";
constexpr char const* DASH = "- ";

char const* LevelWord(_DEWARP_LOG_LEVEL level) {
    switch (level) {
        case DEWARP_LOG_LEVEL_ERROR:
            return "ERROR ";
        case DEWARP_LOG_LEVEL_WARNING:
            return "WARNING ";
        case DEWARP_LOG_LEVEL_INFO:
            return "INFO ";
        case DEWARP_LOG_LEVEL_DEBUG:
            return "DEBUG ";
        case DEWARP_LOG_LEVEL_TRACE:
            return "TRACE ";
    }
    return nullptr;
}

std::string Text(char const* text) {
    return text == nullptr ? std::string() : std::string(text);
}

}  // namespace

std::atomic<_DEWARP_LOG_LEVEL> Log::m_eLevel{Defaults::LogLevel};
std::atomic<_DEWARP_LOG_FUNCTION> Log::m_fnLogger{Defaults::LogFunction};

Log::Log() = default;

Log::Log(Log const&) = default;

Log& Log::operator=(Log const&) = default;

Log::~Log() = default;

// Both tests come before any string is built, so a suppressed line costs nothing.
bool Log::Wants(_DEWARP_LOG_LEVEL least_level) {
    return m_fnLogger.load(std::memory_order_relaxed) != nullptr &&
           m_eLevel.load(std::memory_order_relaxed) >= least_level;
}

// The sink is read again: one removed since the first test is not called.
void Log::Deliver(std::string const& full_format, va_list arguments) {
    _DEWARP_LOG_FUNCTION const sink = m_fnLogger.load(std::memory_order_relaxed);
    if (sink != nullptr) {
        sink(full_format.c_str(), arguments);
    }
}

void Log::err(int line, char const* file, char const* function, char const* format, ...) {
    if (Wants(DEWARP_LOG_LEVEL_ERROR)) {
        va_list arguments;
        va_start(arguments, format);
        Deliver(reformat(DEWARP_LOG_LEVEL_ERROR, line, file, function, format), arguments);
        va_end(arguments);
    }
}

void Log::warn(int line, char const* file, char const* function, char const* format, ...) {
    if (Wants(DEWARP_LOG_LEVEL_WARNING)) {
        va_list arguments;
        va_start(arguments, format);
        Deliver(reformat(DEWARP_LOG_LEVEL_WARNING, line, file, function, format), arguments);
        va_end(arguments);
    }
}

void Log::info(int line, char const* file, char const* function, char const* format, ...) {
    if (Wants(DEWARP_LOG_LEVEL_INFO)) {
        va_list arguments;
        va_start(arguments, format);
        Deliver(reformat(DEWARP_LOG_LEVEL_INFO, line, file, function, format), arguments);
        va_end(arguments);
    }
}

// Debug and trace lines are above MaxLevel, so no setting shows them.
void Log::debug(int line, char const* file, char const* function, char const* format, ...) {
    if (Wants(DEWARP_LOG_LEVEL_DEBUG)) {
        va_list arguments;
        va_start(arguments, format);
        Deliver(reformat(DEWARP_LOG_LEVEL_DEBUG, line, file, function, format), arguments);
        va_end(arguments);
    }
}

void Log::entry(int line, char const* file, char const* function, char const* format, ...) {
    if (Wants(DEWARP_LOG_LEVEL_TRACE)) {
        va_list arguments;
        va_start(arguments, format);
        Deliver(reformat(DEWARP_LOG_LEVEL_TRACE, line, file, function, nullptr, format), arguments);
        va_end(arguments);
    }
}

void Log::exit(int line, char const* file, char const* function, char const* format, ...) {
    if (Wants(DEWARP_LOG_LEVEL_TRACE)) {
        va_list arguments;
        va_start(arguments, format);
        Deliver(reformat(DEWARP_LOG_LEVEL_TRACE, line, file, function, nullptr, format), arguments);
        va_end(arguments);
    }
}

bool Log::check_level(_DEWARP_LOG_LEVEL level) {
    return m_eLevel.load(std::memory_order_relaxed) >= level;
}

void Log::printf(char const* format, ...) {
    va_list arguments;
    va_start(arguments, format);
    vprintf(format, arguments);
    va_end(arguments);
}

void Log::vprintf(char const* format, va_list arguments) {
    if (m_fnLogger.load(std::memory_order_relaxed) != nullptr) {
        Deliver(reformat(format), arguments);
    }
}

void Log::log(char const* format, va_list arguments) {
    _DEWARP_LOG_FUNCTION const sink = m_fnLogger.load(std::memory_order_relaxed);
    if (sink != nullptr) {
        sink(format, arguments);
    }
}

_DEWARP_LOG_SETTINGS Log::set_logging(_DEWARP_LOG_SETTINGS const& settings) {
    _DEWARP_LOG_SETTINGS const previous{m_fnLogger.load(std::memory_order_relaxed),
                                        m_eLevel.load(std::memory_order_relaxed)};
    int level = int(settings.level);
    if (level < int(MinLevel)) {
        level = MinLevel;
    }
    if (level > int(MaxLevel)) {
        level = MaxLevel;
    }
    m_fnLogger.store(settings.function, std::memory_order_relaxed);
    m_eLevel.store(static_cast<_DEWARP_LOG_LEVEL>(level), std::memory_order_relaxed);
    return previous;
}

std::string Log::reformat(char const* format) {
    return PREFIX + std::string(DASH) + Text(format);
}

std::string Log::reformat(int, char const*, char const*, char const* format) {
    return reformat(format);
}

std::string Log::reformat(_DEWARP_LOG_LEVEL level, int, char const*, char const*,
                          char const* format) {
    char const* const word = LevelWord(level);
    std::string full = word == nullptr ? std::string() : PREFIX + std::string(word);
    return full + DASH + Text(format);
}

std::string Log::reformat(_DEWARP_LOG_LEVEL level, int line, char const* file, char const* function,
                          char const*, char const* format) {
    return reformat(level, line, file, function, format);
}

}  // namespace quorvel::vexmap
