#include "vexmap/rotation_matrix_3d.h"

#include <array>
#include <cmath>
#include <cstddef>
#include <ostream>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/euler_angles.h"
#include "vexmap/quaternion.h"

namespace quorvel::vexmap {
namespace {

using ::testing::AllOf;
using ::testing::Eq;
using ::testing::Field;
using ::testing::FloatNear;
using ::testing::Matcher;

constexpr float TOLERANCE = 1e-6f;
constexpr float HALF_PI_VALUE = 1.57079633f;
constexpr float THIRD_PI = 1.04719755f;
constexpr float ROOT_HALF = 0.70710678f;

using Elements = std::array<float, 9>;  // row by row

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

// The right-handed turns about the axes.
Elements AboutX(float angle) {
    float const c = std::cos(angle);
    float const s = std::sin(angle);
    return {1, 0, 0, 0, c, -s, 0, s, c};
}

Elements AboutY(float angle) {
    float const c = std::cos(angle);
    float const s = std::sin(angle);
    return {c, 0, s, 0, 1, 0, -s, 0, c};
}

Elements AboutZ(float angle) {
    float const c = std::cos(angle);
    float const s = std::sin(angle);
    return {c, -s, 0, s, c, 0, 0, 0, 1};
}

Matcher<RotationMatrix3d> HasElements(Elements const& e, float tolerance = 0.0f) {
    auto near = [tolerance](float value) -> Matcher<float> {
        if (tolerance > 0.0f) {
            return FloatNear(value, tolerance);
        }
        return Eq(value);
    };
    return AllOf(Field("m11", &RotationMatrix3d::m11, near(e[0])),
                 Field("m12", &RotationMatrix3d::m12, near(e[1])),
                 Field("m13", &RotationMatrix3d::m13, near(e[2])),
                 Field("m21", &RotationMatrix3d::m21, near(e[3])),
                 Field("m22", &RotationMatrix3d::m22, near(e[4])),
                 Field("m23", &RotationMatrix3d::m23, near(e[5])),
                 Field("m31", &RotationMatrix3d::m31, near(e[6])),
                 Field("m32", &RotationMatrix3d::m32, near(e[7])),
                 Field("m33", &RotationMatrix3d::m33, near(e[8])));
}

Elements ElementsOf(RotationMatrix3d const& m) {
    return {m.m11, m.m12, m.m13, m.m21, m.m22, m.m23, m.m31, m.m32, m.m33};
}

Matcher<Vector3d> IsVector(float x, float y, float z, float tolerance = 0.0f) {
    if (tolerance > 0.0f) {
        return AllOf(Field("x", &Vector3d::x, FloatNear(x, tolerance)),
                     Field("y", &Vector3d::y, FloatNear(y, tolerance)),
                     Field("z", &Vector3d::z, FloatNear(z, tolerance)));
    }
    return AllOf(Field("x", &Vector3d::x, Eq(x)), Field("y", &Vector3d::y, Eq(y)),
                 Field("z", &Vector3d::z, Eq(z)));
}

RotationMatrix3d Make(Elements const& e) {
    RotationMatrix3d m;
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

Elements const IDENTITY = {1, 0, 0, 0, 1, 0, 0, 0, 1};
Elements const SEVENS = {7, 7, 7, 7, 7, 7, 7, 7, 7};  // whatever a setup has to overwrite

TEST(RotationMatrix3d, DefaultIsIdentity) {
    EXPECT_THAT(RotationMatrix3d(), HasElements(IDENTITY));
}

TEST(RotationMatrix3d, IdentityConstantIsIdentity) {
    EXPECT_THAT(RotationMatrix3d::Identity, HasElements(IDENTITY));
}

TEST(RotationMatrix3d, SetIdentityOverwritesEveryElement) {
    RotationMatrix3d m = Make(SEVENS);
    m.SetIdentity();
    EXPECT_THAT(m, HasElements(IDENTITY));
}

TEST(RotationMatrix3d, ConstructorsFromAnglesAreSetup) {
    RotationMatrix3d expected = Make(SEVENS);
    expected.Setup(EulerAngles(0.3f, -0.4f, 0.5f));
    EXPECT_THAT(RotationMatrix3d(EulerAngles(0.3f, -0.4f, 0.5f)),
                HasElements(ElementsOf(expected)));
    EXPECT_THAT(RotationMatrix3d(0.3f, -0.4f, 0.5f), HasElements(ElementsOf(expected)));
}

TEST(RotationMatrix3d, PanOfAQuarterTurnLooksAlongX) {
    RotationMatrix3d const m(HALF_PI_VALUE, 0.0f, 0.0f);
    EXPECT_THAT(m, HasElements({0, 0, 1, 0, 1, 0, -1, 0, 0}, TOLERANCE));
    EXPECT_THAT(m.ObjectToInertial(Vector3d(0.0f, 0.0f, 1.0f)),
                IsVector(1.0f, 0.0f, 0.0f, TOLERANCE));
    EXPECT_THAT(m.ObjectToInertial(Vector3d(1.0f, 0.0f, 0.0f)),
                IsVector(0.0f, 0.0f, -1.0f, TOLERANCE));
}

TEST(RotationMatrix3d, TiltOfAQuarterTurnLooksDown) {
    RotationMatrix3d const m(0.0f, HALF_PI_VALUE, 0.0f);
    EXPECT_THAT(m, HasElements({1, 0, 0, 0, 0, -1, 0, 1, 0}, TOLERANCE));
    EXPECT_THAT(m.ObjectToInertial(Vector3d(0.0f, 0.0f, 1.0f)),
                IsVector(0.0f, -1.0f, 0.0f, TOLERANCE));
}

TEST(RotationMatrix3d, RollOfAQuarterTurnTurnsXIntoY) {
    RotationMatrix3d const m(0.0f, 0.0f, HALF_PI_VALUE);
    EXPECT_THAT(m, HasElements({0, -1, 0, 1, 0, 0, 0, 0, 1}, TOLERANCE));
    EXPECT_THAT(m.ObjectToInertial(Vector3d(1.0f, 0.0f, 0.0f)),
                IsVector(0.0f, 1.0f, 0.0f, TOLERANCE));
}

TEST(RotationMatrix3d, ObjectToInertialIsMatrixTimesVector) {
    // (1 + 4 + 9, 4 + 10 + 18, 7 + 16 + 27)
    RotationMatrix3d const m = Make({1, 2, 3, 4, 5, 6, 7, 8, 9});
    EXPECT_THAT(m.ObjectToInertial(Vector3d(1.0f, 2.0f, 3.0f)), IsVector(14.0f, 32.0f, 50.0f));
}

TEST(RotationMatrix3d, InertialToObjectIsTransposeTimesVector) {
    // (1 + 8 + 21, 2 + 10 + 24, 3 + 12 + 27)
    RotationMatrix3d const m = Make({1, 2, 3, 4, 5, 6, 7, 8, 9});
    EXPECT_THAT(m.InertialToObject(Vector3d(1.0f, 2.0f, 3.0f)), IsVector(30.0f, 36.0f, 42.0f));
}

TEST(RotationMatrix3d, ObjectToInertialQuaternionFollowsItsTable) {
    // q = (1, 2, 3, 4), not of unit length, so each element is an integer:
    // 1 - 2 (9 + 16), 2 (6 - 4), 2 (8 + 3); 2 (6 + 4), 1 - 2 (4 + 16), 2 (12 - 2);
    // 2 (8 - 3), 2 (12 + 2), 1 - 2 (4 + 9).
    RotationMatrix3d m = Make(SEVENS);
    m.FromObjectToInertialQuaternion(Quaternion(1.0f, 2.0f, 3.0f, 4.0f));
    EXPECT_THAT(m, HasElements({-49, 4, 22, 20, -39, 20, 10, 28, -25}));
}

TEST(RotationMatrix3d, InertialToObjectQuaternionTakesWWithTheOtherSign) {
    // The same terms with -w in place of w: for (1, 2, 3, 4) the transpose of the table above.
    RotationMatrix3d m = Make(SEVENS);
    m.FromInertialToObjectQuaternion(Quaternion(1.0f, 2.0f, 3.0f, 4.0f));
    EXPECT_THAT(m, HasElements({-49, 20, 10, 4, -39, 28, 22, 20, -25}));
}

TEST(RotationMatrix3d, QuarterTurnQuaternionAboutYGivesTheQuarterTurnAboutY) {
    RotationMatrix3d m = Make(SEVENS);
    m.FromObjectToInertialQuaternion(Quaternion(ROOT_HALF, 0.0f, ROOT_HALF, 0.0f));
    EXPECT_THAT(m, HasElements({0, 0, 1, 0, 1, 0, -1, 0, 0}, TOLERANCE));
    RotationMatrix3d back = Make(SEVENS);
    back.FromInertialToObjectQuaternion(Quaternion(ROOT_HALF, 0.0f, ROOT_HALF, 0.0f));
    EXPECT_THAT(back, HasElements({0, 0, -1, 0, 1, 0, 1, 0, 0}, TOLERANCE));
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

class RotationMatrix3dOrientationTest : public ::testing::TestWithParam<Orientation> {
protected:
    EulerAngles Angles() const {
        return EulerAngles(GetParam().pan, GetParam().tilt, GetParam().roll);
    }
};

TEST_P(RotationMatrix3dOrientationTest, SetupIsPanTimesTiltTimesRoll) {
    Orientation const& o = GetParam();
    Elements const expected = Product(Product(AboutY(o.pan), AboutX(o.tilt)), AboutZ(o.roll));
    RotationMatrix3d m = Make(SEVENS);
    m.Setup(Angles());
    EXPECT_THAT(m, HasElements(expected, TOLERANCE));
}

TEST_P(RotationMatrix3dOrientationTest, InertialToObjectUndoesObjectToInertial) {
    RotationMatrix3d const m(Angles());
    Vector3d const v(0.25f, -0.5f, 2.0f);
    EXPECT_THAT(m.InertialToObject(m.ObjectToInertial(v)), IsVector(0.25f, -0.5f, 2.0f, 1e-5f));
    EXPECT_THAT(m.ObjectToInertial(m.InertialToObject(v)), IsVector(0.25f, -0.5f, 2.0f, 1e-5f));
}

TEST_P(RotationMatrix3dOrientationTest, ObjectToInertialQuaternionGivesTheSameMatrix) {
    Quaternion q;
    q.SetToRotateObjectToInertial(Angles());
    RotationMatrix3d m = Make(SEVENS);
    m.FromObjectToInertialQuaternion(q);
    EXPECT_THAT(m, HasElements(ElementsOf(RotationMatrix3d(Angles())), TOLERANCE));
}

TEST_P(RotationMatrix3dOrientationTest, InertialToObjectQuaternionGivesTheSameMatrix) {
    Quaternion q;
    q.SetToRotateInertialToObject(Angles());
    RotationMatrix3d m = Make(SEVENS);
    m.FromInertialToObjectQuaternion(q);
    EXPECT_THAT(m, HasElements(ElementsOf(RotationMatrix3d(Angles())), TOLERANCE));
}

INSTANTIATE_TEST_SUITE_P(, RotationMatrix3dOrientationTest,
                         ::testing::Values(Orientation{0.0f, 0.0f, 0.0f},
                                           Orientation{0.3f, -0.4f, 0.5f},
                                           Orientation{-2.5f, 1.2f, 3.0f},
                                           Orientation{1.0f, -1.5f, -2.0f},
                                           Orientation{3.0f, 0.1f, -0.1f},
                                           Orientation{HALF_PI_VALUE, THIRD_PI, HALF_PI_VALUE},
                                           Orientation{-0.7f, 0.9f, 0.0f}));

TEST(RotationMatrix3d, AssignmentToItselfWarnsAndKeepsTheValue) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    RotationMatrix3d m = Make({1, 2, 3, 4, 5, 6, 7, 8, 9});
    RotationMatrix3d const& same = m;
    EXPECT_EQ(&m, &(m = same));
    EXPECT_THAT(m, HasElements({1, 2, 3, 4, 5, 6, 7, 8, 9}));
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of %s object\n", lines[0].format);
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of RotationMatrix3d object\n", lines[0].text);
}

TEST(RotationMatrix3d, CopiesEveryElementSilently) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    RotationMatrix3d const source = Make({1, 2, 3, 4, 5, 6, 7, 8, 9});
    EXPECT_THAT(RotationMatrix3d(source), HasElements({1, 2, 3, 4, 5, 6, 7, 8, 9}));
    RotationMatrix3d m;
    EXPECT_EQ(&m, &(m = source));
    EXPECT_THAT(m, HasElements({1, 2, 3, 4, 5, 6, 7, 8, 9}));
    EXPECT_EQ(0u, sink.Count());
}

}  // namespace
}  // namespace quorvel::vexmap
