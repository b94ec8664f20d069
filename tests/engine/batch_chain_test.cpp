#include "vexmap/batch_chain.h"

#include <cstdint>
#include <limits>
#include <random>
#include <string>
#include <vector>

#include <boost/shared_ptr.hpp>
#include <gtest/gtest.h>

#include "available_lanes.h"
#include "vexmap/batch_lanes.h"
#include "vexmap/map_functors.h"
#include "vexmap/projection_functor.h"
#include "vexmap/spherical_orientation_functor.h"
#include "vexmap/transform_2d_functor.h"
#include "vexmap/trigonometry.h"
#include "vexmap/view.h"

namespace quorvel::vexmap {
namespace {

constexpr float F = 560.0f;  // pixels a radian, a 183-degree lens on a 1936 sensor
// Vector trigonometry is within a unit or two in the last place of the library's: a point of the
// chain moves by far less than a thousandth of a pixel.
constexpr float POINT_TOLERANCE = 2e-3f;

struct Points {
    std::vector<float> x;
    std::vector<float> y;
};

// A row of an output 1000 wide at several heights, and the centre itself.
Points Row() {
    Points points;
    for (float y : {-300.0f, -1.0f, 0.0f, 250.0f}) {
        for (int x = -500; x <= 500; x += 8) {
            points.x.push_back(float(x));
            points.y.push_back(y);
        }
    }
    return points;
}

void ExpectAsPointByPoint(MapFunctor& link, Points points, float tolerance) {
    Points batch = points;
    BatchChain chain(link);
    chain.Run(batch.x.data(), batch.y.data(), int(batch.x.size()));
    for (std::size_t i = 0; i < points.x.size(); ++i) {
        Vector2d const expected = link.Call(Vector2d(points.x[i], points.y[i]));
        if (tolerance == 0.0f) {
            ASSERT_EQ(expected.x, batch.x[i]) << i;
            ASSERT_EQ(expected.y, batch.y[i]) << i;
        } else {
            ASSERT_NEAR(expected.x, batch.x[i], tolerance) << points.x[i] << ", " << points.y[i];
            ASSERT_NEAR(expected.y, batch.y[i], tolerance) << points.x[i] << ", " << points.y[i];
        }
    }
}

TEST(BatchChain, AnEmptyChainLeavesThePoints) {
    Points points = Row();
    Points const before = points;
    BatchChain().Run(points.x.data(), points.y.data(), int(points.x.size()));
    EXPECT_EQ(before.x, points.x);
    EXPECT_EQ(before.y, points.y);
}

TEST(BatchChain, APlanarLinkIsItsMatrixExactly) {
    Transform2dFunctor::_TRANSFORM_2D transform = {};
    transform.scale_x = 0.7f;
    transform.scale_y = 1.3f;
    transform.angle = 0.4f;
    transform.offset_y = -90.0f;
    transform.mirror_x = true;
    Transform2dFunctor link(transform);
    ExpectAsPointByPoint(link, Row(), 0.0f);
}

TEST(BatchChain, ASphericalTurnIsItsCallWithinAThousandthOfAPixel) {
    SphericalOrientationFunctor link(EulerAngles(0.9f, -0.4f, 0.2f), F);
    ExpectAsPointByPoint(link, Row(), POINT_TOLERANCE);
}

// The centre, where the turn divides by a zero radius, goes the way of the Call's guard.
TEST(BatchChain, ASphericalTurnKeepsTheGuardAtTheCentre) {
    SphericalOrientationFunctor link(EulerAngles(0.0f, 0.0f, 0.0f), F);
    float x[1] = {0.0f};
    float y[1] = {0.0f};
    BatchChain(link).Run(x, y, 1);
    EXPECT_EQ(0.0f, x[0]);
    EXPECT_EQ(0.0f, y[0]);
}

class BatchChainConversionTest : public testing::TestWithParam<_DEWARP_PROJECTION> {};

// Every public projection into the picture of a fisheye lens, as the views' chains have it.
TEST_P(BatchChainConversionTest, IsTheConversionOfTheGridWithinAThousandthOfAPixel) {
    ProjectionFunctor link(GetParam(), DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, F,
                           Vector2d(0.0f, 0.0f));
    ExpectAsPointByPoint(link, Row(), POINT_TOLERANCE);
}

INSTANTIATE_TEST_SUITE_P(
    EveryPublicProjection, BatchChainConversionTest,
    testing::Values(DEWARP_PROJECTION_RECTILINEAR, DEWARP_PROJECTION_CYLINDRICAL,
                    DEWARP_PROJECTION_EQUIRECTANGULAR, DEWARP_PROJECTION_MERCATOR,
                    DEWARP_PROJECTION_LAMBERT_CYLINDRICAL, DEWARP_PROJECTION_MILLER_CYLINDRICAL,
                    DEWARP_PROJECTION_PANNINI, DEWARP_PROJECTION_ARCHITECTURAL,
                    DEWARP_PROJECTION_EQUIRECTANGULAR_PANNINI));

// A conversion without a kernel of its own, such as into a rectilinear camera's picture, is the
// grid's function point by point: the same numbers exactly.
TEST(BatchChain, AnyOtherConversionIsCalledPointByPoint) {
    ProjectionFunctor link(DEWARP_PROJECTION_CYLINDRICAL, DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR,
                           F, Vector2d(0.0f, 0.0f));
    ExpectAsPointByPoint(link, Row(), 0.0f);
}

// A class derived from a known link may answer differently; its own Call decides.
struct DoublingTurn : SphericalOrientationFunctor {
    DoublingTurn() : SphericalOrientationFunctor(EulerAngles(0.5f, 0.0f, 0.0f), F) {}
    Vector2d Call(Vector2d const& p) override { return Vector2d(2.0f * p.x, 2.0f * p.y); }
};

TEST(BatchChain, ADerivedLinkIsCalledThroughItsOwnCall) {
    DoublingTurn link;
    ExpectAsPointByPoint(link, Row(), 0.0f);
}

// A chain within a chain is run link by link, in the order of application.
TEST(BatchChain, NestedChainsRunInTheirOrder) {
    boost::shared_ptr<MapFunctors> inner(new MapFunctors);
    Transform2dFunctor::_TRANSFORM_2D shift = {};
    shift.offset_x = 40.0f;
    inner->PushBack(new Transform2dFunctor(shift));
    inner->PushBack(new DoublingTurn);
    MapFunctors outer;
    outer.PushBack(inner);
    outer.PushBack(new ProjectionFunctor(DEWARP_PROJECTION_RECTILINEAR,
                                         DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, F,
                                         Vector2d(0.0f, 0.0f)));
    ExpectAsPointByPoint(outer, Row(), POINT_TOLERANCE);
}

/// The builders' plain span store, reached from a test.
struct SpanStore : View {
    using View::StoreSpan;
};

class BatchLanesStoreTest : public testing::TestWithParam<BatchLanes const*> {};

// Rows of random points, near, far, negative and not a number, stored by the lanes and then by
// the plain store from where they stopped: the same words as the plain store alone.
TEST_P(BatchLanesStoreTest, StoresEighthSpansWordForWordAsThePlainStore) {
    std::mt19937 random(5);
    std::uniform_real_distribution<float> near(-3000.0f, 70000.0f);
    std::uniform_real_distribution<float> far(-1e7f, 1e7f);
    std::uniform_int_distribution<int> oddity(0, 199);
    for (int row = 0; row < 300; ++row) {
        int const count = 1 + row % 70;
        std::vector<float> x(static_cast<std::size_t>(count));
        std::vector<float> y(static_cast<std::size_t>(count));
        for (std::size_t i = 0; i < x.size(); ++i) {
            x[i] = near(random);
            y[i] = near(random);
            int const odd = oddity(random);
            if (odd == 0) {
                x[i] = far(random);
            } else if (odd == 1) {
                y[i] = std::numeric_limits<float>::quiet_NaN();
            }
        }
        Vector2d const centre(967.5f, 968.0f);
        std::vector<unsigned short> expected(16 * std::size_t(count), 0xABCD);
        unsigned short* plain = expected.data();
        for (std::size_t k = 1; k < x.size(); ++k) {
            SpanStore::StoreSpan(plain, Vector2d(x[k - 1], y[k - 1]), Vector2d(x[k], y[k]), centre,
                                 8);
        }
        std::vector<unsigned short> stored(expected.size(), 0xABCD);
        unsigned short* cursor = stored.data();
        int k = 1;
        while (k < count) {
            int const done = GetParam()->store_eighth_spans(
                cursor, x.data() + k - 1, y.data() + k - 1, count - k + 1, centre.x, centre.y);
            ASSERT_GE(done, 0);
            cursor += 16 * done;
            k += done;
            if (k < count) {
                SpanStore::StoreSpan(cursor, Vector2d(x[std::size_t(k - 1)], y[std::size_t(k - 1)]),
                                     Vector2d(x[std::size_t(k)], y[std::size_t(k)]), centre, 8);
                ++k;
            }
        }
        ASSERT_EQ(expected, stored) << "row " << row;
    }
}

INSTANTIATE_TEST_SUITE_P(EveryLaneWidthOfThisProcessor, BatchLanesStoreTest,
                         testing::ValuesIn(AvailableLanes()), LanesName);

}  // namespace
}  // namespace quorvel::vexmap
