#include "vexmap/euler_angles.h"

#include <array>
#include <cmath>
#include <cstddef>
#include <ostream>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/floating_point.h"
#include "vexmap/quaternion.h"
#include "vexmap/rotation_matrix_3d.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

using ::testing::AllOf;
using ::testing::Eq;
using ::testing::Field;
using ::testing::FloatNear;
using ::testing::Matcher;

constexpr float TOLERANCE = 1e-6f;
constexpr float ANGLE_TOLERANCE = 1e-5f;  // radians, after sums of a few turns or an asin near 1
constexpr float NAN_VALUE = FloatingPoint::Nan;
constexpr float PI_VALUE = 3.14159265f;
constexpr float HALF_PI_VALUE = 1.57079633f;
constexpr float THIRD_PI = 1.04719755f;
constexpr float QUARTER_PI = 0.78539816f;
constexpr float TWO_PI_VALUE = 6.28318531f;
constexpr float SUM_QUARTER = 0.68301270f;         // (sqrt 3 + 1) / 4
constexpr float DIFFERENCE_QUARTER = 0.18301270f;  // (sqrt 3 - 1) / 4
constexpr float ROOT_6_OVER_4 = 0.61237244f;
constexpr float ROOT_2_OVER_4 = 0.35355339f;

Matcher<EulerAngles> IsAngles(float pan, float tilt, float roll) {
    return AllOf(Field("pan", &EulerAngles::pan, Eq(pan)),
                 Field("tilt", &EulerAngles::tilt, Eq(tilt)),
                 Field("roll", &EulerAngles::roll, Eq(roll)));
}

Matcher<EulerAngles> IsNearAngles(float pan, float tilt, float roll,
                                  float tolerance = ANGLE_TOLERANCE) {
    return AllOf(Field("pan", &EulerAngles::pan, FloatNear(pan, tolerance)),
                 Field("tilt", &EulerAngles::tilt, FloatNear(tilt, tolerance)),
                 Field("roll", &EulerAngles::roll, FloatNear(roll, tolerance)));
}

using Elements = std::array<float, 9>;  // row by row

Elements ElementsOf(RotationMatrix3d const& m) {
    return {m.m11, m.m12, m.m13, m.m21, m.m22, m.m23, m.m31, m.m32, m.m33};
}

Elements Product(Elements const& a, Elements const& b) {
    Elements product{};
    for (std::size_t row = 0; row < 3; ++row) {
        for (std::size_t column = 0; column < 3; ++column) {
            float sum = 0.0f;
            for (std::size_t k = 0; k < 3; ++k) {
                sum += a[3 * row + k] * b[3 * k + column];
            }
            product[3 * row + column] = sum;
        }
    }
    return product;
}

Matcher<Elements> IsNearElements(Elements const& e) {
    return ::testing::ElementsAre(
        FloatNear(e[0], ANGLE_TOLERANCE), FloatNear(e[1], ANGLE_TOLERANCE),
        FloatNear(e[2], ANGLE_TOLERANCE), FloatNear(e[3], ANGLE_TOLERANCE),
        FloatNear(e[4], ANGLE_TOLERANCE), FloatNear(e[5], ANGLE_TOLERANCE),
        FloatNear(e[6], ANGLE_TOLERANCE), FloatNear(e[7], ANGLE_TOLERANCE),
        FloatNear(e[8], ANGLE_TOLERANCE));
}

TEST(EulerAngles, DefaultIsZero) {
    EXPECT_THAT(EulerAngles(), IsAngles(0.0f, 0.0f, 0.0f));
}

TEST(EulerAngles, KeepsItsAnglesAndCopiesThem) {
    EulerAngles const e(0.5f, -1.0f, 2.0f);
    EXPECT_THAT(EulerAngles(e), IsAngles(0.5f, -1.0f, 2.0f));
}

TEST(EulerAngles, IdentityConstantIsZero) {
    EXPECT_THAT(EulerAngles::Identity, IsAngles(0.0f, 0.0f, 0.0f));
}

TEST(EulerAngles, InvalidConstantIsThreeNans) {
    EXPECT_TRUE(std::isnan(EulerAngles::Invalid.pan));
    EXPECT_TRUE(std::isnan(EulerAngles::Invalid.tilt));
    EXPECT_TRUE(std::isnan(EulerAngles::Invalid.roll));
}

// Each row: two orientations and what == and != say of them; a NaN angle counts as equal.
struct ComparisonRow {
    char const* name;
    EulerAngles left;
    EulerAngles right;
    bool equal;
    bool unequal;
};

void PrintTo(ComparisonRow const& row, std::ostream* out) {
    *out << row.name;
}

std::string ComparisonName(::testing::TestParamInfo<ComparisonRow> const& row) {
    return row.param.name;
}

class EulerAnglesComparisonTest : public ::testing::TestWithParam<ComparisonRow> {};

TEST_P(EulerAnglesComparisonTest, FollowsTheLenientTest) {
    ComparisonRow const& row = GetParam();
    EXPECT_EQ(row.equal, row.left == row.right);
    EXPECT_EQ(row.unequal, row.left != row.right);
}

INSTANTIATE_TEST_SUITE_P(
    , EulerAnglesComparisonTest,
    ::testing::Values(
        ComparisonRow{"SameAngles", {0.1f, 0.2f, 0.3f}, {0.1f, 0.2f, 0.3f}, true, false},
        ComparisonRow{"OtherPan", {0.1f, 0.2f, 0.3f}, {0.5f, 0.2f, 0.3f}, false, true},
        ComparisonRow{"OtherTilt", {0.1f, 0.2f, 0.3f}, {0.1f, -0.2f, 0.3f}, false, true},
        ComparisonRow{"OtherRoll", {0.1f, 0.2f, 0.3f}, {0.1f, 0.2f, 0.0f}, false, true},
        ComparisonRow{"SignedZeros", {0.0f, -0.0f, 0.0f}, {-0.0f, 0.0f, -0.0f}, true, false},
        ComparisonRow{
            "NanPanAgainstANumber", {NAN_VALUE, 0.2f, 0.3f}, {0.1f, 0.2f, 0.3f}, true, false},
        ComparisonRow{
            "NanRollOnTheRight", {0.1f, 0.2f, 0.3f}, {0.1f, 0.2f, NAN_VALUE}, true, false},
        ComparisonRow{
            "NanPanButOtherTilt", {NAN_VALUE, 0.2f, 0.3f}, {0.1f, 0.7f, 0.3f}, false, true},
        ComparisonRow{"InvalidAgainstAnything",
                      {NAN_VALUE, NAN_VALUE, NAN_VALUE},
                      {1.0f, 2.0f, 3.0f},
                      true,
                      false}),
    ComparisonName);

TEST(EulerAngles, InvalidEqualsAnyOrientation) {
    EXPECT_TRUE(EulerAngles::Invalid == EulerAngles(1.0f, 2.0f, 3.0f));
    EXPECT_FALSE(EulerAngles::Invalid != EulerAngles(1.0f, 2.0f, 3.0f));
}

TEST(EulerAngles, NegatesAddsAndSubtractsEachAngle) {
    EulerAngles const a(1.0f, 2.0f, 3.0f);
    EulerAngles const b(0.5f, -4.0f, 1.0f);
    EXPECT_THAT(-a, IsAngles(-1.0f, -2.0f, -3.0f));
    EXPECT_THAT(a + b, IsAngles(1.5f, -2.0f, 4.0f));
    EXPECT_THAT(a - b, IsAngles(0.5f, 6.0f, 2.0f));
}

TEST(EulerAngles, MultipliesEachAngle) {
    EulerAngles const a(1.0f, 2.0f, 3.0f);
    EXPECT_THAT(a * 2.0f, IsAngles(2.0f, 4.0f, 6.0f));
    EXPECT_THAT(-0.5f * a, IsAngles(-0.5f, -1.0f, -1.5f));
}

TEST(EulerAngles, DivisionDividesThePanAndMultipliesTheRest) {
    EXPECT_THAT(EulerAngles(1.0f, 2.0f, 3.0f) / 2.0f, IsAngles(0.5f, 4.0f, 6.0f));
}

TEST(EulerAngles, CompoundDivisionDividesAllThree) {
    EulerAngles e(1.0f, 2.0f, 3.0f);
    EXPECT_EQ(&e, &(e /= 2.0f));
    EXPECT_THAT(e, IsAngles(0.5f, 1.0f, 1.5f));
}

TEST(EulerAngles, CompoundOperatorsChangeTheObjectAndReturnIt) {
    EulerAngles e(1.0f, 2.0f, 3.0f);
    EXPECT_EQ(&e, &(e += EulerAngles(1.0f, 1.0f, 1.0f)));
    EXPECT_THAT(e, IsAngles(2.0f, 3.0f, 4.0f));
    EXPECT_EQ(&e, &(e -= EulerAngles(4.0f, 1.0f, 0.5f)));
    EXPECT_THAT(e, IsAngles(-2.0f, 2.0f, 3.5f));
    EXPECT_EQ(&e, &(e *= 2.0f));
    EXPECT_THAT(e, IsAngles(-4.0f, 4.0f, 7.0f));
}

TEST(EulerAngles, NumberOverAnglesPutsEachAngleInTheDenominator) {
    EXPECT_THAT(6.0f / EulerAngles(1.0f, 2.0f, -3.0f), IsAngles(6.0f, 3.0f, -2.0f));
}

TEST(EulerAngles, SetIdentityClearsEveryAngle) {
    EulerAngles e(1.0f, 2.0f, 3.0f);
    e.SetIdentity();
    EXPECT_THAT(e, IsAngles(0.0f, 0.0f, 0.0f));
}

TEST(EulerAngles, NormaliseOfATiltOfThreeTurnsPanAndRollHalfATurn) {
    // The tilt is past pi/2: pan and roll gain pi, the tilt becomes pi - 3. Pan and roll of pi
    // normalise to about -pi or pi, whichever way the rounding falls.
    EulerAngles e(0.0f, 3.0f, 0.0f);
    e.Normalise();
    EXPECT_THAT(std::fabs(e.pan), FloatNear(PI_VALUE, ANGLE_TOLERANCE));
    EXPECT_THAT(e.tilt, FloatNear(PI_VALUE - 3.0f, ANGLE_TOLERANCE));
    EXPECT_THAT(std::fabs(e.roll), FloatNear(PI_VALUE, ANGLE_TOLERANCE));
    for (float const angle : {e.pan, e.tilt, e.roll}) {
        EXPECT_GE(angle, -PI_VALUE - ANGLE_TOLERANCE);
        EXPECT_LE(angle, PI_VALUE + ANGLE_TOLERANCE);
    }
}

TEST(EulerAngles, NormaliseOfATiltBelowMinusHalfPiTurnsPanAndRollHalfATurn) {
    // Tilt -2 becomes -pi + 2; pan 0.5 + pi and roll 0.25 + pi come back into range a turn down.
    EulerAngles e(0.5f, -2.0f, 0.25f);
    e.Normalise();
    EXPECT_THAT(e, IsNearAngles(0.5f - PI_VALUE, 2.0f - PI_VALUE, 0.25f - PI_VALUE));
}

TEST(EulerAngles, NormaliseBringsPanAndRollIntoRange) {
    EulerAngles e(4.0f, 0.5f, -4.0f);
    e.Normalise();
    EXPECT_THAT(e, IsNearAngles(4.0f - TWO_PI_VALUE, 0.5f, TWO_PI_VALUE - 4.0f));
}

TEST(EulerAngles, NormaliseWrapsATiltOfMoreThanATurnFirst) {
    EulerAngles e(0.0f, TWO_PI_VALUE + 0.25f, 0.0f);
    e.Normalise();
    EXPECT_THAT(e, IsNearAngles(0.0f, 0.25f, 0.0f));
}

TEST(EulerAngles, NormaliseNearGimbalLockFoldsTheRollIntoThePan) {
    // 1.5707 lies within 0.0001 of pi/2.
    EulerAngles up(0.5f, 1.5707f, 0.25f);
    up.Normalise();
    EXPECT_THAT(up.pan, FloatNear(0.75f, ANGLE_TOLERANCE));
    EXPECT_THAT(up.tilt, FloatNear(1.5707f, ANGLE_TOLERANCE));
    EXPECT_EQ(0.0f, up.roll);
    EulerAngles down(0.5f, -1.5707f, 0.25f);
    down.Normalise();
    EXPECT_THAT(down.pan, FloatNear(0.75f, ANGLE_TOLERANCE));
    EXPECT_THAT(down.tilt, FloatNear(-1.5707f, ANGLE_TOLERANCE));
    EXPECT_EQ(0.0f, down.roll);
}

TEST(EulerAngles, ObjectToInertialQuaternionGivesItsOrientation) {
    // The object-to-inertial quaternion of pan pi/2, tilt pi/3, roll pi/2 is (s, s, d, d) with
    // s = (sqrt 3 + 1) / 4 and d = (sqrt 3 - 1) / 4: sin tilt = 2 (s^2 - d^2) = sqrt 3 / 2, and
    // pan and roll are atan2(2 s d, 0.5 - s^2 - d^2) = atan2(1/4, 0).
    EulerAngles e;
    e.FromObjectToInertialQuaternion(
        Quaternion(SUM_QUARTER, SUM_QUARTER, DIFFERENCE_QUARTER, DIFFERENCE_QUARTER));
    EXPECT_THAT(e, IsNearAngles(HALF_PI_VALUE, THIRD_PI, HALF_PI_VALUE));
}

TEST(EulerAngles, InertialToObjectQuaternionGivesItsOrientation) {
    // The conjugate of the quaternion above.
    EulerAngles e;
    e.FromInertialToObjectQuaternion(
        Quaternion(SUM_QUARTER, -SUM_QUARTER, -DIFFERENCE_QUARTER, -DIFFERENCE_QUARTER));
    EXPECT_THAT(e, IsNearAngles(HALF_PI_VALUE, THIRD_PI, HALF_PI_VALUE));
}

// At tilt pi/2 the object-to-inertial quaternion of (h, pi/2, b) is
// (r cos D, r cos D, r sin D, -r sin D) with D = (h - b) / 2: only the difference of pan and roll
// is left, and the gimbal branch gives it as the pan, atan2(sin D cos D, cos(2 D) / 2) = 2 D.
// With 2 D = pi/3 the components are (sqrt 6, sqrt 6, sqrt 2, -sqrt 2) / 4.
TEST(EulerAngles, ObjectToInertialQuaternionAtGimbalLockPutsEverythingInThePan) {
    EulerAngles e(9.0f, 9.0f, 9.0f);
    e.FromObjectToInertialQuaternion(
        Quaternion(ROOT_6_OVER_4, ROOT_6_OVER_4, ROOT_2_OVER_4, -ROOT_2_OVER_4));
    EXPECT_THAT(e.pan, FloatNear(THIRD_PI, ANGLE_TOLERANCE));
    EXPECT_THAT(e.tilt, FloatNear(HALF_PI_VALUE, ANGLE_TOLERANCE));
    EXPECT_EQ(0.0f, e.roll);
}

TEST(EulerAngles, InertialToObjectQuaternionAtGimbalLockPutsEverythingInThePan) {
    EulerAngles e(9.0f, 9.0f, 9.0f);
    e.FromInertialToObjectQuaternion(
        Quaternion(ROOT_6_OVER_4, -ROOT_6_OVER_4, -ROOT_2_OVER_4, ROOT_2_OVER_4));
    EXPECT_THAT(e.pan, FloatNear(THIRD_PI, ANGLE_TOLERANCE));
    EXPECT_THAT(e.tilt, FloatNear(HALF_PI_VALUE, ANGLE_TOLERANCE));
    EXPECT_EQ(0.0f, e.roll);
}

// Without roll the quaternion of (h, p, 0) gives a pan of exactly h in the gimbal branch too.
// 0.01 short of pi/2 the sine of the tilt is cos 0.01 = 0.99995, past the 0.9999 of the gimbal
// test, so the tilt comes out as 0.99995 pi/2 and not as the asin of it.
TEST(EulerAngles, QuaternionsJustShortOfGimbalLockScaleTheSineOfTheTilt) {
    float const tilt = HALF_PI_VALUE - 0.01f;
    float const sine = 0.99995f;
    Quaternion object_to_inertial;
    object_to_inertial.SetToRotateObjectToInertial(EulerAngles(0.7f, tilt, 0.0f));
    EulerAngles e(9.0f, 9.0f, 9.0f);
    e.FromObjectToInertialQuaternion(object_to_inertial);
    EXPECT_THAT(e, IsNearAngles(0.7f, sine * HALF_PI_VALUE, 0.0f));
    EXPECT_EQ(0.0f, e.roll);

    Quaternion inertial_to_object;
    inertial_to_object.SetToRotateInertialToObject(EulerAngles(0.7f, -tilt, 0.0f));
    e = EulerAngles(9.0f, 9.0f, 9.0f);
    e.FromInertialToObjectQuaternion(inertial_to_object);
    EXPECT_THAT(e, IsNearAngles(0.7f, -sine * HALF_PI_VALUE, 0.0f));
    EXPECT_EQ(0.0f, e.roll);
}

TEST(EulerAngles, QuaternionAtTiltHalfPiTakesTheGimbalBranch) {
    Quaternion q;
    q.SetToRotateObjectToInertial(EulerAngles(0.4f, Trigonometry::HALF_PI, 0.3f));
    EulerAngles e;
    e.FromObjectToInertialQuaternion(q);
    EXPECT_THAT(e.pan, FloatNear(0.1f, ANGLE_TOLERANCE));
    EXPECT_THAT(e.tilt, FloatNear(HALF_PI_VALUE, ANGLE_TOLERANCE));
    EXPECT_EQ(0.0f, e.roll);
}

// The float HALF_PI lies just above pi/2, so its cosine is a tiny negative number: the matrix
// keeps sin(pan) cos(tilt), cos(pan) cos(tilt) and their roll twins, both atan2 land half a turn
// away from pan and roll, and the roll is not zeroed.
TEST(EulerAngles, MatrixAtTiltExactlyHalfPiTakesTheOrdinaryBranch) {
    RotationMatrix3d const m(0.4f, Trigonometry::HALF_PI, 0.3f);
    EulerAngles e;
    e.FromRotationMatrix(m);
    EXPECT_THAT(e.tilt, FloatNear(HALF_PI_VALUE, TOLERANCE));
    EXPECT_NE(0.0f, e.roll);
    EXPECT_THAT(e.roll, FloatNear(0.3f - PI_VALUE, ANGLE_TOLERANCE));
    EXPECT_THAT(e.pan, FloatNear(0.4f - PI_VALUE, ANGLE_TOLERANCE));
}

// Orientations away from gimbal lock, in radians.
struct Orientation {
    float pan;
    float tilt;
    float roll;
};

void PrintTo(Orientation const& o, std::ostream* out) {
    *out << "pan " << o.pan << ", tilt " << o.tilt << ", roll " << o.roll;
}

class EulerAnglesRoundTripTest : public ::testing::TestWithParam<Orientation> {
protected:
    EulerAngles Angles() const {
        return EulerAngles(GetParam().pan, GetParam().tilt, GetParam().roll);
    }
};

TEST_P(EulerAnglesRoundTripTest, ThroughTheObjectToInertialQuaternion) {
    Quaternion q;
    q.SetToRotateObjectToInertial(Angles());
    EulerAngles e;
    e.FromObjectToInertialQuaternion(q);
    EXPECT_THAT(e, IsNearAngles(GetParam().pan, GetParam().tilt, GetParam().roll));
}

TEST_P(EulerAnglesRoundTripTest, ThroughTheInertialToObjectQuaternion) {
    Quaternion q;
    q.SetToRotateInertialToObject(Angles());
    EulerAngles e;
    e.FromInertialToObjectQuaternion(q);
    EXPECT_THAT(e, IsNearAngles(GetParam().pan, GetParam().tilt, GetParam().roll));
}

TEST_P(EulerAnglesRoundTripTest, ThroughTheRotationMatrix) {
    EulerAngles e;
    e.FromRotationMatrix(RotationMatrix3d(Angles()));
    EXPECT_THAT(e, IsNearAngles(GetParam().pan, GetParam().tilt, GetParam().roll));
}

TEST_P(EulerAnglesRoundTripTest, ConcatenatingTheIdentityChangesNothing) {
    EulerAngles e = Angles();
    e.Concatenate(EulerAngles::Identity);
    EXPECT_THAT(e, IsNearAngles(GetParam().pan, GetParam().tilt, GetParam().roll));
    EulerAngles identity;
    identity.Concatenate(Angles());
    EXPECT_THAT(identity, IsNearAngles(GetParam().pan, GetParam().tilt, GetParam().roll));
}

INSTANTIATE_TEST_SUITE_P(
    , EulerAnglesRoundTripTest,
    ::testing::Values(Orientation{0.0f, 0.0f, 0.0f}, Orientation{0.3f, -0.4f, 0.5f},
                      Orientation{-2.5f, 1.2f, 3.0f}, Orientation{1.0f, -1.5f, -2.0f},
                      Orientation{3.0f, 0.1f, -0.1f}, Orientation{-0.7f, 0.9f, 0.0f},
                      Orientation{0.0f, 0.0f, -2.8f}));

TEST(EulerAngles, ConcatenatingATiltAfterAPanGivesBoth) {
    // Ry(pi/2) Rx(pi/4) is the matrix of pan pi/2 and tilt pi/4.
    EulerAngles e(HALF_PI_VALUE, 0.0f, 0.0f);
    e.Concatenate(EulerAngles(0.0f, QUARTER_PI, 0.0f));
    EXPECT_THAT(e, IsNearAngles(HALF_PI_VALUE, QUARTER_PI, 0.0f));
}

// Each row: two orientations; this one's matrix times the other's is the matrix of the result.
struct ConcatenationRow {
    Orientation first;
    Orientation second;
};

void PrintTo(ConcatenationRow const& row, std::ostream* out) {
    PrintTo(row.first, out);
    *out << " then ";
    PrintTo(row.second, out);
}

class EulerAnglesConcatenateTest : public ::testing::TestWithParam<ConcatenationRow> {};

TEST_P(EulerAnglesConcatenateTest, ComposesTheRotationMatrices) {
    Orientation const& first = GetParam().first;
    Orientation const& second = GetParam().second;
    EulerAngles e(first.pan, first.tilt, first.roll);
    e.Concatenate(EulerAngles(second.pan, second.tilt, second.roll));
    Elements const expected =
        Product(ElementsOf(RotationMatrix3d(first.pan, first.tilt, first.roll)),
                ElementsOf(RotationMatrix3d(second.pan, second.tilt, second.roll)));
    EXPECT_THAT(ElementsOf(RotationMatrix3d(e)), IsNearElements(expected));
}

INSTANTIATE_TEST_SUITE_P(
    , EulerAnglesConcatenateTest,
    ::testing::Values(ConcatenationRow{{0.3f, -0.4f, 0.5f}, {1.0f, 0.2f, -0.3f}},
                      ConcatenationRow{{1.0f, 0.2f, -0.3f}, {0.3f, -0.4f, 0.5f}},
                      ConcatenationRow{{-2.5f, 0.6f, 3.0f}, {0.5f, -0.5f, 0.5f}},
                      ConcatenationRow{{0.1f, 0.2f, 0.3f}, {-0.1f, -0.2f, -0.3f}},
                      ConcatenationRow{{0.0f, 0.7f, 0.0f}, {1.2f, 0.0f, 0.0f}}));

TEST(EulerAngles, AssignmentToItselfWarnsOnceAndLeavesTheObjectAlone) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    EulerAngles e(0.5f, -1.0f, 2.0f);
    EulerAngles const& same = e;
    EXPECT_EQ(&e, &(e = same));
    EXPECT_THAT(e, IsAngles(0.5f, -1.0f, 2.0f));
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of %s object\n", lines[0].format);
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of EulerAngles object\n", lines[0].text);
}

TEST(EulerAngles, AssignmentFromAnotherCopiesSilently) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    EulerAngles e;
    EulerAngles const other(0.5f, -1.0f, 2.0f);
    EXPECT_EQ(&e, &(e = other));
    EXPECT_THAT(e, IsAngles(0.5f, -1.0f, 2.0f));
    EXPECT_EQ(0u, sink.Count());
}

}  // namespace
}  // namespace quorvel::vexmap
