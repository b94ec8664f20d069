#include "vexmap/panoramic_view_traits.h"

#include <cerrno>
#include <tuple>

#include <boost/shared_ptr.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/camera_builder.h"
#include "vexmap/dual_panoramic_view.h"
#include "vexmap/error.h"
#include "vexmap/floating_point.h"
#include "vexmap/single_panoramic_view.h"
#include "vexmap/tarvex_brenvia_418.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

using ::testing::AllOf;
using ::testing::EndsWith;
using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

constexpr float RADIAN_TOLERANCE = 1e-5f;

constexpr _DEWARP_INTERNAL_CAMERA_MOUNT CEILING = DEWARP_INTERNAL_CAMERA_MOUNT_CEILING;
constexpr _DEWARP_INTERNAL_CAMERA_MOUNT FLOOR = DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR;
constexpr _DEWARP_INTERNAL_CAMERA_MOUNT WALL = DEWARP_INTERNAL_CAMERA_MOUNT_WALL;
constexpr _DEWARP_INTERNAL_CAMERA_MOUNT INVERTED_WALL = DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL;
constexpr _DEWARP_INTERNAL_CAMERA_MOUNT MOUNT_SEVEN = static_cast<_DEWARP_INTERNAL_CAMERA_MOUNT>(7);

// Lenses narrower than half a turn, and wider than it across only.
_DEWARP_INTERNAL_CAMERA_MODEL const NARROW_LENS{
    DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, 180.0f, 160.0f, 120.0f, 1600, 1200};
_DEWARP_INTERNAL_CAMERA_MODEL const ACROSS_LENS{
    DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, 200.0f, 190.0f, 150.0f, 1900, 1500};

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

void ExpectSameField(FieldOfView const& expected, FieldOfView const& actual) {
    EXPECT_EQ(expected.horizontal, actual.horizontal);
    EXPECT_EQ(expected.vertical, actual.vertical);
    EXPECT_EQ(expected.diagonal, actual.diagonal);
}

void ExpectSameRange(PtzRange const& expected, PtzRange const& actual) {
    EXPECT_EQ(expected.pan.x, actual.pan.x);
    EXPECT_EQ(expected.pan.y, actual.pan.y);
    EXPECT_EQ(expected.tilt.x, actual.tilt.x);
    EXPECT_EQ(expected.tilt.y, actual.tilt.y);
    EXPECT_EQ(expected.roll.x, actual.roll.x);
    EXPECT_EQ(expected.roll.y, actual.roll.y);
    EXPECT_EQ(expected.zoom.x, actual.zoom.x);
    EXPECT_EQ(expected.zoom.y, actual.zoom.y);
    EXPECT_EQ(expected.flags, actual.flags);
}

TEST(PanoramicViewTraits, SharedObjectIsOnePanoramicViewTraits) {
    ASSERT_TRUE(PanoramicViewTraits::PANORAMIC_VIEW_TRAITS);
    EXPECT_NE(nullptr, dynamic_cast<PanoramicViewTraits const*>(
                           PanoramicViewTraits::PANORAMIC_VIEW_TRAITS.get()));
    EXPECT_EQ(PanoramicViewTraits::PANORAMIC_VIEW_TRAITS.get(),
              PanoramicViewTraits::GetPanoramicViewTraits().get());
}

TEST(PanoramicViewTraits, EachCopyOfTheSharedPointerAddsOneReference) {
    long const before = PanoramicViewTraits::PANORAMIC_VIEW_TRAITS.use_count();
    {
        boost::shared_ptr<ViewTraits const> const first =
            PanoramicViewTraits::GetPanoramicViewTraits();
        EXPECT_EQ(before + 1, PanoramicViewTraits::PANORAMIC_VIEW_TRAITS.use_count());
        boost::shared_ptr<ViewTraits const> const second =
            PanoramicViewTraits::GetPanoramicViewTraits();
        EXPECT_EQ(before + 2, PanoramicViewTraits::PANORAMIC_VIEW_TRAITS.use_count());
    }
    EXPECT_EQ(before, PanoramicViewTraits::PANORAMIC_VIEW_TRAITS.use_count());
}

TEST(PanoramicViewTraits, TwoViewsOfTheFamilyHoldTheSameObjectWithOneReferenceEach) {
    boost::shared_ptr<Camera> const camera = MakeCamera(CEILING);
    long const before = PanoramicViewTraits::PANORAMIC_VIEW_TRAITS.use_count();
    SinglePanoramicView const single(camera, DEWARP_PROJECTION_CYLINDRICAL);
    EXPECT_EQ(before + 1, PanoramicViewTraits::PANORAMIC_VIEW_TRAITS.use_count());
    DualPanoramicView const dual(camera, DEWARP_PROJECTION_CYLINDRICAL);
    EXPECT_EQ(before + 2, PanoramicViewTraits::PANORAMIC_VIEW_TRAITS.use_count());
    EXPECT_EQ(PanoramicViewTraits::PANORAMIC_VIEW_TRAITS.get(), &single.GetTraits());
    EXPECT_EQ(&single.GetTraits(), &dual.GetTraits());
}

TEST(PanoramicViewTraits, DefaultsAreCylindricalAndFit) {
    PanoramicViewTraits const traits;
    EXPECT_EQ(DEWARP_PROJECTION_CYLINDRICAL, traits.GetDefaultProjection());
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FIT, traits.GetDefaultAspectRatio());
}

TEST(PanoramicViewTraits, AssignmentToItselfWarnsWithTheClassName) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    PanoramicViewTraits traits;
    PanoramicViewTraits const copy(traits);
    traits = copy;
    EXPECT_EQ(0u, sink.Count());
    PanoramicViewTraits& same = traits;
    traits = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of PanoramicViewTraits object\n", lines[0].text);
}

TEST(PanoramicViewTraits, CompatibleProjectionKeepsPanniniOnAWall) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    PanoramicViewTraits const traits;
    EXPECT_EQ(DEWARP_PROJECTION_PANNINI,
              traits.GetCompatibleProjection(*MakeCamera(WALL), DEWARP_PROJECTION_PANNINI));
    EXPECT_EQ(0u, sink.Count());
}

TEST(PanoramicViewTraits, CompatibleProjectionTurnsPanniniOnAFloorIntoCylindrical) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    PanoramicViewTraits const traits;
    EXPECT_EQ(DEWARP_PROJECTION_CYLINDRICAL,
              traits.GetCompatibleProjection(*MakeCamera(FLOOR), DEWARP_PROJECTION_PANNINI));
    auto const lines = sink.Lines();
    ASSERT_EQ(2u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - The pannini projection is unsupported by this view\n",
              lines[0].text);
    EXPECT_EQ("VEXMAP: INFO - The cylindical projection will be substituted\n", lines[1].text);
}

TEST(PanoramicViewTraits, CompatibleProjectionNamesProjectionNineUnknown) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    PanoramicViewTraits const traits;
    EXPECT_EQ(DEWARP_PROJECTION_CYLINDRICAL,
              traits.GetCompatibleProjection(*MakeCamera(WALL), AsProjection(9)));
    auto const lines = sink.Lines();
    ASSERT_EQ(3u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - The <unknown> projection is unsupported by this view\n",
              lines[1].text);
}

using MountAndProjection = std::tuple<_DEWARP_INTERNAL_CAMERA_MOUNT, int>;

class PanoramicViewTraitsUpOrDownTest : public ::testing::TestWithParam<MountAndProjection> {
protected:
    FieldOfView Target() const {
        return PanoramicViewTraits().GetTargetFov(*MakeCamera(std::get<0>(GetParam())),
                                                  AsProjection(std::get<1>(GetParam())));
    }
    static FieldOfView const& MountField(_DEWARP_INTERNAL_CAMERA_MOUNT mount) {
        return mount == CEILING ? FieldOfView::CeilingFieldOfView : FieldOfView::FloorFieldOfView;
    }
};

class PanoramicViewTraitsCylindricalUpOrDownTest : public PanoramicViewTraitsUpOrDownTest {};

TEST_P(PanoramicViewTraitsCylindricalUpOrDownTest, TargetFieldIsAFullTurnByAQuarterTurn) {
    FieldOfView const target = Target();
    ExpectSameField(MountField(std::get<0>(GetParam())), target);
    EXPECT_EQ(Trigonometry::TWO_PI, target.horizontal);
    EXPECT_EQ(Trigonometry::HALF_PI, target.vertical);
}

INSTANTIATE_TEST_SUITE_P(CeilingAndFloor, PanoramicViewTraitsCylindricalUpOrDownTest,
                         ::testing::Combine(::testing::Values(CEILING, FLOOR),
                                            ::testing::Values(1)));

class PanoramicViewTraitsDoubledUpOrDownTest : public PanoramicViewTraitsUpOrDownTest {};

TEST_P(PanoramicViewTraitsDoubledUpOrDownTest,
       TargetFieldIsAFullTurnByAHalfTurnKeepingTheDiagonal) {
    FieldOfView const target = Target();
    EXPECT_EQ(Trigonometry::TWO_PI, target.horizontal);
    EXPECT_EQ(Trigonometry::PI, target.vertical);
    EXPECT_EQ(MountField(std::get<0>(GetParam())).diagonal, target.diagonal);
    EXPECT_NEAR(FloatingPoint::sqrt(Trigonometry::TWO_PI * Trigonometry::TWO_PI +
                                    Trigonometry::HALF_PI * Trigonometry::HALF_PI),
                target.diagonal, RADIAN_TOLERANCE);
}

INSTANTIATE_TEST_SUITE_P(CeilingAndFloor, PanoramicViewTraitsDoubledUpOrDownTest,
                         ::testing::Combine(::testing::Values(CEILING, FLOOR),
                                            ::testing::Values(2, 3, 4, 5, 7)));

class PanoramicViewTraitsRejectedUpOrDownTest : public PanoramicViewTraitsUpOrDownTest {};

TEST_P(PanoramicViewTraitsRejectedUpOrDownTest, TargetFieldFailsAsInvalidForThisOrientation) {
    errno = 0;
    EXPECT_THAT([this] { Target(); },
                ThrowsMessage<Error>(AllOf(
                    HasSubstr("(PanoramicViewTraits::GetTargetFov@"),
                    EndsWith("[Error EINVAL (22)] - Invalid projection for this orientation"))));
    EXPECT_EQ(EINVAL, errno);
}

INSTANTIATE_TEST_SUITE_P(CeilingAndFloor, PanoramicViewTraitsRejectedUpOrDownTest,
                         ::testing::Combine(::testing::Values(CEILING, FLOOR),
                                            ::testing::Values(0, 6, 8)));

class PanoramicViewTraitsUnknownProjectionTest : public PanoramicViewTraitsUpOrDownTest {};

TEST_P(PanoramicViewTraitsUnknownProjectionTest, TargetFieldFailsAsInvalidProjection) {
    errno = 0;
    EXPECT_THAT([this] { Target(); },
                ThrowsMessage<Error>(AllOf(HasSubstr("(PanoramicViewTraits::GetTargetFov@"),
                                           EndsWith("[Error EINVAL (22)] - Invalid projection"))));
    EXPECT_EQ(EINVAL, errno);
}

// -1 is above 8 as an unsigned number.
INSTANTIATE_TEST_SUITE_P(EveryMount, PanoramicViewTraitsUnknownProjectionTest,
                         ::testing::Combine(::testing::Values(CEILING, FLOOR, WALL, INVERTED_WALL,
                                                              MOUNT_SEVEN),
                                            ::testing::Values(9, 100, -1)));

// Wall, inverted wall and a mount beyond the four, which takes the wall's branch.
class PanoramicViewTraitsWallTest : public ::testing::TestWithParam<MountAndProjection> {
protected:
    FieldOfView Target(_DEWARP_INTERNAL_CAMERA_MODEL const& model) const {
        return PanoramicViewTraits().GetTargetFov(*MakeCamera(std::get<0>(GetParam()), model),
                                                  AsProjection(std::get<1>(GetParam())));
    }
};

class PanoramicViewTraitsOwnFieldWallTest : public PanoramicViewTraitsWallTest {};

TEST_P(PanoramicViewTraitsOwnFieldWallTest, TargetFieldIsTheCamerasOwn) {
    for (_DEWARP_INTERNAL_CAMERA_MODEL const& model : {TarvexBrenvia418, NARROW_LENS}) {
        ExpectSameField(MakeCamera(WALL, model)->GetFieldOfView(), Target(model));
    }
}

INSTANTIATE_TEST_SUITE_P(WallLike, PanoramicViewTraitsOwnFieldWallTest,
                         ::testing::Combine(::testing::Values(WALL, INVERTED_WALL, MOUNT_SEVEN),
                                            ::testing::Values(1, 2, 3, 4, 5, 7)));

class PanoramicViewTraitsPanniniWallTest : public PanoramicViewTraitsWallTest {};

TEST_P(PanoramicViewTraitsPanniniWallTest, TargetFieldIsTheCamerasOwnAtMostHalfATurnEachWay) {
    FieldOfView const wide = Target(TarvexBrenvia418);  // 183 degrees both ways
    EXPECT_EQ(Trigonometry::PI, wide.horizontal);
    EXPECT_EQ(Trigonometry::PI, wide.vertical);
    EXPECT_NEAR(Degrees(183.0f), wide.diagonal, RADIAN_TOLERANCE);

    FieldOfView const across = Target(ACROSS_LENS);
    EXPECT_EQ(Trigonometry::PI, across.horizontal);
    EXPECT_NEAR(Degrees(150.0f), across.vertical, RADIAN_TOLERANCE);
    EXPECT_NEAR(Degrees(200.0f), across.diagonal, RADIAN_TOLERANCE);

    ExpectSameField(MakeCamera(WALL, NARROW_LENS)->GetFieldOfView(), Target(NARROW_LENS));
}

INSTANTIATE_TEST_SUITE_P(WallLike, PanoramicViewTraitsPanniniWallTest,
                         ::testing::Combine(::testing::Values(WALL, INVERTED_WALL, MOUNT_SEVEN),
                                            ::testing::Values(6, 8)));

class PanoramicViewTraitsRectilinearWallTest : public PanoramicViewTraitsWallTest {};

TEST_P(PanoramicViewTraitsRectilinearWallTest, TargetFieldIsWhatTheRectilinearMapCovers) {
    boost::shared_ptr<Camera> const camera = MakeCamera(WALL);
    FieldOfView const covered = camera->GetProjectionFieldOfView(
        camera->GetProjectionMapSize(DEWARP_PROJECTION_RECTILINEAR), DEWARP_PROJECTION_RECTILINEAR);
    FieldOfView const target = Target(TarvexBrenvia418);
    ExpectSameField(covered, target);
    EXPECT_LT(target.horizontal, Trigonometry::PI);  // less than the lens sees
}

INSTANTIATE_TEST_SUITE_P(WallLike, PanoramicViewTraitsRectilinearWallTest,
                         ::testing::Combine(::testing::Values(WALL, INVERTED_WALL, MOUNT_SEVEN),
                                            ::testing::Values(0)));

class PanoramicViewTraitsRangeTest
    : public ::testing::TestWithParam<std::tuple<_DEWARP_INTERNAL_CAMERA_MOUNT, PtzRange const*>> {
};

TEST_P(PanoramicViewTraitsRangeTest, PtzRangeIsTheMountsConstantWhateverTheField) {
    PanoramicViewTraits const traits;
    boost::shared_ptr<Camera> const camera = MakeCamera(std::get<0>(GetParam()));
    ExpectSameRange(*std::get<1>(GetParam()), traits.GetPtzRange(*camera, FieldOfView(0.2f, 0.1f)));
    ExpectSameRange(*std::get<1>(GetParam()), traits.GetPtzRange(*camera, FieldOfView(4.0f, 2.0f)));
}

INSTANTIATE_TEST_SUITE_P(
    EveryMount, PanoramicViewTraitsRangeTest,
    ::testing::Values(std::make_tuple(CEILING, &PtzRange::CeilingPanoramicRange),
                      std::make_tuple(FLOOR, &PtzRange::FloorPanoramicRange),
                      std::make_tuple(WALL, &PtzRange::WallPanoramicRange),
                      std::make_tuple(INVERTED_WALL, &PtzRange::InvertedWallPanoramicRange)));

TEST(PanoramicViewTraits, PtzRangeTurnsInPanUpOrDownAndInRollOnAWall) {
    PanoramicViewTraits const traits;
    FieldOfView const field(1.0f, 1.0f);
    PtzRange const ceiling = traits.GetPtzRange(*MakeCamera(CEILING), field);
    EXPECT_EQ(Vector2d(Trigonometry::PI, -Trigonometry::PI), ceiling.pan);
    EXPECT_EQ(Vector2d(0.0f, 0.0f), ceiling.roll);
    PtzRange const wall = traits.GetPtzRange(*MakeCamera(INVERTED_WALL), field);
    EXPECT_EQ(Vector2d(0.0f, 0.0f), wall.pan);
    EXPECT_EQ(Vector2d(Trigonometry::PI, -Trigonometry::PI), wall.roll);
    for (PtzRange const& range : {ceiling, wall}) {
        EXPECT_EQ(Vector2d(0.0f, 0.0f), range.tilt);
        EXPECT_EQ(0.0f, range.zoom.x);  // the empty zoom interval in force
        EXPECT_EQ(0.0f, range.zoom.y);
    }
}

TEST(PanoramicViewTraits, PtzRangeOfMountSevenFailsAsInvalidCameraMount) {
    PanoramicViewTraits const traits;
    boost::shared_ptr<Camera> const camera = MakeCamera(MOUNT_SEVEN);
    errno = 0;
    EXPECT_THAT(
        [&] { traits.GetPtzRange(*camera, FieldOfView(1.0f, 1.0f)); },
        ThrowsMessage<Error>(AllOf(HasSubstr("(PanoramicViewTraits::GetPtzRange@"),
                                   EndsWith("[Error EINVAL (22)] - Invalid camera mount"))));
    EXPECT_EQ(EINVAL, errno);
}

TEST(PanoramicViewTraits, RectilinearPanoramaOnACeilingFailsWhileTheViewIsBuilt) {
    boost::shared_ptr<Camera> const camera = MakeCamera(CEILING);
    EXPECT_THAT([&] { SinglePanoramicView const view(camera, DEWARP_PROJECTION_RECTILINEAR); },
                ThrowsMessage<Error>(HasSubstr("Invalid projection for this orientation")));
}

TEST(PanoramicViewTraits, RectilinearPanoramaOnAWallAimsAtWhatTheRectilinearMapCovers) {
    boost::shared_ptr<Camera> const camera = MakeCamera(WALL);
    SinglePanoramicView const view(camera, DEWARP_PROJECTION_RECTILINEAR);
    Resolution const map_size = camera->GetProjectionMapSize(DEWARP_PROJECTION_RECTILINEAR);
    FieldOfView const covered =
        camera->GetProjectionFieldOfView(map_size, DEWARP_PROJECTION_RECTILINEAR);
    ExpectSameField(covered, view.GetFieldOfView());
    Resolution const expected =
        camera->GetProjectionResolution(covered, DEWARP_PROJECTION_RECTILINEAR);
    EXPECT_EQ(expected.x, view.GetProjectionSize().x);
    EXPECT_EQ(expected.y, view.GetProjectionSize().y);
}

TEST(PanoramicViewTraits, ProjectionInfoMeasuresTheTargetOfTheMount) {
    boost::shared_ptr<Camera> const camera = MakeCamera(FLOOR);
    PanoramicViewTraits traits;
    ProjectionInfo const info =
        traits.GetProjectionInfo(*camera, DEWARP_PROJECTION_EQUIRECTANGULAR);
    FieldOfView const map_field = camera->GetProjectionFieldOfView(
        camera->GetProjectionMapSize(DEWARP_PROJECTION_EQUIRECTANGULAR),
        DEWARP_PROJECTION_EQUIRECTANGULAR);
    ASSERT_GT(map_field.vertical, Trigonometry::PI);  // nothing to cut
    EXPECT_EQ(Trigonometry::TWO_PI, info.field_of_view.horizontal);
    EXPECT_EQ(Trigonometry::PI, info.field_of_view.vertical);
    // An equirectangular picture is the focal length times the angle each way.
    EXPECT_NEAR(FloatingPoint::floor(camera->GetFocalLength() * Trigonometry::TWO_PI),
                info.resolution.x, 1.0f);
    EXPECT_NEAR(FloatingPoint::floor(camera->GetFocalLength() * Trigonometry::PI),
                info.resolution.y, 1.0f);
}

}  // namespace
}  // namespace quorvel::vexmap
