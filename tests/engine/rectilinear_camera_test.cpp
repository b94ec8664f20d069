#include "vexmap/rectilinear_camera.h"

#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/floating_point.h"

namespace quorvel::vexmap {
namespace {

_DEWARP_INTERNAL_CAMERA_MODEL const LENS{
    DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR, 100.0f, 90.0f, 60.0f, 1280, 720};

TEST(RectilinearCamera, AHitPointIsInvalidWhateverThePoint) {
    RectilinearCamera const camera(LENS, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    for (Vector2d const& point :
         {Vector2d(0.0f, 0.0f), Vector2d(640.0f, 360.0f), Vector2d(-5.0f, 1e6f)}) {
        Vector2d const hit = camera.MapHitPoint(point);
        EXPECT_TRUE(FloatingPoint::is_nan(hit.x));
        EXPECT_TRUE(FloatingPoint::is_nan(hit.y));
    }
}

TEST(RectilinearCamera, HomeIsTheIdentityOnEveryMount) {
    for (auto mount : {DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR,
                       DEWARP_INTERNAL_CAMERA_MOUNT_WALL}) {
        PtzPosition const home = RectilinearCamera(LENS, mount).GetHomePosition();
        EXPECT_EQ(0.0f, home.orientation.tilt);
        EXPECT_EQ(0.0f, home.orientation.roll);
        EXPECT_EQ(1.0f, home.zoom);
    }
}

TEST(RectilinearCamera, AssignmentCopiesNothingAndWarnsOnItselfWithItsOwnName) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    RectilinearCamera const source(LENS, DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR);
    RectilinearCamera target;
    target = source;
    EXPECT_EQ(0.0f, target.GetResolution().x);
    RectilinearCamera& same = target;
    target = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of RectilinearCamera object\n", lines[0].text);
}

}  // namespace
}  // namespace quorvel::vexmap
