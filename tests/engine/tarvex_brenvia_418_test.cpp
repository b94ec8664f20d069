#include "vexmap/tarvex_brenvia_418.h"

#include <gtest/gtest.h>

namespace quorvel::vexmap {
namespace {

TEST(TarvexBrenvia418, IsACircularFisheyeOf183DegreesOnA1936PixelSquare) {
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, TarvexBrenvia418.type);
    EXPECT_EQ(183.0f, TarvexBrenvia418.diagonal_fov);
    EXPECT_EQ(183.0f, TarvexBrenvia418.horizontal_fov);
    EXPECT_EQ(183.0f, TarvexBrenvia418.vertical_fov);
    EXPECT_EQ(1936u, TarvexBrenvia418.width);
    EXPECT_EQ(1936u, TarvexBrenvia418.height);
}

TEST(TarvexBrenvia418, GetTarvexBrenvia418CameraGivesACopyOfTheModel) {
    _DEWARP_INTERNAL_CAMERA_MODEL copy = GetTarvexBrenvia418Camera();
    EXPECT_EQ(TarvexBrenvia418.width, copy.width);
    EXPECT_EQ(TarvexBrenvia418.diagonal_fov, copy.diagonal_fov);
    copy.width = 640;
    EXPECT_EQ(1936u, GetTarvexBrenvia418Camera().width);
}

}  // namespace
}  // namespace quorvel::vexmap
