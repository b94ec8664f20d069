#include "vexmap/log.h"

#include <atomic>
#include <cstdlib>
#include <new>
#include <thread>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"

// Counts the allocations of this test binary while asked to, so a test can show that a line
// below the level builds nothing. The replacement pairs malloc with free, which the compiler
// cannot see through inlining.
#if defined(__GNUC__) && !defined(__clang__)
#pragma GCC diagnostic ignored "-Wmismatched-new-delete"
#endif
namespace {
std::atomic<bool> counting{false};
std::atomic<int> allocations{0};
}  // namespace

void* operator new(std::size_t size) {
    if (counting.load()) {
        ++allocations;
    }
    if (void* const memory = std::malloc(size == 0 ? 1 : size)) {
        return memory;
    }
    throw std::bad_alloc();
}

void operator delete(void* memory) noexcept {
    std::free(memory);
}

void operator delete(void* memory, std::size_t) noexcept {
    std::free(memory);
}

namespace quorvel::vexmap {
namespace {

using ::testing::ElementsAre;
using ::testing::Field;

auto Format(std::string const& format) {
    return Field(&RecordingLogSink::Line::format, format);
}

TEST(Log, WithoutASinkNothingHappensEvenForErrors) {
    _DEWARP_LOG_SETTINGS const previous = Log::set_logging({nullptr, DEWARP_LOG_LEVEL_INFO});
    allocations = 0;
    counting = true;
    Log::err(__LINE__, __FILE__, "Test", "an error long enough to need the heap as a string %d\n",
             1);
    Log::printf("a plain line long enough to need the heap as a string %d\n", 2);
    counting = false;
    EXPECT_EQ(0, allocations.load());
    Log::set_logging(previous);
}

TEST(Log, StartsWithoutASinkAtTheErrorLevel) {
    EXPECT_EQ(nullptr, Log::m_fnLogger.load());
    EXPECT_EQ(DEWARP_LOG_LEVEL_ERROR, Log::m_eLevel.load());
}

TEST(Log, ALevelLineReachesTheSinkWithItsPrefixAndUnexpandedArguments) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    Log::err(10, "src/view", "View::BuildMap", "Invalid %s at %d\n", "map", 7);
    Log::warn(11, "src/view", "View::BuildMap", "Invalid log level\n");
    Log::info(12, "src/camera", "Camera::LogCameraInfo", "width %u\n", 1936u);
    auto const lines = sink.Lines();
    ASSERT_EQ(3u, lines.size());
    EXPECT_EQ("VEXMAP: ERROR - Invalid %s at %d\n", lines[0].format);
    EXPECT_EQ("VEXMAP: ERROR - Invalid map at 7\n", lines[0].text);
    EXPECT_EQ("VEXMAP: WARNING - Invalid log level\n", lines[1].format);
    EXPECT_EQ("VEXMAP: INFO - width %u\n", lines[2].format);
    EXPECT_EQ("VEXMAP: INFO - width 1936\n", lines[2].text);
}

TEST(Log, TheFormatEndsInTheCallersOwnCharacters) {
    RecordingLogSink const sink;
    Log::err(1, "f", "g", "no newline");
    Log::err(1, "f", "g", "two\n\n");
    EXPECT_THAT(sink.Lines(), ElementsAre(Format("VEXMAP: ERROR - no newline"),
                                          Format("VEXMAP: ERROR - two\n\n")));
}

TEST(Log, AtLevelZeroAWarningIsHiddenAndAnErrorShown) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    Log::warn(1, "f", "g", "hidden\n");
    Log::info(1, "f", "g", "hidden\n");
    Log::err(1, "f", "g", "shown\n");
    EXPECT_THAT(sink.Lines(), ElementsAre(Format("VEXMAP: ERROR - shown\n")));
}

TEST(Log, ALevelOfFourBehavesExactlyAsTwo) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_TRACE);
    EXPECT_EQ(DEWARP_LOG_LEVEL_INFO, Log::m_eLevel.load());
    Log::info(1, "f", "g", "info\n");
    Log::debug(1, "f", "g", "debug\n");
    Log::entry(1, "f", "g", "entry\n");
    Log::exit(1, "f", "g", "exit\n");
    EXPECT_THAT(sink.Lines(), ElementsAre(Format("VEXMAP: INFO - info\n")));
}

TEST(Log, ALevelOfMinusOneBehavesAsZero) {
    RecordingLogSink const sink(static_cast<_DEWARP_LOG_LEVEL>(-1));
    EXPECT_EQ(DEWARP_LOG_LEVEL_ERROR, Log::m_eLevel.load());
    Log::warn(1, "f", "g", "hidden\n");
    Log::err(1, "f", "g", "shown\n");
    EXPECT_EQ(1u, sink.Count());
}

TEST(Log, SetLoggingReturnsTheSettingsItReplaces) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    _DEWARP_LOG_SETTINGS const previous = Log::set_logging({nullptr, DEWARP_LOG_LEVEL_INFO});
    EXPECT_NE(nullptr, previous.function);
    EXPECT_EQ(DEWARP_LOG_LEVEL_WARNING, previous.level);
    Log::set_logging(previous);
}

TEST(Log, CheckLevelIsTrueUpToTheLevelSet) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    EXPECT_TRUE(Log::check_level(DEWARP_LOG_LEVEL_ERROR));
    EXPECT_TRUE(Log::check_level(DEWARP_LOG_LEVEL_WARNING));
    EXPECT_FALSE(Log::check_level(DEWARP_LOG_LEVEL_INFO));
}

TEST(Log, PrintfReachesTheSinkAtAnyLevel) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    Log::printf("plain %d\n", 3);
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: - plain %d\n", lines[0].format);
    EXPECT_EQ("VEXMAP: - plain 3\n", lines[0].text);
}

void Forward(char const* format, ...) {
    va_list arguments;
    va_start(arguments, format);
    Log::log(format, arguments);
    va_end(arguments);
}

TEST(Log, LogHandsTheFormatOverWithoutAPrefix) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    Forward("bare %s\n", "line");
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("bare %s\n", lines[0].format);
    EXPECT_EQ("bare line\n", lines[0].text);
}

TEST(Log, ReformatPutsTheLevelWordBeforeTheDash) {
    EXPECT_EQ("VEXMAP: - text", Log::reformat("text"));
    EXPECT_EQ("VEXMAP: - text", Log::reformat(1, "f", "g", "text"));
    EXPECT_EQ("VEXMAP: ERROR - text", Log::reformat(DEWARP_LOG_LEVEL_ERROR, 1, "f", "g", "text"));
    EXPECT_EQ("VEXMAP: WARNING - text",
              Log::reformat(DEWARP_LOG_LEVEL_WARNING, 1, "f", "g", "text"));
    EXPECT_EQ("VEXMAP: INFO - text", Log::reformat(DEWARP_LOG_LEVEL_INFO, 1, "f", "g", "text"));
    EXPECT_EQ("VEXMAP: DEBUG - text", Log::reformat(DEWARP_LOG_LEVEL_DEBUG, 1, "f", "g", "text"));
    EXPECT_EQ("VEXMAP: TRACE - text",
              Log::reformat(DEWARP_LOG_LEVEL_TRACE, 1, "f", "g", "detail", "text"));
}

TEST(Log, ReformatOfALevelOutsideTheWordsGivesOnlyTheDashAndTheFormat) {
    EXPECT_EQ("- text", Log::reformat(static_cast<_DEWARP_LOG_LEVEL>(9), 1, "f", "g", "text"));
    EXPECT_EQ("- text", Log::reformat(static_cast<_DEWARP_LOG_LEVEL>(-1), 1, "f", "g", "text"));
}

TEST(Log, ALineBelowTheLevelBuildsNoString) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    allocations = 0;
    counting = true;
    Log::warn(1, "f", "g", "a warning long enough that any string of it would be allocated %d\n",
              1);
    counting = false;
    EXPECT_EQ(0, allocations.load());
    counting = true;
    Log::err(1, "f", "g", "an error long enough that its string must be allocated on the heap\n");
    counting = false;
    EXPECT_GT(allocations.load(), 0);
}

TEST(Log, LinesFromSeveralThreadsAllArrive) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    std::vector<std::thread> threads;
    for (int thread = 0; thread < 4; ++thread) {
        threads.emplace_back([thread] {
            for (int line = 0; line < 250; ++line) {
                Log::info(line, "f", "g", "thread %d line %d\n", thread, line);
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(1000u, sink.Count());
}

TEST(Log, ChangingTheSettingsWhileOthersLogIsSafe) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    std::atomic<bool> done{false};
    std::thread logger([&done] {
        while (!done.load()) {
            Log::err(1, "f", "g", "busy\n");
        }
    });
    _DEWARP_LOG_SETTINGS const installed = Log::set_logging({nullptr, DEWARP_LOG_LEVEL_INFO});
    for (int turn = 0; turn < 200; ++turn) {
        Log::set_logging(turn % 2 == 0 ? installed
                                       : _DEWARP_LOG_SETTINGS{nullptr, DEWARP_LOG_LEVEL_ERROR});
    }
    Log::set_logging(installed);
    done = true;
    logger.join();
    EXPECT_EQ(DEWARP_LOG_LEVEL_INFO, Log::m_eLevel.load());
}

}  // namespace
}  // namespace quorvel::vexmap
