#include "vexmap/performance_timer.h"

#include <gtest/gtest.h>

#include "recording_log_sink.h"

namespace quorvel::vexmap {
namespace {

TEST(PerformanceTimer, DefaultIsUnnamed) {
    EXPECT_EQ("<unnamed>", PerformanceTimer().Name());
}

TEST(PerformanceTimer, ANullNameIsUnnamed) {
    EXPECT_EQ("<unnamed>", PerformanceTimer(static_cast<char const*>(nullptr)).Name());
}

TEST(PerformanceTimer, KeepsItsName) {
    EXPECT_EQ("One stage map build", PerformanceTimer("One stage map build").Name());
    EXPECT_EQ("image dewarp", PerformanceTimer(std::string("image dewarp")).Name());
}

TEST(PerformanceTimer, ACopyHasNoName) {
    PerformanceTimer const original(static_cast<char const*>(nullptr));
    PerformanceTimer const copy(original);
    EXPECT_EQ("", copy.Name());
}

TEST(PerformanceTimer, AssignmentCopiesNothing) {
    PerformanceTimer const source("source");
    PerformanceTimer target("target");
    target = source;
    EXPECT_EQ("target", target.Name());
}

TEST(PerformanceTimer, AssignmentToItselfWarns) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    PerformanceTimer timer("timer");
    PerformanceTimer& same = timer;
    timer = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of %s object\n", lines[0].format);
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of PerformanceTimer object\n", lines[0].text);
}

TEST(PerformanceTimer, StartAndFinishReportNothing) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    PerformanceTimer timer("image dewarp");
    timer.Start();
    timer.Finish();
    EXPECT_EQ("image dewarp", timer.Name());
    EXPECT_EQ(0u, sink.Count());
}

}  // namespace
}  // namespace quorvel::vexmap
