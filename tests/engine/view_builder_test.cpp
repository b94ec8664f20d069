#include "vexmap/view_builder.h"

#include <cerrno>
#include <memory>

#include <boost/shared_ptr.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/camera_builder.h"
#include "vexmap/dual_panoramic_view.h"
#include "vexmap/error.h"
#include "vexmap/quad_ptz_view.h"
#include "vexmap/single_panoramic_view.h"
#include "vexmap/single_ptz_view.h"
#include "vexmap/tarvex_brenvia_418.h"

namespace quorvel::vexmap {
namespace {

using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

boost::shared_ptr<Camera> MakeCamera(_DEWARP_INTERNAL_CAMERA_MOUNT mount) {
    return boost::shared_ptr<Camera>(CameraBuilder::MakeCamera(TarvexBrenvia418, mount));
}

std::unique_ptr<AbstractView> Build(_DEWARP_VIEW view, boost::shared_ptr<Camera> const& camera,
                                    _DEWARP_PROJECTION projection) {
    return std::unique_ptr<AbstractView>(ViewBuilder::BuildView(view, camera, projection));
}

TEST(ViewBuilder, BuildsASinglePanoramicView) {
    auto const view =
        Build(DEWARP_VIEW_SINGLE_PANORAMIC, MakeCamera(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
              DEWARP_PROJECTION_CYLINDRICAL);
    ASSERT_NE(nullptr, dynamic_cast<SinglePanoramicView*>(view.get()));
    EXPECT_EQ(nullptr, dynamic_cast<DualPanoramicView*>(view.get()));
}

TEST(ViewBuilder, BuildsADualPanoramicView) {
    auto const view =
        Build(DEWARP_VIEW_DUAL_PANORAMIC, MakeCamera(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
              DEWARP_PROJECTION_CYLINDRICAL);
    EXPECT_NE(nullptr, dynamic_cast<DualPanoramicView*>(view.get()));
}

TEST(ViewBuilder, BuildsASinglePtzView) {
    auto const view =
        Build(DEWARP_VIEW_SINGLE_PTZ, MakeCamera(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
              DEWARP_PROJECTION_RECTILINEAR);
    ASSERT_NE(nullptr, dynamic_cast<SinglePtzView*>(view.get()));
    EXPECT_EQ(nullptr, dynamic_cast<QuadPtzView*>(view.get()));
}

TEST(ViewBuilder, BuildsAQuadPtzView) {
    auto const view = Build(DEWARP_VIEW_QUAD_PTZ, MakeCamera(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                            DEWARP_PROJECTION_RECTILINEAR);
    EXPECT_NE(nullptr, dynamic_cast<QuadPtzView*>(view.get()));
}

TEST(ViewBuilder, HandsTheCameraAndProjectionToTheView) {
    boost::shared_ptr<Camera> const camera = MakeCamera(DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    auto const view =
        Build(DEWARP_VIEW_SINGLE_PTZ, camera, DEWARP_PROJECTION_EQUIRECTANGULAR_PANNINI);
    EXPECT_EQ(camera.get(), &view->GetCamera());
    EXPECT_EQ(DEWARP_PROJECTION_EQUIRECTANGULAR_PANNINI, view->GetProjection());
    EXPECT_EQ(2, camera.use_count());  // the caller's and the view's
}

TEST(ViewBuilder, BuildsANewObjectEachTime) {
    boost::shared_ptr<Camera> const camera = MakeCamera(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    auto const first = Build(DEWARP_VIEW_SINGLE_PTZ, camera, DEWARP_PROJECTION_RECTILINEAR);
    auto const second = Build(DEWARP_VIEW_SINGLE_PTZ, camera, DEWARP_PROJECTION_RECTILINEAR);
    EXPECT_NE(first.get(), second.get());
}

TEST(ViewBuilder, ViewValueFourLogsSetsLastErrorAndThrowsInvalidView) {
    boost::shared_ptr<Camera> const camera = MakeCamera(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    _DEWARP_VIEW const four = static_cast<_DEWARP_VIEW>(4);
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    errno = 0;
    EXPECT_THAT([&]() { Build(four, camera, DEWARP_PROJECTION_CYLINDRICAL); },
                ThrowsMessage<Error>(HasSubstr("(ViewBuilder::BuildView@src/view_builder:")));
    EXPECT_EQ(EINVAL, errno);
    EXPECT_THAT([&]() { Build(four, camera, DEWARP_PROJECTION_CYLINDRICAL); },
                ThrowsMessage<Error>(HasSubstr("[Error EINVAL (22)] - Invalid view")));
    auto const lines = sink.Lines();
    ASSERT_EQ(2u, lines.size());
    EXPECT_EQ("VEXMAP: ERROR - Invalid view\n", lines[0].text);
}

TEST(ViewBuilder, AnErrorOfAViewConstructorLeavesThroughBuildView) {
    boost::shared_ptr<Camera> const camera = MakeCamera(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    EXPECT_THAT(
        [&camera]() { Build(DEWARP_VIEW_SINGLE_PANORAMIC, camera, DEWARP_PROJECTION_RECTILINEAR); },
        ThrowsMessage<Error>(HasSubstr("Invalid projection for this orientation")));
    EXPECT_EQ(1, camera.use_count());  // no half-built view keeps the camera
}

TEST(ViewBuilder, AssignmentToItselfWarns) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    ViewBuilder builder;
    ViewBuilder& same = builder;
    builder = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of ViewBuilder object\n", lines[0].text);
}

TEST(ViewBuilder, AssignmentOfAnotherBuilderLogsNothing) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    ViewBuilder builder;
    ViewBuilder const other(builder);
    builder = other;
    EXPECT_EQ(0u, sink.Count());
}

}  // namespace
}  // namespace quorvel::vexmap
