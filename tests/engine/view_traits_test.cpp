#include "vexmap/view_traits.h"

#include <cerrno>
#include <string>
#include <tuple>

#include <boost/shared_ptr.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/camera_builder.h"
#include "vexmap/defaults.h"
#include "vexmap/error.h"
#include "vexmap/floating_point.h"
#include "vexmap/panoramic_view_traits.h"
#include "vexmap/tarvex_brenvia_418.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

constexpr _DEWARP_INTERNAL_CAMERA_MOUNT CEILING = DEWARP_INTERNAL_CAMERA_MOUNT_CEILING;
constexpr _DEWARP_INTERNAL_CAMERA_MOUNT FLOOR = DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR;
constexpr _DEWARP_INTERNAL_CAMERA_MOUNT WALL = DEWARP_INTERNAL_CAMERA_MOUNT_WALL;
constexpr _DEWARP_INTERNAL_CAMERA_MOUNT INVERTED_WALL = DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL;
constexpr _DEWARP_INTERNAL_CAMERA_MOUNT MOUNT_SEVEN = static_cast<_DEWARP_INTERNAL_CAMERA_MOUNT>(7);

boost::shared_ptr<Camera> MakeCamera(_DEWARP_INTERNAL_CAMERA_MOUNT mount) {
    boost::shared_ptr<Camera> camera(CameraBuilder::MakeCamera(TarvexBrenvia418, WALL));
    camera->SetCameraMount(mount);  // so that a mount beyond the four reaches the camera too
    return camera;
}

_DEWARP_PROJECTION AsProjection(int value) {
    return static_cast<_DEWARP_PROJECTION>(value);
}

// Traits that aim at a field of our choosing and, optionally, substitute a projection of their own.
class TargetTraits : public ViewTraits {
public:
    explicit TargetTraits(FieldOfView const& target_value,
                          _DEWARP_PROJECTION default_projection = Defaults::Projection)
        : target(target_value), fallback(default_projection) {}
    _DEWARP_PROJECTION GetDefaultProjection() const override { return fallback; }
    FieldOfView GetTargetFov(Camera const&, _DEWARP_PROJECTION) const override { return target; }

private:
    FieldOfView target;
    _DEWARP_PROJECTION fallback;
};

TEST(ViewTraits, DefaultsAreTheEngineDefaults) {
    ViewTraits const traits;
    EXPECT_EQ(DEWARP_PROJECTION_CYLINDRICAL, traits.GetDefaultProjection());
    EXPECT_EQ(DEWARP_ASPECT_RATIO_STRETCH, traits.GetDefaultAspectRatio());
}

TEST(ViewTraits, TargetFieldIsZeroWhateverTheCameraAndProjection) {
    ViewTraits const traits;
    for (_DEWARP_INTERNAL_CAMERA_MOUNT const mount : {CEILING, FLOOR, WALL, INVERTED_WALL}) {
        boost::shared_ptr<Camera> const camera = MakeCamera(mount);
        for (int projection = 0; projection <= 9; ++projection) {
            FieldOfView const target = traits.GetTargetFov(*camera, AsProjection(projection));
            EXPECT_EQ(0.0f, target.horizontal) << mount << " " << projection;
            EXPECT_EQ(0.0f, target.vertical) << mount << " " << projection;
            EXPECT_EQ(0.0f, target.diagonal) << mount << " " << projection;
        }
    }
}

TEST(ViewTraits, PtzRangeIsEmptyWhateverTheCameraAndField) {
    ViewTraits const traits;
    for (_DEWARP_INTERNAL_CAMERA_MOUNT const mount : {CEILING, FLOOR, WALL, INVERTED_WALL}) {
        PtzRange const range = traits.GetPtzRange(*MakeCamera(mount), FieldOfView(1.0f, 0.5f));
        EXPECT_EQ(Vector2d(0.0f, 0.0f), range.pan) << mount;
        EXPECT_EQ(Vector2d(0.0f, 0.0f), range.tilt) << mount;
        EXPECT_EQ(Vector2d(0.0f, 0.0f), range.roll) << mount;
        EXPECT_EQ(0.0f, range.zoom.x) << mount;  // the empty zoom interval in force
        EXPECT_EQ(0.0f, range.zoom.y) << mount;
        EXPECT_EQ(0u, range.flags) << mount;
    }
}

TEST(ViewTraits, AssignmentToItselfWarnsWithTheClassName) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    ViewTraits traits;
    ViewTraits const copy(traits);
    traits = copy;
    EXPECT_EQ(0u, sink.Count());
    ViewTraits& same = traits;
    traits = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of ViewTraits object\n", lines[0].text);
}

// Every mount against the projections that any view can show.
class ViewTraitsPlainProjectionTest
    : public ::testing::TestWithParam<std::tuple<_DEWARP_INTERNAL_CAMERA_MOUNT, int>> {};

TEST_P(ViewTraitsPlainProjectionTest, CompatibleProjectionReturnsItAsItStandsWithoutALine) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    ViewTraits const traits;
    _DEWARP_PROJECTION const projection = AsProjection(std::get<1>(GetParam()));
    EXPECT_EQ(projection,
              traits.GetCompatibleProjection(*MakeCamera(std::get<0>(GetParam())), projection));
    EXPECT_EQ(0u, sink.Count());
}

INSTANTIATE_TEST_SUITE_P(EveryMount, ViewTraitsPlainProjectionTest,
                         ::testing::Combine(::testing::Values(CEILING, FLOOR, WALL, INVERTED_WALL),
                                            ::testing::Values(0, 1, 2, 3, 4, 5, 7)));

class ViewTraitsPanniniTest
    : public ::testing::TestWithParam<std::tuple<_DEWARP_INTERNAL_CAMERA_MOUNT, int>> {};

TEST_P(ViewTraitsPanniniTest, CompatibleProjectionKeepsAPanniniProjectionOnAWall) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    ViewTraits const traits;
    _DEWARP_PROJECTION const projection = AsProjection(std::get<1>(GetParam()));
    EXPECT_EQ(projection,
              traits.GetCompatibleProjection(*MakeCamera(std::get<0>(GetParam())), projection));
    EXPECT_EQ(0u, sink.Count());
}

INSTANTIATE_TEST_SUITE_P(WallAndInvertedWall, ViewTraitsPanniniTest,
                         ::testing::Combine(::testing::Values(WALL, INVERTED_WALL),
                                            ::testing::Values(6, 8)));

// The projection's name and the mount that cannot show it.
class ViewTraitsUpOrDownPanniniTest
    : public ::testing::TestWithParam<
          std::tuple<_DEWARP_INTERNAL_CAMERA_MOUNT, std::tuple<int, char const*>>> {};

TEST_P(ViewTraitsUpOrDownPanniniTest, CompatibleProjectionSubstitutesTheDefaultWithTwoLines) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    ViewTraits const traits;
    _DEWARP_PROJECTION const projection = AsProjection(std::get<0>(std::get<1>(GetParam())));
    std::string const name = std::get<1>(std::get<1>(GetParam()));
    EXPECT_EQ(DEWARP_PROJECTION_CYLINDRICAL,
              traits.GetCompatibleProjection(*MakeCamera(std::get<0>(GetParam())), projection));
    auto const lines = sink.Lines();
    ASSERT_EQ(2u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - The %s projection is unsupported by this view\n", lines[0].format);
    EXPECT_EQ("VEXMAP: WARNING - The " + name + " projection is unsupported by this view\n",
              lines[0].text);
    EXPECT_EQ("VEXMAP: INFO - The %s projection will be substituted\n", lines[1].format);
    // "substituted" stands beside the new projection's name: the wanted wording.
    EXPECT_EQ("VEXMAP: INFO - The cylindical projection will be substituted\n", lines[1].text);
}

INSTANTIATE_TEST_SUITE_P(
    CeilingAndFloor, ViewTraitsUpOrDownPanniniTest,
    ::testing::Combine(::testing::Values(CEILING, FLOOR),
                       ::testing::Values(std::make_tuple(6, "pannini"),
                                         std::make_tuple(8, "equirectangular pannini"))));

class ViewTraitsUnknownProjectionTest
    : public ::testing::TestWithParam<std::tuple<_DEWARP_INTERNAL_CAMERA_MOUNT, int>> {};

TEST_P(ViewTraitsUnknownProjectionTest, CompatibleProjectionSubstitutesAndNamesItUnknown) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    ViewTraits const traits;
    EXPECT_EQ(DEWARP_PROJECTION_CYLINDRICAL,
              traits.GetCompatibleProjection(*MakeCamera(std::get<0>(GetParam())),
                                             AsProjection(std::get<1>(GetParam()))));
    auto const lines = sink.Lines();
    ASSERT_EQ(3u, lines.size());  // the name look-up warns of its own
    EXPECT_EQ("VEXMAP: WARNING - Unable to get the name of an unknown projection\n", lines[0].text);
    EXPECT_EQ("VEXMAP: WARNING - The <unknown> projection is unsupported by this view\n",
              lines[1].text);
    EXPECT_EQ("VEXMAP: INFO - The cylindical projection will be substituted\n", lines[2].text);
}

// -1 is above 8 as an unsigned number.
INSTANTIATE_TEST_SUITE_P(EveryMount, ViewTraitsUnknownProjectionTest,
                         ::testing::Combine(::testing::Values(CEILING, FLOOR, WALL, INVERTED_WALL),
                                            ::testing::Values(9, 100, -1)));

TEST(ViewTraits, CompatibleProjectionTakesTheSubstituteFromTheVirtualDefault) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    TargetTraits const traits(FieldOfView(1.0f, 0.5f), DEWARP_PROJECTION_MERCATOR);
    EXPECT_EQ(DEWARP_PROJECTION_MERCATOR,
              traits.GetCompatibleProjection(*MakeCamera(FLOOR), DEWARP_PROJECTION_PANNINI));
    auto const lines = sink.Lines();
    ASSERT_EQ(2u, lines.size());
    EXPECT_EQ("VEXMAP: INFO - The mercator projection will be substituted\n", lines[1].text);
}

TEST(ViewTraits, CompatibleProjectionTreatsAMountBeyondTheFourAsAWall) {
    ViewTraits const traits;
    EXPECT_EQ(DEWARP_PROJECTION_PANNINI,
              traits.GetCompatibleProjection(*MakeCamera(MOUNT_SEVEN), DEWARP_PROJECTION_PANNINI));
}

TEST(ViewTraits, ProjectionInfoKeepsATargetThatTheMapCovers) {
    boost::shared_ptr<Camera> const camera = MakeCamera(WALL);
    FieldOfView const target(1.0f, 0.5f);
    FieldOfView const map_field = camera->GetProjectionFieldOfView(
        camera->GetProjectionMapSize(DEWARP_PROJECTION_CYLINDRICAL), DEWARP_PROJECTION_CYLINDRICAL);
    ASSERT_LT(target.vertical, map_field.vertical);
    TargetTraits traits(target);
    ProjectionInfo const info = traits.GetProjectionInfo(*camera, DEWARP_PROJECTION_CYLINDRICAL);
    EXPECT_EQ(target.horizontal, info.field_of_view.horizontal);
    EXPECT_EQ(target.vertical, info.field_of_view.vertical);
    EXPECT_EQ(target.diagonal, info.field_of_view.diagonal);
    Resolution const expected =
        camera->GetProjectionResolution(target, DEWARP_PROJECTION_CYLINDRICAL);
    EXPECT_EQ(expected.x, info.resolution.x);
    EXPECT_EQ(expected.y, info.resolution.y);
}

TEST(ViewTraits, ProjectionInfoCutsOnlyTheVerticalToWhatTheMapCovers) {
    boost::shared_ptr<Camera> const camera = MakeCamera(WALL);
    FieldOfView const target(1.0f, 3.0f);
    Resolution const map_size = camera->GetProjectionMapSize(DEWARP_PROJECTION_CYLINDRICAL);
    FieldOfView const map_field =
        camera->GetProjectionFieldOfView(map_size, DEWARP_PROJECTION_CYLINDRICAL);
    ASSERT_GT(target.vertical, map_field.vertical);
    TargetTraits traits(target);
    ProjectionInfo const info = traits.GetProjectionInfo(*camera, DEWARP_PROJECTION_CYLINDRICAL);
    EXPECT_EQ(map_field.vertical, info.field_of_view.vertical);
    EXPECT_EQ(map_size.y, info.resolution.y);
    EXPECT_EQ(target.horizontal, info.field_of_view.horizontal);
    EXPECT_EQ(target.diagonal, info.field_of_view.diagonal);
    EXPECT_EQ(camera->GetProjectionResolution(target, DEWARP_PROJECTION_CYLINDRICAL).x,
              info.resolution.x);
}

TEST(ViewTraits, ProjectionInfoOfTheZeroTargetFailsAsInvalidResolutionAtTheViewBuilder) {
    boost::shared_ptr<Camera> const camera = MakeCamera(WALL);
    ViewTraits traits;
    errno = 0;
    EXPECT_THAT(
        [&] { traits.GetProjectionInfo(*camera, DEWARP_PROJECTION_CYLINDRICAL); },
        ThrowsMessage<Error>(HasSubstr("[Error EDOM (33)] - Invalid projection resolution")));
    EXPECT_EQ(EDOM, errno);
    EXPECT_THAT([&] { traits.GetProjectionInfo(*camera, DEWARP_PROJECTION_CYLINDRICAL); },
                ThrowsMessage<Error>(HasSubstr("(ViewBuilder::GetProjectionInfo@")));
}

TEST(ViewTraits, ProjectionInfoOfANonFiniteFieldFailsAsInvalidFieldOfView) {
    boost::shared_ptr<Camera> const camera = MakeCamera(WALL);
    TargetTraits traits(FieldOfView(1.0f, 0.5f, FloatingPoint::Infinity));
    errno = 0;
    EXPECT_THAT(
        [&] { traits.GetProjectionInfo(*camera, DEWARP_PROJECTION_CYLINDRICAL); },
        ThrowsMessage<Error>(HasSubstr("[Error EDOM (33)] - Invalid projection field-of-view")));
    EXPECT_EQ(EDOM, errno);
    EXPECT_THAT([&] { traits.GetProjectionInfo(*camera, DEWARP_PROJECTION_CYLINDRICAL); },
                ThrowsMessage<Error>(HasSubstr("(ViewBuilder::GetProjectionInfo@")));
}

TEST(ViewTraits, ProjectionInfoAsksTheVirtualTargetOfTheFamily) {
    boost::shared_ptr<Camera> const camera = MakeCamera(CEILING);
    PanoramicViewTraits traits;
    ProjectionInfo const info = traits.GetProjectionInfo(*camera, DEWARP_PROJECTION_CYLINDRICAL);
    EXPECT_EQ(Trigonometry::TWO_PI, info.field_of_view.horizontal);
    EXPECT_EQ(Trigonometry::HALF_PI, info.field_of_view.vertical);
    EXPECT_EQ(camera
                  ->GetProjectionResolution(FieldOfView::CeilingFieldOfView,
                                            DEWARP_PROJECTION_CYLINDRICAL)
                  .x,
              info.resolution.x);
}

}  // namespace
}  // namespace quorvel::vexmap
