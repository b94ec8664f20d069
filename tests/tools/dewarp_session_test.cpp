#include "dewarp_session.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstdlib>
#include <set>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "plugin_host.h"
#include "tool_error.h"

namespace vexmap_host {
namespace {

using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

constexpr int SENTRY360 = 2;
constexpr int PTZ = 1;
constexpr int PANORAMA = 2;
constexpr int SIZE = 256;

using Colour = std::array<uint8_t, 3>;

constexpr Colour DISC{200, 120, 40};

// Right, down, left and up of the centre in picture coordinates: each axis runs through the
// middle of its own colour, so a view looking along any of them sees one colour only.
constexpr std::array<Colour, 4> SECTORS{
    {{230, 40, 40}, {40, 40, 230}, {40, 200, 40}, {220, 200, 40}}};

Colour PixelAt(RgbImage const& image, int column, int row) {
    uint8_t const* pixel =
        &image.pixels[(std::size_t(row) * std::size_t(image.width) + std::size_t(column)) * 3];
    return {pixel[0], pixel[1], pixel[2]};
}

void Paint(RgbImage& image, int column, int row, Colour const& colour) {
    uint8_t* pixel =
        &image.pixels[(std::size_t(row) * std::size_t(image.width) + std::size_t(column)) * 3];
    pixel[0] = colour[0];
    pixel[1] = colour[1];
    pixel[2] = colour[2];
}

RgbImage Black(int size) {
    RgbImage image;
    image.width = size;
    image.height = size;
    image.pixels.assign(std::size_t(size) * std::size_t(size) * 3, 0);
    return image;
}

// A disc of one colour filling the image circle, black around it.
RgbImage Disc(int size) {
    RgbImage image = Black(size);
    int const centre2 = size;  // doubled coordinates keep pixel centres whole
    for (int row = 0; row < size; ++row) {
        for (int column = 0; column < size; ++column) {
            int const x = 2 * column + 1 - centre2;
            int const y = 2 * row + 1 - centre2;
            if (x * x + y * y <= size * size) {
                Paint(image, column, row, DISC);
            }
        }
    }
    return image;
}

// Four quarter circles split along the diagonals.
RgbImage Sectors(int size) {
    RgbImage image = Black(size);
    for (int row = 0; row < size; ++row) {
        for (int column = 0; column < size; ++column) {
            int const x = 2 * column + 1 - size;
            int const y = 2 * row + 1 - size;
            if (x * x + y * y > size * size) {
                continue;
            }
            std::size_t const sector =
                std::abs(x) >= std::abs(y) ? (x > 0 ? 0u : 2u) : (y > 0 ? 1u : 3u);
            Paint(image, column, row, SECTORS[sector]);
        }
    }
    return image;
}

DewarpParams CeilingCamera() {
    DewarpParams params{};
    params.position = 1;
    params.circleX = SIZE / 2;
    params.circleY = SIZE / 2;
    params.circleRadius = SIZE / 2;
    return params;
}

class DewarpSessionTest : public ::testing::Test {
protected:
    PluginHost const host{VEXMAP_PLUGIN_PATH};
};

TEST_F(DewarpSessionTest, HoldsADewarperOfTheAskedMode) {
    DewarpSession const session(host, SENTRY360, CeilingCamera());
    EXPECT_EQ(SENTRY360, session.Get().Mode());
}

TEST_F(DewarpSessionTest, PtzViewKeepsAWishThatIsAlreadyAligned) {
    DewarpSession const session(host, SENTRY360, CeilingCamera());
    RgbImage const view = session.Render(PTZ, {}, Disc(SIZE), 960, 540, 2);
    EXPECT_EQ(960, view.width);
    EXPECT_EQ(540, view.height);
    EXPECT_EQ(std::size_t(960) * 540 * 3, view.pixels.size());
}

TEST_F(DewarpSessionTest, PtzViewRoundsTheWidthToEightAndTheHeightToEven) {
    DewarpSession const session(host, SENTRY360, CeilingCamera());
    RgbImage const view = session.Render(PTZ, {}, Disc(SIZE), 641, 361, 2);
    EXPECT_EQ(648, view.width);
    EXPECT_EQ(362, view.height);
    EXPECT_EQ(std::size_t(648) * 362 * 3, view.pixels.size());
}

// One frame only: a new view samples the nearest pixel, so no blending can shade the colour.
TEST_F(DewarpSessionTest, PtzViewInsideAUniformDiscIsThatColourThroughout) {
    DewarpSession const session(host, SENTRY360, CeilingCamera());
    RgbImage const view = session.Render(PTZ, {}, Disc(SIZE), 320, 180, 1);
    ASSERT_EQ(std::size_t(320) * 180 * 3, view.pixels.size());
    for (int row = 0; row < view.height; ++row) {
        for (int column = 0; column < view.width; ++column) {
            ASSERT_EQ(DISC, PixelAt(view, column, row)) << "at " << column << "," << row;
        }
    }
}

TEST_F(DewarpSessionTest, PanoramaIsHalfTheInputWhateverTheWish) {
    DewarpSession const session(host, SENTRY360, CeilingCamera());
    RgbImage const view = session.Render(PANORAMA, {}, Disc(SIZE), 960, 540, 2);
    EXPECT_EQ(128, view.width);
    EXPECT_EQ(128, view.height);
    ASSERT_EQ(std::size_t(128) * 128 * 3, view.pixels.size());
    EXPECT_EQ(DISC, PixelAt(view, 64, 64));
}

TEST_F(DewarpSessionTest, OneSessionRendersBothViewsInTurn) {
    DewarpSession const session(host, SENTRY360, CeilingCamera());
    RgbImage const input = Disc(SIZE);
    EXPECT_EQ(960, session.Render(PTZ, {}, input, 960, 540, 1).width);
    EXPECT_EQ(128, session.Render(PANORAMA, {}, input, 960, 540, 1).width);
    RgbImage const again = session.Render(PTZ, {}, input, 960, 540, 1);
    EXPECT_EQ(960, again.width);
    EXPECT_EQ(540, again.height);
}

TEST_F(DewarpSessionTest, AppliesTheRequestedPosition) {
    DewarpSession const session(host, SENTRY360, CeilingCamera());
    RequestedPosition position;
    position.pan = 45.0f;
    position.tilt = 30.0f;
    position.zoom = 1.5f;
    session.Render(PTZ, position, Disc(SIZE), 320, 180, 1);
    float pan = 0.0f;
    float tilt = 0.0f;
    float zoom = 0.0f;
    session.Get().GetPosition(pan, tilt, zoom);
    EXPECT_FLOAT_EQ(45.0f, pan);
    EXPECT_FLOAT_EQ(30.0f, tilt);
    EXPECT_FLOAT_EQ(1.5f, zoom);
}

TEST_F(DewarpSessionTest, KeepsWhatThePositionLeavesOut) {
    DewarpSession const session(host, SENTRY360, CeilingCamera());
    float pan = 0.0f;
    float tilt = 0.0f;
    float zoom = 0.0f;
    session.Get().GetPosition(pan, tilt, zoom);
    float const default_tilt = tilt;
    float const default_zoom = zoom;
    RequestedPosition position;
    position.pan = 60.0f;
    session.Render(PTZ, position, Disc(SIZE), 320, 180, 1);
    session.Get().GetPosition(pan, tilt, zoom);
    EXPECT_FLOAT_EQ(60.0f, pan);
    EXPECT_FLOAT_EQ(default_tilt, tilt);
    EXPECT_FLOAT_EQ(default_zoom, zoom);
}

TEST_F(DewarpSessionTest, TurningThePanShowsAnotherPartOfTheCircle) {
    DewarpSession const session(host, SENTRY360, CeilingCamera());
    RgbImage const input = Sectors(SIZE);
    std::set<Colour> seen;
    for (float const pan : {-90.0f, 0.0f, 90.0f, 180.0f}) {
        RequestedPosition position;
        position.pan = pan;
        position.tilt = 45.0f;
        RgbImage const view = session.Render(PTZ, position, input, 64, 64, 1);
        Colour const centre = PixelAt(view, 32, 32);
        EXPECT_NE(SECTORS.end(), std::find(SECTORS.begin(), SECTORS.end(), centre))
            << "pan " << pan;
        seen.insert(centre);
    }
    EXPECT_EQ(4u, seen.size());
}

TEST_F(DewarpSessionTest, RefusesAnUnregisteredMode) {
    EXPECT_THAT([&] { DewarpSession const session(host, 10, CeilingCamera()); },
                ThrowsMessage<ToolError>(HasSubstr("the plug-in made no dewarper of mode 10")));
}

}  // namespace
}  // namespace vexmap_host
