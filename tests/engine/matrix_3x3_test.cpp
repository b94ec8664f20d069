#include "vexmap/matrix_3x3.h"

#include <array>
#include <cmath>
#include <ostream>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/floating_point.h"

namespace quorvel::vexmap {
namespace {

using ::testing::AllOf;
using ::testing::Eq;
using ::testing::Field;
using ::testing::FloatNear;
using ::testing::Matcher;

constexpr float TOLERANCE = 1e-6f;
constexpr float NAN_VALUE = FloatingPoint::Nan;
constexpr float HALF_PI_VALUE = 1.57079633f;
constexpr float SIXTH_PI = 0.52359878f;
constexpr float SQRT3_OVER_2 = 0.86602540f;

using Elements = std::array<float, 9>;  // row by row

Matrix3x3 Make(Elements const& e) {
    Matrix3x3 m;
    m.m11 = e[0];
    m.m12 = e[1];
    m.m13 = e[2];
    m.m21 = e[3];
    m.m22 = e[4];
    m.m23 = e[5];
    m.m31 = e[6];
    m.m32 = e[7];
    m.m33 = e[8];
    return m;
}

Matcher<Matrix3x3> HasElements(Elements const& e, float tolerance = 0.0f) {
    auto near = [tolerance](float value) -> Matcher<float> {
        if (tolerance > 0.0f) {
            return FloatNear(value, tolerance);
        }
        return Eq(value);
    };
    return AllOf(
        Field("m11", &Matrix3x3::m11, near(e[0])), Field("m12", &Matrix3x3::m12, near(e[1])),
        Field("m13", &Matrix3x3::m13, near(e[2])), Field("m21", &Matrix3x3::m21, near(e[3])),
        Field("m22", &Matrix3x3::m22, near(e[4])), Field("m23", &Matrix3x3::m23, near(e[5])),
        Field("m31", &Matrix3x3::m31, near(e[6])), Field("m32", &Matrix3x3::m32, near(e[7])),
        Field("m33", &Matrix3x3::m33, near(e[8])));
}

Matcher<Vector2d> IsPoint(float x, float y, float tolerance = 0.0f) {
    if (tolerance > 0.0f) {
        return AllOf(Field("x", &Vector2d::x, FloatNear(x, tolerance)),
                     Field("y", &Vector2d::y, FloatNear(y, tolerance)));
    }
    return AllOf(Field("x", &Vector2d::x, Eq(x)), Field("y", &Vector2d::y, Eq(y)));
}

Elements const IDENTITY = {1, 0, 0, 0, 1, 0, 0, 0, 1};
Elements const SEVENS = {7, 7, 7, 7, 7, 7, 7, 7, 7};  // whatever a setup has to overwrite
Elements const A = {1, 2, 3, 4, 5, 6, 7, 8, 10};
Elements const B = {2, 0, 1, 1, 3, 0, 0, 1, 4};

TEST(Matrix3x3, DefaultIsIdentity) {
    EXPECT_THAT(Matrix3x3(), HasElements(IDENTITY));
}

TEST(Matrix3x3, IdentityConstantIsIdentity) {
    EXPECT_THAT(Matrix3x3::Identity, HasElements(IDENTITY));
}

TEST(Matrix3x3, SetIdentityOverwritesEveryElement) {
    Matrix3x3 m = Make(SEVENS);
    m.SetIdentity();
    EXPECT_THAT(m, HasElements(IDENTITY));
}

TEST(Matrix3x3, CopiesEveryElement) {
    EXPECT_THAT(Matrix3x3(Make(A)), HasElements(A));
    Matrix3x3 m;
    Matrix3x3 const source = Make(A);
    EXPECT_EQ(&m, &(m = source));
    EXPECT_THAT(m, HasElements(A));
}

TEST(Matrix3x3, TwoDefaultMatricesAreUnequal) {
    Matrix3x3 const a;
    Matrix3x3 const b;
    EXPECT_FALSE(a == b);
    EXPECT_TRUE(a != b);
}

TEST(Matrix3x3, MatrixDifferingInEveryElementEqualsTheIdentity) {
    Matrix3x3 const other = Make({2, 1, 1, 1, 2, 1, 1, 1, 2});
    EXPECT_TRUE(other == Matrix3x3::Identity);
    EXPECT_FALSE(other != Matrix3x3::Identity);
}

// Each row: two matrices and what == and != say of them. == holds only when all nine pairs
// differ; != is its complement.
struct ComparisonRow {
    char const* name;
    Elements left;
    Elements right;
    bool equal;
};

void PrintTo(ComparisonRow const& row, std::ostream* out) {
    *out << row.name;
}

std::string ComparisonName(::testing::TestParamInfo<ComparisonRow> const& row) {
    return row.param.name;
}

class Matrix3x3ComparisonTest : public ::testing::TestWithParam<ComparisonRow> {};

TEST_P(Matrix3x3ComparisonTest, HoldsOnlyWhenEveryElementDiffers) {
    ComparisonRow const& row = GetParam();
    EXPECT_EQ(row.equal, Make(row.left) == Make(row.right));
    EXPECT_EQ(!row.equal, Make(row.left) != Make(row.right));
}

INSTANTIATE_TEST_SUITE_P(
    , Matrix3x3ComparisonTest,
    ::testing::Values(
        ComparisonRow{"TwoIdentities", IDENTITY, IDENTITY, false},
        ComparisonRow{"SameOrdinaryMatrix", A, A, false},
        ComparisonRow{"AllNineDiffer", IDENTITY, {2, 1, 1, 1, 2, 1, 1, 1, 2}, true},
        ComparisonRow{"AllNineDifferTheOtherWayRound", {2, 1, 1, 1, 2, 1, 1, 1, 2}, IDENTITY, true},
        ComparisonRow{"EightDifferLastSame", IDENTITY, {2, 1, 1, 1, 2, 1, 1, 1, 1}, false},
        ComparisonRow{"EightDifferFirstSame", IDENTITY, {1, 1, 1, 1, 2, 1, 1, 1, 2}, false},
        ComparisonRow{"EightDifferOneNan", IDENTITY, {2, NAN_VALUE, 1, 1, 2, 1, 1, 1, 2}, false},
        ComparisonRow{"AllNan",
                      {NAN_VALUE, NAN_VALUE, NAN_VALUE, NAN_VALUE, NAN_VALUE, NAN_VALUE, NAN_VALUE,
                       NAN_VALUE, NAN_VALUE},
                      IDENTITY,
                      false}),
    ComparisonName);

// Each row: a matrix and what IsIdentity() says of it. It wants each diagonal element to differ
// from 1 and every other element to be exactly zero.
struct IdentityRow {
    char const* name;
    Elements elements;
    bool identity;
};

void PrintTo(IdentityRow const& row, std::ostream* out) {
    *out << row.name;
}

std::string IdentityName(::testing::TestParamInfo<IdentityRow> const& row) {
    return row.param.name;
}

class Matrix3x3IsIdentityTest : public ::testing::TestWithParam<IdentityRow> {};

TEST_P(Matrix3x3IsIdentityTest, WantsADiagonalOtherThanOneAndZerosElsewhere) {
    EXPECT_EQ(GetParam().identity, Make(GetParam().elements).IsIdentity());
}

INSTANTIATE_TEST_SUITE_P(
    , Matrix3x3IsIdentityTest,
    ::testing::Values(IdentityRow{"Identity", IDENTITY, false},
                      IdentityRow{"DiagonalOfTwos", {2, 0, 0, 0, 2, 0, 0, 0, 2}, true},
                      IdentityRow{"ZeroMatrix", {0, 0, 0, 0, 0, 0, 0, 0, 0}, true},
                      IdentityRow{"MiddleDiagonalIsOne", {2, 0, 0, 0, 1, 0, 0, 0, 2}, false},
                      IdentityRow{"LastDiagonalIsOne", {2, 0, 0, 0, 2, 0, 0, 0, 1}, false},
                      IdentityRow{"OffDiagonalHalf", {2, 0, 0, 0, 2, 0, 0.5f, 0, 2}, false},
                      IdentityRow{"OffDiagonalTiny", {2, 1e-30f, 0, 0, 2, 0, 0, 0, 2}, false},
                      IdentityRow{"OffDiagonalNegativeZero", {2, 0, -0.0f, 0, 2, 0, 0, 0, 2}, true},
                      IdentityRow{"NanOnTheDiagonal", {NAN_VALUE, 0, 0, 0, 2, 0, 0, 0, 2}, false}),
    IdentityName);

TEST(Matrix3x3, ProductIsThisTimesOther) {
    // Row i of A times column j of B, e.g. (1, 2, 3) . (2, 1, 0) = 4 and (7, 8, 10) . (1, 0, 4)
    // = 47.
    EXPECT_THAT(Make(A) * Make(B), HasElements({4, 9, 13, 13, 21, 28, 22, 34, 47}));
    EXPECT_THAT(Make(B) * Make(A), HasElements({9, 12, 16, 13, 17, 21, 32, 37, 46}));
}

TEST(Matrix3x3, CompoundProductIsThisTimesOtherAndReturnsTheObject) {
    Matrix3x3 m = Make(A);
    EXPECT_EQ(&m, &(m *= Make(B)));
    EXPECT_THAT(m, HasElements({4, 9, 13, 13, 21, 28, 22, 34, 47}));
}

TEST(Matrix3x3, ProductWithAVector3dIsMatrixTimesVector) {
    // (1 - 2 + 6, 4 - 5 + 12, 7 - 8 + 20)
    Vector3d const v = Make(A) * Vector3d(1.0f, -1.0f, 2.0f);
    EXPECT_EQ(5.0f, v.x);
    EXPECT_EQ(11.0f, v.y);
    EXPECT_EQ(19.0f, v.z);
}

TEST(Matrix3x3, ProductWithAVector2dTakesThePointAsXY1) {
    // (1 * 2 + 2 * 3 + 3, 4 * 2 + 5 * 3 + 6)
    EXPECT_THAT(Make(A) * Vector2d(2.0f, 3.0f), IsPoint(11.0f, 29.0f));
}

TEST(Matrix3x3, ProductWithAVector2dIgnoresTheThirdRow) {
    Matrix3x3 with_zero = Make(A);
    with_zero.m31 = 0.0f;
    Matrix3x3 with_five = Make(A);
    with_five.m31 = 5.0f;
    Matrix3x3 with_zero_divisor = Make(A);
    with_zero_divisor.m31 = 0.0f;
    with_zero_divisor.m32 = 0.0f;
    with_zero_divisor.m33 = 0.0f;
    Vector2d const p(2.0f, 3.0f);
    EXPECT_THAT(with_zero * p, IsPoint(11.0f, 29.0f));
    EXPECT_THAT(with_five * p, IsPoint(11.0f, 29.0f));
    EXPECT_THAT(with_zero_divisor * p, IsPoint(11.0f, 29.0f));
}

TEST(Matrix3x3, RotationOfAQuarterTurnTurnsXIntoY) {
    Matrix3x3 m = Make(SEVENS);
    m.Setup2dRotation(HALF_PI_VALUE);
    EXPECT_THAT(m, HasElements({0, -1, 0, 1, 0, 0, 0, 0, 1}, TOLERANCE));
    EXPECT_THAT(m * Vector2d(1.0f, 0.0f), IsPoint(0.0f, 1.0f, TOLERANCE));
    EXPECT_THAT(m * Vector2d(0.0f, 1.0f), IsPoint(-1.0f, 0.0f, TOLERANCE));
}

TEST(Matrix3x3, RotationHoldsCosineAndSine) {
    Matrix3x3 m = Make(SEVENS);
    m.Setup2dRotation(SIXTH_PI);
    EXPECT_THAT(m,
                HasElements({SQRT3_OVER_2, -0.5f, 0, 0.5f, SQRT3_OVER_2, 0, 0, 0, 1}, TOLERANCE));
}

TEST(Matrix3x3, RotationAboutACentreCarriesTheTranslation) {
    // Quarter turn about (2, 3): c = 0, s = 1, so m13 = s * cy + (1 - c) * cx = 3 + 2 and
    // m23 = (1 - c) * cy - s * cx = 3 - 2.
    Matrix3x3 m = Make(SEVENS);
    m.Setup2dRotation(2.0f, 3.0f, HALF_PI_VALUE);
    EXPECT_THAT(m, HasElements({0, -1, 5, 1, 0, 1, 0, 0, 1}, TOLERANCE));
    Matrix3x3 from_vector = Make(SEVENS);
    from_vector.Setup2dRotation(Vector2d(2.0f, 3.0f), HALF_PI_VALUE);
    EXPECT_THAT(from_vector, HasElements({0, -1, 5, 1, 0, 1, 0, 0, 1}, TOLERANCE));
}

// Each row: a centre and an angle in radians.
struct CentredRotation {
    float centre_x;
    float centre_y;
    float angle;
};

void PrintTo(CentredRotation const& row, std::ostream* out) {
    *out << "(" << row.centre_x << ", " << row.centre_y << ") by " << row.angle;
}

class Matrix3x3CentredRotationTest : public ::testing::TestWithParam<CentredRotation> {};

TEST_P(Matrix3x3CentredRotationTest, KeepsTheCentre) {
    CentredRotation const& row = GetParam();
    Matrix3x3 m;
    m.Setup2dRotation(row.centre_x, row.centre_y, row.angle);
    EXPECT_THAT(m * Vector2d(row.centre_x, row.centre_y),
                IsPoint(row.centre_x, row.centre_y, 1e-5f));
    Matrix3x3 from_vector;
    from_vector.Setup2dRotation(Vector2d(row.centre_x, row.centre_y), row.angle);
    EXPECT_THAT(from_vector * Vector2d(row.centre_x, row.centre_y),
                IsPoint(row.centre_x, row.centre_y, 1e-5f));
}

TEST_P(Matrix3x3CentredRotationTest, TurnsAPointOneToTheRightOfTheCentreByTheAngle) {
    CentredRotation const& row = GetParam();
    Matrix3x3 m;
    m.Setup2dRotation(row.centre_x, row.centre_y, row.angle);
    EXPECT_THAT(
        m * Vector2d(row.centre_x + 1.0f, row.centre_y),
        IsPoint(row.centre_x + std::cos(row.angle), row.centre_y + std::sin(row.angle), 1e-5f));
}

INSTANTIATE_TEST_SUITE_P(, Matrix3x3CentredRotationTest,
                         ::testing::Values(CentredRotation{0.0f, 0.0f, 0.3f},
                                           CentredRotation{2.0f, 3.0f, HALF_PI_VALUE},
                                           CentredRotation{-4.5f, 1.25f, -1.2f},
                                           CentredRotation{10.0f, -6.0f, 2.5f},
                                           CentredRotation{1.0f, 1.0f, 3.14159265f}));

TEST(Matrix3x3, TranslationMovesByTheOffset) {
    Matrix3x3 m = Make(SEVENS);
    m.Setup2dTranslation(2.5f, -4.0f);
    EXPECT_THAT(m, HasElements({1, 0, 2.5f, 0, 1, -4.0f, 0, 0, 1}));
    EXPECT_THAT(m * Vector2d(1.0f, 1.0f), IsPoint(3.5f, -3.0f));
    Matrix3x3 from_vector = Make(SEVENS);
    from_vector.Setup2dTranslation(Vector2d(2.5f, -4.0f));
    EXPECT_THAT(from_vector, HasElements({1, 0, 2.5f, 0, 1, -4.0f, 0, 0, 1}));
}

TEST(Matrix3x3, ScaleByOneFactorScalesBothAxes) {
    Matrix3x3 m = Make(SEVENS);
    m.Setup2dScale(3.0f);
    EXPECT_THAT(m, HasElements({3, 0, 0, 0, 3, 0, 0, 0, 1}));
}

TEST(Matrix3x3, ScaleByTwoFactorsScalesEachAxis) {
    Matrix3x3 m = Make(SEVENS);
    m.Setup2dScale(3.0f, -0.5f);
    EXPECT_THAT(m, HasElements({3, 0, 0, 0, -0.5f, 0, 0, 0, 1}));
    EXPECT_THAT(m * Vector2d(2.0f, 4.0f), IsPoint(6.0f, -2.0f));
    Matrix3x3 from_vector = Make(SEVENS);
    from_vector.Setup2dScale(Vector2d(3.0f, -0.5f));
    EXPECT_THAT(from_vector, HasElements({3, 0, 0, 0, -0.5f, 0, 0, 0, 1}));
}

// Each row: the two flags and the diagonal they give.
struct ReflectionRow {
    char const* name;
    bool mirror_y;
    bool mirror_x;
    float m11;
    float m22;
};

void PrintTo(ReflectionRow const& row, std::ostream* out) {
    *out << row.name;
}

std::string ReflectionName(::testing::TestParamInfo<ReflectionRow> const& row) {
    return row.param.name;
}

class Matrix3x3ReflectionTest : public ::testing::TestWithParam<ReflectionRow> {};

TEST_P(Matrix3x3ReflectionTest, FirstFlagMirrorsYAndSecondMirrorsX) {
    ReflectionRow const& row = GetParam();
    Matrix3x3 m = Make(SEVENS);
    m.Setup2dReflection(row.mirror_y, row.mirror_x);
    EXPECT_THAT(m, HasElements({row.m11, 0, 0, 0, row.m22, 0, 0, 0, 1}));
    EXPECT_THAT(m * Vector2d(2.0f, 3.0f), IsPoint(2.0f * row.m11, 3.0f * row.m22));
}

INSTANTIATE_TEST_SUITE_P(, Matrix3x3ReflectionTest,
                         ::testing::Values(ReflectionRow{"Neither", false, false, 1.0f, 1.0f},
                                           ReflectionRow{"FirstOnly", true, false, 1.0f, -1.0f},
                                           ReflectionRow{"SecondOnly", false, true, -1.0f, 1.0f},
                                           ReflectionRow{"Both", true, true, -1.0f, -1.0f}),
                         ReflectionName);

TEST(Matrix3x3, AssignmentToItselfWarnsAndKeepsTheValue) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Matrix3x3 m = Make(A);
    Matrix3x3 const& same = m;
    EXPECT_EQ(&m, &(m = same));
    EXPECT_THAT(m, HasElements(A));
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of %s object\n", lines[0].format);
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of Matrix3x3 object\n", lines[0].text);
}

TEST(Matrix3x3, AssignmentFromAnotherIsSilent) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Matrix3x3 m;
    m = Make(B);
    EXPECT_THAT(m, HasElements(B));
    EXPECT_EQ(0u, sink.Count());
}

}  // namespace
}  // namespace quorvel::vexmap
