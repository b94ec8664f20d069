#include "pixel_format.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tool_error.h"

namespace vexmap_host {
namespace {

using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

using Rgb = std::array<uint8_t, 3>;
using Yuv = std::array<uint8_t, 3>;

// Quantising luma and both colour differences to whole steps moves a colour by up to about one
// step of RGB on each; rounding the result back adds half of one.
constexpr int ROUND_TRIP_TOLERANCE = 2;

// Byte i holds i, so any reordering or offset shows.
RgbImage NumberedPixels(int width, int height) {
    RgbImage image;
    image.width = width;
    image.height = height;
    image.pixels.resize(std::size_t(width) * std::size_t(height) * 3);
    for (std::size_t index = 0; index < image.pixels.size(); ++index) {
        image.pixels[index] = uint8_t(index);
    }
    return image;
}

TEST(PixelFormat, Rgb24IsFormatThree) {
    EXPECT_EQ(3, PixelFormat::RGB24);
}

TEST(PixelFormat, FrameBytesAreThreePerPixel) {
    PixelFormat const format(PixelFormat::RGB24);
    EXPECT_EQ(36u, format.FrameBytes(4, 3));
    EXPECT_EQ(1920u * 1080u * 3u, format.FrameBytes(1920, 1080));
}

TEST(PixelFormat, AnEmptyOrNegativeSizeTakesNoBytes) {
    PixelFormat const format(PixelFormat::RGB24);
    EXPECT_EQ(0u, format.FrameBytes(0, 10));
    EXPECT_EQ(0u, format.FrameBytes(10, 0));
    EXPECT_EQ(0u, format.FrameBytes(-4, 3));
    EXPECT_EQ(0u, format.FrameBytes(4, -3));
}

TEST(PixelFormat, EncodeCopiesTheRowsInFileOrder) {
    RgbImage const image = NumberedPixels(5, 3);
    std::vector<unsigned char> buffer(45, 0xEE);
    PixelFormat(PixelFormat::RGB24).Encode(image, buffer.data(), buffer.size());
    EXPECT_EQ(image.pixels, buffer);
}

TEST(PixelFormat, DecodeGivesBackWhatEncodeWrote) {
    PixelFormat const format(PixelFormat::RGB24);
    RgbImage const image = NumberedPixels(7, 4);
    std::vector<unsigned char> buffer(format.FrameBytes(7, 4));
    format.Encode(image, buffer.data(), buffer.size());
    RgbImage const decoded = format.Decode(7, 4, buffer.data(), buffer.size());
    EXPECT_EQ(7, decoded.width);
    EXPECT_EQ(4, decoded.height);
    EXPECT_EQ(image.pixels, decoded.pixels);
}

TEST(PixelFormat, EncodeRefusesABufferOfTheWrongSize) {
    RgbImage const image = NumberedPixels(4, 3);
    std::vector<unsigned char> buffer(40, 0xEE);
    EXPECT_THAT(
        [&] { PixelFormat(PixelFormat::RGB24).Encode(image, buffer.data(), 35); },
        ThrowsMessage<ToolError>(HasSubstr("a 4x3 frame of format 3 takes 36 bytes, the plug-in "
                                           "gave 35")));
    EXPECT_EQ(std::vector<unsigned char>(40, 0xEE), buffer);
}

TEST(PixelFormat, DecodeRefusesABufferOfTheWrongSize) {
    std::vector<unsigned char> const buffer(37, 0);
    EXPECT_THAT([&] { PixelFormat(PixelFormat::RGB24).Decode(4, 3, buffer.data(), 37); },
                ThrowsMessage<ToolError>(HasSubstr("takes 36 bytes, the plug-in gave 37")));
}

TEST(PixelFormat, DecodeRefusesAnEmptyFrame) {
    std::vector<unsigned char> const buffer(12, 0);
    EXPECT_THAT([&] { PixelFormat(PixelFormat::RGB24).Decode(0, 4, buffer.data(), 12); },
                ThrowsMessage<ToolError>(HasSubstr("takes 0 bytes, the plug-in gave 12")));
}

RgbImage Uniform(int width, int height, Rgb const& colour) {
    RgbImage image;
    image.width = width;
    image.height = height;
    image.pixels.resize(std::size_t(width) * std::size_t(height) * colour.size());
    for (std::size_t byte = 0; byte < image.pixels.size(); ++byte) {
        image.pixels[byte] = colour[byte % colour.size()];
    }
    return image;
}

Yuv YuvAt(YuvImage const& image, int column, int row) {
    std::size_t const width = std::size_t(image.width);
    std::size_t const chroma_width = YuvImage::ChromaWidth(width);
    std::size_t const luma_size = width * std::size_t(image.height);
    std::size_t const chroma_size =
        chroma_width * YuvImage::ChromaHeight(std::size_t(image.height));
    std::size_t const chroma = std::size_t(row / 2) * chroma_width + std::size_t(column / 2);
    return {image.bytes[std::size_t(row) * width + std::size_t(column)],
            image.bytes[luma_size + chroma], image.bytes[luma_size + chroma_size + chroma]};
}

Rgb RgbAt(RgbImage const& image, int column, int row) {
    uint8_t const* pixel =
        &image.pixels[(std::size_t(row) * std::size_t(image.width) + std::size_t(column)) * 3];
    return {pixel[0], pixel[1], pixel[2]};
}

YuvImage NumberedYuv(int width, int height) {
    YuvImage image;
    image.width = width;
    image.height = height;
    image.bytes.resize(YuvImage::FrameBytes(uint64_t(width), uint64_t(height)));
    for (std::size_t index = 0; index < image.bytes.size(); ++index) {
        image.bytes[index] = uint8_t(index * 7);
    }
    return image;
}

TEST(PixelFormat, I420IsFormatZero) {
    EXPECT_EQ(0, PixelFormat::I420);
}

TEST(PixelFormat, I420FrameBytesAreOneAndAHalfPerPixel) {
    PixelFormat const format(PixelFormat::I420);
    EXPECT_EQ(12u, format.FrameBytes(4, 2));
    EXPECT_EQ(1920u * 1080u * 3u / 2u, format.FrameBytes(1920, 1080));
    EXPECT_EQ(0u, format.FrameBytes(0, 2));
}

TEST(PixelFormat, FrameBytesOfAYuvPictureRoundTheChromaPlanesUp) {
    EXPECT_EQ(6u, YuvImage::FrameBytes(2, 2));
    EXPECT_EQ(15u + 2u * 3u * 2u, YuvImage::FrameBytes(5, 3));
    EXPECT_EQ(3u, YuvImage::FrameBytes(1, 1));
    EXPECT_EQ(16384u * 16384u * 3u / 2u, YuvImage::FrameBytes(16384, 16384));
}

struct Primary {
    char const* name;
    Rgb rgb;
    Yuv yuv;  // BT.601, limited range, rounded
};

class PixelFormatPrimaryTest : public ::testing::TestWithParam<Primary> {};

TEST_P(PixelFormatPrimaryTest, ToYuvGivesTheLimitedRangeValuesOfBt601) {
    YuvImage const yuv = PixelFormat::ToYuv(Uniform(2, 2, GetParam().rgb));
    ASSERT_EQ(6u, yuv.bytes.size());
    EXPECT_EQ(GetParam().yuv, YuvAt(yuv, 1, 1));
}

std::string PrimaryName(::testing::TestParamInfo<Primary> const& info) {
    return info.param.name;
}

INSTANTIATE_TEST_SUITE_P(Primaries, PixelFormatPrimaryTest,
                         ::testing::Values(Primary{"Black", {0, 0, 0}, {16, 128, 128}},
                                           Primary{"White", {255, 255, 255}, {235, 128, 128}},
                                           Primary{"Red", {255, 0, 0}, {81, 90, 240}},
                                           Primary{"Green", {0, 255, 0}, {145, 54, 34}},
                                           Primary{"Blue", {0, 0, 255}, {41, 240, 110}},
                                           Primary{"Yellow", {255, 255, 0}, {210, 16, 146}}),
                         PrimaryName);

TEST(PixelFormat, ToRgbTakesLimitedRangeBlackAndWhiteToTheEndsAndClampsBeyond) {
    YuvImage yuv;
    yuv.width = 4;
    yuv.height = 1;
    yuv.bytes = {16, 235, 0, 255, 128, 128, 128, 128};
    RgbImage const rgb = PixelFormat::ToRgb(yuv);
    EXPECT_EQ((Rgb{0, 0, 0}), RgbAt(rgb, 0, 0));
    EXPECT_EQ((Rgb{255, 255, 255}), RgbAt(rgb, 1, 0));
    EXPECT_EQ((Rgb{0, 0, 0}), RgbAt(rgb, 2, 0));
    EXPECT_EQ((Rgb{255, 255, 255}), RgbAt(rgb, 3, 0));
}

// Red and blue in a block: the chroma is the mean of the two colours' own, (90.2 + 240) / 2 for U
// and (240 + 109.8) / 2 for V, while each pixel keeps its own luma.
TEST(PixelFormat, ToYuvAveragesTheChromaOfEachBlock) {
    RgbImage image = Uniform(2, 2, {255, 0, 0});
    image.pixels[3] = 0;
    image.pixels[5] = 255;
    image.pixels[6] = 0;
    image.pixels[8] = 255;
    YuvImage const yuv = PixelFormat::ToYuv(image);
    EXPECT_EQ((std::vector<uint8_t>{81, 41, 41, 81, 165, 175}), yuv.bytes);
}

TEST(PixelFormat, ToYuvGivesAnOddEdgeItsOwnChroma) {
    RgbImage image = Uniform(3, 3, {255, 0, 0});
    for (int row = 0; row < 3; ++row) {
        uint8_t* pixel = &image.pixels[(std::size_t(row) * 3 + 2) * 3];
        pixel[0] = 0;
        pixel[2] = 255;
    }
    YuvImage const yuv = PixelFormat::ToYuv(image);
    ASSERT_EQ(17u, yuv.bytes.size());
    EXPECT_EQ((Yuv{81, 90, 240}), YuvAt(yuv, 0, 2));
    EXPECT_EQ((Yuv{41, 240, 110}), YuvAt(yuv, 2, 0));
    EXPECT_EQ((Yuv{41, 240, 110}), YuvAt(yuv, 2, 2));
}

// Uniform 2 x 2 blocks of colours every 15 steps of each channel, side by side, so that each
// block's chroma belongs to its colour alone.
std::vector<Rgb> GridColours() {
    std::vector<Rgb> colours;
    for (int r = 0; r <= 255; r += 15) {
        for (int g = 0; g <= 255; g += 15) {
            for (int b = 0; b <= 255; b += 15) {
                colours.push_back({uint8_t(r), uint8_t(g), uint8_t(b)});
            }
        }
    }
    return colours;
}

RgbImage Blocks(std::vector<Rgb> const& colours) {
    int const width = int(colours.size()) * 2;
    RgbImage image = Uniform(width, 2, {0, 0, 0});
    for (std::size_t index = 0; index < colours.size(); ++index) {
        for (std::size_t pixel : {2 * index, 2 * index + 1, 2 * index + std::size_t(width),
                                  2 * index + 1 + std::size_t(width)}) {
            std::copy(colours[index].begin(), colours[index].end(), &image.pixels[pixel * 3]);
        }
    }
    return image;
}

TEST(PixelFormat, RgbThroughYuvAndBackStaysWithinTolerance) {
    RgbImage const image = Blocks(GridColours());
    RgbImage const back = PixelFormat::ToRgb(PixelFormat::ToYuv(image));
    ASSERT_EQ(image.pixels.size(), back.pixels.size());
    int worst = 0;
    for (std::size_t index = 0; index < image.pixels.size(); ++index) {
        worst = std::max(worst, std::abs(int(image.pixels[index]) - int(back.pixels[index])));
    }
    EXPECT_LE(worst, ROUND_TRIP_TOLERANCE);
}

TEST(PixelFormat, EncodeCopiesAYuvPictureIntoI420Unchanged) {
    YuvImage const image = NumberedYuv(6, 4);
    std::vector<unsigned char> buffer(36, 0xEE);
    PixelFormat(PixelFormat::I420).Encode(image, buffer.data(), buffer.size());
    EXPECT_EQ(image.bytes, buffer);
}

TEST(PixelFormat, DecodeYuvGivesBackAnI420FrameUnchanged) {
    YuvImage const image = NumberedYuv(6, 4);
    YuvImage const decoded =
        PixelFormat(PixelFormat::I420).DecodeYuv(6, 4, image.bytes.data(), image.bytes.size());
    EXPECT_EQ(6, decoded.width);
    EXPECT_EQ(4, decoded.height);
    EXPECT_EQ(image.bytes, decoded.bytes);
}

TEST(PixelFormat, EncodeConvertsAnRgbPictureIntoI420) {
    RgbImage const image = NumberedPixels(4, 2);
    std::vector<unsigned char> buffer(12, 0xEE);
    PixelFormat(PixelFormat::I420).Encode(image, buffer.data(), buffer.size());
    EXPECT_EQ(PixelFormat::ToYuv(image).bytes, buffer);
}

TEST(PixelFormat, DecodeConvertsAnI420FrameIntoRgb) {
    YuvImage const image = NumberedYuv(4, 2);
    RgbImage const decoded =
        PixelFormat(PixelFormat::I420).Decode(4, 2, image.bytes.data(), image.bytes.size());
    EXPECT_EQ(PixelFormat::ToRgb(image).pixels, decoded.pixels);
}

TEST(PixelFormat, Rgb24ConvertsAYuvPictureBothWays) {
    YuvImage const image = NumberedYuv(4, 2);
    PixelFormat const format(PixelFormat::RGB24);
    std::vector<unsigned char> buffer(24, 0xEE);
    format.Encode(image, buffer.data(), buffer.size());
    EXPECT_EQ(PixelFormat::ToRgb(image).pixels, buffer);
    EXPECT_EQ(PixelFormat::ToYuv(PixelFormat::ToRgb(image)).bytes,
              format.DecodeYuv(4, 2, buffer.data(), buffer.size()).bytes);
}

TEST(PixelFormat, I420RefusesAnOddSide) {
    YuvImage const image = NumberedYuv(5, 4);
    std::vector<unsigned char> buffer(30, 0xEE);
    EXPECT_THAT([&] { PixelFormat(PixelFormat::I420).Encode(image, buffer.data(), 30); },
                ThrowsMessage<ToolError>(HasSubstr(
                    "4:2:0 frames of the plug-in need an even width and height, not 5x4")));
    EXPECT_THAT([&] { PixelFormat(PixelFormat::I420).DecodeYuv(4, 3, buffer.data(), 18); },
                ThrowsMessage<ToolError>(HasSubstr("not 4x3")));
    EXPECT_EQ(std::vector<unsigned char>(30, 0xEE), buffer);
}

TEST(PixelFormat, I420RefusesABufferOfTheWrongSize) {
    YuvImage const image = NumberedYuv(4, 2);
    std::vector<unsigned char> buffer(13, 0xEE);
    EXPECT_THAT([&] { PixelFormat(PixelFormat::I420).Encode(image, buffer.data(), 13); },
                ThrowsMessage<ToolError>(
                    HasSubstr("a 4x2 frame of format 0 takes 12 bytes, the plug-in gave 13")));
}

TEST(PixelFormat, RefusesAYuvPictureWhoseBytesDoNotFitItsSize) {
    YuvImage image = NumberedYuv(4, 2);
    image.bytes.pop_back();
    EXPECT_THAT([&] { PixelFormat::ToRgb(image); },
                ThrowsMessage<ToolError>(HasSubstr("the 4x2 picture holds 11 bytes")));
    std::vector<unsigned char> buffer(12, 0xEE);
    EXPECT_THAT([&] { PixelFormat(PixelFormat::I420).Encode(image, buffer.data(), 12); },
                ThrowsMessage<ToolError>(HasSubstr("the 4x2 picture holds 11 bytes")));
}

TEST(PixelFormat, Rgbx32IsFormatSixWithFourBytesAPixel) {
    EXPECT_EQ(6, PixelFormat::RGBX32);
    EXPECT_EQ(48u, PixelFormat(PixelFormat::RGBX32).FrameBytes(4, 3));
}

TEST(PixelFormat, Rgbx32EncodePadsEachPixelWithAnOpaqueFourthByte) {
    RgbImage const image = NumberedPixels(2, 1);
    std::vector<unsigned char> buffer(8, 0xEE);
    PixelFormat(PixelFormat::RGBX32).Encode(image, buffer.data(), buffer.size());
    EXPECT_EQ((std::vector<unsigned char>{0, 1, 2, 255, 3, 4, 5, 255}), buffer);
}

TEST(PixelFormat, Rgbx32DecodeDropsTheFourthByte) {
    std::vector<unsigned char> const buffer = {10, 20, 30, 0, 40, 50, 60, 7};
    RgbImage const image = PixelFormat(PixelFormat::RGBX32).Decode(2, 1, buffer.data(), 8);
    EXPECT_EQ(2, image.width);
    EXPECT_EQ(1, image.height);
    EXPECT_EQ((std::vector<uint8_t>{10, 20, 30, 40, 50, 60}), image.pixels);
}

TEST(PixelFormat, Rgbx32RefusesABufferOfThreeBytesAPixel) {
    RgbImage const image = NumberedPixels(4, 3);
    std::vector<unsigned char> buffer(36, 0xEE);
    EXPECT_THAT(
        [&] { PixelFormat(PixelFormat::RGBX32).Encode(image, buffer.data(), 36); },
        ThrowsMessage<ToolError>(HasSubstr("a 4x3 frame of format 6 takes 48 bytes, the plug-in "
                                           "gave 36")));
}

TEST(PixelFormat, Rgbx32ConvertsAYuvPictureBothWays) {
    PixelFormat const format(PixelFormat::RGBX32);
    YuvImage const yuv = PixelFormat::ToYuv(NumberedPixels(4, 2));
    std::vector<unsigned char> buffer(format.FrameBytes(4, 2));
    format.Encode(yuv, buffer.data(), buffer.size());
    EXPECT_EQ(PixelFormat::ToRgb(yuv).pixels, format.Decode(4, 2, buffer.data(), 32).pixels);
    EXPECT_EQ(yuv.bytes, format.DecodeYuv(4, 2, buffer.data(), 32).bytes);
}

TEST(PixelFormat, Format23IsPlanar420LikeFormatZero) {
    PixelFormat const format(PixelFormat::PLANAR_420);
    EXPECT_EQ(23, PixelFormat::PLANAR_420);
    EXPECT_EQ(PixelFormat(PixelFormat::I420).FrameBytes(6, 4), format.FrameBytes(6, 4));
    YuvImage const yuv = PixelFormat::ToYuv(NumberedPixels(6, 4));
    std::vector<unsigned char> buffer(format.FrameBytes(6, 4));
    format.Encode(yuv, buffer.data(), buffer.size());
    EXPECT_EQ(yuv.bytes, std::vector<uint8_t>(buffer.begin(), buffer.end()));
    EXPECT_EQ(yuv.bytes, format.DecodeYuv(6, 4, buffer.data(), buffer.size()).bytes);
}

TEST(PixelFormat, Format23RefusesAnOddSide) {
    EXPECT_THAT(
        [&] {
            std::vector<unsigned char> buffer(22);
            PixelFormat(PixelFormat::PLANAR_420).Decode(5, 3, buffer.data(), buffer.size());
        },
        ThrowsMessage<ToolError>(HasSubstr("need an even width and height, not 5x3")));
}

class PixelFormatTest : public ::testing::TestWithParam<int> {};

TEST_P(PixelFormatTest, RefusesAFormatItCannotConvertNamingIt) {
    int const unknown = GetParam();
    EXPECT_THAT([&] { PixelFormat const format(unknown); },
                ThrowsMessage<ToolError>(
                    HasSubstr("the tool cannot convert pixel format " + std::to_string(unknown))));
}

INSTANTIATE_TEST_SUITE_P(UnknownFormats, PixelFormatTest, ::testing::Values(1, 2, 7, 22, 24, -1));

RgbImage OnePixelPicture(uint8_t red, uint8_t green, uint8_t blue) {
    RgbImage image;
    image.width = 2;
    image.height = 2;
    uint8_t const channels[3] = {red, green, blue};
    image.pixels.resize(std::size_t(4) * 3);
    for (std::size_t index = 0; index < image.pixels.size(); ++index) {
        image.pixels[index] = channels[index % 3];
    }
    return image;
}

// Full range: Y' = 0.299 R + 0.587 G + 0.114 B, Cb = 128 + (B - Y') / 1.772,
// Cr = 128 + (R - Y') / 1.402, over the whole byte.
TEST(PixelFormat, FullRangeGivesTheWholeByteValuesOfBt601) {
    struct Case {
        std::array<uint8_t, 3> rgb;
        std::array<uint8_t, 3> yuv;
    };
    for (Case const& item : {Case{{255, 0, 0}, {76, 85, 255}}, Case{{0, 0, 255}, {29, 255, 107}},
                             Case{{255, 255, 255}, {255, 128, 128}}, Case{{0, 0, 0}, {0, 128, 128}},
                             Case{{128, 128, 128}, {128, 128, 128}}}) {
        YuvImage const yuv = PixelFormat::ToYuv(
            OnePixelPicture(item.rgb[0], item.rgb[1], item.rgb[2]), ColourRange::FULL);
        EXPECT_EQ(item.yuv[0], yuv.bytes[0]) << int(item.rgb[0]) << " " << int(item.rgb[2]);
        EXPECT_EQ(item.yuv[1], yuv.bytes[4]) << int(item.rgb[0]) << " " << int(item.rgb[2]);
        EXPECT_EQ(item.yuv[2], yuv.bytes[5]) << int(item.rgb[0]) << " " << int(item.rgb[2]);
    }
}

TEST(PixelFormat, FullRangeRoundTripStaysWithinOne) {
    for (int value = 0; value < 256; value += 5) {
        RgbImage const picture =
            OnePixelPicture(uint8_t(value), uint8_t(255 - value), uint8_t(value / 2));
        RgbImage const back =
            PixelFormat::ToRgb(PixelFormat::ToYuv(picture, ColourRange::FULL), ColourRange::FULL);
        for (std::size_t channel = 0; channel < 3; ++channel) {
            EXPECT_NEAR(picture.pixels[channel], back.pixels[channel], 1) << value;
        }
    }
}

TEST(PixelFormat, UnspecifiedRangeIsReadAsLimited) {
    RgbImage const picture = OnePixelPicture(200, 30, 90);
    EXPECT_EQ(PixelFormat::ToYuv(picture).bytes,
              PixelFormat::ToYuv(picture, ColourRange::UNSPECIFIED).bytes);
    EXPECT_NE(PixelFormat::ToYuv(picture).bytes,
              PixelFormat::ToYuv(picture, ColourRange::FULL).bytes);
}

TEST(PixelFormat, RgbFormatConvertsAFullRangeFrameInItsOwnRange) {
    YuvImage grey;
    grey.width = 2;
    grey.height = 2;
    grey.bytes = {128, 128, 128, 128, 128, 128};
    std::vector<unsigned char> buffer(12);
    PixelFormat(PixelFormat::RGB24, ColourRange::FULL).Encode(grey, buffer.data(), buffer.size());
    EXPECT_EQ(std::vector<unsigned char>(12, 128), buffer);
    YuvImage const back = PixelFormat(PixelFormat::RGB24, ColourRange::FULL)
                              .DecodeYuv(2, 2, buffer.data(), buffer.size());
    EXPECT_EQ(grey.bytes, back.bytes);
}

// BT.601 from RGB bytes: Y' = 0.299 R + 0.587 G + 0.114 B; luma = black + scale Y', and each colour
// difference 128 + its scale times (B - Y') / 1.772 or (R - Y') / 1.402, rounded and clamped.
struct RangeForm {
    char const* name;
    ColourRange range;
    double black;
    double luma_scale;
    double chroma_scale;
};

class PixelFormatRangeTest : public ::testing::TestWithParam<RangeForm> {};

// Whether `byte` is `value` rounded and clamped to a byte. A value half way between two bytes,
// as full range's chroma often is ((R - Y') / 1.402 is (R - G) / 2 where G = B), may go either way
// by the last bit of the arithmetic, so both neighbours are taken there.
bool IsRounded(uint8_t byte, double value) {
    double const clamped = std::clamp(value, 0.0, 255.0);
    double const below = std::floor(clamped);
    if (std::abs(clamped - below - 0.5) < 1e-9) {
        return byte == below || byte == below + 1.0;
    }
    return byte == std::lround(clamped);
}

TEST_P(PixelFormatRangeTest, ToYuvOfEachColourIsTheClosedFormOfItsRange) {
    RangeForm const& form = GetParam();
    std::vector<Rgb> const colours = GridColours();
    YuvImage const yuv = PixelFormat::ToYuv(Blocks(colours), form.range);
    int mismatches = 0;
    for (std::size_t index = 0; index < colours.size(); ++index) {
        double const r = colours[index][0];
        double const g = colours[index][1];
        double const b = colours[index][2];
        double const y = 0.299 * r + 0.587 * g + 0.114 * b;
        Yuv const actual = YuvAt(yuv, int(2 * index), 1);
        if ((!IsRounded(actual[0], form.black + form.luma_scale * y) ||
             !IsRounded(actual[1], 128.0 + form.chroma_scale * (b - y) / 1.772) ||
             !IsRounded(actual[2], 128.0 + form.chroma_scale * (r - y) / 1.402)) &&
            ++mismatches <= 5) {
            ADD_FAILURE() << "RGB " << r << " " << g << " " << b << " gives Y " << int(actual[0])
                          << " U " << int(actual[1]) << " V " << int(actual[2]);
        }
    }
    EXPECT_EQ(0, mismatches);
}

std::string RangeName(::testing::TestParamInfo<RangeForm> const& info) {
    return info.param.name;
}

INSTANTIATE_TEST_SUITE_P(Ranges, PixelFormatRangeTest,
                         ::testing::Values(RangeForm{"Limited", ColourRange::LIMITED, 16.0,
                                                     219.0 / 255.0, 224.0 / 255.0},
                                           RangeForm{"Unspecified", ColourRange::UNSPECIFIED, 16.0,
                                                     219.0 / 255.0, 224.0 / 255.0},
                                           RangeForm{"Full", ColourRange::FULL, 0.0, 1.0, 1.0}),
                         RangeName);

TEST(PixelFormat, FullRangeGivesTheGreenAndYellowOfTheWholeByte) {
    EXPECT_EQ((Yuv{150, 44, 21}),
              YuvAt(PixelFormat::ToYuv(Uniform(2, 2, {0, 255, 0}), ColourRange::FULL), 0, 0));
    EXPECT_EQ((Yuv{226, 0, 149}),
              YuvAt(PixelFormat::ToYuv(Uniform(2, 2, {255, 255, 0}), ColourRange::FULL), 0, 0));
}

// Full range spends the whole byte on luma and finer steps than limited on chroma, so a colour
// comes back within one level where limited range needs two.
TEST(PixelFormat, FullRangeRgbThroughYuvAndBackStaysWithinOneOverTheGrid) {
    RgbImage const image = Blocks(GridColours());
    RgbImage const back =
        PixelFormat::ToRgb(PixelFormat::ToYuv(image, ColourRange::FULL), ColourRange::FULL);
    ASSERT_EQ(image.pixels.size(), back.pixels.size());
    int worst = 0;
    for (std::size_t index = 0; index < image.pixels.size(); ++index) {
        worst = std::max(worst, std::abs(int(image.pixels[index]) - int(back.pixels[index])));
    }
    EXPECT_LE(worst, 1);
}

TEST(PixelFormat, FullRangeToRgbTakesTheEndsOfTheByteToBlackWhiteAndRed) {
    YuvImage yuv;
    yuv.width = 6;
    yuv.height = 1;
    // Blocks: luma 0, 255 and 76 with chroma neutral, neutral and red's 85, 255.
    yuv.bytes = {0, 0, 255, 255, 76, 76, 128, 128, 85, 128, 128, 255};
    RgbImage const rgb = PixelFormat::ToRgb(yuv, ColourRange::FULL);
    EXPECT_EQ((Rgb{0, 0, 0}), RgbAt(rgb, 0, 0));
    EXPECT_EQ((Rgb{255, 255, 255}), RgbAt(rgb, 2, 0));
    Rgb const red = RgbAt(rgb, 4, 0);
    EXPECT_NEAR(255, red[0], 1);
    EXPECT_NEAR(0, red[1], 1);
    EXPECT_NEAR(0, red[2], 1);
}

TEST(PixelFormat, ToRgbOfLimitedRangeIsTheDefaultAndDiffersFromFull) {
    YuvImage const yuv = NumberedYuv(6, 4);
    EXPECT_EQ(PixelFormat::ToRgb(yuv).pixels, PixelFormat::ToRgb(yuv, ColourRange::LIMITED).pixels);
    EXPECT_EQ(PixelFormat::ToRgb(yuv).pixels,
              PixelFormat::ToRgb(yuv, ColourRange::UNSPECIFIED).pixels);
    EXPECT_NE(PixelFormat::ToRgb(yuv).pixels, PixelFormat::ToRgb(yuv, ColourRange::FULL).pixels);
}

TEST(PixelFormat, FourTwoZeroFormatOfFullRangeConvertsRgbInFullRange) {
    RgbImage const image = NumberedPixels(4, 2);
    PixelFormat const full(PixelFormat::I420, ColourRange::FULL);
    std::vector<unsigned char> buffer(12, 0xEE);
    full.Encode(image, buffer.data(), buffer.size());
    EXPECT_EQ(PixelFormat::ToYuv(image, ColourRange::FULL).bytes, buffer);
    EXPECT_NE(PixelFormat::ToYuv(image).bytes, buffer);
    EXPECT_EQ(
        PixelFormat::ToRgb(PixelFormat::ToYuv(image, ColourRange::FULL), ColourRange::FULL).pixels,
        full.Decode(4, 2, buffer.data(), buffer.size()).pixels);
}

TEST(PixelFormat, RgbFormatOfLimitedRangeConvertsAsTheDefaultDoes) {
    YuvImage const yuv = NumberedYuv(4, 2);
    std::vector<unsigned char> by_default(24);
    std::vector<unsigned char> limited(24);
    PixelFormat(PixelFormat::RGB24).Encode(yuv, by_default.data(), by_default.size());
    PixelFormat(PixelFormat::RGB24, ColourRange::LIMITED)
        .Encode(yuv, limited.data(), limited.size());
    EXPECT_EQ(PixelFormat::ToRgb(yuv).pixels, by_default);
    EXPECT_EQ(by_default, limited);
    EXPECT_EQ(PixelFormat::ToYuv(PixelFormat::ToRgb(yuv)).bytes,
              PixelFormat(PixelFormat::RGB24, ColourRange::LIMITED)
                  .DecodeYuv(4, 2, limited.data(), limited.size())
                  .bytes);
}

}  // namespace
}  // namespace vexmap_host
