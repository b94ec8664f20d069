#pragma once

#include <cstdarg>
#include <cstdio>
#include <mutex>
#include <string>
#include <vector>

#include "vexmap/log.h"

/// Installs itself as the engine's log sink for its lifetime and keeps each line that reaches it:
/// the format exactly as the sink got it, and the text that format expands to. Restores the
/// settings it found. Lines may arrive from several threads.
class RecordingLogSink {
public:
    struct Line {
        std::string format;
        std::string text;
    };

    explicit RecordingLogSink(_DEWARP_LOG_LEVEL level = DEWARP_LOG_LEVEL_INFO)
        : previous(quorvel::vexmap::Log::set_logging({&Sink, level})) {
        Current() = this;
    }
    RecordingLogSink(RecordingLogSink const&) = delete;
    RecordingLogSink& operator=(RecordingLogSink const&) = delete;
    virtual ~RecordingLogSink() {
        quorvel::vexmap::Log::set_logging(previous);
        Current() = nullptr;
    }

    std::vector<Line> Lines() const {
        std::lock_guard<std::mutex> const lock(mutex);
        return lines;
    }

    std::size_t Count() const {
        std::lock_guard<std::mutex> const lock(mutex);
        return lines.size();
    }

private:
    static RecordingLogSink*& Current() {
        static RecordingLogSink* current = nullptr;
        return current;
    }

    static void Sink(char const* format, va_list arguments) {
        char text[1024];
        vsnprintf(text, sizeof text, format, arguments);
        RecordingLogSink* const sink = Current();
        if (sink != nullptr) {
            std::lock_guard<std::mutex> const lock(sink->mutex);
            sink->lines.push_back({format, text});
        }
    }

    _DEWARP_LOG_SETTINGS previous;
    mutable std::mutex mutex;
    std::vector<Line> lines;
};
