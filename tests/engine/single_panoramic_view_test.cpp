#include "vexmap/single_panoramic_view.h"

#include <cstdlib>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/error.h"
#include "vexmap/panoramic_view_traits.h"
#include "vexmap/transform_2d_functor.h"
#include "vexmap/trigonometry.h"
#include "view_test_support.h"

namespace quorvel::vexmap {
namespace {

using testing::Entries;
using testing::Entry;
using testing::EntryOf;
using ::testing::HasSubstr;
using testing::IsUnmapped;
using testing::MakeFisheye;
using ::testing::ThrowsMessage;

constexpr float DEGREE = Trigonometry::PI / 180.0f;

void Build(View& view, Resolution const& size) {
    view.SetDewarpedSize(size);
    view.BuildMap();
}

Vector2d Through(boost::shared_ptr<MapFunctor> const& functor, Vector2d const& point) {
    return functor->Call(point);
}

TEST(SinglePanoramicView, SetPtzAlwaysReadsBackAZoomOfZero) {
    SinglePanoramicView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                             DEWARP_PROJECTION_CYLINDRICAL);
    EXPECT_EQ(1.0f, view.GetPtz().zoom);
    for (float zoom : {1.0f, 3.0f, 0.25f}) {
        EXPECT_EQ(0.0f, view.SetPtz(PtzPosition(EulerAngles(0.2f, 0, 0), zoom)).zoom);
    }
}

TEST(SinglePanoramicView, OnACeilingAPanOfNinetyMovesTheStripAQuarterRoundAndWrapsIt) {
    auto const camera = MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    SinglePanoramicView still(camera, DEWARP_PROJECTION_CYLINDRICAL);
    SinglePanoramicView turned(camera, DEWARP_PROJECTION_CYLINDRICAL);
    still.SetPtz(PtzPosition(EulerAngles(0.0f, 0, 0), 1.0f));
    turned.SetPtz(PtzPosition(EulerAngles(90.0f * DEGREE, 0, 0), 1.0f));
    // At zoom 0 one output pixel is one projection pixel: an output of the projection's size
    // shows the whole strip.
    Resolution const size = still.GetProjectionSize();
    int const width = int(size.x);
    int const quarter = width / 4;
    Build(still, size);
    Build(turned, size);
    int compared = 0;
    int mismatches = 0;
    for (int row = 2; row < int(size.y) - 2; row += 3) {
        for (int column = 0; column < width - 8; ++column) {
            int const shifted = (column + quarter) % width;
            if (shifted >= width - 8) {
                continue;
            }
            Entry const a = EntryOf(*turned.GetImageMap(), column, row);
            Entry const b = EntryOf(*still.GetImageMap(), shifted, row);
            Entry const c = EntryOf(*still.GetImageMap(), (column - quarter + width) % width, row);
            bool const near_b =
                std::abs(int(a.x) - int(b.x)) <= 2 && std::abs(int(a.y) - int(b.y)) <= 2;
            bool const near_c =
                std::abs(int(a.x) - int(c.x)) <= 2 && std::abs(int(a.y) - int(c.y)) <= 2;
            ++compared;
            mismatches += !(near_b || near_c);
        }
    }
    EXPECT_GT(compared, 1000);
    EXPECT_LT(mismatches, compared / 100);
}

// The tilt bounds of a zoom-0 range are not numbers, so a tilt passes the limit and drops the
// map; the map that follows is the same, as a wall panorama turns in roll only.
TEST(SinglePanoramicView, OnAWallPanAndTiltLeaveTheMapAsItWasAfterTheFirstSetPtz) {
    SinglePanoramicView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL),
                             DEWARP_PROJECTION_CYLINDRICAL);
    view.SetPtz(PtzPosition(EulerAngles(0, 0, 0), 1.0f));
    Build(view, Resolution(64, 32));
    std::vector<Entry> const first = Entries(*view.GetImageMap());
    view.SetPtz(PtzPosition(EulerAngles(0.4f, 0.3f, 0), 1.0f));
    EXPECT_EQ(0.0f, view.GetPtz().orientation.pan);
    EXPECT_FLOAT_EQ(0.3f, view.GetPtz().orientation.tilt);
    Build(view, Resolution(64, 32));
    EXPECT_EQ(first, Entries(*view.GetImageMap()));
}

TEST(SinglePanoramicView, OnAWallARollTurnsThePictureByItsNegative) {
    SinglePanoramicView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL),
                             DEWARP_PROJECTION_CYLINDRICAL);
    view.SetPtz(PtzPosition(EulerAngles(0, 0, 0.5f), 1.0f));
    ASSERT_FLOAT_EQ(0.5f, view.GetPtz().orientation.roll);
    boost::shared_ptr<MapFunctor> const turn(view.GetPtzFunctor());
    Transform2dFunctor::_TRANSFORM_2D expected = {};
    expected.scale_x = 1.0f;
    expected.scale_y = 1.0f;
    expected.angle = -0.5f;
    boost::shared_ptr<MapFunctor> const reference(new Transform2dFunctor(expected));
    for (Vector2d const& point : {Vector2d(10, 0), Vector2d(-3, 7)}) {
        EXPECT_EQ(Through(reference, point), Through(turn, point));
    }
    Vector2d const turned = Through(turn, Vector2d(10, 0));
    EXPECT_NEAR(10.0f, std::hypot(turned.x, turned.y), 1e-4f);  // about the centre
}

TEST(SinglePanoramicView, OnAnInvertedWallThePictureIsHalfATurnRoundWithoutAnySetPtz) {
    SinglePanoramicView wall(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL),
                             DEWARP_PROJECTION_CYLINDRICAL);
    SinglePanoramicView inverted(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL),
                                 DEWARP_PROJECTION_CYLINDRICAL);
    wall.SetDewarpedSize(Resolution(64, 32));
    inverted.SetDewarpedSize(Resolution(64, 32));
    boost::shared_ptr<MapFunctor> const upright(wall.GetScaleFunctor(Vector2d(64, 32)));
    boost::shared_ptr<MapFunctor> const upside_down(inverted.GetScaleFunctor(Vector2d(64, 32)));
    for (Vector2d const& point : {Vector2d(10, 4), Vector2d(-20, 9)}) {
        Vector2d const a = Through(upright, point);
        Vector2d const b = Through(upside_down, point);
        EXPECT_NEAR(-a.x, b.x, 1e-3f);
        EXPECT_NEAR(-a.y, b.y, 1e-3f);
    }
}

TEST(SinglePanoramicView, TheOffsetOfAStripIsHalfTheCropWithoutTheZoom) {
    SinglePanoramicView ceiling(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                                DEWARP_PROJECTION_CYLINDRICAL);
    SinglePanoramicView floor(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR),
                              DEWARP_PROJECTION_CYLINDRICAL);
    ceiling.SetDewarpedSize(Resolution(64, 32));
    floor.SetDewarpedSize(Resolution(64, 32));
    boost::shared_ptr<MapFunctor> const up(ceiling.GetScaleFunctor(Vector2d(64, 32)));
    boost::shared_ptr<MapFunctor> const down(floor.GetScaleFunctor(Vector2d(64, 32)));
    float const step = Through(up, Vector2d(0, 1)).y - Through(up, Vector2d(0, 0)).y;
    // The origin moves by half the crop, 16 output rows, in projection units; an offset is
    // positive upward, so the ceiling's negative one moves the picture up.
    EXPECT_NEAR(16.0f * step, Through(up, Vector2d(0, 0)).y, 1e-3f);
    EXPECT_NEAR(-16.0f * step, Through(down, Vector2d(0, 0)).y, 1e-3f);
}

TEST(SinglePanoramicView, AfterSetPtzOnAFloorASmallOutputShowsTheMiddleOfTheStripPixelForPixel) {
    SinglePanoramicView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR),
                             DEWARP_PROJECTION_CYLINDRICAL);
    Resolution const strip = view.GetProjectionSize();
    view.SetDewarpedSize(Resolution(strip.x / 4.0f, strip.y / 4.0f));
    boost::shared_ptr<MapFunctor> const before(view.GetScaleFunctor(view.GetCropSize()));
    view.SetPtz(PtzPosition(EulerAngles(0, 0, 0), 1.0f));
    boost::shared_ptr<MapFunctor> const after(view.GetScaleFunctor(view.GetCropSize()));
    Vector2d const unit = Through(after, Vector2d(1, 1)) - Through(after, Vector2d(0, 0));
    EXPECT_FLOAT_EQ(1.0f, unit.x);
    EXPECT_FLOAT_EQ(1.0f, unit.y);
    Vector2d const scaled = Through(before, Vector2d(1, 1)) - Through(before, Vector2d(0, 0));
    EXPECT_GT(scaled.x, 3.0f);  // before any SetPtz the strip is fitted to the output
    Build(view, view.GetDewarpedSize());
    int const middle_row = int(view.GetDewarpedSize().y) / 2;
    EXPECT_FALSE(IsUnmapped(EntryOf(*view.GetImageMap(), 5, middle_row)));
}

TEST(SinglePanoramicView, RectilinearOnACeilingFailsWhileItIsConstructed) {
    EXPECT_THAT(
        [] {
            SinglePanoramicView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                                     DEWARP_PROJECTION_RECTILINEAR);
        },
        ThrowsMessage<Error>(HasSubstr("Invalid projection for this orientation")));
}

TEST(SinglePanoramicView, HoldsTheSharedPanoramicTraits) {
    SinglePanoramicView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL),
                             DEWARP_PROJECTION_CYLINDRICAL);
    EXPECT_EQ(PanoramicViewTraits::PANORAMIC_VIEW_TRAITS.get(), &view.GetTraits());
}

TEST(SinglePanoramicView, AssignmentToItselfWarnsWithItsOwnName) {
    SinglePanoramicView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL),
                             DEWARP_PROJECTION_CYLINDRICAL);
    RecordingLogSink sink(DEWARP_LOG_LEVEL_WARNING);
    SinglePanoramicView& same = view;
    view = same;
    ASSERT_EQ(1u, sink.Count());
    EXPECT_THAT(sink.Lines()[0].text, HasSubstr("Self assignment of SinglePanoramicView"));
}

}  // namespace
}  // namespace quorvel::vexmap
