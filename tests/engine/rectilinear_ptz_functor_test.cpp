#include "vexmap/rectilinear_ptz_functor.h"

#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/rectilinear_camera.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

constexpr float TOLERANCE = 1e-3f;

_DEWARP_INTERNAL_CAMERA_MODEL const LENS{
    DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR, 100.0f, 90.0f, 60.0f, 1000, 600};

TEST(RectilinearPtzFunctor, AtTheIdentityWithoutShiftOrZoomThePointStays) {
    Vector2d const result = RectilinearPtzFunctor::RectilinearPerspective(
        Vector2d(30.0f, -20.0f), 500.0f, RotationMatrix3d::Identity, Vector2d(), 1.0f);
    EXPECT_EQ(30.0f, result.x);
    EXPECT_EQ(-20.0f, result.y);
}

TEST(RectilinearPtzFunctor, AZoomOfTwoHalvesThePointWithoutAShift) {
    RectilinearPtzFunctor functor(PtzPosition(EulerAngles(), 2.0f), 500.0f, Vector2d());
    Vector2d const result = functor.Call(Vector2d(30.0f, -20.0f));
    EXPECT_EQ(15.0f, result.x);
    EXPECT_EQ(-10.0f, result.y);
}

TEST(RectilinearPtzFunctor, AZoomOfTwoWithAShiftHalvesTheShiftedPointAndShiftsBack) {
    RectilinearPtzFunctor functor(PtzPosition(EulerAngles(), 2.0f), 500.0f, Vector2d(10.0f, 4.0f));
    Vector2d const result = functor.Call(Vector2d(30.0f, -20.0f));
    EXPECT_EQ((30.0f + 10.0f) / 2.0f - 10.0f, result.x);
    EXPECT_EQ((-20.0f + 4.0f) / 2.0f - 4.0f, result.y);
}

TEST(RectilinearPtzFunctor, APanProjectsTheTurnedRayOntoThePlane) {
    // The centre's ray (0, 0, f) panned by a: (f sin a, 0, f cos a), so x = f tan a.
    float const a = 0.3f;
    RectilinearPtzFunctor functor(PtzPosition(EulerAngles(a, 0.0f, 0.0f), 1.0f), 500.0f,
                                  Vector2d());
    Vector2d const result = functor.Call(Vector2d(0.0f, 0.0f));
    EXPECT_NEAR(500.0f * Trigonometry::tan(a), result.x, TOLERANCE);
    EXPECT_NEAR(0.0f, result.y, TOLERANCE);
}

TEST(RectilinearPtzFunctor, SetLeavesTheShift) {
    RectilinearPtzFunctor functor(PtzPosition(), 500.0f, Vector2d(3.0f, 4.0f));
    functor.Set(PtzPosition(EulerAngles(0.1f, 0.0f, 0.0f), 2.0f), 100.0f);
    EXPECT_EQ(3.0f, functor.shift.x);
    EXPECT_EQ(4.0f, functor.shift.y);
    EXPECT_EQ(100.0f, functor.focal_length);
}

TEST(RectilinearPtzFunctor, FromACameraItTakesTheFocalLengthAndLogsOnce) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    RectilinearCamera const camera(LENS, DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    RectilinearPtzFunctor const functor(camera, PtzPosition(EulerAngles(), 1.5f),
                                        Vector2d(1.0f, 2.0f));
    EXPECT_EQ(camera.GetFocalLength(), functor.focal_length);
    EXPECT_EQ(1.5f, functor.zoom);
    EXPECT_EQ(2.0f, functor.shift.y);
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: INFO - Setting up rectilinear functor\n", lines[0].text);
}

TEST(RectilinearPtzFunctor, AssignmentCopiesTheShiftAndWarnsOnItself) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    RectilinearPtzFunctor const source(PtzPosition(), 500.0f, Vector2d(3.0f, 4.0f));
    RectilinearPtzFunctor target;
    target = source;
    EXPECT_EQ(4.0f, target.shift.y);
    EXPECT_EQ(500.0f, target.focal_length);
    RectilinearPtzFunctor& same = target;
    target = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of RectilinearPtzFunctor object\n", lines[0].text);
}

}  // namespace
}  // namespace quorvel::vexmap
