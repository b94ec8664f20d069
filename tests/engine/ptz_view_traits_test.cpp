#include "vexmap/ptz_view_traits.h"

#include <cerrno>
#include <string>
#include <tuple>

#include <boost/shared_ptr.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/camera_builder.h"
#include "vexmap/error.h"
#include "vexmap/floating_point.h"
#include "vexmap/quad_ptz_view.h"
#include "vexmap/single_ptz_view.h"
#include "vexmap/tarvex_brenvia_418.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

constexpr float RADIAN_TOLERANCE = 1e-5f;

constexpr _DEWARP_INTERNAL_CAMERA_MOUNT CEILING = DEWARP_INTERNAL_CAMERA_MOUNT_CEILING;
constexpr _DEWARP_INTERNAL_CAMERA_MOUNT FLOOR = DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR;
constexpr _DEWARP_INTERNAL_CAMERA_MOUNT WALL = DEWARP_INTERNAL_CAMERA_MOUNT_WALL;
constexpr _DEWARP_INTERNAL_CAMERA_MOUNT INVERTED_WALL = DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL;
constexpr _DEWARP_INTERNAL_CAMERA_MOUNT MOUNT_SEVEN = static_cast<_DEWARP_INTERNAL_CAMERA_MOUNT>(7);

// A lens whose horizontal and vertical fields differ: 160 by 120 degrees.
_DEWARP_INTERNAL_CAMERA_MODEL const WIDE_LENS{
    DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, 180.0f, 160.0f, 120.0f, 1600, 1200};

boost::shared_ptr<Camera> MakeCamera(
    _DEWARP_INTERNAL_CAMERA_MOUNT mount,
    _DEWARP_INTERNAL_CAMERA_MODEL const& model = TarvexBrenvia418) {
    boost::shared_ptr<Camera> camera(CameraBuilder::MakeCamera(model, WALL));
    camera->SetCameraMount(mount);  // so that a mount beyond the four reaches the camera too
    return camera;
}

_DEWARP_PROJECTION AsProjection(int value) {
    return static_cast<_DEWARP_PROJECTION>(value);
}

float Degrees(float degrees) {
    return degrees * Trigonometry::DEGREES_TO_RADIANS;
}

TEST(PtzViewTraits, SharedObjectIsOnePtzViewTraits) {
    ASSERT_TRUE(PtzViewTraits::PTZ_VIEW_TRAITS);
    EXPECT_NE(nullptr, dynamic_cast<PtzViewTraits const*>(PtzViewTraits::PTZ_VIEW_TRAITS.get()));
    EXPECT_EQ(PtzViewTraits::PTZ_VIEW_TRAITS.get(), PtzViewTraits::GetPtzViewTraits().get());
}

TEST(PtzViewTraits, EachCopyOfTheSharedPointerAddsOneReference) {
    long const before = PtzViewTraits::PTZ_VIEW_TRAITS.use_count();
    {
        boost::shared_ptr<ViewTraits const> const first = PtzViewTraits::GetPtzViewTraits();
        EXPECT_EQ(before + 1, PtzViewTraits::PTZ_VIEW_TRAITS.use_count());
        boost::shared_ptr<ViewTraits const> const second = PtzViewTraits::GetPtzViewTraits();
        EXPECT_EQ(before + 2, PtzViewTraits::PTZ_VIEW_TRAITS.use_count());
    }
    EXPECT_EQ(before, PtzViewTraits::PTZ_VIEW_TRAITS.use_count());
}

TEST(PtzViewTraits, TwoViewsOfTheFamilyHoldTheSameObjectWithOneReferenceEach) {
    boost::shared_ptr<Camera> const camera = MakeCamera(WALL);
    long const before = PtzViewTraits::PTZ_VIEW_TRAITS.use_count();
    SinglePtzView const single(camera, DEWARP_PROJECTION_RECTILINEAR);
    EXPECT_EQ(before + 1, PtzViewTraits::PTZ_VIEW_TRAITS.use_count());
    QuadPtzView const quad(camera, DEWARP_PROJECTION_RECTILINEAR);
    EXPECT_EQ(before + 2, PtzViewTraits::PTZ_VIEW_TRAITS.use_count());
    EXPECT_EQ(PtzViewTraits::PTZ_VIEW_TRAITS.get(), &single.GetTraits());
    EXPECT_EQ(&single.GetTraits(), &quad.GetTraits());
}

TEST(PtzViewTraits, DefaultsAreRectilinearAndFill) {
    PtzViewTraits const traits;
    EXPECT_EQ(DEWARP_PROJECTION_RECTILINEAR, traits.GetDefaultProjection());
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FILL, traits.GetDefaultAspectRatio());
}

TEST(PtzViewTraits, AssignmentToItselfWarnsWithTheClassName) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    PtzViewTraits traits;
    PtzViewTraits const copy(traits);
    traits = copy;
    EXPECT_EQ(0u, sink.Count());
    PtzViewTraits& same = traits;
    traits = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of PtzViewTraits object\n", lines[0].text);
}

class PtzViewTraitsMountTest : public ::testing::TestWithParam<_DEWARP_INTERNAL_CAMERA_MOUNT> {};

TEST_P(PtzViewTraitsMountTest, CompatibleProjectionKeepsRectilinearWithoutALine) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    PtzViewTraits const traits;
    EXPECT_EQ(
        DEWARP_PROJECTION_RECTILINEAR,
        traits.GetCompatibleProjection(*MakeCamera(GetParam()), DEWARP_PROJECTION_RECTILINEAR));
    EXPECT_EQ(0u, sink.Count());
}

TEST_P(PtzViewTraitsMountTest, CompatibleProjectionNamesAnUnknownProjectionAndGivesRectilinear) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    PtzViewTraits const traits;
    EXPECT_EQ(DEWARP_PROJECTION_RECTILINEAR,
              traits.GetCompatibleProjection(*MakeCamera(GetParam()), AsProjection(9)));
    auto const lines = sink.Lines();
    ASSERT_EQ(3u, lines.size());  // the name look-up warns of its own
    EXPECT_EQ("VEXMAP: WARNING - Unable to get the name of an unknown projection\n", lines[0].text);
    EXPECT_EQ("VEXMAP: WARNING - The <unknown> projection is unsupported by this view\n",
              lines[1].text);
    EXPECT_EQ("VEXMAP: INFO - The rectilinear projection will be substituted\n", lines[2].text);
}

TEST_P(PtzViewTraitsMountTest, TargetFieldIsAQuarterTurnEachWayWhateverTheProjection) {
    PtzViewTraits const traits;
    boost::shared_ptr<Camera> const camera = MakeCamera(GetParam());
    for (int projection = -1; projection <= 9; ++projection) {
        FieldOfView const target = traits.GetTargetFov(*camera, AsProjection(projection));
        EXPECT_EQ(Trigonometry::HALF_PI, target.horizontal) << projection;
        EXPECT_EQ(Trigonometry::HALF_PI, target.vertical) << projection;
        EXPECT_NEAR(Trigonometry::HALF_PI * FloatingPoint::sqrt(2.0f), target.diagonal,
                    RADIAN_TOLERANCE)
            << projection;
    }
}

INSTANTIATE_TEST_SUITE_P(EveryMount, PtzViewTraitsMountTest,
                         ::testing::Values(CEILING, FLOOR, WALL, INVERTED_WALL, MOUNT_SEVEN));

// Every mount against every projection but rectilinear, with the name that the warning gives.
class PtzViewTraitsSubstitutionTest
    : public ::testing::TestWithParam<
          std::tuple<_DEWARP_INTERNAL_CAMERA_MOUNT, std::tuple<int, char const*>>> {};

TEST_P(PtzViewTraitsSubstitutionTest,
       CompatibleProjectionGivesRectilinearWithOneWarningAndOneInfo) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    PtzViewTraits const traits;
    _DEWARP_PROJECTION const projection = AsProjection(std::get<0>(std::get<1>(GetParam())));
    std::string const name = std::get<1>(std::get<1>(GetParam()));
    boost::shared_ptr<Camera> const camera = MakeCamera(std::get<0>(GetParam()));
    for (int call = 1; call <= 2; ++call) {
        EXPECT_EQ(DEWARP_PROJECTION_RECTILINEAR,
                  traits.GetCompatibleProjection(*camera, projection));
        ASSERT_EQ(2u * unsigned(call), sink.Count());  // the same two lines each time
    }
    auto const lines = sink.Lines();
    EXPECT_EQ("VEXMAP: WARNING - The %s projection is unsupported by this view\n", lines[2].format);
    EXPECT_EQ("VEXMAP: WARNING - The " + name + " projection is unsupported by this view\n",
              lines[2].text);
    EXPECT_EQ("VEXMAP: INFO - The %s projection will be substituted\n", lines[3].format);
    EXPECT_EQ("VEXMAP: INFO - The rectilinear projection will be substituted\n", lines[3].text);
}

INSTANTIATE_TEST_SUITE_P(
    EveryMount, PtzViewTraitsSubstitutionTest,
    ::testing::Combine(
        ::testing::Values(CEILING, FLOOR, WALL, INVERTED_WALL),
        ::testing::Values(std::make_tuple(1, "cylindical"), std::make_tuple(2, "equirectangular"),
                          std::make_tuple(3, "mercator"), std::make_tuple(4, "lambert cylindrical"),
                          std::make_tuple(5, "miller cyclindrical"), std::make_tuple(6, "pannini"),
                          std::make_tuple(7, "architectural"),
                          std::make_tuple(8, "equirectangular pannini"))));

TEST(PtzViewTraits, PtzRangeOnACeilingIsTheCeilingRangeWidenedByHalfTheField) {
    PtzViewTraits const traits;
    FieldOfView const field(1.0f, 0.6f);
    PtzRange const range = traits.GetPtzRange(*MakeCamera(CEILING), field);
    EXPECT_EQ(Trigonometry::PI, range.pan.x);  // a full turn is left as it is
    EXPECT_EQ(-Trigonometry::PI, range.pan.y);
    EXPECT_NEAR(Trigonometry::QUARTER_PI * 0.5f + 0.3f, range.tilt.x, RADIAN_TOLERANCE);
    EXPECT_NEAR(-Trigonometry::THREE_QUARTERS_PI - 0.3f, range.tilt.y, RADIAN_TOLERANCE);
    EXPECT_EQ(0.0f, range.roll.x);
    EXPECT_EQ(0.0f, range.roll.y);
    EXPECT_EQ(FloatingPoint::Infinity, range.zoom.x);
    EXPECT_EQ(0.5f, range.zoom.y);
    EXPECT_EQ(0u, range.flags);
}

TEST(PtzViewTraits, PtzRangeOnAFloorIsTheFloorRangeWidenedByHalfTheField) {
    PtzViewTraits const traits;
    FieldOfView const field(1.0f, 0.6f);
    PtzRange const range = traits.GetPtzRange(*MakeCamera(FLOOR), field);
    EXPECT_EQ(Trigonometry::PI, range.pan.x);
    EXPECT_EQ(-Trigonometry::PI, range.pan.y);
    EXPECT_NEAR(Trigonometry::THREE_QUARTERS_PI + 0.3f, range.tilt.x, RADIAN_TOLERANCE);
    EXPECT_NEAR(-Trigonometry::QUARTER_PI * 0.5f - 0.3f, range.tilt.y, RADIAN_TOLERANCE);
    EXPECT_EQ(0.0f, range.roll.x);
    EXPECT_EQ(0.0f, range.roll.y);
    EXPECT_EQ(FloatingPoint::Infinity, range.zoom.x);
    EXPECT_EQ(0.5f, range.zoom.y);
    EXPECT_EQ(0u, range.flags);
}

TEST(PtzViewTraits, PtzRangeLookingUpOrDownMovesWithTheViewsField) {
    PtzViewTraits const traits;
    boost::shared_ptr<Camera> const camera = MakeCamera(CEILING);
    PtzRange const narrow = traits.GetPtzRange(*camera, FieldOfView(0.2f, 0.2f));
    PtzRange const wide = traits.GetPtzRange(*camera, FieldOfView(1.2f, 1.2f));
    EXPECT_NEAR(0.5f, wide.tilt.x - narrow.tilt.x, RADIAN_TOLERANCE);  // half the difference
    EXPECT_NEAR(-0.5f, wide.tilt.y - narrow.tilt.y, RADIAN_TOLERANCE);
}

class PtzViewTraitsWallTest : public ::testing::TestWithParam<_DEWARP_INTERNAL_CAMERA_MOUNT> {};

TEST_P(PtzViewTraitsWallTest, PtzRangeIsHalfTheCamerasFieldEachWayWithAnyZoomFromAHalf) {
    PtzViewTraits const traits;
    PtzRange const range =
        traits.GetPtzRange(*MakeCamera(GetParam(), WIDE_LENS), FieldOfView(1.0f, 0.6f));
    EXPECT_NEAR(Degrees(80.0f), range.pan.x, RADIAN_TOLERANCE);
    EXPECT_NEAR(-Degrees(80.0f), range.pan.y, RADIAN_TOLERANCE);
    EXPECT_NEAR(Degrees(60.0f), range.tilt.x, RADIAN_TOLERANCE);
    EXPECT_NEAR(-Degrees(60.0f), range.tilt.y, RADIAN_TOLERANCE);
    EXPECT_EQ(Trigonometry::PI, range.roll.x);
    EXPECT_EQ(-Trigonometry::PI, range.roll.y);
    EXPECT_EQ(FloatingPoint::Infinity, range.zoom.x);
    EXPECT_EQ(0.5f, range.zoom.y);
    EXPECT_EQ(0u, range.flags);
}

TEST_P(PtzViewTraitsWallTest, PtzRangeTakesNoNoticeOfTheViewsField) {
    PtzViewTraits const traits;
    boost::shared_ptr<Camera> const camera = MakeCamera(GetParam(), WIDE_LENS);
    PtzRange const narrow = traits.GetPtzRange(*camera, FieldOfView(0.2f, 0.1f));
    PtzRange const wide = traits.GetPtzRange(*camera, FieldOfView(3.0f, 2.0f));
    EXPECT_EQ(narrow.pan, wide.pan);
    EXPECT_EQ(narrow.tilt, wide.tilt);
}

INSTANTIATE_TEST_SUITE_P(WallAndInvertedWall, PtzViewTraitsWallTest,
                         ::testing::Values(WALL, INVERTED_WALL));

TEST(PtzViewTraits, PtzRangeOfMountSevenFailsAsInvalidCameraMount) {
    PtzViewTraits const traits;
    boost::shared_ptr<Camera> const camera = MakeCamera(MOUNT_SEVEN);
    errno = 0;
    EXPECT_THAT([&] { traits.GetPtzRange(*camera, FieldOfView(1.0f, 1.0f)); },
                ThrowsMessage<Error>(HasSubstr("[Error EINVAL (22)] - Invalid camera mount")));
    EXPECT_EQ(EINVAL, errno);
    EXPECT_THAT([&] { traits.GetPtzRange(*camera, FieldOfView(1.0f, 1.0f)); },
                ThrowsMessage<Error>(HasSubstr("(PtzViewTraits::GetPtzRange@")));
}

TEST(PtzViewTraits, ProjectionInfoMeasuresTheQuarterTurnOnTheCamera) {
    boost::shared_ptr<Camera> const camera = MakeCamera(WALL);
    PtzViewTraits traits;
    FieldOfView const map_field = camera->GetProjectionFieldOfView(
        camera->GetProjectionMapSize(DEWARP_PROJECTION_RECTILINEAR), DEWARP_PROJECTION_RECTILINEAR);
    ASSERT_LT(Trigonometry::HALF_PI, map_field.vertical);  // nothing to cut
    ProjectionInfo const info = traits.GetProjectionInfo(*camera, DEWARP_PROJECTION_RECTILINEAR);
    EXPECT_EQ(Trigonometry::HALF_PI, info.field_of_view.horizontal);
    EXPECT_EQ(Trigonometry::HALF_PI, info.field_of_view.vertical);
    Resolution const expected =
        camera->GetProjectionResolution(FieldOfView::PtzFieldOfView, DEWARP_PROJECTION_RECTILINEAR);
    EXPECT_EQ(expected.x, info.resolution.x);
    EXPECT_EQ(expected.y, info.resolution.y);
    // A rectilinear quarter turn each way is twice the focal length across.
    EXPECT_NEAR(2.0f * camera->GetFocalLength(), info.resolution.x, 1.0f);
}

}  // namespace
}  // namespace quorvel::vexmap
