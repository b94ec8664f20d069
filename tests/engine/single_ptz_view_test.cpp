#include "vexmap/single_ptz_view.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/defaults.h"
#include "vexmap/ptz_view_traits.h"
#include "view_test_support.h"

namespace quorvel::vexmap {
namespace {

using testing::MakeFisheye;

TEST(SinglePtzView, EveryConstructorHoldsTheSharedPtzTraits) {
    auto const camera = MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ViewTraits const* const shared = PtzViewTraits::PTZ_VIEW_TRAITS.get();
    EXPECT_EQ(shared, &SinglePtzView().GetTraits());
    EXPECT_EQ(shared, &SinglePtzView(camera).GetTraits());
    EXPECT_EQ(shared, &SinglePtzView(camera, DEWARP_PROJECTION_RECTILINEAR).GetTraits());
    EXPECT_EQ(
        shared,
        &SinglePtzView(camera, DEWARP_PROJECTION_RECTILINEAR, DEWARP_ASPECT_RATIO_FIT).GetTraits());
    EXPECT_EQ(
        shared,
        &SinglePtzView(camera, DEWARP_PROJECTION_RECTILINEAR, Resolution(64, 48)).GetTraits());
    EXPECT_EQ(shared, &SinglePtzView(camera, DEWARP_PROJECTION_RECTILINEAR, Resolution(64, 48),
                                     DEWARP_ASPECT_RATIO_FILL)
                           .GetTraits());
}

TEST(SinglePtzView, ConstructorsTakeTheGlobalDefaultsNotTheTraitsOnes) {
    SinglePtzView const view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING));
    EXPECT_EQ(Defaults::Projection, view.GetProjection());
    EXPECT_EQ(Defaults::AspectRatio, view.GetAspectRatio());
    EXPECT_FALSE(view.GetDewarpedSize().Valid());
}

TEST(SinglePtzView, AimsAtTheFixedPtzFieldWhateverTheCamera) {
    SinglePtzView const view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL, 512),
                             DEWARP_PROJECTION_RECTILINEAR);
    EXPECT_FLOAT_EQ(FieldOfView::PtzFieldOfView.horizontal, view.GetFieldOfView().horizontal);
}

TEST(SinglePtzView, ACopySharesTheMapAndAssignmentToItselfWarnsWithItsOwnName) {
    SinglePtzView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL),
                       DEWARP_PROJECTION_RECTILINEAR);
    view.CheckMap(Resolution(16, 8));
    SinglePtzView const copy(view);
    EXPECT_EQ(view.GetImageMap(), copy.GetImageMap());
    RecordingLogSink sink(DEWARP_LOG_LEVEL_WARNING);
    SinglePtzView& same = view;
    view = same;
    ASSERT_EQ(1u, sink.Count());
    EXPECT_THAT(sink.Lines()[0].text, ::testing::HasSubstr("Self assignment of SinglePtzView"));
    EXPECT_TRUE(view.GetImageMap());
}

}  // namespace
}  // namespace quorvel::vexmap
