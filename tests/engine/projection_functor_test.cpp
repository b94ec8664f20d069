#include "vexmap/projection_functor.h"

#include <cerrno>
#include <set>
#include <utility>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/error.h"
#include "vexmap/floating_point.h"

namespace quorvel::vexmap {
namespace {

using ::testing::HasSubstr;
using ::testing::ThrowsMessage;
using Functor = ProjectionFunctor;

struct Entry {
    int from;
    int to;
    ConversionFunction function;
};

// Every pair the table answers, each with the member of its own two names: sources 0 to 11, 13
// and 15, targets 0 to 11 and 13 to 15.
Entry const EXPECTED[] = {
    {0, 0, &Projection::RectilinearToRectilinear},
    {0, 1, &Projection::RectilinearToCylindrical},
    {0, 2, &Projection::RectilinearToEquirectangular},
    {0, 3, &Projection::RectilinearToMercator},
    {0, 4, &Projection::RectilinearToLambertCylindrical},
    {0, 5, &Projection::RectilinearToMillerCylindrical},
    {0, 6, &Projection::RectilinearToPannini},
    {0, 7, &Projection::RectilinearToArchitectural},
    {0, 8, &Projection::RectilinearToEquirectangularPannini},
    {0, 9, &Projection::RectilinearToStereographic},
    {0, 10, &Projection::RectilinearToOrthographic},
    {0, 11, &Projection::RectilinearToEquisolid},
    {0, 13, &Projection::RectilinearToFisheye},
    {0, 14, &Projection::RectilinearToSpherical},
    {0, 15, &Projection::RectilinearToMirror},
    {1, 0, &Projection::CylindricalToRectilinear},
    {1, 1, &Projection::CylindricalToCylindrical},
    {1, 2, &Projection::CylindricalToEquirectangular},
    {1, 3, &Projection::CylindricalToMercator},
    {1, 4, &Projection::CylindricalToLambertCylindrical},
    {1, 5, &Projection::CylindricalToMillerCylindrical},
    {1, 6, &Projection::CylindricalToPannini},
    {1, 7, &Projection::CylindricalToArchitectural},
    {1, 8, &Projection::CylindricalToEquirectangularPannini},
    {1, 9, &Projection::CylindricalToStereographic},
    {1, 10, &Projection::CylindricalToOrthographic},
    {1, 11, &Projection::CylindricalToEquisolid},
    {1, 13, &Projection::CylindricalToFisheye},
    {1, 14, &Projection::CylindricalToSpherical},
    {1, 15, &Projection::CylindricalToMirror},
    {2, 0, &Projection::EquirectangularToRectilinear},
    {2, 1, &Projection::EquirectangularToCylindrical},
    {2, 2, &Projection::EquirectangularToEquirectangular},
    {2, 3, &Projection::EquirectangularToMercator},
    {2, 4, &Projection::EquirectangularToLambertCylindrical},
    {2, 5, &Projection::EquirectangularToMillerCylindrical},
    {2, 6, &Projection::EquirectangularToPannini},
    {2, 7, &Projection::EquirectangularToArchitectural},
    {2, 8, &Projection::EquirectangularToEquirectangularPannini},
    {2, 9, &Projection::EquirectangularToStereographic},
    {2, 10, &Projection::EquirectangularToOrthographic},
    {2, 11, &Projection::EquirectangularToEquisolid},
    {2, 13, &Projection::EquirectangularToFisheye},
    {2, 14, &Projection::EquirectangularToSpherical},
    {2, 15, &Projection::EquirectangularToMirror},
    {3, 0, &Projection::MercatorToRectilinear},
    {3, 1, &Projection::MercatorToCylindrical},
    {3, 2, &Projection::MercatorToEquirectangular},
    {3, 3, &Projection::MercatorToMercator},
    {3, 4, &Projection::MercatorToLambertCylindrical},
    {3, 5, &Projection::MercatorToMillerCylindrical},
    {3, 6, &Projection::MercatorToPannini},
    {3, 7, &Projection::MercatorToArchitectural},
    {3, 8, &Projection::MercatorToEquirectangularPannini},
    {3, 9, &Projection::MercatorToStereographic},
    {3, 10, &Projection::MercatorToOrthographic},
    {3, 11, &Projection::MercatorToEquisolid},
    {3, 13, &Projection::MercatorToFisheye},
    {3, 14, &Projection::MercatorToSpherical},
    {3, 15, &Projection::MercatorToMirror},
    {4, 0, &Projection::LambertCylindricalToRectilinear},
    {4, 1, &Projection::LambertCylindricalToCylindrical},
    {4, 2, &Projection::LambertCylindricalToEquirectangular},
    {4, 3, &Projection::LambertCylindricalToMercator},
    {4, 4, &Projection::LambertCylindricalToLambertCylindrical},
    {4, 5, &Projection::LambertCylindricalToMillerCylindrical},
    {4, 6, &Projection::LambertCylindricalToPannini},
    {4, 7, &Projection::LambertCylindricalToArchitectural},
    {4, 8, &Projection::LambertCylindricalToEquirectangularPannini},
    {4, 9, &Projection::LambertCylindricalToStereographic},
    {4, 10, &Projection::LambertCylindricalToOrthographic},
    {4, 11, &Projection::LambertCylindricalToEquisolid},
    {4, 13, &Projection::LambertCylindricalToFisheye},
    {4, 14, &Projection::LambertCylindricalToSpherical},
    {4, 15, &Projection::LambertCylindricalToMirror},
    {5, 0, &Projection::MillerCylindricalToRectilinear},
    {5, 1, &Projection::MillerCylindricalToCylindrical},
    {5, 2, &Projection::MillerCylindricalToEquirectangular},
    {5, 3, &Projection::MillerCylindricalToMercator},
    {5, 4, &Projection::MillerCylindricalToLambertCylindrical},
    {5, 5, &Projection::MillerCylindricalToMillerCylindrical},
    {5, 6, &Projection::MillerCylindricalToPannini},
    {5, 7, &Projection::MillerCylindricalToArchitectural},
    {5, 8, &Projection::MillerCylindricalToEquirectangularPannini},
    {5, 9, &Projection::MillerCylindricalToStereographic},
    {5, 10, &Projection::MillerCylindricalToOrthographic},
    {5, 11, &Projection::MillerCylindricalToEquisolid},
    {5, 13, &Projection::MillerCylindricalToFisheye},
    {5, 14, &Projection::MillerCylindricalToSpherical},
    {5, 15, &Projection::MillerCylindricalToMirror},
    {6, 0, &Projection::PanniniToRectilinear},
    {6, 1, &Projection::PanniniToCylindrical},
    {6, 2, &Projection::PanniniToEquirectangular},
    {6, 3, &Projection::PanniniToMercator},
    {6, 4, &Projection::PanniniToLambertCylindrical},
    {6, 5, &Projection::PanniniToMillerCylindrical},
    {6, 6, &Projection::PanniniToPannini},
    {6, 7, &Projection::PanniniToArchitectural},
    {6, 8, &Projection::PanniniToEquirectangularPannini},
    {6, 9, &Projection::PanniniToStereographic},
    {6, 10, &Projection::PanniniToOrthographic},
    {6, 11, &Projection::PanniniToEquisolid},
    {6, 13, &Projection::PanniniToFisheye},
    {6, 14, &Projection::PanniniToSpherical},
    {6, 15, &Projection::PanniniToMirror},
    {7, 0, &Projection::ArchitecturalToRectilinear},
    {7, 1, &Projection::ArchitecturalToCylindrical},
    {7, 2, &Projection::ArchitecturalToEquirectangular},
    {7, 3, &Projection::ArchitecturalToMercator},
    {7, 4, &Projection::ArchitecturalToLambertCylindrical},
    {7, 5, &Projection::ArchitecturalToMillerCylindrical},
    {7, 6, &Projection::ArchitecturalToPannini},
    {7, 7, &Projection::ArchitecturalToArchitectural},
    {7, 8, &Projection::ArchitecturalToEquirectangularPannini},
    {7, 9, &Projection::ArchitecturalToStereographic},
    {7, 10, &Projection::ArchitecturalToOrthographic},
    {7, 11, &Projection::ArchitecturalToEquisolid},
    {7, 13, &Projection::ArchitecturalToFisheye},
    {7, 14, &Projection::ArchitecturalToSpherical},
    {7, 15, &Projection::ArchitecturalToMirror},
    {8, 0, &Projection::EquirectangularPanniniToRectilinear},
    {8, 1, &Projection::EquirectangularPanniniToCylindrical},
    {8, 2, &Projection::EquirectangularPanniniToEquirectangular},
    {8, 3, &Projection::EquirectangularPanniniToMercator},
    {8, 4, &Projection::EquirectangularPanniniToLambertCylindrical},
    {8, 5, &Projection::EquirectangularPanniniToMillerCylindrical},
    {8, 6, &Projection::EquirectangularPanniniToPannini},
    {8, 7, &Projection::EquirectangularPanniniToArchitectural},
    {8, 8, &Projection::EquirectangularPanniniToEquirectangularPannini},
    {8, 9, &Projection::EquirectangularPanniniToStereographic},
    {8, 10, &Projection::EquirectangularPanniniToOrthographic},
    {8, 11, &Projection::EquirectangularPanniniToEquisolid},
    {8, 13, &Projection::EquirectangularPanniniToFisheye},
    {8, 14, &Projection::EquirectangularPanniniToSpherical},
    {8, 15, &Projection::EquirectangularPanniniToMirror},
    {9, 0, &Projection::StereographicToRectilinear},
    {9, 1, &Projection::StereographicToCylindrical},
    {9, 2, &Projection::StereographicToEquirectangular},
    {9, 3, &Projection::StereographicToMercator},
    {9, 4, &Projection::StereographicToLambertCylindrical},
    {9, 5, &Projection::StereographicToMillerCylindrical},
    {9, 6, &Projection::StereographicToPannini},
    {9, 7, &Projection::StereographicToArchitectural},
    {9, 8, &Projection::StereographicToEquirectangularPannini},
    {9, 9, &Projection::StereographicToStereographic},
    {9, 10, &Projection::StereographicToOrthographic},
    {9, 11, &Projection::StereographicToEquisolid},
    {9, 13, &Projection::StereographicToFisheye},
    {9, 14, &Projection::StereographicToSpherical},
    {9, 15, &Projection::StereographicToMirror},
    {10, 0, &Projection::OrthographicToRectilinear},
    {10, 1, &Projection::OrthographicToCylindrical},
    {10, 2, &Projection::OrthographicToEquirectangular},
    {10, 3, &Projection::OrthographicToMercator},
    {10, 4, &Projection::OrthographicToLambertCylindrical},
    {10, 5, &Projection::OrthographicToMillerCylindrical},
    {10, 6, &Projection::OrthographicToPannini},
    {10, 7, &Projection::OrthographicToArchitectural},
    {10, 8, &Projection::OrthographicToEquirectangularPannini},
    {10, 9, &Projection::OrthographicToStereographic},
    {10, 10, &Projection::OrthographicToOrthographic},
    {10, 11, &Projection::OrthographicToEquisolid},
    {10, 13, &Projection::OrthographicToFisheye},
    {10, 14, &Projection::OrthographicToSpherical},
    {10, 15, &Projection::OrthographicToMirror},
    {11, 0, &Projection::EquisolidToRectilinear},
    {11, 1, &Projection::EquisolidToCylindrical},
    {11, 2, &Projection::EquisolidToEquirectangular},
    {11, 3, &Projection::EquisolidToMercator},
    {11, 4, &Projection::EquisolidToLambertCylindrical},
    {11, 5, &Projection::EquisolidToMillerCylindrical},
    {11, 6, &Projection::EquisolidToPannini},
    {11, 7, &Projection::EquisolidToArchitectural},
    {11, 8, &Projection::EquisolidToEquirectangularPannini},
    {11, 9, &Projection::EquisolidToStereographic},
    {11, 10, &Projection::EquisolidToOrthographic},
    {11, 11, &Projection::EquisolidToEquisolid},
    {11, 13, &Projection::EquisolidToFisheye},
    {11, 14, &Projection::EquisolidToSpherical},
    {11, 15, &Projection::EquisolidToMirror},
    {13, 0, &Projection::FisheyeToRectilinear},
    {13, 1, &Projection::FisheyeToCylindrical},
    {13, 2, &Projection::FisheyeToEquirectangular},
    {13, 3, &Projection::FisheyeToMercator},
    {13, 4, &Projection::FisheyeToLambertCylindrical},
    {13, 5, &Projection::FisheyeToMillerCylindrical},
    {13, 6, &Projection::FisheyeToPannini},
    {13, 7, &Projection::FisheyeToArchitectural},
    {13, 8, &Projection::FisheyeToEquirectangularPannini},
    {13, 9, &Projection::FisheyeToStereographic},
    {13, 10, &Projection::FisheyeToOrthographic},
    {13, 11, &Projection::FisheyeToEquisolid},
    {13, 13, &Projection::FisheyeToFisheye},
    {13, 14, &Projection::FisheyeToSpherical},
    {13, 15, &Projection::FisheyeToMirror},
    {15, 0, &Projection::MirrorToRectilinear},
    {15, 1, &Projection::MirrorToCylindrical},
    {15, 2, &Projection::MirrorToEquirectangular},
    {15, 3, &Projection::MirrorToMercator},
    {15, 4, &Projection::MirrorToLambertCylindrical},
    {15, 5, &Projection::MirrorToMillerCylindrical},
    {15, 6, &Projection::MirrorToPannini},
    {15, 7, &Projection::MirrorToArchitectural},
    {15, 8, &Projection::MirrorToEquirectangularPannini},
    {15, 9, &Projection::MirrorToStereographic},
    {15, 10, &Projection::MirrorToOrthographic},
    {15, 11, &Projection::MirrorToEquisolid},
    {15, 13, &Projection::MirrorToFisheye},
    {15, 14, &Projection::MirrorToSpherical},
    {15, 15, &Projection::MirrorToMirror},
};

Functor::_PROJECTION P(int value) {
    return static_cast<Functor::_PROJECTION>(value);
}

TEST(ProjectionFunctor, TheTableHoldsTwoHundredAndTenConversions) {
    EXPECT_EQ(210u, sizeof EXPECTED / sizeof EXPECTED[0]);
}

TEST(ProjectionFunctor, EveryPairOfTheTableGivesTheMemberOfItsNames) {
    for (Entry const& entry : EXPECTED) {
        EXPECT_EQ(entry.function, Functor::GetProjection(P(entry.from), P(entry.to)))
            << entry.from << " to " << entry.to;
    }
}

TEST(ProjectionFunctor, EveryOtherPairOfTheSixteenBySixteenThrows) {
    std::set<std::pair<int, int>> answered;
    for (Entry const& entry : EXPECTED) {
        answered.insert({entry.from, entry.to});
    }
    for (int from = 0; from < 16; ++from) {
        for (int to = 0; to < 16; ++to) {
            if (answered.count({from, to}) == 0) {
                EXPECT_THROW(Functor::GetProjection(P(from), P(to)), Error) << from << " to " << to;
            }
        }
    }
}

TEST(ProjectionFunctor, ReservedAsTargetThrowsInvalidProjectionAndSetsTheLastError) {
    errno = 0;
    EXPECT_THAT(
        [] {
            Functor::GetProjection(Functor::PROJECTION_RECTILINEAR, Functor::PROJECTION_RESERVED);
        },
        ThrowsMessage<Error>(
            HasSubstr("(ProjectionFunctor::GetProjection@src/projection_functor:")));
    EXPECT_EQ(EINVAL, errno);
    EXPECT_THAT(
        [] { Functor::GetProjection(Functor::PROJECTION_RESERVED, Functor::PROJECTION_FISHEYE); },
        ThrowsMessage<Error>(HasSubstr("[Error EINVAL (22)] - Invalid projection")));
}

TEST(ProjectionFunctor, NothingConvertsOutOfSphericalNotEvenToSpherical) {
    EXPECT_THROW(
        Functor::GetProjection(Functor::PROJECTION_SPHERICAL, Functor::PROJECTION_SPHERICAL),
        Error);
    EXPECT_THROW(
        Functor::GetProjection(Functor::PROJECTION_SPHERICAL, Functor::PROJECTION_EQUIRECTANGULAR),
        Error);
}

TEST(ProjectionFunctor, MirrorToSphericalIsInTheTable) {
    EXPECT_EQ(&Projection::MirrorToSpherical,
              Functor::GetProjection(Functor::PROJECTION_MIRROR, Functor::PROJECTION_SPHERICAL));
}

TEST(ProjectionFunctor, ValuesBeyondTheTableThrow) {
    EXPECT_THROW(Functor::GetProjection(P(16), P(2)), Error);
    EXPECT_THROW(Functor::GetProjection(P(2), P(-1)), Error);
    EXPECT_THROW(Functor::GetProjection(P(1 << 16), P(0)), Error);
}

TEST(ProjectionFunctor, CameraTypesConvertToTheirImagesProjection) {
    EXPECT_EQ(Functor::PROJECTION_RECTILINEAR,
              Functor::ConvertCamera(DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR));
    EXPECT_EQ(Functor::PROJECTION_FISHEYE,
              Functor::ConvertCamera(DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE));
}

TEST(ProjectionFunctor, AnUnknownCameraTypeThrowsInvalidCameraType) {
    errno = 0;
    EXPECT_THAT([] { Functor::ConvertCamera(static_cast<_DEWARP_INTERNAL_CAMERA_TYPE>(2)); },
                ThrowsMessage<Error>(
                    HasSubstr("(ProjectionFunctor::ConvertCamera@src/projection_functor:")));
    EXPECT_THAT([] { Functor::ConvertCamera(static_cast<_DEWARP_INTERNAL_CAMERA_TYPE>(2)); },
                ThrowsMessage<Error>(HasSubstr("[Error EINVAL (22)] - Invalid camera type")));
    EXPECT_EQ(EINVAL, errno);
}

TEST(ProjectionFunctor, MixedFormsStartWhereTheirFirstArgumentSays) {
    EXPECT_EQ(&Projection::FisheyeToCylindrical,
              Functor::GetProjection(DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE,
                                     DEWARP_PROJECTION_CYLINDRICAL));
    EXPECT_EQ(&Projection::CylindricalToRectilinear,
              Functor::GetProjection(DEWARP_PROJECTION_CYLINDRICAL,
                                     DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR));
}

TEST(ProjectionFunctor, DefaultReturnsThePointWhateverItsNanFocalLength) {
    Functor functor;
    EXPECT_EQ(&Projection::EquirectangularToEquirectangular, functor.conversion);
    EXPECT_TRUE(FloatingPoint::is_nan(functor.focal_length));
    EXPECT_EQ(0.0f, functor.scale.x);
    Vector2d const point = functor.Call(Vector2d(12.5f, -3.0f));
    EXPECT_EQ(12.5f, point.x);
    EXPECT_EQ(-3.0f, point.y);
}

TEST(ProjectionFunctor, CallAppliesTheConversionAtTheFocalLength) {
    Functor functor(&Projection::EquirectangularToCylindrical, 100.0f, Vector2d(1.0f, 1.0f));
    Vector2d const expected =
        Projection::EquirectangularToCylindrical(Vector2d(30.0f, 40.0f), 100.0f);
    Vector2d const result = functor.Call(Vector2d(30.0f, 40.0f));
    EXPECT_EQ(expected.x, result.x);
    EXPECT_EQ(expected.y, result.y);
}

TEST(ProjectionFunctor, TwoProjectionsGoFromTheSecondToTheFirst) {
    Functor const functor(DEWARP_PROJECTION_RECTILINEAR, DEWARP_PROJECTION_MERCATOR, 10.0f,
                          Projection::IdentityScale);
    EXPECT_EQ(&Projection::MercatorToRectilinear, functor.conversion);
}

TEST(ProjectionFunctor, CameraFirstGoesFromTheCamerasImage) {
    Functor const from_camera(DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE,
                              DEWARP_PROJECTION_EQUIRECTANGULAR, 10.0f, Projection::IdentityScale);
    EXPECT_EQ(&Projection::FisheyeToEquirectangular, from_camera.conversion);
    Functor const to_camera(DEWARP_PROJECTION_EQUIRECTANGULAR,
                            DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, 10.0f,
                            Projection::IdentityScale);
    EXPECT_EQ(&Projection::EquirectangularToFisheye, to_camera.conversion);
    EXPECT_EQ(10.0f, to_camera.focal_length);
}

TEST(ProjectionFunctor, ANullFunctionThrowsAndLeavesTheEarlierConversion) {
    Functor functor(&Projection::MercatorToPannini, 5.0f, Vector2d(2.0f, 3.0f));
    EXPECT_THAT([&functor] { functor.Set(nullptr, 9.0f, Vector2d()); },
                ThrowsMessage<Error>(HasSubstr("ProjectionFunctor::Set@")));
    EXPECT_EQ(&Projection::MercatorToPannini, functor.conversion);
    EXPECT_EQ(5.0f, functor.focal_length);
    EXPECT_EQ(3.0f, functor.scale.y);
}

TEST(ProjectionFunctor, AFailedSetFromTheTableLeavesTheFunctorUnchanged) {
    Functor functor(&Projection::MercatorToPannini, 5.0f, Vector2d(2.0f, 3.0f));
    EXPECT_THROW(functor.Set(DEWARP_PROJECTION_RECTILINEAR,
                             static_cast<_DEWARP_INTERNAL_CAMERA_TYPE>(7), 9.0f, Vector2d()),
                 Error);
    EXPECT_THROW(functor.Set(static_cast<_DEWARP_PROJECTION>(12), DEWARP_PROJECTION_RECTILINEAR,
                             9.0f, Vector2d()),
                 Error);
    EXPECT_EQ(&Projection::MercatorToPannini, functor.conversion);
    EXPECT_EQ(5.0f, functor.focal_length);
}

TEST(ProjectionFunctor, FunctorsDifferingOnlyInScaleGiveIdenticalResults) {
    Functor first(&Projection::FisheyeToEquirectangular, 250.0f, Vector2d(1.0f, 1.0f));
    Functor second(&Projection::FisheyeToEquirectangular, 250.0f, Vector2d(7.0f, -3.0f));
    for (Vector2d const& point : {Vector2d(10.0f, 20.0f), Vector2d(-300.0f, 120.0f)}) {
        Vector2d const a = first.Call(point);
        Vector2d const b = second.Call(point);
        EXPECT_EQ(a.x, b.x);
        EXPECT_EQ(a.y, b.y);
    }
}

TEST(ProjectionFunctor, ResetRestoresTheDefaultState) {
    Functor functor(&Projection::MercatorToPannini, 5.0f, Vector2d(2.0f, 3.0f));
    functor.Reset();
    EXPECT_EQ(&Projection::EquirectangularToEquirectangular, functor.conversion);
    EXPECT_TRUE(FloatingPoint::is_nan(functor.focal_length));
    EXPECT_EQ(0.0f, functor.scale.x);
}

TEST(ProjectionFunctor, CopiesCarryAllThreeMembersAndSelfAssignmentWarns) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    Functor const source(&Projection::MercatorToPannini, 5.0f, Vector2d(2.0f, 3.0f));
    Functor copy(source);
    EXPECT_EQ(&Projection::MercatorToPannini, copy.conversion);
    Functor assigned;
    assigned = source;
    EXPECT_EQ(5.0f, assigned.focal_length);
    EXPECT_EQ(2.0f, assigned.scale.x);
    Functor& same = assigned;
    assigned = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of ProjectionFunctor object\n", lines[0].text);
}

}  // namespace
}  // namespace quorvel::vexmap
