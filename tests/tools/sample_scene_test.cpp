#include "sample_scene.h"

#include <algorithm>
#include <cstdint>

#include <gtest/gtest.h>

namespace vexmap_host {
namespace {

constexpr int SIZE = 128;

// The floor is grey (its lightest tile differs by 15 between channels), the walls are painted,
// and outside the image circle is black. Mixed edge pixels may fall either way, so comparisons
// of families allow this share of disagreement.
constexpr int GREY_SPREAD = 20;
constexpr double MIXED_SHARE = 0.01;

enum class Family { Black, Grey, Painted };

uint8_t const* PixelAt(RgbImage const& image, int column, int row) {
    return &image.pixels[(std::size_t(row) * std::size_t(image.width) + std::size_t(column)) * 3];
}

Family FamilyOf(uint8_t const* pixel) {
    int const high = std::max({pixel[0], pixel[1], pixel[2]});
    int const low = std::min({pixel[0], pixel[1], pixel[2]});
    if (high == 0) {
        return Family::Black;
    }
    return high - low <= GREY_SPREAD ? Family::Grey : Family::Painted;
}

bool IsBlack(uint8_t const* pixel) {
    return pixel[0] == 0 && pixel[1] == 0 && pixel[2] == 0;
}

TEST(SampleScene, IsASquarePictureOfTheAskedSize) {
    SampleFisheye const sample = MakeSampleFisheye(SIZE);
    EXPECT_EQ(SIZE, sample.image.width);
    EXPECT_EQ(SIZE, sample.image.height);
    EXPECT_EQ(std::size_t(SIZE) * SIZE * 3, sample.image.pixels.size());
}

TEST(SampleScene, ImageCircleFillsThePicture) {
    SampleFisheye const sample = MakeSampleFisheye(SIZE);
    EXPECT_EQ(SIZE / 2, sample.circle_x);
    EXPECT_EQ(SIZE / 2, sample.circle_y);
    EXPECT_EQ(SIZE / 2, sample.circle_radius);
}

TEST(SampleScene, CornersOutsideTheCircleAreBlack) {
    SampleFisheye const sample = MakeSampleFisheye(SIZE);
    EXPECT_TRUE(IsBlack(PixelAt(sample.image, 0, 0)));
    EXPECT_TRUE(IsBlack(PixelAt(sample.image, SIZE - 1, 0)));
    EXPECT_TRUE(IsBlack(PixelAt(sample.image, 0, SIZE - 1)));
    EXPECT_TRUE(IsBlack(PixelAt(sample.image, SIZE - 1, SIZE - 1)));
    // Still outside, on the diagonal just beyond the rim.
    EXPECT_TRUE(IsBlack(PixelAt(sample.image, 16, 16)));
}

TEST(SampleScene, EdgeMidpointsInsideTheCircleShowTheRoom) {
    SampleFisheye const sample = MakeSampleFisheye(SIZE);
    int const middle = SIZE / 2;
    EXPECT_FALSE(IsBlack(PixelAt(sample.image, 1, middle)));
    EXPECT_FALSE(IsBlack(PixelAt(sample.image, SIZE - 2, middle)));
    EXPECT_FALSE(IsBlack(PixelAt(sample.image, middle, 1)));
    EXPECT_FALSE(IsBlack(PixelAt(sample.image, middle, SIZE - 2)));
}

TEST(SampleScene, CentreLooksAtTheGreyFloor) {
    SampleFisheye const sample = MakeSampleFisheye(SIZE);
    int const middle = SIZE / 2;
    for (int row = middle - 4; row < middle + 4; ++row) {
        for (int column = middle - 4; column < middle + 4; ++column) {
            EXPECT_EQ(Family::Grey, FamilyOf(PixelAt(sample.image, column, row)))
                << "at " << column << "," << row;
        }
    }
}

TEST(SampleScene, RimLooksAtThePaintedWalls) {
    SampleFisheye const sample = MakeSampleFisheye(SIZE);
    int painted = 0;
    int inside = 0;
    for (int row = 0; row < SIZE; ++row) {
        for (int column = 0; column < SIZE; ++column) {
            double const x = column + 0.5 - SIZE / 2;
            double const y = row + 0.5 - SIZE / 2;
            double const radius = SIZE / 2;
            double const distance_squared = x * x + y * y;
            // The outer tenth of the circle sees nearly horizontal rays.
            if (distance_squared < 0.81 * radius * radius || distance_squared > radius * radius) {
                continue;
            }
            ++inside;
            painted += FamilyOf(PixelAt(sample.image, column, row)) == Family::Painted ? 1 : 0;
        }
    }
    ASSERT_GT(inside, 0);
    EXPECT_GT(painted, inside / 2);
}

TEST(SampleScene, BlackOutsideTheCircleIsMirrorSymmetric) {
    SampleFisheye const sample = MakeSampleFisheye(SIZE);
    for (int row = 0; row < SIZE; ++row) {
        for (int column = 0; column < SIZE; ++column) {
            bool const black = IsBlack(PixelAt(sample.image, column, row));
            ASSERT_EQ(black, IsBlack(PixelAt(sample.image, SIZE - 1 - column, row)))
                << "left/right at " << column << "," << row;
            ASSERT_EQ(black, IsBlack(PixelAt(sample.image, column, SIZE - 1 - row)))
                << "top/bottom at " << column << "," << row;
        }
    }
}

// The room is as wide on the left as on the right and as deep above as below, so a centred lens
// sees the same kind of surface at mirrored pixels; only tile shades and wall paints differ.
TEST(SampleScene, MirroredPixelsShowTheSameKindOfSurface) {
    SampleFisheye const sample = MakeSampleFisheye(SIZE);
    int left_right = 0;
    int top_bottom = 0;
    for (int row = 0; row < SIZE; ++row) {
        for (int column = 0; column < SIZE; ++column) {
            Family const family = FamilyOf(PixelAt(sample.image, column, row));
            left_right += family != FamilyOf(PixelAt(sample.image, SIZE - 1 - column, row)) ? 1 : 0;
            top_bottom += family != FamilyOf(PixelAt(sample.image, column, SIZE - 1 - row)) ? 1 : 0;
        }
    }
    int const allowed = int(MIXED_SHARE * SIZE * SIZE);
    EXPECT_LE(left_right, allowed);
    EXPECT_LE(top_bottom, allowed);
}

TEST(SampleScene, SameSizeGivesTheSamePicture) {
    SampleFisheye const first = MakeSampleFisheye(SIZE);
    SampleFisheye const second = MakeSampleFisheye(SIZE);
    EXPECT_EQ(first.image.pixels, second.image.pixels);
}

}  // namespace
}  // namespace vexmap_host
