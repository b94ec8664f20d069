#include "vexmap/camera_builder.h"

#include <memory>

#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/fisheye_camera.h"
#include "vexmap/rectilinear_camera.h"
#include "vexmap/tarvex_brenvia_418.h"

namespace quorvel::vexmap {
namespace {

TEST(CameraBuilder, MakesAFisheyeCameraForACircularFisheyeModel) {
    std::unique_ptr<Camera> const camera(
        CameraBuilder::MakeCamera(TarvexBrenvia418, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING));
    ASSERT_NE(nullptr, dynamic_cast<FisheyeCamera*>(camera.get()));
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, camera->GetMount());
    EXPECT_EQ(1936.0f, camera->GetResolution().x);
}

TEST(CameraBuilder, MakesARectilinearCameraForARectilinearModel) {
    _DEWARP_INTERNAL_CAMERA_MODEL model = TarvexBrenvia418;
    model.type = DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR;
    std::unique_ptr<Camera> const camera(
        CameraBuilder::MakeCamera(model, DEWARP_INTERNAL_CAMERA_MOUNT_WALL));
    EXPECT_NE(nullptr, dynamic_cast<RectilinearCamera*>(camera.get()));
}

TEST(CameraBuilder, MakesNothingForAnotherType) {
    _DEWARP_INTERNAL_CAMERA_MODEL model = TarvexBrenvia418;
    model.type = static_cast<_DEWARP_INTERNAL_CAMERA_TYPE>(2);
    EXPECT_EQ(nullptr, CameraBuilder::MakeCamera(model, DEWARP_INTERNAL_CAMERA_MOUNT_WALL));
}

TEST(CameraBuilder, AssignmentToItselfWarns) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    CameraBuilder builder;
    CameraBuilder& same = builder;
    builder = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of CameraBuilder object\n", lines[0].text);
}

}  // namespace
}  // namespace quorvel::vexmap
