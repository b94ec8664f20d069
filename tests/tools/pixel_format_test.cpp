#include "pixel_format.h"

#include <cstdint>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tool_error.h"

namespace vexmap_host {
namespace {

using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

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

class PixelFormatTest : public ::testing::TestWithParam<int> {};

TEST_P(PixelFormatTest, RefusesAFormatItCannotConvertNamingIt) {
    int const unknown = GetParam();
    EXPECT_THAT([&] { PixelFormat const format(unknown); },
                ThrowsMessage<ToolError>(
                    HasSubstr("the tool cannot convert pixel format " + std::to_string(unknown))));
}

INSTANTIATE_TEST_SUITE_P(UnknownFormats, PixelFormatTest, ::testing::Values(0, 6, 23, -1));

}  // namespace
}  // namespace vexmap_host
