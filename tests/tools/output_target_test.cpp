#include "output_target.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tool_error.h"

namespace vexmap_host {
namespace {

using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

TEST(OutputTarget, TellsEachKindOfPlaceFromItsName) {
    EXPECT_EQ(OutputTarget::PICTURE_FILE, OutputTarget("a/view.png").GetKind());
    EXPECT_EQ(OutputTarget::PICTURE_FILE, OutputTarget("view.JPG").GetKind());
    EXPECT_EQ(OutputTarget::PICTURE_FILE, OutputTarget("view.jpeg").GetKind());
    EXPECT_EQ(OutputTarget::STREAM_FILE, OutputTarget("clip.y4m").GetKind());
    EXPECT_EQ(OutputTarget::STANDARD_OUTPUT, OutputTarget("-").GetKind());
    EXPECT_EQ(OutputTarget::DEVICE, OutputTarget("/dev/null").GetKind());
    EXPECT_EQ(OutputTarget::FOLDER, OutputTarget("out").GetKind());
    EXPECT_EQ(OutputTarget::FOLDER, OutputTarget("out.d/").GetKind());
    EXPECT_EQ(OutputTarget::FOLDER, OutputTarget("/tmp").GetKind());
    EXPECT_EQ(OutputTarget::FOLDER, OutputTarget("a.b/.hidden").GetKind());
}

TEST(OutputTarget, StreamsAreTheFileTheDeviceAndStandardOutput) {
    EXPECT_TRUE(OutputTarget("clip.y4m").IsStream());
    EXPECT_TRUE(OutputTarget("/dev/null").IsStream());
    EXPECT_TRUE(OutputTarget("-").IsStream());
    EXPECT_FALSE(OutputTarget("view.png").IsStream());
    EXPECT_FALSE(OutputTarget("out").IsStream());
}

TEST(OutputTarget, FileOfAnotherKindIsAUsageErrorBeforeAnyWork) {
    EXPECT_THAT([] { OutputTarget target("view.bmp"); },
                ThrowsMessage<UsageError>(HasSubstr("--output view.bmp: vexmap writes .png, .jpg "
                                                    "and .jpeg pictures, .y4m streams, a device, "
                                                    "- (standard output) or a folder, not .bmp")));
    EXPECT_THROW(OutputTarget(""), UsageError);
}

TEST(OutputTarget, NamesEachViewAfterThePictureOrInTheFolder) {
    EXPECT_EQ("a/view.png", OutputTarget("a/view.png").PicturePath("Brenvia", "ptz", false));
    EXPECT_EQ("a/view-ptz.jpg", OutputTarget("a/view.jpg").PicturePath("Brenvia", "ptz", true));
    EXPECT_EQ("out/sentry360-panorama.png",
              OutputTarget("out").PicturePath("Sentry360", "panorama", true));
}

}  // namespace
}  // namespace vexmap_host
