#include "vexmap/dual_panoramic_view.h"

#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "view_test_support.h"

namespace quorvel::vexmap {
namespace {

using testing::Entries;
using testing::Entry;
using testing::EntryOf;
using ::testing::HasSubstr;
using testing::IsUnmapped;
using testing::MakeFisheye;
using testing::RecordingFunctor;

/// A dual panorama that keeps every point its scale link was given.
class WatchedDual : public DualPanoramicView {
public:
    using DualPanoramicView::DualPanoramicView;
    MapFunctor* GetScaleFunctor(Vector2d const& crop) const override {
        return new RecordingFunctor(DualPanoramicView::GetScaleFunctor(crop), inputs);
    }
    boost::shared_ptr<std::vector<Vector2d>> inputs{new std::vector<Vector2d>()};
};

/// The first chain input of each output row, in the order the rows are walked.
std::vector<Vector2d> RowStarts(WatchedDual& view, int width) {
    std::vector<Vector2d> starts;
    int const per_row = 1 + (width - 1) / 8;  // the first point and the whole spans
    for (std::size_t i = 0; i < view.inputs->size(); i += std::size_t(per_row)) {
        starts.push_back((*view.inputs)[i]);
    }
    return starts;
}

TEST(DualPanoramicView, ItsProjectionSizeIsHalfAsWideAndTwiceAsTallAsASingleViews) {
    auto const camera = MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    SinglePanoramicView single(camera, DEWARP_PROJECTION_CYLINDRICAL);
    DualPanoramicView dual(camera, DEWARP_PROJECTION_CYLINDRICAL);
    Resolution const strip = single.GetProjectionSize();
    EXPECT_EQ(Resolution(strip.x * 0.5f, strip.y * 2.0f), dual.GetProjectionSize());
}

TEST(DualPanoramicView, StackingAndUnstackingHalveAndDoubleTheSides) {
    EXPECT_EQ(Resolution(320, 960), DualPanoramicView::DualResolution(Resolution(640, 480)));
    EXPECT_EQ(Resolution(1280, 240), DualPanoramicView::SingleResolution(Resolution(640, 480)));
    EXPECT_EQ(Resolution(2, 2), DualPanoramicView::DualResolution(Resolution(5, 1)));  // floored
}

TEST(DualPanoramicView, WithAnEvenSizeTheFirstRowAndTheMiddleRowWalkTheSameStripRow) {
    WatchedDual view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                     DEWARP_PROJECTION_CYLINDRICAL);
    view.SetAspectRatio(DEWARP_ASPECT_RATIO_FILL);
    view.SetDewarpedSize(Resolution(64, 40));
    view.BuildMap();
    std::vector<Vector2d> const starts = RowStarts(view, 64);
    ASSERT_EQ(40u, starts.size());
    EXPECT_EQ(starts[0].y, starts[20].y);
    EXPECT_FLOAT_EQ(-10.0f, starts[0].y);  // -20 + 20 / 2
    EXPECT_FLOAT_EQ(9.0f, starts[19].y);
}

TEST(DualPanoramicView, ColumnZeroSamplesTheStripsLeftEndAboveAndItsMiddleBelow) {
    WatchedDual view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                     DEWARP_PROJECTION_CYLINDRICAL);
    view.SetAspectRatio(DEWARP_ASPECT_RATIO_FILL);
    view.SetDewarpedSize(Resolution(64, 40));
    view.BuildMap();
    std::vector<Vector2d> const starts = RowStarts(view, 64);
    EXPECT_FLOAT_EQ(-64.0f, starts[0].x);  // 2L with L = -32
    EXPECT_FLOAT_EQ(-64.0f, starts[19].x);
    EXPECT_FLOAT_EQ(0.0f, starts[20].x);
    EXPECT_FLOAT_EQ(0.0f, starts[39].x);
}

TEST(DualPanoramicView, BothHalvesEndInAnUnmappedTailWhenTheWidthIsAMultipleOfEight) {
    DualPanoramicView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                           DEWARP_PROJECTION_CYLINDRICAL);
    view.SetAspectRatio(DEWARP_ASPECT_RATIO_FILL);
    view.SetDewarpedSize(Resolution(64, 40));
    view.BuildMap();
    SimpleImageMap const& map = *view.GetImageMap();
    for (int row : {0, 19, 20, 39}) {
        EXPECT_FALSE(IsUnmapped(EntryOf(map, 56, row)));
        for (int column = 57; column < 64; ++column) {
            EXPECT_TRUE(IsUnmapped(EntryOf(map, column, row)));
        }
    }
}

TEST(DualPanoramicView, TheHalvesJoinIntoTheSingleStripOfTwiceTheWidth) {
    auto const camera = MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    DualPanoramicView dual(camera, DEWARP_PROJECTION_CYLINDRICAL);
    SinglePanoramicView single(camera, DEWARP_PROJECTION_CYLINDRICAL);
    dual.SetAspectRatio(DEWARP_ASPECT_RATIO_STRETCH);
    single.SetAspectRatio(DEWARP_ASPECT_RATIO_STRETCH);
    dual.SetDewarpedSize(Resolution(64, 40));
    single.SetDewarpedSize(Resolution(128, 20));
    dual.BuildMap();
    single.BuildMap();
    // Row r of each half shows strip row r; the lower half continues where the upper ends.
    int mismatches = 0;
    for (int row = 0; row < 20; ++row) {
        for (int column = 0; column < 56; ++column) {
            Entry const upper = EntryOf(*dual.GetImageMap(), column, row);
            Entry const lower = EntryOf(*dual.GetImageMap(), column, row + 20);
            Entry const left = EntryOf(*single.GetImageMap(), column, row);
            Entry const right = EntryOf(*single.GetImageMap(), column + 64, row);
            mismatches += std::abs(int(upper.x) - int(left.x)) > 1 ||
                          std::abs(int(upper.y) - int(left.y)) > 1;
            mismatches += std::abs(int(lower.x) - int(right.x)) > 1 ||
                          std::abs(int(lower.y) - int(right.y)) > 1;
        }
    }
    EXPECT_EQ(0, mismatches);
}

TEST(DualPanoramicView, SetPtzReadsBackAZoomOfZero) {
    DualPanoramicView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR),
                           DEWARP_PROJECTION_CYLINDRICAL);
    EXPECT_EQ(0.0f, view.SetPtz(PtzPosition(EulerAngles(0.1f, 0, 0), 2.0f)).zoom);
}

TEST(DualPanoramicView, FitLeavesBarsWhenTheStackedShapeDoesNotFillTheOutput) {
    DualPanoramicView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                           DEWARP_PROJECTION_CYLINDRICAL);
    view.SetAspectRatio(DEWARP_ASPECT_RATIO_FIT);
    view.SetDewarpedSize(Resolution(64, 200));  // far taller than the stacked strip
    view.BuildMap();
    SimpleImageMap const& map = *view.GetImageMap();
    EXPECT_TRUE(IsUnmapped(EntryOf(map, 10, 0)));
    EXPECT_TRUE(IsUnmapped(EntryOf(map, 10, 199)));
    EXPECT_FALSE(IsUnmapped(EntryOf(map, 10, 90)));
}

TEST(DualPanoramicView, AssignmentToItselfWarnsWithItsOwnName) {
    DualPanoramicView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL),
                           DEWARP_PROJECTION_CYLINDRICAL);
    RecordingLogSink sink(DEWARP_LOG_LEVEL_WARNING);
    DualPanoramicView& same = view;
    view = same;
    ASSERT_EQ(1u, sink.Count());
    EXPECT_THAT(sink.Lines()[0].text, HasSubstr("Self assignment of DualPanoramicView"));
}

}  // namespace
}  // namespace quorvel::vexmap
