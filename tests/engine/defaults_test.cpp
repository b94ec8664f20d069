#include "vexmap/defaults.h"

#include <gtest/gtest.h>

namespace quorvel::vexmap {
namespace {

TEST(Defaults, HoldTheStartingValueOfEverySetting) {
    EXPECT_EQ(DEWARP_LOG_LEVEL_ERROR, Defaults::LogLevel);
    EXPECT_EQ(nullptr, Defaults::LogFunction);
    EXPECT_EQ(nullptr, Defaults::LogSettings.function);
    EXPECT_EQ(DEWARP_LOG_LEVEL_ERROR, Defaults::LogSettings.level);
    EXPECT_EQ(1, Defaults::Interpolation);
    EXPECT_EQ(DEWARP_PROJECTION_CYLINDRICAL, Defaults::Projection);
    EXPECT_EQ(1, Defaults::Projection);
    EXPECT_EQ(DEWARP_VIEW_SINGLE_PANORAMIC, Defaults::View);
    EXPECT_EQ(0, Defaults::View);
    EXPECT_EQ(DEWARP_ASPECT_RATIO_STRETCH, Defaults::AspectRatio);
    EXPECT_EQ(2, Defaults::AspectRatio);
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_MOUNT_WALL, Defaults::CameraMount);
    EXPECT_EQ(2, Defaults::CameraMount);
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, Defaults::CameraType);
    EXPECT_EQ(1, Defaults::CameraType);
}

}  // namespace
}  // namespace quorvel::vexmap
