#include "vexmap/code_location.h"

#include <sstream>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"

namespace quorvel::vexmap {
namespace {

TEST(CodeLocation, OutsideAClassPrintsFunctionAtFileAndLine) {
    EXPECT_EQ("SetView@src/dewarp:985", CodeLocation("src/dewarp", "SetView", 985).Text());
}

TEST(CodeLocation, InsideAClassPutsTheClassBeforeTheFunction) {
    EXPECT_EQ("Channel::GetViewObject@src/channel:567",
              CodeLocation("src/channel", "Channel", "GetViewObject", 567).Text());
}

TEST(CodeLocation, NullNamesCountAsEmpty) {
    EXPECT_EQ("@:7", CodeLocation(nullptr, nullptr, 7).Text());
    EXPECT_EQ("@:8", CodeLocation(nullptr, nullptr, nullptr, 8).Text());
}

TEST(CodeLocation, DefaultPrintsTheLineAsMinusOne) {
    EXPECT_EQ("@:-1", CodeLocation().Text());
}

TEST(CodeLocation, StreamsAsItsText) {
    std::ostringstream stream;
    stream << CodeLocation("src/view", "View", "BuildMap", 12);
    EXPECT_EQ("View::BuildMap@src/view:12", stream.str());
}

TEST(CodeLocation, CopiesAndAssignmentsCarryEveryMember) {
    CodeLocation const original("src/view", "View", "BuildMap", 12);
    CodeLocation const copy(original);
    CodeLocation assigned;
    assigned = original;
    EXPECT_EQ(original.Text(), copy.Text());
    EXPECT_EQ(original.Text(), assigned.Text());
}

TEST(CodeLocation, AssignmentToItselfWarnsAndKeepsTheLocation) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    CodeLocation location("src/view", "View", "BuildMap", 12);
    CodeLocation& same = location;
    location = same;
    EXPECT_EQ("View::BuildMap@src/view:12", location.Text());
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of %s object\n", lines[0].format);
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of CodeLocation object\n", lines[0].text);
}

}  // namespace
}  // namespace quorvel::vexmap
