#include <cmath>
#include <cstdint>
#include <limits>
#include <ostream>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/projection.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

using testing::DoubleNear;
using testing::Not;

// A float formula of a few operations against the same formula in double, relative to the value.
constexpr double RELATIVE_TOLERANCE = 4e-6;
constexpr double PI_DOUBLE = 3.14159265358979323846;

uint32_t Bits(float value) {
    return __builtin_bit_cast(uint32_t, value);
}

// Equal bit for bit, or NaN both.
bool SameFloat(float a, float b) {
    return (std::isnan(a) && std::isnan(b)) || Bits(a) == Bits(b);
}

testing::Matcher<double> Near(double expected) {
    return DoubleNear(expected, RELATIVE_TOLERANCE * std::fabs(expected));
}

struct Pair {
    double x;
    double y;
};

double Square(double value) {
    return value * value;
}

TEST(Projection, ZeroShiftIsZero) {
    EXPECT_EQ(0x00000000u, Bits(Projection::ZeroShift.x));
    EXPECT_EQ(0x00000000u, Bits(Projection::ZeroShift.y));
}

TEST(Projection, IdentityScaleHoldsZerosNotOnes) {
    EXPECT_EQ(0x00000000u, Bits(Projection::IdentityScale.x));
    EXPECT_EQ(0x00000000u, Bits(Projection::IdentityScale.y));
}

TEST(Projection, CopiesAndAssignmentsAreSilent) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    Projection projection;
    Projection const copy(projection);
    EXPECT_EQ(&projection, &(projection = copy));
    EXPECT_EQ(0u, sink.Count());
}

TEST(Projection, AssignmentToItselfWarnsOnce) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Projection projection;
    Projection const& same = projection;
    EXPECT_EQ(&projection, &(projection = same));
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of %s object\n", lines[0].format);
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of Projection object\n", lines[0].text);
}

struct NameRow {
    _DEWARP_PROJECTION projection;
    char const* name;
};

void PrintTo(NameRow const& row, std::ostream* out) {
    *out << int(row.projection) << " \"" << row.name << '"';
}

class ProjectionNameTest : public testing::TestWithParam<NameRow> {};

TEST_P(ProjectionNameTest, IsSpelledAsTheInterfaceReportsItAndSaysNothing) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    EXPECT_EQ(GetParam().name, Projection::GetName(GetParam().projection));
    EXPECT_EQ(0u, sink.Count());
}

INSTANTIATE_TEST_SUITE_P(
    , ProjectionNameTest,
    testing::Values(NameRow{DEWARP_PROJECTION_RECTILINEAR, "rectilinear"},
                    NameRow{DEWARP_PROJECTION_CYLINDRICAL, "cylindical"},
                    NameRow{DEWARP_PROJECTION_EQUIRECTANGULAR, "equirectangular"},
                    NameRow{DEWARP_PROJECTION_MERCATOR, "mercator"},
                    NameRow{DEWARP_PROJECTION_LAMBERT_CYLINDRICAL, "lambert cylindrical"},
                    NameRow{DEWARP_PROJECTION_MILLER_CYLINDRICAL, "miller cyclindrical"},
                    NameRow{DEWARP_PROJECTION_PANNINI, "pannini"},
                    NameRow{DEWARP_PROJECTION_ARCHITECTURAL, "architectural"},
                    NameRow{DEWARP_PROJECTION_EQUIRECTANGULAR_PANNINI, "equirectangular pannini"}),
    [](testing::TestParamInfo<NameRow> const& param_info) {
        std::string name;
        bool capital = true;
        for (char const* letter = param_info.param.name; *letter != '\0'; ++letter) {
            if (*letter == ' ') {
                capital = true;
            } else {
                name += capital ? char(*letter - 'a' + 'A') : *letter;
                capital = false;
            }
        }
        return name;
    });

TEST(Projection, CylindricalAndMillerNamesKeepTheSpellingHostsAlreadySee) {
    EXPECT_EQ("cylindical", Projection::GetName(DEWARP_PROJECTION_CYLINDRICAL));
    EXPECT_EQ("miller cyclindrical", Projection::GetName(DEWARP_PROJECTION_MILLER_CYLINDRICAL));
}

TEST(Projection, NameOfAnUnknownProjectionIsUnknownWithOneWarning) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    EXPECT_EQ("<unknown>", Projection::GetName(static_cast<_DEWARP_PROJECTION>(9)));
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Unable to get the name of an unknown projection\n", lines[0].text);
}

TEST(Projection, NameOfANegativeProjectionIsUnknownToo) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    EXPECT_EQ("<unknown>", Projection::GetName(static_cast<_DEWARP_PROJECTION>(-1)));
    EXPECT_EQ(1u, sink.Count());
}

// Focal length family: r pixels at the angle a.

struct FocalLengthRow {
    char const* name;
    float (*function)(float r, float a);
    double (*closed_form)(double r, double a);
};

void PrintTo(FocalLengthRow const& row, std::ostream* out) {
    *out << row.name;
}

class ProjectionFocalLengthTest : public testing::TestWithParam<FocalLengthRow> {};

TEST_P(ProjectionFocalLengthTest, MatchesItsClosedForm) {
    for (float const r : {320.0f, 960.0f, 17.5f}) {
        for (float const a : {0.2f, 0.7f, 1.2f}) {
            EXPECT_THAT(double(GetParam().function(r, a)),
                        Near(GetParam().closed_form(double(r), double(a))))
                << "r " << r << ", a " << a;
        }
    }
}

double AngularFocalLength(double r, double a) {
    return r / a;
}

double HalfAngleTangentFocalLength(double r, double a) {
    return r / (2.0 * std::tan(a / 2.0));
}

INSTANTIATE_TEST_SUITE_P(
    , ProjectionFocalLengthTest,
    testing::Values(
        FocalLengthRow{"Rectilinear", &Projection::RectilinearFocalLength,
                       [](double r, double a) { return r / std::tan(a); }},
        FocalLengthRow{"Stereographic", &Projection::StereographicFocalLength,
                       &HalfAngleTangentFocalLength},
        FocalLengthRow{"Orthographic", &Projection::OrthographicFocalLength,
                       [](double r, double a) { return r / std::sin(a); }},
        FocalLengthRow{"Equisolid", &Projection::EquisolidFocalLength,
                       [](double r, double a) { return r / (2.0 * std::sin(a / 2.0)); }},
        FocalLengthRow{"Fisheye", &Projection::FisheyeFocalLength, &AngularFocalLength},
        FocalLengthRow{"Equirectangular", &Projection::EquirectangularFocalLength,
                       &AngularFocalLength},
        FocalLengthRow{"Cylindrical", &Projection::CylindricalFocalLength, &AngularFocalLength},
        FocalLengthRow{"Mercator", &Projection::MercatorFocalLength, &AngularFocalLength},
        FocalLengthRow{"LambertCylindrical", &Projection::LambertCylindricalFocalLength,
                       &AngularFocalLength},
        FocalLengthRow{"MillerCylindrical", &Projection::MillerCylindricalFocalLength,
                       &AngularFocalLength},
        FocalLengthRow{"Architectural", &Projection::ArchitecturalFocalLength, &AngularFocalLength},
        FocalLengthRow{"Pannini", &Projection::PanniniFocalLength, &HalfAngleTangentFocalLength},
        FocalLengthRow{"EquirectangularPannini", &Projection::EquirectangularPanniniFocalLength,
                       &HalfAngleTangentFocalLength}),
    [](testing::TestParamInfo<FocalLengthRow> const& param_info) { return param_info.param.name; });

TEST(Projection, RectilinearFocalLengthAtTheFloatHalfPiIsATinyNegativeNumber) {
    // The float HALF_PI lies just past pi/2, where the tangent is huge and negative.
    float const f = Projection::RectilinearFocalLength(1000.0f, Trigonometry::HALF_PI);
    EXPECT_LT(f, 0.0f);
    EXPECT_GT(f, -1e-3f);
    EXPECT_THAT(double(f), Near(1000.0 / std::tan(double(Trigonometry::HALF_PI))));
}

TEST(Projection, PanniniFocalLengthEqualsStereographicFocalLengthForAllArguments) {
    std::vector<float> const values = {0.0f,
                                       -0.0f,
                                       1e-30f,
                                       0.25f,
                                       -0.7f,
                                       1.0f,
                                       Trigonometry::HALF_PI,
                                       Trigonometry::PI,
                                       -Trigonometry::TWO_PI,
                                       3.0f,
                                       480.0f,
                                       -1920.0f,
                                       1e30f,
                                       std::numeric_limits<float>::infinity(),
                                       -std::numeric_limits<float>::infinity(),
                                       std::numeric_limits<float>::quiet_NaN()};
    for (float const r : values) {
        for (float const a : values) {
            float const pannini = Projection::PanniniFocalLength(r, a);
            float const stereographic = Projection::StereographicFocalLength(r, a);
            EXPECT_TRUE(SameFloat(stereographic, pannini))
                << "r " << r << ", a " << a << ": " << pannini << " against " << stereographic;
        }
    }
}

// Field of view family: a whole resolution at the focal length f.

struct FieldOfViewRow {
    char const* name;
    Vector2d (*function)(Vector2d const& resolution, float f);
    Pair (*closed_form)(double rx, double ry, double f);
};

void PrintTo(FieldOfViewRow const& row, std::ostream* out) {
    *out << row.name;
}

class ProjectionFieldOfViewTest : public testing::TestWithParam<FieldOfViewRow> {};

TEST_P(ProjectionFieldOfViewTest, MatchesItsClosedForm) {
    for (Vector2d const& resolution :
         {Vector2d(400.0f, 300.0f), Vector2d(240.0f, 450.0f), Vector2d(96.0f, 54.0f)}) {
        for (float const f : {500.0f, 1100.0f}) {
            Vector2d const fov = GetParam().function(resolution, f);
            Pair const expected =
                GetParam().closed_form(double(resolution.x), double(resolution.y), double(f));
            EXPECT_THAT(double(fov.x), Near(expected.x))
                << resolution.x << " x " << resolution.y << " at " << f;
            EXPECT_THAT(double(fov.y), Near(expected.y))
                << resolution.x << " x " << resolution.y << " at " << f;
        }
    }
}

Pair AngularFieldOfView(double rx, double ry, double f) {
    return {rx / f, ry / f};
}

double MillerFieldOfView(double ry, double f) {
    return 2.5 * std::atan(std::sinh(0.8 * ry / 2.0 / f));
}

double LambertFieldOfView(double ry, double f) {
    return 2.0 * std::asin(ry / 2.0 / f);
}

INSTANTIATE_TEST_SUITE_P(
    , ProjectionFieldOfViewTest,
    testing::Values(
        FieldOfViewRow{
            "Rectilinear", &Projection::RectilinearFieldOfView,
            [](double rx, double ry, double f) {
                return Pair{2.0 * std::atan(rx / 2.0 / f), 2.0 * std::atan(ry / 2.0 / f)};
            }},
        FieldOfViewRow{"Stereographic", &Projection::StereographicFieldOfView,
                       [](double rx, double ry, double f) {
                           return Pair{4.0 * std::atan(rx / f), 4.0 * std::atan(ry / f)};
                       }},
        FieldOfViewRow{
            "Orthographic", &Projection::OrthographicFieldOfView,
            [](double rx, double ry, double f) {
                return Pair{2.0 * std::asin(rx / 2.0 / f), 2.0 * std::asin(ry / 2.0 / f)};
            }},
        FieldOfViewRow{"Equisolid", &Projection::EquisolidFieldOfView,
                       [](double rx, double ry, double f) {
                           return Pair{4.0 * std::asin(rx / f), 4.0 * std::asin(ry / f)};
                       }},
        FieldOfViewRow{"Fisheye", &Projection::FisheyeFieldOfView, &AngularFieldOfView},
        FieldOfViewRow{"Equirectangular", &Projection::EquirectangularFieldOfView,
                       &AngularFieldOfView},
        FieldOfViewRow{"Cylindrical", &Projection::CylindricalFieldOfView,
                       [](double rx, double ry, double f) {
                           return Pair{rx / f, 2.0 * std::atan(ry / 2.0 / f)};
                       }},
        FieldOfViewRow{"Mercator", &Projection::MercatorFieldOfView,
                       [](double rx, double ry, double f) {
                           // The Gudermannian of the half height, twice.
                           return Pair{rx / f, 2.0 * (2.0 * std::atan(std::exp(ry / 2.0 / f)) -
                                                      PI_DOUBLE / 2.0)};
                       }},
        FieldOfViewRow{"LambertCylindrical", &Projection::LambertCylindricalFieldOfView,
                       [](double rx, double ry, double f) {
                           return Pair{rx / f, LambertFieldOfView(ry, f)};
                       }},
        FieldOfViewRow{"MillerCylindrical", &Projection::MillerCylindricalFieldOfView,
                       [](double rx, double ry, double f) {
                           return Pair{rx / f, MillerFieldOfView(ry, f)};
                       }},
        FieldOfViewRow{
            "Architectural", &Projection::ArchitecturalFieldOfView,
            [](double rx, double ry, double f) {
                return Pair{rx / f, (MillerFieldOfView(ry, f) + LambertFieldOfView(ry, f)) / 2.0};
            }},
        FieldOfViewRow{
            "Pannini", &Projection::PanniniFieldOfView,
            [](double rx, double ry, double f) {
                double const quarter = std::atan(rx / 4.0 / f);
                return Pair{4.0 * quarter,
                            2.0 * std::atan(std::atan(ry / 2.0 / (f * Square(std::cos(quarter)))))};
            }},
        FieldOfViewRow{"EquirectangularPannini", &Projection::EquirectangularPanniniFieldOfView,
                       [](double rx, double ry, double f) {
                           double const quarter = std::atan(rx / 4.0 / f);
                           return Pair{4.0 * quarter,
                                       2.0 * std::atan(ry / 2.0 / (f * Square(std::cos(quarter))))};
                       }}),
    [](testing::TestParamInfo<FieldOfViewRow> const& param_info) { return param_info.param.name; });

TEST(Projection, OrthographicFieldOfViewBeyondTwiceTheFocalLengthSaturatesAtExactlyHalfATurn) {
    // An orthographic picture shows at most a hemisphere: the arcsine saturates at HALF_PI, and
    // twice that is the float PI exactly, never NaN.
    Vector2d const fov = Projection::OrthographicFieldOfView(Vector2d(1250.0f, 5000.0f), 500.0f);
    EXPECT_EQ(2.0f * Trigonometry::HALF_PI, fov.x);
    EXPECT_EQ(Trigonometry::PI, fov.x);
    EXPECT_EQ(Trigonometry::PI, fov.y);
}

TEST(Projection, EquisolidFieldOfViewBeyondTheFocalLengthSaturatesAtExactlyAWholeTurn) {
    Vector2d const fov = Projection::EquisolidFieldOfView(Vector2d(600.0f, 90.0f), 500.0f);
    EXPECT_EQ(Trigonometry::TWO_PI, fov.x);
    EXPECT_FALSE(std::isnan(fov.y));
}

TEST(Projection, EachFieldOfViewComponentDependsOnItsOwnSizeExceptPanniniVertical) {
    float const f = 700.0f;
    Vector2d const narrow(200.0f, 300.0f);
    Vector2d const wide(900.0f, 300.0f);
    EXPECT_EQ(Projection::RectilinearFieldOfView(narrow, f).y,
              Projection::RectilinearFieldOfView(wide, f).y);
    EXPECT_EQ(Projection::MillerCylindricalFieldOfView(narrow, f).y,
              Projection::MillerCylindricalFieldOfView(wide, f).y);
    EXPECT_NE(Projection::PanniniFieldOfView(narrow, f).y,
              Projection::PanniniFieldOfView(wide, f).y);
    EXPECT_NE(Projection::EquirectangularPanniniFieldOfView(narrow, f).y,
              Projection::EquirectangularPanniniFieldOfView(wide, f).y);
}

// Resolution family: a whole field at the focal length f.

struct ResolutionRow {
    char const* name;
    Vector2d (*function)(Vector2d const& fov, float f);
    Pair (*closed_form)(double ax, double ay, double f);
};

void PrintTo(ResolutionRow const& row, std::ostream* out) {
    *out << row.name;
}

class ProjectionResolutionTest : public testing::TestWithParam<ResolutionRow> {};

TEST_P(ProjectionResolutionTest, MatchesItsClosedForm) {
    for (Vector2d const& fov :
         {Vector2d(1.2f, 0.8f), Vector2d(2.0f, 1.1f), Vector2d(0.3f, 0.2f), Vector2d(0.9f, 1.5f)}) {
        for (float const f : {500.0f, 1100.0f}) {
            Vector2d const resolution = GetParam().function(fov, f);
            Pair const expected = GetParam().closed_form(double(fov.x), double(fov.y), double(f));
            EXPECT_THAT(double(resolution.x), Near(expected.x))
                << fov.x << " x " << fov.y << " at " << f;
            EXPECT_THAT(double(resolution.y), Near(expected.y))
                << fov.x << " x " << fov.y << " at " << f;
        }
    }
}

Pair AngularResolution(double ax, double ay, double f) {
    return {ax * f, ay * f};
}

double MillerHeight(double ay, double f) {
    // Twice the projected half field: 1.25·ln(tan(pi/4 + 0.4·b)).
    return 2.0 * f * 1.25 * std::log(std::tan(PI_DOUBLE / 4.0 + 0.4 * ay / 2.0));
}

double LambertHeight(double ay, double f) {
    return 2.0 * f * std::sin(ay / 2.0);
}

INSTANTIATE_TEST_SUITE_P(
    , ProjectionResolutionTest,
    testing::Values(
        ResolutionRow{"Rectilinear", &Projection::RectilinearResolution,
                      [](double ax, double ay, double f) {
                          return Pair{2.0 * f * std::tan(ax / 2.0), 2.0 * f * std::tan(ay / 2.0)};
                      }},
        ResolutionRow{"Stereographic", &Projection::StereographicResolution,
                      [](double ax, double ay, double f) {
                          return Pair{4.0 * f * std::tan(ax / 4.0), 4.0 * f * std::tan(ay / 4.0)};
                      }},
        ResolutionRow{"Orthographic", &Projection::OrthographicResolution,
                      [](double ax, double ay, double f) {
                          return Pair{2.0 * f * std::sin(ax / 2.0), 2.0 * f * std::sin(ay / 2.0)};
                      }},
        ResolutionRow{"Equisolid", &Projection::EquisolidResolution,
                      [](double ax, double ay, double f) {
                          return Pair{4.0 * f * std::sin(ax / 4.0), 4.0 * f * std::sin(ay / 4.0)};
                      }},
        ResolutionRow{"Fisheye", &Projection::FisheyeResolution, &AngularResolution},
        ResolutionRow{"Equirectangular", &Projection::EquirectangularResolution,
                      &AngularResolution},
        ResolutionRow{"Cylindrical", &Projection::CylindricalResolution,
                      [](double ax, double ay, double f) {
                          return Pair{ax * f, 2.0 * f * std::tan(ay / 2.0)};
                      }},
        ResolutionRow{
            "Mercator", &Projection::MercatorResolution,
            [](double ax, double ay, double f) {
                return Pair{ax * f, 2.0 * f * std::log(std::tan(PI_DOUBLE / 4.0 + ay / 4.0))};
            }},
        ResolutionRow{"LambertCylindrical", &Projection::LambertCylindricalResolution,
                      [](double ax, double ay, double f) {
                          return Pair{ax * f, LambertHeight(ay, f)};
                      }},
        ResolutionRow{"MillerCylindrical", &Projection::MillerCylindricalResolution,
                      [](double ax, double ay, double f) {
                          return Pair{ax * f, MillerHeight(ay, f)};
                      }},
        ResolutionRow{"Architectural", &Projection::ArchitecturalResolution,
                      [](double ax, double ay, double f) {
                          return Pair{ax * f, (MillerHeight(ay, f) + LambertHeight(ay, f)) / 2.0};
                      }},
        ResolutionRow{"Pannini", &Projection::PanniniResolution,
                      [](double ax, double ay, double f) {
                          return Pair{
                              4.0 * f * std::tan(ax / 4.0),
                              2.0 * f * std::tan(std::tan(ay / 2.0)) / Square(std::cos(ax / 4.0))};
                      }},
        ResolutionRow{"EquirectangularPannini", &Projection::EquirectangularPanniniResolution,
                      [](double ax, double ay, double f) {
                          return Pair{4.0 * f * std::tan(ax / 4.0),
                                      2.0 * f * std::tan(ay / 2.0) / Square(std::cos(ax / 4.0))};
                      }}),
    [](testing::TestParamInfo<ResolutionRow> const& param_info) { return param_info.param.name; });

TEST(Projection, ArchitecturalResolutionOfAFlatFieldHasHeightZeroAndTheWidthOfBothParents) {
    Vector2d const fov(1.7f, 0.0f);
    float const f = 640.0f;
    Vector2d const architectural = Projection::ArchitecturalResolution(fov, f);
    EXPECT_EQ(0.0f, architectural.y);
    EXPECT_EQ(Projection::MillerCylindricalResolution(fov, f).x, architectural.x);
    EXPECT_EQ(Projection::LambertCylindricalResolution(fov, f).x, architectural.x);
}

TEST(Projection, EquirectangularFieldOfViewGivesBackTheFieldOfItsResolution) {
    for (Vector2d const& fov :
         {Vector2d(1.2f, 0.8f), Vector2d(6.1f, 3.0f), Vector2d(0.01f, 2.2f)}) {
        Vector2d const back = Projection::EquirectangularFieldOfView(
            Projection::EquirectangularResolution(fov, 900.0f), 900.0f);
        EXPECT_THAT(double(back.x), Near(double(fov.x)));
        EXPECT_THAT(double(back.y), Near(double(fov.y)));
    }
}

TEST(Projection, StereographicFieldOfViewDoesNotGiveBackTheFieldOfItsResolution) {
    float const f = 500.0f;
    Vector2d const fov(1.0f, 0.6f);
    Vector2d const resolution = Projection::StereographicResolution(fov, f);
    Vector2d const back = Projection::StereographicFieldOfView(resolution, f);
    // The width is not divided by 4 on the way back, so the field comes out much wider.
    EXPECT_THAT(double(back.x), Near(4.0 * std::atan(4.0 * std::tan(0.25))));
    EXPECT_THAT(double(back.x), Not(DoubleNear(1.0, 0.5)));
    EXPECT_THAT(4.0 * std::atan2(double(resolution.x) / 4.0, double(f)), Near(1.0));
}

TEST(Projection, EquisolidFieldOfViewDoesNotGiveBackTheFieldOfItsResolution) {
    float const f = 500.0f;
    Vector2d const fov(1.0f, 0.6f);
    Vector2d const resolution = Projection::EquisolidResolution(fov, f);
    Vector2d const back = Projection::EquisolidFieldOfView(resolution, f);
    // The width is not divided by 4f on the way back, so the field comes out much wider.
    EXPECT_THAT(double(back.x), Near(4.0 * std::asin(4.0 * std::sin(0.25))));
    EXPECT_THAT(double(back.x), Not(DoubleNear(1.0, 0.5)));
    EXPECT_THAT(double(back.y), Near(4.0 * std::asin(4.0 * std::sin(0.15))));
    EXPECT_THAT(4.0 * std::asin(double(resolution.x) / (4.0 * double(f))), Near(1.0));
}

TEST(Projection, LambertCylindricalResolutionTakesTheSineWhereTheConversionTakesTheArcsine) {
    float const f = 500.0f;
    float const latitude = 0.6f;
    float const half_height =
        Projection::LambertCylindricalResolution(Vector2d(1.0f, 2.0f * latitude), f).y / 2.0f;
    float const converted =
        Projection::EquirectangularToLambertCylindrical(Vector2d(0.0f, f * latitude), f).y;
    EXPECT_THAT(double(half_height), Near(double(f) * std::sin(0.6)));
    EXPECT_THAT(double(converted), Near(double(f) * std::asin(0.6)));
    EXPECT_THAT(double(converted), Not(DoubleNear(double(half_height), 10.0)));
}

TEST(Projection, PanniniFieldOfViewUndoesPanniniResolutionOnTheVerticalAxis) {
    // The doubled arctangent undoes the doubled tangent where the width is nil.
    float const f = 500.0f;
    Vector2d const fov(0.0f, 0.8f);
    Vector2d const back = Projection::PanniniFieldOfView(Projection::PanniniResolution(fov, f), f);
    EXPECT_EQ(0.0f, back.x);
    EXPECT_THAT(double(back.y), Near(0.8));
}

TEST(Projection, PanniniFieldOfViewDoesNotUndoPanniniResolutionAwayFromTheVerticalAxis) {
    // The resolution divides the height by cos² of a quarter field, and the field of view divides
    // by it once more instead of multiplying.
    float const f = 500.0f;
    Vector2d const fov(1.0f, 0.8f);
    Vector2d const back = Projection::PanniniFieldOfView(Projection::PanniniResolution(fov, f), f);
    EXPECT_THAT(double(back.x), Near(1.0));
    EXPECT_THAT(
        double(back.y),
        Near(2.0 * std::atan(std::atan(std::tan(std::tan(0.4)) / Square(Square(std::cos(0.25)))))));
    EXPECT_THAT(double(back.y), Not(DoubleNear(0.8, 0.05)));
}

}  // namespace
}  // namespace quorvel::vexmap
