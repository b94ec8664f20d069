#include "vexmap/quaternion.h"

#include <cmath>
#include <ostream>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/euler_angles.h"

namespace quorvel::vexmap {
namespace {

using ::testing::AllOf;
using ::testing::Eq;
using ::testing::Field;
using ::testing::FloatNear;
using ::testing::Matcher;

constexpr float TOLERANCE = 1e-6f;
constexpr float PI_VALUE = 3.14159265f;
constexpr float HALF_PI_VALUE = 1.57079633f;
constexpr float THIRD_PI = 1.04719755f;
constexpr float ROOT_HALF = 0.70710678f;     // cos and sin of a quarter pi
constexpr float SQRT3_OVER_2 = 0.86602540f;  // cos of a sixth pi
constexpr float COS_EIGHTH_PI = 0.92387953f;
constexpr float SIN_EIGHTH_PI = 0.38268343f;
constexpr float COS_SIXTEENTH_PI = 0.98078528f;
constexpr float SIN_SIXTEENTH_PI = 0.19509032f;
// (cos(pi/6) + sin(pi/6)) / 2 and (cos(pi/6) - sin(pi/6)) / 2, that is (sqrt 3 +- 1) / 4.
constexpr float SUM_QUARTER = 0.68301270f;
constexpr float DIFFERENCE_QUARTER = 0.18301270f;

Matcher<Quaternion> IsQuaternion(float w, float x, float y, float z) {
    return AllOf(Field("w", &Quaternion::w, Eq(w)), Field("x", &Quaternion::x, Eq(x)),
                 Field("y", &Quaternion::y, Eq(y)), Field("z", &Quaternion::z, Eq(z)));
}

Matcher<Quaternion> IsNearQuaternion(float w, float x, float y, float z,
                                     float tolerance = TOLERANCE) {
    return AllOf(Field("w", &Quaternion::w, FloatNear(w, tolerance)),
                 Field("x", &Quaternion::x, FloatNear(x, tolerance)),
                 Field("y", &Quaternion::y, FloatNear(y, tolerance)),
                 Field("z", &Quaternion::z, FloatNear(z, tolerance)));
}

Matcher<Vector3d> IsNearVector(float x, float y, float z) {
    return AllOf(Field("x", &Vector3d::x, FloatNear(x, TOLERANCE)),
                 Field("y", &Vector3d::y, FloatNear(y, TOLERANCE)),
                 Field("z", &Vector3d::z, FloatNear(z, TOLERANCE)));
}

Quaternion Junk() {
    return Quaternion(7.0f, 7.0f, 7.0f, 7.0f);
}

TEST(Quaternion, DefaultIsTheIdentity) {
    EXPECT_THAT(Quaternion(), IsQuaternion(1.0f, 0.0f, 0.0f, 0.0f));
}

TEST(Quaternion, KeepsItsComponentsAndCopiesThem) {
    Quaternion const q(1.0f, 2.0f, 3.0f, 4.0f);
    EXPECT_THAT(Quaternion(q), IsQuaternion(1.0f, 2.0f, 3.0f, 4.0f));
}

TEST(Quaternion, IdentityConstantIsOneThenZeros) {
    EXPECT_THAT(Quaternion::Identity, IsQuaternion(1.0f, 0.0f, 0.0f, 0.0f));
}

TEST(Quaternion, InvalidConstantIsFourNans) {
    EXPECT_TRUE(std::isnan(Quaternion::Invalid.w));
    EXPECT_TRUE(std::isnan(Quaternion::Invalid.x));
    EXPECT_TRUE(std::isnan(Quaternion::Invalid.y));
    EXPECT_TRUE(std::isnan(Quaternion::Invalid.z));
}

TEST(Quaternion, SetIdentityOverwritesEveryComponent) {
    Quaternion q = Junk();
    q.SetIdentity();
    EXPECT_THAT(q, IsQuaternion(1.0f, 0.0f, 0.0f, 0.0f));
}

TEST(Quaternion, NegationNegatesAllFour) {
    EXPECT_THAT(-Quaternion(1.0f, -2.0f, 3.0f, -4.0f), IsQuaternion(-1.0f, 2.0f, -3.0f, 4.0f));
}

TEST(Quaternion, ProductIsHamiltonsProductTheOtherWayRound) {
    // By hand, a = (1, 2, 3, 4), b = (5, 6, 7, 8):
    //   w = 5 - 12 - 21 - 32 = -60
    //   x = a.w b.x + a.x b.w + a.z b.y - a.y b.z = 6 + 10 + 28 - 24 = 20
    //   y = a.w b.y + a.y b.w + a.x b.z - a.z b.x = 7 + 15 + 16 - 24 = 14
    //   z = a.w b.z + a.z b.w + a.y b.x - a.x b.y = 8 + 20 + 18 - 14 = 32
    // Hamilton's a b is (-60, 12, 30, 24); his b a is the result here.
    Quaternion const a(1.0f, 2.0f, 3.0f, 4.0f);
    Quaternion const b(5.0f, 6.0f, 7.0f, 8.0f);
    EXPECT_THAT(a * b, IsQuaternion(-60.0f, 20.0f, 14.0f, 32.0f));
    EXPECT_THAT(b * a, IsQuaternion(-60.0f, 12.0f, 30.0f, 24.0f));
}

TEST(Quaternion, CompoundProductMatchesTheProductAndReturnsTheObject) {
    Quaternion q(1.0f, 2.0f, 3.0f, 4.0f);
    EXPECT_EQ(&q, &(q *= Quaternion(5.0f, 6.0f, 7.0f, 8.0f)));
    EXPECT_THAT(q, IsQuaternion(-60.0f, 20.0f, 14.0f, 32.0f));
}

TEST(Quaternion, QuarterTurnsAboutXThenYComposeInReverseHamiltonOrder) {
    // qx = (r, r, 0, 0), qy = (r, 0, r, 0) with r * r = 1/2. Hamilton: qx qy = (1, 1, 1, 1) / 2
    // and qy qx = (1, 1, 1, -1) / 2; the product here gives the second for qx * qy.
    Quaternion qx;
    qx.SetToRotateAboutX(HALF_PI_VALUE);
    Quaternion qy;
    qy.SetToRotateAboutY(HALF_PI_VALUE);
    EXPECT_THAT(qx * qy, IsNearQuaternion(0.5f, 0.5f, 0.5f, -0.5f));
    EXPECT_THAT(qy * qx, IsNearQuaternion(0.5f, 0.5f, 0.5f, 0.5f));
}

TEST(Quaternion, RotationsAboutTheAxesHoldTheHalfAngle) {
    Quaternion q = Junk();
    q.SetToRotateAboutX(HALF_PI_VALUE);
    EXPECT_THAT(q, IsNearQuaternion(ROOT_HALF, ROOT_HALF, 0.0f, 0.0f));
    q = Junk();
    q.SetToRotateAboutY(THIRD_PI);
    EXPECT_THAT(q, IsNearQuaternion(SQRT3_OVER_2, 0.0f, 0.5f, 0.0f));
    q = Junk();
    q.SetToRotateAboutZ(-THIRD_PI);
    EXPECT_THAT(q, IsNearQuaternion(SQRT3_OVER_2, 0.0f, 0.0f, -0.5f));
    q = Junk();
    q.SetToRotateAboutX(PI_VALUE);
    EXPECT_THAT(q, IsNearQuaternion(0.0f, 1.0f, 0.0f, 0.0f));
}

TEST(Quaternion, RotationAboutAnAxisTakesTheAxisAsItIs) {
    // (cos(pi/6), (0, 2, 0) * sin(pi/6)): the axis of length 2 is not normalised.
    Quaternion q = Junk();
    q.SetToRotateAboutAxis(Vector3d(0.0f, 2.0f, 0.0f), THIRD_PI);
    EXPECT_THAT(q, IsNearQuaternion(SQRT3_OVER_2, 0.0f, 1.0f, 0.0f));
    q = Junk();
    q.SetToRotateAboutAxis(Vector3d(0.6f, 0.0f, -0.8f), HALF_PI_VALUE);
    EXPECT_THAT(q, IsNearQuaternion(ROOT_HALF, 0.6f * ROOT_HALF, 0.0f, -0.8f * ROOT_HALF));
}

// Each row: an orientation and its object-to-inertial quaternion worked out from the half-angle
// sines and cosines; the inertial-to-object quaternion is its conjugate.
struct OrientationRow {
    char const* name;
    float pan;
    float tilt;
    float roll;
    float w;
    float x;
    float y;
    float z;
};

void PrintTo(OrientationRow const& row, std::ostream* out) {
    *out << row.name;
}

std::string OrientationName(::testing::TestParamInfo<OrientationRow> const& row) {
    return row.param.name;
}

class QuaternionOrientationTest : public ::testing::TestWithParam<OrientationRow> {};

TEST_P(QuaternionOrientationTest, ObjectToInertialFollowsTheHalfAngleTable) {
    OrientationRow const& row = GetParam();
    Quaternion q = Junk();
    q.SetToRotateObjectToInertial(EulerAngles(row.pan, row.tilt, row.roll));
    EXPECT_THAT(q, IsNearQuaternion(row.w, row.x, row.y, row.z));
}

TEST_P(QuaternionOrientationTest, InertialToObjectIsTheConjugate) {
    OrientationRow const& row = GetParam();
    Quaternion q = Junk();
    q.SetToRotateInertialToObject(EulerAngles(row.pan, row.tilt, row.roll));
    EXPECT_THAT(q, IsNearQuaternion(row.w, -row.x, -row.y, -row.z));
}

TEST_P(QuaternionOrientationTest, ObjectToInertialIsRollThenTiltThenPan) {
    // Hamilton's pan tilt roll, which is roll * tilt * pan in this engine's product.
    OrientationRow const& row = GetParam();
    Quaternion pan;
    pan.SetToRotateAboutY(row.pan);
    Quaternion tilt;
    tilt.SetToRotateAboutX(row.tilt);
    Quaternion roll;
    roll.SetToRotateAboutZ(row.roll);
    EXPECT_THAT(roll * tilt * pan, IsNearQuaternion(row.w, row.x, row.y, row.z));
}

// With sh, ch for pan/2, sp, cp for tilt/2 and sb, cb for roll/2: pan and roll of pi/2 make
// sh = ch = sb = cb = r, each product of two of them 1/2, so a tilt of pi/3 gives
// w = x = (cp + sp) / 2 and y = z = (cp - sp) / 2. A pan of -pi/2 turns sh into -r:
// w = (cp - sp) / 2, x = (sp - cp) / 2, y = -(cp + sp) / 2, z = (cp + sp) / 2.
INSTANTIATE_TEST_SUITE_P(
    , QuaternionOrientationTest,
    ::testing::Values(OrientationRow{"Level", 0.0f, 0.0f, 0.0f, 1.0f, 0.0f, 0.0f, 0.0f},
                      OrientationRow{"PanQuarterTurn", HALF_PI_VALUE, 0.0f, 0.0f, ROOT_HALF, 0.0f,
                                     ROOT_HALF, 0.0f},
                      OrientationRow{"PanHalfTurn", PI_VALUE, 0.0f, 0.0f, 0.0f, 0.0f, 1.0f, 0.0f},
                      OrientationRow{"TiltQuarterTurn", 0.0f, HALF_PI_VALUE, 0.0f, ROOT_HALF,
                                     ROOT_HALF, 0.0f, 0.0f},
                      OrientationRow{"RollQuarterTurn", 0.0f, 0.0f, HALF_PI_VALUE, ROOT_HALF, 0.0f,
                                     0.0f, ROOT_HALF},
                      OrientationRow{"AllThree", HALF_PI_VALUE, THIRD_PI, HALF_PI_VALUE,
                                     SUM_QUARTER, SUM_QUARTER, DIFFERENCE_QUARTER,
                                     DIFFERENCE_QUARTER},
                      OrientationRow{"AllThreeWithNegativePan", -HALF_PI_VALUE, THIRD_PI,
                                     HALF_PI_VALUE, DIFFERENCE_QUARTER, -DIFFERENCE_QUARTER,
                                     -SUM_QUARTER, SUM_QUARTER}),
    OrientationName);

TEST(Quaternion, NormaliseGivesUnitLength) {
    Quaternion q(1.0f, 2.0f, -2.0f, 4.0f);  // length 5
    q.Normalise();
    EXPECT_THAT(q, IsNearQuaternion(0.2f, 0.4f, -0.4f, 0.8f));
}

TEST(Quaternion, NormaliseTurnsZeroIntoTheIdentity) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Quaternion q(0.0f, 0.0f, 0.0f, 0.0f);
    q.Normalise();
    EXPECT_THAT(q, IsQuaternion(1.0f, 0.0f, 0.0f, 0.0f));
    EXPECT_EQ(0u, sink.Count());
}

TEST(Quaternion, RotationAngleIsTwiceTheArcCosineOfW) {
    EXPECT_THAT(Quaternion(SQRT3_OVER_2, 0.5f, 0.0f, 0.0f).GetRotationAngle(),
                FloatNear(THIRD_PI, TOLERANCE));
    EXPECT_THAT(Quaternion(0.0f, 1.0f, 0.0f, 0.0f).GetRotationAngle(),
                FloatNear(PI_VALUE, TOLERANCE));
    EXPECT_EQ(0.0f, Quaternion::Identity.GetRotationAngle());
}

TEST(Quaternion, RotationAngleOfAWJustAboveOneIsZero) {
    EXPECT_EQ(0.0f, Quaternion(1.0000001f, 0.0f, 0.0f, 0.0f).GetRotationAngle());
}

TEST(Quaternion, RotationAxisIsTheVectorPartOverTheSineOfTheHalfAngle) {
    // 1 - w * w is 0.25 and 0.64 in the first two: the vector part over 0.5 and over 0.8.
    EXPECT_THAT(Quaternion(SQRT3_OVER_2, 0.0f, 0.0f, 0.5f).GetRotationAxis(),
                IsNearVector(0.0f, 0.0f, 1.0f));
    EXPECT_THAT(Quaternion(0.6f, 0.48f, -0.64f, 0.0f).GetRotationAxis(),
                IsNearVector(0.6f, -0.8f, 0.0f));
    EXPECT_THAT(Quaternion(0.0f, 2.0f, 0.0f, 0.0f).GetRotationAxis(),
                IsNearVector(2.0f, 0.0f, 0.0f));
}

TEST(Quaternion, RotationAxisWithoutARotationIsX) {
    Vector3d const axis = Quaternion::Identity.GetRotationAxis();
    EXPECT_EQ(1.0f, axis.x);
    EXPECT_EQ(0.0f, axis.y);
    EXPECT_EQ(0.0f, axis.z);
    Vector3d const beyond = Quaternion(2.0f, 1.0f, 1.0f, 1.0f).GetRotationAxis();
    EXPECT_EQ(1.0f, beyond.x);
    EXPECT_EQ(0.0f, beyond.y);
    EXPECT_EQ(0.0f, beyond.z);
}

TEST(Quaternion, DotProductSumsTheComponentProducts) {
    EXPECT_EQ(70.0f,
              DotProduct(Quaternion(1.0f, 2.0f, 3.0f, 4.0f), Quaternion(5.0f, 6.0f, 7.0f, 8.0f)));
    EXPECT_EQ(-2.0f,
              DotProduct(Quaternion(1.0f, 0.0f, -1.0f, 0.0f), Quaternion(-1.0f, 0.0f, 1.0f, 0.0f)));
}

TEST(Quaternion, ConjugateNegatesTheVectorPart) {
    EXPECT_THAT(Conjugate(Quaternion(1.0f, 2.0f, -3.0f, 4.0f)),
                IsQuaternion(1.0f, -2.0f, 3.0f, -4.0f));
}

TEST(Quaternion, SlerpAtOrBeforeZeroIsTheFirst) {
    Quaternion const a(0.5f, 0.5f, 0.5f, 0.5f);
    Quaternion const b(ROOT_HALF, 0.0f, 0.0f, ROOT_HALF);
    EXPECT_THAT(Slerp(a, b, 0.0f), IsQuaternion(0.5f, 0.5f, 0.5f, 0.5f));
    EXPECT_THAT(Slerp(a, b, -0.5f), IsQuaternion(0.5f, 0.5f, 0.5f, 0.5f));
}

TEST(Quaternion, SlerpAtOrAfterOneIsTheSecondUnnegated) {
    Quaternion const a = Quaternion::Identity;
    Quaternion const b(-ROOT_HALF, 0.0f, 0.0f, -ROOT_HALF);
    ASSERT_LT(DotProduct(a, b), 0.0f);
    EXPECT_THAT(Slerp(a, b, 1.0f), IsQuaternion(-ROOT_HALF, 0.0f, 0.0f, -ROOT_HALF));
    EXPECT_THAT(Slerp(a, b, 2.0f), IsQuaternion(-ROOT_HALF, 0.0f, 0.0f, -ROOT_HALF));
}

TEST(Quaternion, SlerpFollowsTheArc) {
    // From no turn to a quarter turn about z: a fraction t of the way is a turn of t pi/2.
    Quaternion const a = Quaternion::Identity;
    Quaternion const b(ROOT_HALF, 0.0f, 0.0f, ROOT_HALF);
    EXPECT_THAT(Slerp(a, b, 0.5f), IsNearQuaternion(COS_EIGHTH_PI, 0.0f, 0.0f, SIN_EIGHTH_PI));
    EXPECT_THAT(Slerp(a, b, 0.25f),
                IsNearQuaternion(COS_SIXTEENTH_PI, 0.0f, 0.0f, SIN_SIXTEENTH_PI));
}

TEST(Quaternion, SlerpTakesTheShortWayWhenTheDotProductIsNegative) {
    // -b is the same rotation as b; the way from a to b is through -b's side.
    Quaternion const a = Quaternion::Identity;
    Quaternion const b(-ROOT_HALF, 0.0f, 0.0f, -ROOT_HALF);
    EXPECT_THAT(Slerp(a, b, 0.5f), IsNearQuaternion(COS_EIGHTH_PI, 0.0f, 0.0f, SIN_EIGHTH_PI));
}

TEST(Quaternion, SlerpOfNearlyEqualQuaternionsIsLinearAndNotNormalised) {
    // b = (cos 0.01, 0, 0, sin 0.01), so the dot product is 0.99995. A quarter of the way is
    // 0.75 a + 0.25 b = (0.75 + 0.25 cos 0.01, 0, 0, 0.25 sin 0.01), a little short of unit
    // length, where the arc would give (cos 0.0025, 0, 0, sin 0.0025).
    Quaternion const a = Quaternion::Identity;
    Quaternion const b(0.99995f, 0.0f, 0.0f, 0.0099998333f);
    EXPECT_THAT(Slerp(a, b, 0.25f), IsNearQuaternion(0.9999875f, 0.0f, 0.0f, 0.0024999583f));
}

TEST(Quaternion, SlerpOfADotProductAboveOneIsLinear) {
    EXPECT_THAT(Slerp(Quaternion::Identity, Quaternion(2.0f, 0.0f, 0.0f, 0.0f), 0.25f),
                IsNearQuaternion(1.25f, 0.0f, 0.0f, 0.0f));
}

TEST(Quaternion, PowerScalesTheAngle) {
    Quaternion const quarter_turn_about_z(ROOT_HALF, 0.0f, 0.0f, ROOT_HALF);
    EXPECT_THAT(Power(quarter_turn_about_z, 2.0f), IsNearQuaternion(0.0f, 0.0f, 0.0f, 1.0f));
    EXPECT_THAT(Power(quarter_turn_about_z, 0.5f),
                IsNearQuaternion(COS_EIGHTH_PI, 0.0f, 0.0f, SIN_EIGHTH_PI));
    EXPECT_THAT(Power(quarter_turn_about_z, 0.0f), IsNearQuaternion(1.0f, 0.0f, 0.0f, 0.0f));
    // A third of a turn about x, cubed: half angle pi/6 to pi/2, k = sin(pi/2) / sin(pi/6) = 2.
    Quaternion const third_turn_about_x(SQRT3_OVER_2, 0.5f, 0.0f, 0.0f);
    EXPECT_THAT(Power(third_turn_about_x, 3.0f), IsNearQuaternion(0.0f, 1.0f, 0.0f, 0.0f));
}

TEST(Quaternion, PowerOfNearlyNoTurnIsTheQuaternionUnchanged) {
    EXPECT_THAT(Power(Quaternion(0.99995f, 0.01f, 0.0f, 0.0f), 3.0f),
                IsQuaternion(0.99995f, 0.01f, 0.0f, 0.0f));
    EXPECT_THAT(Power(Quaternion(-1.0f, 0.0f, 0.0f, 0.0f), 0.5f),
                IsQuaternion(-1.0f, 0.0f, 0.0f, 0.0f));
}

TEST(Quaternion, AssignmentToItselfWarnsAndKeepsTheValue) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Quaternion q(1.0f, 2.0f, 3.0f, 4.0f);
    Quaternion const& same = q;
    EXPECT_EQ(&q, &(q = same));
    EXPECT_THAT(q, IsQuaternion(1.0f, 2.0f, 3.0f, 4.0f));
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of %s object\n", lines[0].format);
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of Quaternion object\n", lines[0].text);
}

TEST(Quaternion, AssignmentFromAnotherCopiesSilently) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Quaternion q;
    Quaternion const other(-1.0f, 2.0f, -3.0f, 4.0f);
    EXPECT_EQ(&q, &(q = other));
    EXPECT_THAT(q, IsQuaternion(-1.0f, 2.0f, -3.0f, 4.0f));
    EXPECT_EQ(0u, sink.Count());
}

}  // namespace
}  // namespace quorvel::vexmap
