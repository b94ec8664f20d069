#include "dewarp_session.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstdlib>
#include <set>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "pixel_format.h"
#include "plugin_host.h"
#include "tool_error.h"

namespace vexmap_host {
namespace {

using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

constexpr int SENTRY360 = 2;
constexpr int IN_HOUSE = 8;
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
    RgbImage const view = session.Render(PTZ, {}, Disc(SIZE), 960, 540, 2).picture;
    EXPECT_EQ(960, view.width);
    EXPECT_EQ(540, view.height);
    EXPECT_EQ(std::size_t(960) * 540 * 3, view.pixels.size());
}

TEST_F(DewarpSessionTest, PtzViewRoundsTheWidthToEightAndTheHeightToEven) {
    DewarpSession const session(host, SENTRY360, CeilingCamera());
    RgbImage const view = session.Render(PTZ, {}, Disc(SIZE), 641, 361, 2).picture;
    EXPECT_EQ(648, view.width);
    EXPECT_EQ(362, view.height);
    EXPECT_EQ(std::size_t(648) * 362 * 3, view.pixels.size());
}

// One frame only: a new view samples the nearest pixel, so no blending can shade the colour.
TEST_F(DewarpSessionTest, PtzViewInsideAUniformDiscIsThatColourThroughout) {
    DewarpSession const session(host, SENTRY360, CeilingCamera());
    RgbImage const view = session.Render(PTZ, {}, Disc(SIZE), 320, 180, 1).picture;
    ASSERT_EQ(std::size_t(320) * 180 * 3, view.pixels.size());
    for (int row = 0; row < view.height; ++row) {
        for (int column = 0; column < view.width; ++column) {
            ASSERT_EQ(DISC, PixelAt(view, column, row)) << "at " << column << "," << row;
        }
    }
}

TEST_F(DewarpSessionTest, PanoramaIsHalfTheInputWhateverTheWish) {
    DewarpSession const session(host, SENTRY360, CeilingCamera());
    RgbImage const view = session.Render(PANORAMA, {}, Disc(SIZE), 960, 540, 2).picture;
    EXPECT_EQ(128, view.width);
    EXPECT_EQ(128, view.height);
    ASSERT_EQ(std::size_t(128) * 128 * 3, view.pixels.size());
    EXPECT_EQ(DISC, PixelAt(view, 64, 64));
}

TEST_F(DewarpSessionTest, OneSessionRendersBothViewsInTurn) {
    DewarpSession const session(host, SENTRY360, CeilingCamera());
    RgbImage const input = Disc(SIZE);
    EXPECT_EQ(960, session.Render(PTZ, {}, input, 960, 540, 1).picture.width);
    EXPECT_EQ(128, session.Render(PANORAMA, {}, input, 960, 540, 1).picture.width);
    RgbImage const again = session.Render(PTZ, {}, input, 960, 540, 1).picture;
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
        RgbImage const view = session.Render(PTZ, position, input, 64, 64, 1).picture;
        Colour const centre = PixelAt(view, 32, 32);
        EXPECT_NE(SECTORS.end(), std::find(SECTORS.begin(), SECTORS.end(), centre))
            << "pan " << pan;
        seen.insert(centre);
    }
    EXPECT_EQ(4u, seen.size());
}

YuvImage UniformYuv(int size, uint8_t y, uint8_t u, uint8_t v) {
    YuvImage image;
    image.width = size;
    image.height = size;
    std::size_t const pixels = std::size_t(size) * std::size_t(size);
    std::size_t const chroma =
        YuvImage::ChromaWidth(std::size_t(size)) * YuvImage::ChromaHeight(std::size_t(size));
    image.bytes.assign(pixels, y);
    image.bytes.insert(image.bytes.end(), chroma, u);
    image.bytes.insert(image.bytes.end(), chroma, v);
    return image;
}

// Luma, U and V at a pixel of an even-sized frame.
std::array<uint8_t, 3> YuvAt(YuvImage const& image, int column, int row) {
    std::size_t const width = std::size_t(image.width);
    std::size_t const pixels = width * std::size_t(image.height);
    std::size_t const chroma = std::size_t(row / 2) * (width / 2) + std::size_t(column / 2);
    return {image.bytes[std::size_t(row) * width + std::size_t(column)],
            image.bytes[pixels + chroma], image.bytes[pixels + pixels / 4 + chroma]};
}

TEST_F(DewarpSessionTest, InHouseDewarperTakesA420FrameWithoutConversion) {
    DewarpSession const session(host, IN_HOUSE, CeilingCamera());
    YuvImage const view = session.RunFrame(UniformYuv(SIZE, 100, 90, 200), 320, 180);
    EXPECT_EQ(320, view.width);
    EXPECT_EQ(180, view.height);
    ASSERT_EQ(std::size_t(320) * 180 * 3 / 2, view.bytes.size());
    EXPECT_EQ((std::array<uint8_t, 3>{100, 90, 200}), YuvAt(view, 160, 90));
}

TEST_F(DewarpSessionTest, InHouseDewarperConvertsAnRgbPicture) {
    DewarpSession const session(host, IN_HOUSE, CeilingCamera());
    RgbImage const view = session.RunFrame(Disc(SIZE), 320, 180);
    EXPECT_EQ(320, view.width);
    EXPECT_EQ(180, view.height);
    Colour const middle = PixelAt(view, 160, 90);
    for (std::size_t channel = 0; channel < 3; ++channel) {
        EXPECT_NEAR(DISC[channel], middle[channel], 2) << "channel " << channel;
    }
}

TEST_F(DewarpSessionTest, RgbDewarperTakesA420FrameThroughRgb) {
    DewarpSession const session(host, SENTRY360, CeilingCamera());
    YuvImage const input = PixelFormat::ToYuv(Disc(SIZE));
    YuvImage const view = session.RunFrame(input, 320, 180);
    EXPECT_EQ(320, view.width);
    EXPECT_EQ(180, view.height);
    std::array<uint8_t, 3> const expected = YuvAt(input, SIZE / 2, SIZE / 2);
    std::array<uint8_t, 3> const middle = YuvAt(view, 160, 90);
    for (std::size_t plane = 0; plane < 3; ++plane) {
        EXPECT_NEAR(expected[plane], middle[plane], 1) << "plane " << plane;
    }
}

TEST_F(DewarpSessionTest, AimedSubModeHoldsForTheFramesThatFollow) {
    DewarpSession const session(host, SENTRY360, CeilingCamera());
    session.Aim(PANORAMA, {});
    RgbImage const input = Disc(SIZE);
    for (int frame = 0; frame < 2; ++frame) {
        RgbImage const view = session.RunFrame(input, 960, 540);
        EXPECT_EQ(128, view.width);
        EXPECT_EQ(128, view.height);
    }
    EXPECT_EQ(PANORAMA, session.Get().SubMode());
}

TEST_F(DewarpSessionTest, RenderTellsThePositionInForceAfterTheFirstFrame) {
    DewarpSession const session(host, IN_HOUSE, CeilingCamera());
    RequestedPosition position;
    position.pan = 400.0f;  // wraps into 0 to 360
    position.zoom = 50.0f;  // beyond the kind's 10
    RenderedView<RgbImage> const view = session.Render(PTZ, position, Disc(SIZE), 320, 180, 1);
    EXPECT_NEAR(40.0f, view.position.pan, 1e-3f);
    EXPECT_FLOAT_EQ(10.0f, view.position.zoom);
}

TEST_F(DewarpSessionTest, RenderHearsOfEveryFrameDone) {
    DewarpSession const session(host, IN_HOUSE, CeilingCamera());
    std::vector<int> done;
    session.Render(PTZ, {}, Disc(SIZE), 320, 180, 4,
                   [&done](int frames) { done.push_back(frames); });
    EXPECT_EQ((std::vector<int>{1, 2, 3, 4}), done);
}

// The still is converted once and copied in for each later frame: the last frame must show what
// frames converted one by one show, for a kind that converts (RGB into 4:2:0) and one that does
// not.
TEST_F(DewarpSessionTest, ManyFramesOfAStillShowWhatFramesConvertedOneByOneShow) {
    for (int const mode : {IN_HOUSE, SENTRY360}) {
        DewarpSession const by_frame(host, mode, CeilingCamera());
        DewarpSession const at_once(host, mode, CeilingCamera());
        RgbImage const input = Sectors(SIZE);
        by_frame.Aim(PTZ, {});
        RgbImage expected;
        for (int frame = 0; frame < 3; ++frame) {
            expected = by_frame.RunFrame(input, 320, 180);
        }
        RgbImage const last = at_once.Render(PTZ, {}, input, 320, 180, 3).picture;
        EXPECT_EQ(expected.pixels, last.pixels) << "mode " << mode;
    }
}

TEST_F(DewarpSessionTest, FourTwoZeroKindTakesOddSizesGrownByOneColumnAndRow) {
    DewarpSession const session(host, IN_HOUSE, CeilingCamera());
    FrameSize const fed = session.FedSize(255, 127);
    EXPECT_EQ(256, fed.width);
    EXPECT_EQ(128, fed.height);
    RgbImage odd = Disc(SIZE);
    odd.width = SIZE - 1;
    odd.pixels.resize(std::size_t(odd.width) * SIZE * 3);
    RgbImage const view = session.Render(PTZ, {}, odd, 320, 180, 1).picture;
    EXPECT_EQ(320, view.width);
}

TEST_F(DewarpSessionTest, RgbKindTakesOddSizesAsTheyAre) {
    DewarpSession const session(host, SENTRY360, CeilingCamera());
    FrameSize const fed = session.FedSize(255, 127);
    EXPECT_EQ(255, fed.width);
    EXPECT_EQ(127, fed.height);
}

// A frame whose every byte differs from its neighbours, so that a padding of anything but copies
// of the last column and row shows in the view.
YuvImage Numbered(int width, int height) {
    YuvImage image;
    image.width = width;
    image.height = height;
    image.bytes.resize(YuvImage::FrameBytes(std::size_t(width), std::size_t(height)));
    for (std::size_t index = 0; index < image.bytes.size(); ++index) {
        image.bytes[index] = uint8_t(index * 7 % 251);
    }
    return image;
}

// The odd frame the dewarper is fed is the one a host would make by repeating the last column
// and row: its view is that of such a frame, made here by hand.
TEST_F(DewarpSessionTest, OddFrameIsGrownByCopiesOfItsLastColumnAndRow) {
    int const odd = SIZE - 1;
    YuvImage const input = Numbered(odd, odd);
    YuvImage grown = Numbered(SIZE, SIZE);
    for (int row = 0; row < SIZE; ++row) {
        for (int column = 0; column < SIZE; ++column) {
            grown.bytes[std::size_t(row * SIZE + column)] =
                input.bytes[std::size_t(std::min(row, odd - 1) * odd + std::min(column, odd - 1))];
        }
    }
    std::size_t const chroma = 2 * YuvImage::ChromaWidth(odd) * YuvImage::ChromaHeight(odd);
    std::copy_n(input.bytes.end() - std::ptrdiff_t(chroma), chroma,
                grown.bytes.end() - std::ptrdiff_t(chroma));
    DewarpSession const padded(host, IN_HOUSE, CeilingCamera());
    DewarpSession const by_hand(host, IN_HOUSE, CeilingCamera());
    for (int const sub_mode : {PTZ, PANORAMA}) {
        padded.Aim(sub_mode, {});
        by_hand.Aim(sub_mode, {});
        YuvImage from_padded;
        YuvImage from_hand;
        padded.RunFrame(input, 640, 320, from_padded);
        by_hand.RunFrame(grown, 640, 320, from_hand);
        EXPECT_EQ(from_hand.bytes, from_padded.bytes) << "sub-mode " << sub_mode;
    }
}

TEST_F(DewarpSessionTest, FramesIntoOneViewReuseItsStorage) {
    DewarpSession const session(host, IN_HOUSE, CeilingCamera());
    YuvImage const input = UniformYuv(SIZE, 100, 90, 200);
    YuvImage view;
    session.RunFrame(input, 320, 180, view);
    uint8_t const* const storage = view.bytes.data();
    std::size_t const capacity = view.bytes.capacity();
    for (int frame = 0; frame < 3; ++frame) {
        session.RunFrame(input, 320, 180, view);
        EXPECT_EQ(storage, view.bytes.data());
        EXPECT_EQ(capacity, view.bytes.capacity());
    }
}

TEST_F(DewarpSessionTest, RefusesAnUnregisteredMode) {
    EXPECT_THAT([&] { DewarpSession const session(host, 10, CeilingCamera()); },
                ThrowsMessage<ToolError>(HasSubstr("the plug-in made no dewarper of mode 10")));
}

}  // namespace
}  // namespace vexmap_host
