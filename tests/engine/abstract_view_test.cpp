#include "vexmap/abstract_view.h"

#include <cerrno>
#include <cstdio>
#include <string>
#include <vector>

#include <boost/shared_ptr.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/camera_builder.h"
#include "vexmap/error.h"
#include "vexmap/floating_point.h"
#include "vexmap/panoramic_view_traits.h"
#include "vexmap/ptz_view_traits.h"
#include "vexmap/tarvex_brenvia_418.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::ThrowsMessage;

constexpr float RADIAN_TOLERANCE = 1e-5f;
constexpr float ZOOM_TOLERANCE = 1e-4f;
constexpr float PIXEL_TOLERANCE = 1e-3f;
constexpr double DEGREE_TOLERANCE = 1e-3;

constexpr _DEWARP_INTERNAL_CAMERA_MOUNT CEILING = DEWARP_INTERNAL_CAMERA_MOUNT_CEILING;
constexpr _DEWARP_INTERNAL_CAMERA_MOUNT WALL = DEWARP_INTERNAL_CAMERA_MOUNT_WALL;

// The centre of the built-in camera's picture, and a point near its east edge.
Vector2d const CENTRE_POINT(968.0f, 968.0f);
Vector2d const EAST_POINT(1800.0f, 968.0f);

boost::shared_ptr<Camera> MakeCamera(_DEWARP_INTERNAL_CAMERA_MOUNT mount) {
    boost::shared_ptr<Camera> camera(CameraBuilder::MakeCamera(TarvexBrenvia418, mount));
    return camera;
}

// A field of 0.8 by 0.6 radians, so a diagonal of exactly 1, that every map covers.
FieldOfView Field() {
    return FieldOfView(0.8f, 0.6f);
}

// Pan from -0.6 to 1, tilt from -0.5 to 0.5, roll free, zoom from 0.5 to 8.
PtzRange Range() {
    return PtzRange(Vector2d(1.0f, -0.6f), Vector2d(0.5f, -0.5f), PtzRange::FullMotion,
                    Vector2d(8.0f, 0.5f), PtzRange::ZeroFlags);
}

PtzPosition Position(float pan, float tilt, float roll, float zoom) {
    return PtzPosition(EulerAngles(pan, tilt, roll), zoom);
}

// Traits of a fixed target field and range, which remember what the range was asked with.
class FixedTraits : public ViewTraits {
public:
    FixedTraits(FieldOfView const& target_value, PtzRange const& range_value)
        : target(target_value), range(range_value) {}
    FieldOfView GetTargetFov(Camera const&, _DEWARP_PROJECTION) const override { return target; }
    PtzRange GetPtzRange(Camera const& camera, FieldOfView const& fov) const override {
        asked_camera = &camera;
        asked_field = fov;
        return range;
    }

    mutable Camera const* asked_camera = nullptr;
    mutable FieldOfView asked_field;

private:
    FieldOfView target;
    PtzRange range;
};

// An abstract view that records which change ran, with what, and whether the old value it got
// was the live field; then lets the base store the new value.
class RecordingView : public AbstractView {
public:
    using AbstractView::AbstractView;

    void OnAspectRatioChange(_DEWARP_ASPECT_RATIO old_ratio,
                             _DEWARP_ASPECT_RATIO new_ratio) override {
        calls.push_back("OnAspectRatioChange");
        seen_old_ratio = old_ratio;
        seen_new_ratio = new_ratio;
        AbstractView::OnAspectRatioChange(old_ratio, new_ratio);
    }
    void OnSizeChange(Resolution const& old_size, Resolution const& new_size) override {
        calls.push_back("OnSizeChange");
        seen_old_size = old_size;
        seen_new_size = new_size;
        old_was_live = &old_size == &GetDewarpedSize();
        AbstractView::OnSizeChange(old_size, new_size);
    }
    void OnOutputChange(Resolution const& old_size, _DEWARP_ASPECT_RATIO old_ratio,
                        Resolution const& new_size, _DEWARP_ASPECT_RATIO new_ratio) override {
        calls.push_back("OnOutputChange");
        seen_old_size = old_size;
        seen_new_size = new_size;
        seen_old_ratio = old_ratio;
        seen_new_ratio = new_ratio;
        old_was_live = &old_size == &GetDewarpedSize();
        AbstractView::OnOutputChange(old_size, old_ratio, new_size, new_ratio);
    }
    void OnZoomChange(PtzPosition const& old_ptz, PtzPosition const& new_ptz) override {
        Record("OnZoomChange", old_ptz, new_ptz);
        AbstractView::OnZoomChange(old_ptz, new_ptz);
    }
    void OnOrientationChange(PtzPosition const& old_ptz, PtzPosition const& new_ptz) override {
        Record("OnOrientationChange", old_ptz, new_ptz);
        AbstractView::OnOrientationChange(old_ptz, new_ptz);
    }
    void OnPtzChange(PtzPosition const& old_ptz, PtzPosition const& new_ptz) override {
        Record("OnPtzChange", old_ptz, new_ptz);
        AbstractView::OnPtzChange(old_ptz, new_ptz);
    }
    void DewarpImage(_DEWARP_IMAGE const&, _DEWARP_IMAGE&) override {}

    std::vector<std::string> calls;
    _DEWARP_ASPECT_RATIO seen_old_ratio = DEWARP_ASPECT_RATIO_FIT;
    _DEWARP_ASPECT_RATIO seen_new_ratio = DEWARP_ASPECT_RATIO_FIT;
    Resolution seen_old_size;
    Resolution seen_new_size;
    PtzPosition seen_old_ptz;
    PtzPosition seen_new_ptz;
    bool old_was_live = false;

private:
    void Record(char const* name, PtzPosition const& old_ptz, PtzPosition const& new_ptz) {
        calls.push_back(name);
        seen_old_ptz = old_ptz;
        seen_new_ptz = new_ptz;
        old_was_live = &old_ptz == &GetPtz();
    }
};

void ExpectPosition(PtzPosition const& expected, PtzPosition const& actual) {
    EXPECT_NEAR(expected.orientation.pan, actual.orientation.pan, RADIAN_TOLERANCE);
    EXPECT_NEAR(expected.orientation.tilt, actual.orientation.tilt, RADIAN_TOLERANCE);
    EXPECT_NEAR(expected.orientation.roll, actual.orientation.roll, RADIAN_TOLERANCE);
    EXPECT_NEAR(expected.zoom, actual.zoom, ZOOM_TOLERANCE);
}

std::vector<std::string> ViewLines(RecordingLogSink const& sink) {
    std::vector<std::string> texts;
    for (RecordingLogSink::Line const& line : sink.Lines()) {
        if (line.text.find("ABSTRACT_VIEW") != std::string::npos) {
            texts.push_back(line.text);
        }
    }
    return texts;
}

// A view of fixed traits on a wall camera, in the cylindrical projection.
class AbstractViewTest : public ::testing::Test {
protected:
    boost::shared_ptr<Camera> camera = MakeCamera(WALL);
    boost::shared_ptr<FixedTraits> traits{new FixedTraits(Field(), Range())};
    RecordingView view{traits, camera, DEWARP_PROJECTION_CYLINDRICAL};
};

// Constructors

Resolution const OUTPUT_SIZE(640, 480);

struct ConstructorRow {
    char const* name;
    RecordingView* (*make)(boost::shared_ptr<Camera> const& camera);
    bool ptz_traits;  // else the panoramic ones
    bool with_camera;
    _DEWARP_ASPECT_RATIO aspect_ratio;
    _DEWARP_PROJECTION projection;
    bool with_size;  // else invalid
};

boost::shared_ptr<ViewTraits const> Ptz() {
    return PtzViewTraits::GetPtzViewTraits();
}

constexpr _DEWARP_PROJECTION DEFAULT_PROJECTION = DEWARP_PROJECTION_CYLINDRICAL;
constexpr _DEWARP_ASPECT_RATIO DEFAULT_RATIO = DEWARP_ASPECT_RATIO_STRETCH;
constexpr _DEWARP_PROJECTION GIVEN_PROJECTION = DEWARP_PROJECTION_EQUIRECTANGULAR;
constexpr _DEWARP_ASPECT_RATIO GIVEN_RATIO = DEWARP_ASPECT_RATIO_FIT_WIDTH;

ConstructorRow const CONSTRUCTORS[] = {
    {"None", [](boost::shared_ptr<Camera> const&) { return new RecordingView(); }, false, false,
     DEFAULT_RATIO, DEFAULT_PROJECTION, false},
    {"Traits", [](boost::shared_ptr<Camera> const&) { return new RecordingView(Ptz()); }, true,
     false, DEFAULT_RATIO, DEFAULT_PROJECTION, false},
    {"TraitsCamera",
     [](boost::shared_ptr<Camera> const& camera) { return new RecordingView(Ptz(), camera); }, true,
     true, DEFAULT_RATIO, DEFAULT_PROJECTION, false},
    {"TraitsCameraProjection",
     [](boost::shared_ptr<Camera> const& camera) {
         return new RecordingView(Ptz(), camera, GIVEN_PROJECTION);
     },
     true, true, DEFAULT_RATIO, GIVEN_PROJECTION, false},
    {"TraitsCameraProjectionRatio",
     [](boost::shared_ptr<Camera> const& camera) {
         return new RecordingView(Ptz(), camera, GIVEN_PROJECTION, GIVEN_RATIO);
     },
     true, true, GIVEN_RATIO, GIVEN_PROJECTION, false},
    {"TraitsCameraProjectionSize",
     [](boost::shared_ptr<Camera> const& camera) {
         return new RecordingView(Ptz(), camera, GIVEN_PROJECTION, OUTPUT_SIZE);
     },
     true, true, DEFAULT_RATIO, GIVEN_PROJECTION, true},
    {"TraitsCameraProjectionSizeRatio",
     [](boost::shared_ptr<Camera> const& camera) {
         return new RecordingView(Ptz(), camera, GIVEN_PROJECTION, OUTPUT_SIZE, GIVEN_RATIO);
     },
     true, true, GIVEN_RATIO, GIVEN_PROJECTION, true},
    {"Camera", [](boost::shared_ptr<Camera> const& camera) { return new RecordingView(camera); },
     false, true, DEFAULT_RATIO, DEFAULT_PROJECTION, false},
    {"CameraProjection",
     [](boost::shared_ptr<Camera> const& camera) {
         return new RecordingView(camera, GIVEN_PROJECTION);
     },
     false, true, DEFAULT_RATIO, GIVEN_PROJECTION, false},
    {"CameraRatio",
     [](boost::shared_ptr<Camera> const& camera) { return new RecordingView(camera, GIVEN_RATIO); },
     false, true, GIVEN_RATIO, DEFAULT_PROJECTION, false},
    {"CameraProjectionRatio",
     [](boost::shared_ptr<Camera> const& camera) {
         return new RecordingView(camera, GIVEN_PROJECTION, GIVEN_RATIO);
     },
     false, true, GIVEN_RATIO, GIVEN_PROJECTION, false},
    {"CameraProjectionSize",
     [](boost::shared_ptr<Camera> const& camera) {
         return new RecordingView(camera, GIVEN_PROJECTION, OUTPUT_SIZE);
     },
     false, true, DEFAULT_RATIO, GIVEN_PROJECTION, true},
    {"CameraProjectionSizeRatio",
     [](boost::shared_ptr<Camera> const& camera) {
         return new RecordingView(camera, GIVEN_PROJECTION, OUTPUT_SIZE, GIVEN_RATIO);
     },
     false, true, GIVEN_RATIO, GIVEN_PROJECTION, true},
};

class AbstractViewConstructorTest : public ::testing::TestWithParam<ConstructorRow> {};

TEST_P(AbstractViewConstructorTest, FillsWhatItIsNotGivenFromTheGlobalDefaults) {
    ConstructorRow const& row = GetParam();
    boost::shared_ptr<Camera> const camera = MakeCamera(WALL);
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    boost::shared_ptr<RecordingView> const view(row.make(camera));

    ViewTraits const* const expected_traits =
        row.ptz_traits ? PtzViewTraits::PTZ_VIEW_TRAITS.get()
                       : PanoramicViewTraits::PANORAMIC_VIEW_TRAITS.get();
    EXPECT_EQ(expected_traits, &view->GetTraits());
    EXPECT_EQ(row.aspect_ratio, view->GetAspectRatio());
    EXPECT_EQ(row.projection, view->GetProjection());
    if (row.with_size) {
        EXPECT_EQ(640.0f, view->GetDewarpedSize().x);
        EXPECT_EQ(480.0f, view->GetDewarpedSize().y);
    } else {
        EXPECT_TRUE(FloatingPoint::is_nan(view->GetDewarpedSize().x));
        EXPECT_TRUE(FloatingPoint::is_nan(view->GetDewarpedSize().y));
    }
    EXPECT_EQ(0.0f, view->GetPtz().orientation.pan);
    EXPECT_EQ(0.0f, view->GetPtz().orientation.tilt);
    EXPECT_EQ(0.0f, view->GetPtz().orientation.roll);
    EXPECT_EQ(1.0f, view->GetPtz().zoom);
    EXPECT_THAT(view->calls, IsEmpty());

    if (row.with_camera) {
        EXPECT_EQ(camera.get(), &view->GetCamera());
        EXPECT_TRUE(view->GetProjectionSize().Valid());
        EXPECT_TRUE(view->GetFieldOfView().Valid());
        EXPECT_EQ(2u, ViewLines(sink).size());
    } else {
        EXPECT_THROW(view->GetCamera(), Error);
        EXPECT_TRUE(FloatingPoint::is_nan(view->GetProjectionSize().x));
        EXPECT_TRUE(FloatingPoint::is_nan(view->GetProjectionSize().y));
        EXPECT_TRUE(FloatingPoint::is_nan(view->GetFieldOfView().horizontal));
        EXPECT_TRUE(FloatingPoint::is_nan(view->GetFieldOfView().vertical));
        EXPECT_TRUE(FloatingPoint::is_nan(view->GetFieldOfView().diagonal));
        EXPECT_THAT(ViewLines(sink), IsEmpty());
    }
}

INSTANTIATE_TEST_SUITE_P(EveryConstructor, AbstractViewConstructorTest,
                         ::testing::ValuesIn(CONSTRUCTORS),
                         [](auto const& row) { return std::string(row.param.name); });

TEST(AbstractView, ConstructorDoesNotAskTheTraitsForTheirDefaults) {
    // The PTZ family would choose rectilinear and fill.
    RecordingView const view(Ptz(), MakeCamera(WALL));
    EXPECT_EQ(DEWARP_PROJECTION_CYLINDRICAL, view.GetProjection());
    EXPECT_EQ(DEWARP_ASPECT_RATIO_STRETCH, view.GetAspectRatio());
}

TEST(AbstractView, ConstructorKeepsAProjectionThatTheTraitsWouldSubstitute) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    RecordingView const view(Ptz(), MakeCamera(WALL), DEWARP_PROJECTION_MERCATOR);
    EXPECT_EQ(DEWARP_PROJECTION_MERCATOR, view.GetProjection());
    EXPECT_EQ(0u, sink.Count());
}

TEST(AbstractView, ConstructorThrowsWhatTheTraitsRaise) {
    boost::shared_ptr<Camera> const camera = MakeCamera(CEILING);
    EXPECT_THAT([&] { RecordingView const view(camera, DEWARP_PROJECTION_RECTILINEAR); },
                ThrowsMessage<Error>(HasSubstr("Invalid projection for this orientation")));
}

// Null pointers

TEST(AbstractView, GetCameraWithoutACameraFailsWithEfault) {
    RecordingView const view;
    errno = 0;
    EXPECT_THAT([&] { view.GetCamera(); },
                ThrowsMessage<Error>(HasSubstr("[Error EFAULT (14)] - Invalid camera")));
    EXPECT_EQ(EFAULT, errno);
}

TEST(AbstractView, GetTraitsWithoutTraitsFailsWithEfault) {
    RecordingView const view{boost::shared_ptr<ViewTraits const>()};
    errno = 0;
    EXPECT_THAT([&] { view.GetTraits(); },
                ThrowsMessage<Error>(HasSubstr("[Error EFAULT (14)] - Invalid traits")));
    EXPECT_EQ(EFAULT, errno);
}

TEST(AbstractView, OperationsOnTheCameraFailWithoutOne) {
    RecordingView view;
    EXPECT_THAT([&] { view.GetPtzRange(); }, ThrowsMessage<Error>(HasSubstr("Invalid camera")));
    EXPECT_THAT([&] { view.SetPtz(PtzPosition::Identity); },
                ThrowsMessage<Error>(HasSubstr("Invalid camera")));
    EXPECT_THAT([&] { view.CalcPtzPosition(CENTRE_POINT, 1.0f); },
                ThrowsMessage<Error>(HasSubstr("Invalid camera")));
    EXPECT_THAT(view.calls, IsEmpty());
}

TEST(AbstractView, ConstructionWithoutTraitsFailsAsInvalidTraits) {
    boost::shared_ptr<Camera> const camera = MakeCamera(WALL);
    EXPECT_THAT([&] { RecordingView const view(boost::shared_ptr<ViewTraits const>(), camera); },
                ThrowsMessage<Error>(HasSubstr("[Error EFAULT (14)] - Invalid traits")));
}

TEST(AbstractView, ConstructionWithANullCameraFailsAsInvalidCamera) {
    EXPECT_THAT([] { RecordingView const view(Ptz(), boost::shared_ptr<Camera>()); },
                ThrowsMessage<Error>(HasSubstr("[Error EFAULT (14)] - Invalid camera")));
}

// Projection info

TEST_F(AbstractViewTest, ProjectionSizeAndFieldAreWhatTheTargetTakesOnTheCamera) {
    Resolution const expected =
        camera->GetProjectionResolution(Field(), DEWARP_PROJECTION_CYLINDRICAL);
    EXPECT_EQ(expected.x, view.GetProjectionSize().x);
    EXPECT_EQ(expected.y, view.GetProjectionSize().y);
    EXPECT_EQ(0.8f, view.GetFieldOfView().horizontal);
    EXPECT_EQ(0.6f, view.GetFieldOfView().vertical);
    EXPECT_NEAR(1.0f, view.GetFieldOfView().diagonal, RADIAN_TOLERANCE);
}

TEST_F(AbstractViewTest, InitProjectionInfoLogsTheSizeAndTheFieldInDegrees) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    RecordingView const logged(traits, camera, DEWARP_PROJECTION_CYLINDRICAL);
    std::vector<std::string> const lines = ViewLines(sink);
    ASSERT_EQ(2u, lines.size());

    char expected_size[128];
    std::snprintf(expected_size, sizeof expected_size,
                  "VEXMAP: INFO - ABSTRACT_VIEW Projection size = (%f, %f)\n",
                  double(logged.GetProjectionSize().x), double(logged.GetProjectionSize().y));
    EXPECT_EQ(expected_size, lines[0]);

    float horizontal_degrees = 0.0f;
    float vertical_degrees = 0.0f;
    ASSERT_EQ(
        2, std::sscanf(lines[1].c_str(), "VEXMAP: INFO - ABSTRACT_VIEW Projection FOV = (%f, %f)",
                       &horizontal_degrees, &vertical_degrees));
    double const degrees_per_radian = 180.0 / 3.14159265358979;
    EXPECT_NEAR(0.8 * degrees_per_radian, double(horizontal_degrees), DEGREE_TOLERANCE);
    EXPECT_NEAR(0.6 * degrees_per_radian, double(vertical_degrees), DEGREE_TOLERANCE);

    std::vector<std::string> formats;
    for (RecordingLogSink::Line const& line : sink.Lines()) {
        if (line.text.find("ABSTRACT_VIEW") != std::string::npos) {
            formats.push_back(line.format);
        }
    }
    EXPECT_THAT(formats, ElementsAre("VEXMAP: INFO - ABSTRACT_VIEW Projection size = (%f, %f)\n",
                                     "VEXMAP: INFO - ABSTRACT_VIEW Projection FOV = (%f, %f)\n"));
}

TEST_F(AbstractViewTest, InitProjectionInfoStoresTheMeasureOfTheGivenProjection) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    view.InitProjectionInfo(*camera, DEWARP_PROJECTION_EQUIRECTANGULAR);
    Resolution const expected =
        camera->GetProjectionResolution(Field(), DEWARP_PROJECTION_EQUIRECTANGULAR);
    EXPECT_EQ(expected.x, view.GetProjectionSize().x);
    EXPECT_EQ(expected.y, view.GetProjectionSize().y);
    EXPECT_EQ(DEWARP_PROJECTION_CYLINDRICAL, view.GetProjection());  // fixed for life
    EXPECT_EQ(2u, ViewLines(sink).size());
}

TEST_F(AbstractViewTest, CalcProjectionMapSizeCutsOnlyTheVerticalToWhatTheMapCovers) {
    FieldOfView const target(1.0f, 3.0f);
    Resolution const map_size = camera->GetProjectionMapSize(DEWARP_PROJECTION_CYLINDRICAL);
    FieldOfView const map_field =
        camera->GetProjectionFieldOfView(map_size, DEWARP_PROJECTION_CYLINDRICAL);
    ASSERT_GT(target.vertical, map_field.vertical);
    boost::shared_ptr<ViewTraits const> const tall(new FixedTraits(target, Range()));
    RecordingView const cut(tall, camera, DEWARP_PROJECTION_CYLINDRICAL);
    EXPECT_EQ(map_field.vertical, cut.GetFieldOfView().vertical);
    EXPECT_EQ(map_size.y, cut.GetProjectionSize().y);
    EXPECT_EQ(target.horizontal, cut.GetFieldOfView().horizontal);
    EXPECT_EQ(target.diagonal, cut.GetFieldOfView().diagonal);
    EXPECT_EQ(camera->GetProjectionResolution(target, DEWARP_PROJECTION_CYLINDRICAL).x,
              cut.GetProjectionSize().x);
}

TEST_F(AbstractViewTest, CalcProjectionMapSizeOfAZeroTargetFailsAsInvalidResolution) {
    boost::shared_ptr<ViewTraits const> const zero(
        new FixedTraits(FieldOfView::ZeroFieldOfView, Range()));
    errno = 0;
    EXPECT_THAT(
        [&] { RecordingView const failed(zero, camera, DEWARP_PROJECTION_CYLINDRICAL); },
        ThrowsMessage<Error>(HasSubstr("[Error EDOM (33)] - Invalid projection resolution")));
    EXPECT_EQ(EDOM, errno);
    EXPECT_THAT([&] { RecordingView const failed(zero, camera, DEWARP_PROJECTION_CYLINDRICAL); },
                ThrowsMessage<Error>(HasSubstr("(AbstractView::CalcProjectionMapSize@")));
}

TEST_F(AbstractViewTest, CalcProjectionMapSizeOfANonFiniteFieldFailsAsInvalidFieldOfView) {
    boost::shared_ptr<ViewTraits const> const endless(
        new FixedTraits(FieldOfView(0.8f, 0.6f, FloatingPoint::Infinity), Range()));
    errno = 0;
    EXPECT_THAT(
        [&] { RecordingView const failed(endless, camera, DEWARP_PROJECTION_CYLINDRICAL); },
        ThrowsMessage<Error>(HasSubstr("[Error EDOM (33)] - Invalid projection field-of-view")));
    EXPECT_EQ(EDOM, errno);
}

// Aspect ratio and size

TEST_F(AbstractViewTest, SetAspectRatioWithTheSameRatioChangesNothing) {
    view.SetAspectRatio(DEWARP_ASPECT_RATIO_STRETCH);
    EXPECT_THAT(view.calls, IsEmpty());
}

TEST_F(AbstractViewTest, SetAspectRatioWithAnotherRatioCallsOnAspectRatioChange) {
    view.SetAspectRatio(DEWARP_ASPECT_RATIO_FIT);
    EXPECT_THAT(view.calls, ElementsAre("OnAspectRatioChange"));
    EXPECT_EQ(DEWARP_ASPECT_RATIO_STRETCH, view.seen_old_ratio);
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FIT, view.seen_new_ratio);
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FIT, view.GetAspectRatio());
}

TEST_F(AbstractViewTest, SetDewarpedSizeOnANewObjectCallsOnSizeChangeThoughTheSizesCompareEqual) {
    Resolution const invalid(Vector2d::InvalidVector);
    ASSERT_TRUE(invalid == view.GetDewarpedSize());  // NaN sizes compare equal
    view.SetDewarpedSize(invalid);
    EXPECT_THAT(view.calls, ElementsAre("OnSizeChange"));

    RecordingView empty(traits, camera, DEWARP_PROJECTION_CYLINDRICAL, Resolution(0, 0));
    empty.SetDewarpedSize(Resolution(0, 0));  // equal, but not a valid size
    EXPECT_THAT(empty.calls, ElementsAre("OnSizeChange"));
}

TEST_F(AbstractViewTest, SetDewarpedSizeWithTheSizeAlreadySetChangesNothing) {
    view.SetDewarpedSize(Resolution(640, 480));
    EXPECT_THAT(view.calls, ElementsAre("OnSizeChange"));
    view.SetDewarpedSize(Resolution(640, 480));
    EXPECT_THAT(view.calls, ElementsAre("OnSizeChange"));
}

TEST_F(AbstractViewTest, SetDewarpedSizeHandsTheLiveOldSizeToOnSizeChange) {
    view.SetDewarpedSize(Resolution(640, 480));
    view.SetDewarpedSize(Resolution(800, 600));
    EXPECT_THAT(view.calls, ElementsAre("OnSizeChange", "OnSizeChange"));
    EXPECT_EQ(Resolution(640, 480), view.seen_old_size);
    EXPECT_EQ(Resolution(800, 600), view.seen_new_size);
    EXPECT_TRUE(view.old_was_live);  // so it must be read before the base stores the new one
    EXPECT_EQ(Resolution(800, 600), view.GetDewarpedSize());
}

TEST_F(AbstractViewTest, SetDewarpedSizeAndRatioWithTheSameOfBothChangesNothing) {
    view.SetDewarpedSize(Resolution(640, 480));
    view.calls.clear();
    view.SetDewarpedSize(Resolution(640, 480), DEWARP_ASPECT_RATIO_STRETCH);
    EXPECT_THAT(view.calls, IsEmpty());
}

TEST_F(AbstractViewTest, SetDewarpedSizeAndRatioWithTheSameSizeOnlyChangesTheRatio) {
    view.SetDewarpedSize(Resolution(640, 480));
    view.calls.clear();
    view.SetDewarpedSize(Resolution(640, 480), DEWARP_ASPECT_RATIO_FILL);
    EXPECT_THAT(view.calls, ElementsAre("OnAspectRatioChange"));
    EXPECT_EQ(DEWARP_ASPECT_RATIO_STRETCH, view.seen_old_ratio);
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FILL, view.GetAspectRatio());
}

TEST_F(AbstractViewTest, SetDewarpedSizeAndRatioWithANewSizeAndTheSameRatioCallsOnSizeChange) {
    view.SetDewarpedSize(Resolution(640, 480));
    view.calls.clear();
    view.SetDewarpedSize(Resolution(800, 600), DEWARP_ASPECT_RATIO_STRETCH);
    EXPECT_THAT(view.calls, ElementsAre("OnSizeChange"));
    EXPECT_EQ(Resolution(800, 600), view.GetDewarpedSize());
}

TEST_F(AbstractViewTest, SetDewarpedSizeAndRatioWithBothNewCallsOnOutputChange) {
    view.SetDewarpedSize(Resolution(640, 480));
    view.calls.clear();
    view.SetDewarpedSize(Resolution(800, 600), DEWARP_ASPECT_RATIO_FIT);
    EXPECT_THAT(view.calls, ElementsAre("OnOutputChange"));
    EXPECT_EQ(Resolution(640, 480), view.seen_old_size);
    EXPECT_EQ(DEWARP_ASPECT_RATIO_STRETCH, view.seen_old_ratio);
    EXPECT_EQ(Resolution(800, 600), view.seen_new_size);
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FIT, view.seen_new_ratio);
    EXPECT_TRUE(view.old_was_live);
    EXPECT_EQ(Resolution(800, 600), view.GetDewarpedSize());
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FIT, view.GetAspectRatio());
}

TEST_F(AbstractViewTest, SetDewarpedSizeAndRatioOnANewObjectCountsTheSizeAsNew) {
    Resolution const invalid(Vector2d::InvalidVector);
    view.SetDewarpedSize(invalid, DEWARP_ASPECT_RATIO_STRETCH);
    EXPECT_THAT(view.calls, ElementsAre("OnSizeChange"));
    RecordingView other(traits, camera, DEWARP_PROJECTION_CYLINDRICAL);
    other.SetDewarpedSize(invalid, DEWARP_ASPECT_RATIO_FIT);
    EXPECT_THAT(other.calls, ElementsAre("OnOutputChange"));
}

// PTZ position

TEST_F(AbstractViewTest, SetPtzWithThePositionThatGetPtzReturnsCallsNothing) {
    view.SetPtz(view.GetPtz());
    EXPECT_THAT(view.calls, IsEmpty());
    view.SetPtz(Position(0.3f, 0.1f, 0.0f, 2.0f));
    view.calls.clear();
    view.SetPtz(view.GetPtz());
    EXPECT_THAT(view.calls, IsEmpty());
}

TEST_F(AbstractViewTest, SetPtzWithAnotherZoomOnlyCallsOnZoomChange) {
    view.SetPtz(Position(0.0f, 0.0f, 0.0f, 2.0f));
    EXPECT_THAT(view.calls, ElementsAre("OnZoomChange"));
    EXPECT_EQ(2.0f, view.GetPtz().zoom);
}

TEST_F(AbstractViewTest, SetPtzWithAnotherPanOnlyCallsOnOrientationChange) {
    view.SetPtz(Position(0.1f, 0.0f, 0.0f, 1.0f));
    EXPECT_THAT(view.calls, ElementsAre("OnOrientationChange"));
    EXPECT_EQ(0.1f, view.GetPtz().orientation.pan);
}

TEST_F(AbstractViewTest, SetPtzWithAnotherPanAndZoomCallsOnPtzChangeAlone) {
    view.SetPtz(Position(0.1f, 0.0f, 0.0f, 2.0f));
    EXPECT_THAT(view.calls, ElementsAre("OnPtzChange"));
    ExpectPosition(Position(0.1f, 0.0f, 0.0f, 2.0f), view.GetPtz());
}

TEST_F(AbstractViewTest, SetPtzHandsTheLiveOldPositionAndTheLimitedNewOne) {
    view.SetPtz(Position(5.0f, 0.0f, 0.0f, 2.0f));
    ASSERT_THAT(view.calls, ElementsAre("OnPtzChange"));
    EXPECT_EQ(1.0f, view.seen_old_ptz.zoom);
    EXPECT_EQ(0.0f, view.seen_old_ptz.orientation.pan);
    EXPECT_TRUE(view.old_was_live);
    EXPECT_NEAR(1.0f - 0.4f / 2.0f, view.seen_new_ptz.orientation.pan, RADIAN_TOLERANCE);
}

TEST_F(AbstractViewTest, SetPtzReturnsTheStoredPosition) {
    PtzPosition const& stored = view.SetPtz(Position(0.1f, 0.1f, 0.0f, 2.0f));
    EXPECT_EQ(&view.GetPtz(), &stored);
}

TEST_F(AbstractViewTest, SetPtzRaisesAZoomBelowTheRangeToItsLowerLimit) {
    PtzPosition const& stored = view.SetPtz(Position(0.0f, 0.0f, 0.0f, 0.25f));
    EXPECT_EQ(0.5f, stored.zoom);
    EXPECT_EQ(0.5f, view.GetPtz().zoom);
}

TEST_F(AbstractViewTest, SetPtzCountsANanZoomAsAChangeEveryTime) {
    view.SetPtz(Position(0.0f, 0.0f, 0.0f, FloatingPoint::Nan));
    ASSERT_TRUE(FloatingPoint::is_nan(view.GetPtz().zoom));
    view.calls.clear();
    view.SetPtz(view.GetPtz());
    EXPECT_THAT(view.calls, ElementsAre("OnZoomChange"));  // no tolerance, and NaN differs
}

TEST(AbstractView, SetPtzOnACeilingStopsTheTiltWhereHalfTheViewLiesInside) {
    RecordingView view(Ptz(), MakeCamera(CEILING), DEWARP_PROJECTION_RECTILINEAR);
    float const vertical = view.GetFieldOfView().vertical;
    ASSERT_EQ(Trigonometry::HALF_PI, vertical);  // the PTZ target, which the map covers
    float const zoom = 2.0f;
    float const half_seen = vertical / zoom * 0.5f;
    // The range of the traits is the ceiling's widened by half the view's own field.
    float const upper = Trigonometry::QUARTER_PI * 0.5f + vertical * 0.5f;
    float const lower = -Trigonometry::THREE_QUARTERS_PI - vertical * 0.5f;

    PtzPosition const high = view.SetPtz(Position(0.0f, 1.5f, 0.0f, zoom));
    EXPECT_NEAR(upper - half_seen, high.orientation.tilt, RADIAN_TOLERANCE);
    EXPECT_NEAR(upper, high.orientation.tilt + half_seen, RADIAN_TOLERANCE);

    PtzPosition const low = view.SetPtz(Position(0.0f, -3.0f, 0.0f, zoom));
    EXPECT_NEAR(lower + half_seen, low.orientation.tilt, RADIAN_TOLERANCE);

    // At zoom 1 the picture's edge stops where the ceiling's own range ends.
    PtzPosition const natural = view.SetPtz(Position(0.0f, 1.5f, 0.0f, 1.0f));
    EXPECT_NEAR(Trigonometry::QUARTER_PI * 0.5f, natural.orientation.tilt, RADIAN_TOLERANCE);
}

TEST_F(AbstractViewTest, LimitPtzNarrowsTheRangeByWhatThePictureCoversAtItsZoom) {
    ExpectPosition(Position(1.0f - 0.2f, 0.5f - 0.15f, Trigonometry::PI, 2.0f),
                   view.LimitPtz(Position(2.0f, 2.0f, 5.0f, 2.0f)));
    ExpectPosition(Position(-0.6f + 0.2f, -0.5f + 0.15f, -Trigonometry::PI, 2.0f),
                   view.LimitPtz(Position(-2.0f, -2.0f, -5.0f, 2.0f)));
    ExpectPosition(Position(0.1f, -0.1f, 0.3f, 2.0f),
                   view.LimitPtz(Position(0.1f, -0.1f, 0.3f, 2.0f)));
}

TEST_F(AbstractViewTest, LimitPtzNarrowsByTheFieldAtTheLimitedZoom) {
    // Zoom 20 is held at 8, and a picture an eighth of the field wide is what stops at the edge.
    ExpectPosition(Position(1.0f - 0.05f, 0.5f - 0.0375f, 0.0f, 8.0f),
                   view.LimitPtz(Position(2.0f, 2.0f, 0.0f, 20.0f)));
}

TEST_F(AbstractViewTest, LimitPtzCentresAPictureWiderThanTheRange) {
    // At zoom 0.5 the picture is 1.6 by 1.2: as wide as the pan range, taller than the tilt's.
    ExpectPosition(Position(0.2f, 0.0f, 0.0f, 0.5f),
                   view.LimitPtz(Position(0.9f, 0.4f, 0.0f, 0.5f)));
}

TEST_F(AbstractViewTest, LimitPtzLeavesTheViewsPositionAlone) {
    view.LimitPtz(Position(2.0f, 2.0f, 0.0f, 4.0f));
    EXPECT_THAT(view.calls, IsEmpty());
    EXPECT_EQ(1.0f, view.GetPtz().zoom);
}

TEST_F(AbstractViewTest, BestZoomFitsHalfThePictureIntoTheRoomToTheNearerLimit) {
    // Pan 0.6 has 0.4 to spare, tilt 0.3 has 0.2: the tilt decides, 0.3 / 0.2.
    EXPECT_NEAR(1.5f, view.BestZoom(Position(0.6f, 0.3f, 0.0f, 1.0f)), ZOOM_TOLERANCE);
    // Pan 0.9 has 0.1 to spare: the pan decides, 0.4 / 0.1.
    EXPECT_NEAR(4.0f, view.BestZoom(Position(0.9f, 0.0f, 0.0f, 1.0f)), ZOOM_TOLERANCE);
    // Pan -0.4 has 0.2 to spare below.
    EXPECT_NEAR(2.0f, view.BestZoom(Position(-0.4f, 0.0f, 0.0f, 1.0f)), ZOOM_TOLERANCE);
    // At the centre of the tilt range both ways are equal: 0.3 / 0.5.
    EXPECT_NEAR(0.6f, view.BestZoom(Position(0.2f, 0.0f, 0.0f, 1.0f)), ZOOM_TOLERANCE);
}

TEST_F(AbstractViewTest, BestZoomStaysInsideTheZoomRange) {
    EXPECT_EQ(8.0f, view.BestZoom(Position(0.98f, 0.0f, 0.0f, 1.0f)));
}

TEST_F(AbstractViewTest, CalcPtzPositionLooksAtTheHitPointAtTheBestZoom) {
    Vector2d const hit = camera->MapHitPoint(CENTRE_POINT);
    ASSERT_NEAR(0.0f, hit.x, RADIAN_TOLERANCE);
    ASSERT_NEAR(0.0f, hit.y, RADIAN_TOLERANCE);
    // At pan 0 the nearer pan limit is 0.6 away: 0.4 / 0.6 beats the tilt's 0.3 / 0.5.
    ExpectPosition(Position(0.0f, 0.0f, 0.0f, 0.4f / 0.6f),
                   view.CalcPtzPosition(CENTRE_POINT, 4.0f));
}

TEST_F(AbstractViewTest, CalcPtzPositionLimitsAHitBeyondTheRange) {
    Vector2d const hit = camera->MapHitPoint(EAST_POINT);
    ASSERT_GT(hit.x, 1.0f);
    ASSERT_NEAR(0.0f, hit.y, RADIAN_TOLERANCE);
    float const zoom = 1.5f;
    PtzPosition const result = view.CalcPtzPosition(EAST_POINT, zoom);
    EXPECT_NEAR(1.0f - 0.4f / zoom, result.orientation.pan, RADIAN_TOLERANCE);
    EXPECT_NEAR(0.0f, result.orientation.tilt, RADIAN_TOLERANCE);
    // Limited so that the edge touches, the picture is already at its best zoom.
    EXPECT_NEAR(zoom, result.zoom, ZOOM_TOLERANCE);
}

TEST_F(AbstractViewTest, CalcPtzPositionKeepsARequestedZoomBelowTheBestAsItIs) {
    // The position is limited at zoom 0.5, but the zoom is the caller's, not the limited one.
    PtzPosition const result = view.CalcPtzPosition(CENTRE_POINT, 0.25f);
    EXPECT_EQ(0.25f, result.zoom);
    EXPECT_NEAR(0.2f, result.orientation.pan, RADIAN_TOLERANCE);
    EXPECT_NEAR(0.0f, result.orientation.tilt, RADIAN_TOLERANCE);
}

TEST_F(AbstractViewTest, CalcPtzPositionLeavesTheViewsPositionAlone) {
    view.CalcPtzPosition(EAST_POINT, 2.0f);
    EXPECT_THAT(view.calls, IsEmpty());
    ExpectPosition(PtzPosition::Identity, view.GetPtz());
}

TEST_F(AbstractViewTest, ResetPtzAfterZoomingInGivesZoomOneAndOrientationZero) {
    view.SetPtz(Position(0.3f, 0.1f, 0.0f, 4.0f));
    view.calls.clear();
    PtzPosition const& reset = view.ResetPtz();
    EXPECT_THAT(view.calls, ElementsAre("OnPtzChange"));
    EXPECT_EQ(&view.GetPtz(), &reset);
    EXPECT_EQ(0.0f, reset.orientation.pan);
    EXPECT_EQ(0.0f, reset.orientation.tilt);
    EXPECT_EQ(0.0f, reset.orientation.roll);
    EXPECT_EQ(1.0f, reset.zoom);
}

TEST_F(AbstractViewTest, ResetPtzLimitsZoomOneAndOrientationZeroToTheRange) {
    // Tilt from 0.4 to 1.2 and zoom from 2 to 8: neither the identity's tilt nor its zoom fits.
    PtzRange const raised(PtzRange::FullMotion, Vector2d(1.2f, 0.4f), PtzRange::FullMotion,
                          Vector2d(8.0f, 2.0f), PtzRange::ZeroFlags);
    RecordingView lifted(boost::shared_ptr<ViewTraits const>(new FixedTraits(Field(), raised)),
                         camera, DEWARP_PROJECTION_CYLINDRICAL);
    lifted.SetPtz(Position(0.3f, 0.8f, 0.0f, 4.0f));
    PtzPosition const reset = lifted.ResetPtz();
    // At zoom 2 the picture is 0.3 high, so its centre stops 0.15 inside the lower limit.
    ExpectPosition(Position(0.0f, 0.4f + 0.15f, 0.0f, 2.0f), reset);
}

TEST_F(AbstractViewTest, GetPtzRangeAsksTheTraitsWithTheCameraAndTheViewsField) {
    PtzRange const range = view.GetPtzRange();
    EXPECT_EQ(camera.get(), traits->asked_camera);
    EXPECT_EQ(view.GetFieldOfView().horizontal, traits->asked_field.horizontal);
    EXPECT_EQ(view.GetFieldOfView().vertical, traits->asked_field.vertical);
    EXPECT_EQ(Range().pan, range.pan);
    EXPECT_EQ(Range().zoom, range.zoom);
}

TEST(AbstractView, SetPtzOnAPanoramaEndsWithZoomZeroAndTheTiltUnchanged) {
    RecordingView ceiling(MakeCamera(CEILING));
    PtzPosition const turned = ceiling.SetPtz(Position(0.5f, 0.3f, 0.0f, 2.0f));
    EXPECT_EQ(0.0f, turned.zoom);
    EXPECT_EQ(0.5f, turned.orientation.pan);  // a panorama looking up or down turns in pan
    EXPECT_EQ(0.3f, turned.orientation.tilt);

    RecordingView wall(MakeCamera(WALL));
    PtzPosition const rolled = wall.SetPtz(Position(0.0f, 0.3f, 0.7f, 1.0f));
    EXPECT_EQ(0.0f, rolled.zoom);
    EXPECT_EQ(0.7f, rolled.orientation.roll);  // and on a wall in roll
    EXPECT_EQ(0.3f, rolled.orientation.tilt);
    EXPECT_THAT(wall.calls, ElementsAre("OnPtzChange"));

    wall.calls.clear();
    wall.SetPtz(wall.GetPtz());
    EXPECT_THAT(wall.calls, IsEmpty());
    wall.ResetPtz();
    EXPECT_EQ(0.0f, wall.GetPtz().zoom);
}

// Crop size

TEST_F(AbstractViewTest, GetCropSizeOfFitIsTheLargestPictureOfTheProjectionsShape) {
    float const shape = view.GetProjectionSize().x / view.GetProjectionSize().y;
    ASSERT_LT(shape, 800.0f / 600.0f);  // the output is wider: the height decides
    view.SetDewarpedSize(Resolution(800, 600), DEWARP_ASPECT_RATIO_FIT);
    Vector2d const crop = view.GetCropSize();
    EXPECT_NEAR(600.0f * shape, crop.x, PIXEL_TOLERANCE);
    EXPECT_EQ(600.0f, crop.y);

    view.SetDewarpedSize(Resolution(400, 600));  // narrower: the width decides
    Vector2d const narrow = view.GetCropSize();
    EXPECT_EQ(400.0f, narrow.x);
    EXPECT_NEAR(400.0f / shape, narrow.y, PIXEL_TOLERANCE);
}

TEST_F(AbstractViewTest, GetCropSizeOfFitWidthFitsAnOutputNarrowerThanThePicture) {
    float const shape = view.GetProjectionSize().x / view.GetProjectionSize().y;
    ASSERT_GT(shape, 400.0f / 600.0f);
    view.SetDewarpedSize(Resolution(400, 600), DEWARP_ASPECT_RATIO_FIT_WIDTH);
    Vector2d const crop = view.GetCropSize();
    EXPECT_EQ(400.0f, crop.x);
    EXPECT_NEAR(400.0f / shape, crop.y, PIXEL_TOLERANCE);
}

TEST_F(AbstractViewTest, GetCropSizeOfFitWidthIsAWiderOutputItself) {
    float const shape = view.GetProjectionSize().x / view.GetProjectionSize().y;
    ASSERT_LT(shape, 1600.0f / 400.0f);
    view.SetDewarpedSize(Resolution(1600, 400), DEWARP_ASPECT_RATIO_FIT_WIDTH);
    EXPECT_EQ(Vector2d(1600.0f, 400.0f), view.GetCropSize());
}

TEST_F(AbstractViewTest, GetCropSizeOfFillOrStretchIsTheOutputSize) {
    for (_DEWARP_ASPECT_RATIO const ratio :
         {DEWARP_ASPECT_RATIO_FILL, DEWARP_ASPECT_RATIO_STRETCH}) {
        for (Resolution const& output : {Resolution(800, 600), Resolution(400, 600)}) {
            view.SetDewarpedSize(output, ratio);
            Vector2d const crop = view.GetCropSize();
            EXPECT_EQ(output.x, crop.x) << ratio;
            EXPECT_EQ(output.y, crop.y) << ratio;
        }
    }
}

// Copies

TEST_F(AbstractViewTest, CopySharesTraitsAndCameraAndCopiesEveryField) {
    RecordingView source(traits, camera, DEWARP_PROJECTION_EQUIRECTANGULAR, Resolution(640, 480),
                         DEWARP_ASPECT_RATIO_FIT_WIDTH);
    source.SetPtz(Position(0.1f, 0.05f, 0.0f, 2.0f));
    long const cameras = camera.use_count();
    long const traits_references = traits.use_count();
    RecordingView const copy(source);
    EXPECT_EQ(cameras + 1, camera.use_count());
    EXPECT_EQ(traits_references + 1, traits.use_count());
    EXPECT_EQ(&source.GetCamera(), &copy.GetCamera());
    EXPECT_EQ(&source.GetTraits(), &copy.GetTraits());
    EXPECT_EQ(DEWARP_PROJECTION_EQUIRECTANGULAR, copy.GetProjection());
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FIT_WIDTH, copy.GetAspectRatio());
    EXPECT_EQ(Resolution(640, 480), copy.GetDewarpedSize());
    EXPECT_EQ(source.GetProjectionSize(), copy.GetProjectionSize());
    EXPECT_EQ(source.GetFieldOfView().horizontal, copy.GetFieldOfView().horizontal);
    EXPECT_EQ(source.GetFieldOfView().vertical, copy.GetFieldOfView().vertical);
    ExpectPosition(source.GetPtz(), copy.GetPtz());
}

TEST_F(AbstractViewTest, AssignmentCopiesEveryField) {
    RecordingView source(traits, camera, DEWARP_PROJECTION_EQUIRECTANGULAR, Resolution(640, 480),
                         DEWARP_ASPECT_RATIO_FIT_WIDTH);
    source.SetPtz(Position(0.1f, 0.05f, 0.0f, 2.0f));
    RecordingView target(MakeCamera(CEILING));
    static_cast<AbstractView&>(target) = source;
    EXPECT_EQ(camera.get(), &target.GetCamera());
    EXPECT_EQ(traits.get(), &target.GetTraits());
    EXPECT_EQ(DEWARP_PROJECTION_EQUIRECTANGULAR, target.GetProjection());
    EXPECT_EQ(DEWARP_ASPECT_RATIO_FIT_WIDTH, target.GetAspectRatio());
    EXPECT_EQ(Resolution(640, 480), target.GetDewarpedSize());
    EXPECT_EQ(source.GetProjectionSize(), target.GetProjectionSize());
    EXPECT_EQ(source.GetFieldOfView().horizontal, target.GetFieldOfView().horizontal);
    EXPECT_EQ(source.GetFieldOfView().vertical, target.GetFieldOfView().vertical);
    ExpectPosition(source.GetPtz(), target.GetPtz());
    EXPECT_THAT(target.calls, IsEmpty());  // a copy is no change
}

TEST_F(AbstractViewTest, AssignmentToItselfWarnsAndCopiesNothing) {
    view.SetDewarpedSize(Resolution(640, 480));
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    AbstractView& same = view;
    static_cast<AbstractView&>(view) = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of AbstractView object\n", lines[0].text);
    EXPECT_EQ(Resolution(640, 480), view.GetDewarpedSize());
    EXPECT_EQ(camera.get(), &view.GetCamera());
}

}  // namespace
}  // namespace quorvel::vexmap
