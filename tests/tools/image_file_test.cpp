#include "image_file.h"

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <png.h>
#include <string>
#include <turbojpeg.h>
#include <unistd.h>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "crafted_pictures.h"
#include "scratch_folder.h"
#include "tool_error.h"

namespace vexmap_host {
namespace {

using ::testing::HasSubstr;
using ::testing::Not;
using ::testing::ThrowsMessage;

// Quality 100 without chroma subsampling leaves only the rounding of the colour transform and
// the DCT on a smooth gradient.
constexpr int JPEG_TOLERANCE = 4;

// Every channel of every pixel differs from its neighbours, so a swap or shift shows.
RgbImage Gradient(int width, int height) {
    RgbImage image;
    image.width = width;
    image.height = height;
    image.pixels.resize(std::size_t(width) * std::size_t(height) * 3);
    for (int row = 0; row < height; ++row) {
        for (int column = 0; column < width; ++column) {
            uint8_t* pixel =
                &image.pixels[(std::size_t(row) * std::size_t(width) + std::size_t(column)) * 3];
            pixel[0] = uint8_t(column * 255 / (width - 1));
            pixel[1] = uint8_t(row * 255 / (height - 1));
            pixel[2] = uint8_t((column + row) * 255 / (width + height - 2));
        }
    }
    return image;
}

std::vector<unsigned char> ReadAll(std::string const& path) {
    std::ifstream file(path, std::ios::binary);
    return std::vector<unsigned char>((std::istreambuf_iterator<char>(file)),
                                      std::istreambuf_iterator<char>());
}

void WriteAll(std::string const& path, std::vector<unsigned char> const& bytes) {
    std::ofstream file(path, std::ios::binary);
    file.write(reinterpret_cast<char const*>(bytes.data()), std::streamsize(bytes.size()));
}

std::vector<unsigned char> EncodeJpeg(RgbImage const& image) {
    tjhandle const encoder = tjInitCompress();
    unsigned char* jpeg = nullptr;
    unsigned long jpeg_size = 0;
    int const result = tjCompress2(encoder, image.pixels.data(), image.width, 0, image.height,
                                   TJPF_RGB, &jpeg, &jpeg_size, TJSAMP_444, 100, 0);
    std::vector<unsigned char> bytes;
    if (result == 0) {
        bytes.assign(jpeg, jpeg + jpeg_size);
    }
    tjFree(jpeg);
    tjDestroy(encoder);
    return bytes;
}

// A PNG of `format` written by libpng from `pixels`, laid out as the format says.
void WriteFormattedPng(std::string const& path, int width, int height, png_uint_32 format,
                       void const* pixels, void const* colormap = nullptr, int colours = 0) {
    png_image png;
    memset(&png, 0, sizeof png);
    png.version = PNG_IMAGE_VERSION;
    png.width = png_uint_32(width);
    png.height = png_uint_32(height);
    png.format = format;
    png.colormap_entries = png_uint_32(colours);
    ASSERT_NE(0, png_image_write_to_file(&png, path.c_str(), 0, pixels, 0, colormap))
        << png.message;
}

// A JPEG of pixels in `format` (grey or CMYK), encoded at quality 100.
std::vector<unsigned char> EncodeJpegOf(std::vector<unsigned char> const& pixels, int width,
                                        int height, TJPF format, TJSAMP subsampling) {
    tjhandle const encoder = tjInitCompress();
    unsigned char* jpeg = nullptr;
    unsigned long jpeg_size = 0;
    int const result = tjCompress2(encoder, pixels.data(), width, 0, height, format, &jpeg,
                                   &jpeg_size, subsampling, 100, 0);
    std::vector<unsigned char> bytes;
    if (result == 0) {
        bytes.assign(jpeg, jpeg + jpeg_size);
    }
    tjFree(jpeg);
    tjDestroy(encoder);
    return bytes;
}

// The message ReadImage refuses `path` with, "" when it reads.
std::string RefusalOf(std::string const& path) {
    try {
        ReadImage(path);
    } catch (ToolError const& error) {
        return error.what();
    }
    return "";
}

class ImageFileTest : public ::testing::Test {
protected:
    std::string PathOf(std::string const& name) const { return scratch.PathOf(name); }

    ScratchFolder const scratch{"vexmap-image-file-"};
    std::filesystem::path const directory = scratch.Path();
};

TEST_F(ImageFileTest, PngRoundTripKeepsEveryPixel) {
    RgbImage const original = Gradient(37, 23);
    std::string const path = PathOf("gradient.png");
    WritePng(path, original);
    RgbImage const read = ReadImage(path);
    EXPECT_EQ(37, read.width);
    EXPECT_EQ(23, read.height);
    EXPECT_EQ(original.pixels, read.pixels);
}

TEST_F(ImageFileTest, ReadsAJpegCloseToWhatWasEncoded) {
    RgbImage const original = Gradient(48, 32);
    std::vector<unsigned char> const jpeg = EncodeJpeg(original);
    ASSERT_FALSE(jpeg.empty());
    std::string const path = PathOf("gradient.jpg");
    WriteAll(path, jpeg);
    RgbImage const read = ReadImage(path);
    EXPECT_EQ(48, read.width);
    EXPECT_EQ(32, read.height);
    ASSERT_EQ(original.pixels.size(), read.pixels.size());
    int worst = 0;
    for (std::size_t index = 0; index < read.pixels.size(); ++index) {
        worst = std::max(worst, std::abs(int(read.pixels[index]) - int(original.pixels[index])));
    }
    EXPECT_LE(worst, JPEG_TOLERANCE);
}

TEST_F(ImageFileTest, TellsTheFormatByContentNotByName) {
    RgbImage const original = Gradient(8, 6);
    std::string const path = PathOf("picture.jpg");
    WritePng(path, original);
    EXPECT_EQ(original.pixels, ReadImage(path).pixels);
}

TEST_F(ImageFileTest, MissingFileNamesThePathAndTheReason) {
    std::string const path = PathOf("absent.png");
    EXPECT_THAT([&] { ReadImage(path); },
                ThrowsMessage<ToolError>(HasSubstr("cannot read " + path + ": No such file")));
}

TEST_F(ImageFileTest, RefusesAFileThatIsNeitherPngNorJpeg) {
    std::string const path = PathOf("notes.png");
    std::string const text = "just some text, not a picture\n";
    WriteAll(path, std::vector<unsigned char>(text.begin(), text.end()));
    EXPECT_THAT([&] { ReadImage(path); },
                ThrowsMessage<ToolError>(HasSubstr(path + " is neither a PNG nor a JPEG file")));
}

TEST_F(ImageFileTest, RefusesAnEmptyFile) {
    std::string const path = PathOf("empty.png");
    WriteAll(path, {});
    EXPECT_THAT([&] { ReadImage(path); }, ThrowsMessage<ToolError>(HasSubstr(path + " is empty")));
}

TEST_F(ImageFileTest, RefusesATruncatedPng) {
    std::string const path = PathOf("truncated.png");
    WritePng(path, Gradient(64, 48));
    std::vector<unsigned char> bytes = ReadAll(path);
    ASSERT_GT(bytes.size(), 100u);
    bytes.resize(bytes.size() / 2);
    WriteAll(path, bytes);
    EXPECT_THAT([&] { ReadImage(path); },
                ThrowsMessage<ToolError>(HasSubstr(path + " is not a readable PNG file")));
}

TEST_F(ImageFileTest, RefusesAPngSignatureFollowedByGarbage) {
    std::string const path = PathOf("corrupt.png");
    std::vector<unsigned char> bytes = {0x89, 'P', 'N', 'G', '\r', '\n', 0x1A, '\n'};
    for (int index = 0; index < 64; ++index) {
        bytes.push_back(uint8_t(index * 37));
    }
    WriteAll(path, bytes);
    EXPECT_THAT([&] { ReadImage(path); },
                ThrowsMessage<ToolError>(HasSubstr(path + " is not a readable PNG file")));
}

TEST_F(ImageFileTest, RefusesATruncatedJpeg) {
    std::vector<unsigned char> bytes = EncodeJpeg(Gradient(64, 48));
    ASSERT_GT(bytes.size(), 1000u);
    bytes.resize(bytes.size() / 2);
    std::string const path = PathOf("truncated.jpg");
    WriteAll(path, bytes);
    EXPECT_THAT([&] { ReadImage(path); },
                ThrowsMessage<ToolError>(HasSubstr(path + " is not a readable JPEG file")));
}

TEST_F(ImageFileTest, RefusesAJpegSignatureFollowedByGarbage) {
    std::string const path = PathOf("corrupt.jpg");
    std::vector<unsigned char> bytes = {0xFF, 0xD8, 0xFF};
    for (int index = 0; index < 64; ++index) {
        bytes.push_back(uint8_t(index * 37));
    }
    WriteAll(path, bytes);
    EXPECT_THAT([&] { ReadImage(path); },
                ThrowsMessage<ToolError>(HasSubstr(path + " is not a readable JPEG file")));
}

TEST_F(ImageFileTest, WritingIntoAMissingDirectoryNamesThePathAndTheReason) {
    std::string const png = PathOf("absent/picture.png");
    EXPECT_THAT([&] { WritePng(png, Gradient(4, 4)); },
                ThrowsMessage<ToolError>("cannot write " + png + ": No such file or directory"));
    std::string const jpeg = PathOf("absent/picture.jpg");
    EXPECT_THAT([&] { WriteJpeg(jpeg, Gradient(4, 4)); },
                ThrowsMessage<ToolError>("cannot write " + jpeg + ": No such file or directory"));
}

// /dev/full takes the open and refuses every byte, as a full disc does. The noise does not
// compress, so the PNG fails inside libpng's writing; the small JPEG fails at the last flush.
TEST_F(ImageFileTest, FullDiscIsReportedWithTheSystemsReason) {
    RgbImage noise = Gradient(128, 128);
    uint32_t state = 1;
    for (uint8_t& sample : noise.pixels) {
        state = state * 1664525u + 1013904223u;
        sample = uint8_t(state >> 24);
    }
    EXPECT_THAT([&] { WritePng("/dev/full", noise); },
                ThrowsMessage<ToolError>("cannot write /dev/full: No space left on device"));
    EXPECT_THAT([&] { WriteJpeg("/dev/full", Gradient(64, 64)); },
                ThrowsMessage<ToolError>("cannot write /dev/full: No space left on device"));
}

TEST_F(ImageFileTest, GreyPngReadsAsEqualRedGreenAndBlue) {
    std::vector<unsigned char> const grey = {0, 1, 127, 128, 254, 255};
    std::string const path = PathOf("grey.png");
    WriteFormattedPng(path, 3, 2, PNG_FORMAT_GRAY, grey.data());
    RgbImage const read = ReadImage(path);
    ASSERT_EQ(3, read.width);
    ASSERT_EQ(2, read.height);
    std::vector<unsigned char> expected;
    for (unsigned char const value : grey) {
        expected.insert(expected.end(), {value, value, value});
    }
    EXPECT_EQ(expected, read.pixels);
}

TEST_F(ImageFileTest, PalettePngReadsAsTheColoursOfItsEntries) {
    std::vector<unsigned char> const colours = {255, 0, 0, 0, 200, 0, 0, 0, 150, 10, 20, 30};
    std::vector<unsigned char> const entries = {3, 2, 1, 0, 0, 1, 2, 3};
    std::string const path = PathOf("palette.png");
    WriteFormattedPng(path, 4, 2, PNG_FORMAT_RGB_COLORMAP, entries.data(), colours.data(), 4);
    RgbImage const read = ReadImage(path);
    ASSERT_EQ(4, read.width);
    ASSERT_EQ(2, read.height);
    std::vector<unsigned char> expected;
    for (unsigned char const entry : entries) {
        expected.insert(expected.end(), colours.begin() + entry * 3,
                        colours.begin() + entry * 3 + 3);
    }
    EXPECT_EQ(expected, read.pixels);
}

// libpng writes the linear format as 16 bits a sample; the ends of the range map exactly.
TEST_F(ImageFileTest, SixteenBitPngReadsAsEightBits) {
    std::vector<uint16_t> const samples = {65535, 0, 0, 0, 65535, 65535};
    std::string const path = PathOf("deep.png");
    WriteFormattedPng(path, 2, 1, PNG_FORMAT_LINEAR_RGB, samples.data());
    RgbImage const read = ReadImage(path);
    ASSERT_EQ(2, read.width);
    ASSERT_EQ(1, read.height);
    EXPECT_EQ((std::vector<uint8_t>{255, 0, 0, 0, 255, 255}), read.pixels);
}

TEST_F(ImageFileTest, AlphaPngReadsOverBlack) {
    std::vector<unsigned char> const pixels = {200, 100, 50, 255, 200, 100, 50, 0};
    std::string const path = PathOf("alpha.png");
    WriteFormattedPng(path, 2, 1, PNG_FORMAT_RGBA, pixels.data());
    RgbImage const read = ReadImage(path);
    ASSERT_EQ(2, read.width);
    EXPECT_EQ((std::vector<uint8_t>{200, 100, 50, 0, 0, 0}), read.pixels);
}

TEST_F(ImageFileTest, GreyJpegReadsAsEqualRedGreenAndBlue) {
    std::vector<unsigned char> grey(16 * 16);
    for (std::size_t index = 0; index < grey.size(); ++index) {
        grey[index] = uint8_t(index % 16 * 16);
    }
    std::string const path = PathOf("grey.jpg");
    WriteAll(path, EncodeJpegOf(grey, 16, 16, TJPF_GRAY, TJSAMP_GRAY));
    RgbImage const read = ReadImage(path);
    ASSERT_EQ(16, read.width);
    ASSERT_EQ(16, read.height);
    std::size_t unequal = 0;
    int worst = 0;
    for (std::size_t index = 0; index < grey.size(); ++index) {
        uint8_t const* pixel = &read.pixels[index * 3];
        unequal += pixel[0] != pixel[1] || pixel[0] != pixel[2] ? 1 : 0;
        worst = std::max(worst, std::abs(int(grey[index]) - int(pixel[0])));
    }
    EXPECT_EQ(0u, unequal);
    EXPECT_LE(worst, JPEG_TOLERANCE);
}

// CMYK JPEGs hold their samples inverted, 255 being no ink: 255s are white, no 255 for black
// ink is black, no 255 for cyan ink leaves no red.
TEST_F(ImageFileTest, CmykJpegReadsAsRgb) {
    std::vector<unsigned char> cmyk;
    for (int index = 0; index < 8 * 8; ++index) {
        int const column = index % 8;
        if (column < 3) {
            cmyk.insert(cmyk.end(), {255, 255, 255, 255});
        } else if (column < 5) {
            cmyk.insert(cmyk.end(), {255, 255, 255, 0});
        } else {
            cmyk.insert(cmyk.end(), {0, 255, 255, 255});
        }
    }
    std::vector<unsigned char> const jpeg = EncodeJpegOf(cmyk, 8, 8, TJPF_CMYK, TJSAMP_444);
    ASSERT_FALSE(jpeg.empty());
    std::string const path = PathOf("cmyk.jpg");
    WriteAll(path, jpeg);
    RgbImage const read = ReadImage(path);
    ASSERT_EQ(8, read.width);
    ASSERT_EQ(8 * 8 * 3, int(read.pixels.size()));
    uint8_t const* white = &read.pixels[(4 * 8 + 0) * 3];
    uint8_t const* black = &read.pixels[(4 * 8 + 4) * 3];
    uint8_t const* cyan = &read.pixels[(4 * 8 + 7) * 3];
    for (int channel = 0; channel < 3; ++channel) {
        EXPECT_NEAR(255, int(white[channel]), JPEG_TOLERANCE) << channel;
        EXPECT_NEAR(0, int(black[channel]), JPEG_TOLERANCE) << channel;
    }
    EXPECT_NEAR(0, int(cyan[0]), JPEG_TOLERANCE);
    EXPECT_NEAR(255, int(cyan[1]), JPEG_TOLERANCE);
    EXPECT_NEAR(255, int(cyan[2]), JPEG_TOLERANCE);
}

// A sparse file: its size costs no disc, and it must be refused by that size, unread.
TEST_F(ImageFileTest, FileLargerThanAnyPictureIsRefusedUnread) {
    std::string const path = PathOf("huge.png");
    CraftedPictures::Write(path, CraftedPictures::Png(PathOf("scratch.png"), 8, 8));
    std::filesystem::resize_file(path, std::uintmax_t(MAX_PICTURE_FILE_BYTES) + 1);
    EXPECT_THAT([&] { ReadImage(path); },
                ThrowsMessage<ToolError>(path + " holds 1073741825 bytes, more than any picture " +
                                         "vexmap takes"));
}

// /dev/zero never ends: it is refused by its first bytes, not read to the byte bound.
TEST_F(ImageFileTest, EndlessSourceThatIsNoPictureIsRefusedByItsFirstBytes) {
    EXPECT_THAT([&] { ReadImage("/dev/zero"); },
                ThrowsMessage<ToolError>("/dev/zero is neither a PNG nor a JPEG file"));
}

TEST_F(ImageFileTest, LibraryReasonsStayOnOneLine) {
    std::vector<unsigned char> png = {0x89, 'P', 'N', 'G', '\r', '\n', 0x1A, '\n'};
    std::vector<unsigned char> jpeg = {0xFF, 0xD8, 0xFF};
    for (int index = 0; index < 64; ++index) {
        png.push_back(uint8_t(index * 37));
        jpeg.push_back(uint8_t(index * 37));
    }
    WriteAll(PathOf("corrupt.png"), png);
    WriteAll(PathOf("corrupt.jpg"), jpeg);
    std::vector<unsigned char> truncated = EncodeJpeg(Gradient(64, 48));
    truncated.resize(truncated.size() / 2);
    WriteAll(PathOf("truncated.jpg"), truncated);
    for (char const* name : {"corrupt.png", "corrupt.jpg", "truncated.jpg"}) {
        std::string const message = RefusalOf(PathOf(name));
        EXPECT_THAT(message, HasSubstr("is not a readable")) << name;
        EXPECT_THAT(message, Not(HasSubstr("\n"))) << name;
        EXPECT_NE(' ', message.back()) << name;
    }
}

TEST_F(ImageFileTest, JpegHeaderClaimingAHugePictureIsRefusedBeforeDecoding) {
    std::string const path = PathOf("huge.jpg");
    CraftedPictures::Write(path, CraftedPictures::Jpeg(PathOf("scratch.jpg"), 60000, 60000));
    EXPECT_THAT([&] { ReadImage(path); },
                ThrowsMessage<ToolError>(
                    path + " is 60000x60000, beyond the limit of 16384 pixels a side"));
}

TEST_F(ImageFileTest, PngHeaderClaimingAHugePictureIsRefusedBeforeDecoding) {
    std::string const path = PathOf("huge.png");
    CraftedPictures::Write(path, CraftedPictures::Png(PathOf("scratch.png"), 100000, 100000));
    EXPECT_THAT([&] { ReadImage(path); },
                ThrowsMessage<ToolError>(
                    path + " is 100000x100000, beyond the limit of 16384 pixels a side"));
}

TEST_F(ImageFileTest, PictureBeyondTheChosenPixelLimitIsRefused) {
    std::string const path = PathOf("small.png");
    CraftedPictures::Write(path, CraftedPictures::Png(PathOf("scratch.png"), 8, 8));
    EXPECT_EQ(8, ReadImage(path, PictureLimits(64)).width);
    EXPECT_THAT([&] { ReadImage(path, PictureLimits(63)); },
                ThrowsMessage<ToolError>(HasSubstr("beyond the limit of 63 pixels")));
}

TEST_F(ImageFileTest, FolderIsRefusedWithTheSystemsReason) {
    std::filesystem::create_directories(directory / "folder.png");
    std::string const path = PathOf("folder.png");
    EXPECT_THAT([&] { ReadImage(path); },
                ThrowsMessage<ToolError>("cannot read " + path + ": it is a directory"));
}

TEST_F(ImageFileTest, WritesAJpegThatReadsBackCloseToThePicture) {
    RgbImage picture;
    picture.width = 64;
    picture.height = 32;
    picture.pixels.resize(64 * 32 * 3);
    for (std::size_t index = 0; index < picture.pixels.size(); ++index) {
        std::size_t const pixel = index / 3;
        std::size_t const channel = index % 3;
        picture.pixels[index] = channel == 0   ? uint8_t(pixel % 64 * 4)
                                : channel == 1 ? uint8_t(pixel / 64 * 8)
                                               : uint8_t(100);
    }
    std::string const path = PathOf("view.JPEG");
    WritePicture(path, path, picture);
    RgbImage const back = ReadImage(path);
    ASSERT_EQ(64, back.width);
    ASSERT_EQ(32, back.height);
    int worst = 0;
    for (std::size_t index = 0; index < back.pixels.size(); ++index) {
        worst = std::max(worst, std::abs(int(back.pixels[index]) - int(picture.pixels[index])));
    }
    EXPECT_LE(worst, 8);
}

TEST_F(ImageFileTest, WritesTheFormatOfTheNameIntoAnyPath) {
    RgbImage picture;
    picture.width = 8;
    picture.height = 8;
    picture.pixels.assign(8 * 8 * 3, 50);
    std::string const temporary = PathOf(".view.png.tmp");
    WritePicture(temporary, "view.png", picture);
    std::ifstream file(temporary, std::ios::binary);
    char start[4] = {};
    file.read(start, 4);
    EXPECT_EQ(std::string("\x89PNG"), std::string(start, 4));
}

// One-pixel columns of red and blue: chroma at half resolution would mix them into purple.
TEST_F(ImageFileTest, JpegKeepsTheColourOfOnePixelLines) {
    RgbImage picture;
    picture.width = 32;
    picture.height = 16;
    for (int index = 0; index < 32 * 16; ++index) {
        bool const red = index % 2 == 0;
        picture.pixels.insert(picture.pixels.end(),
                              {uint8_t(red ? 255 : 0), 0, uint8_t(red ? 0 : 255)});
    }
    std::string const path = PathOf("lines.jpg");
    WriteJpeg(path, picture);
    RgbImage const back = ReadImage(path);
    ASSERT_EQ(picture.pixels.size(), back.pixels.size());
    for (int column = 8; column < 10; ++column) {
        uint8_t const* pixel = &back.pixels[std::size_t(8 * 32 + column) * 3];
        bool const red = column % 2 == 0;
        EXPECT_GT(int(pixel[red ? 0 : 2]), int(pixel[red ? 2 : 0]) + 100) << column;
    }
}

TEST_F(ImageFileTest, WritesTheFormatItsOwnPathNames) {
    RgbImage const picture = Gradient(8, 8);
    WritePicture(PathOf("view.PNG"), picture);
    WritePicture(PathOf("view.jpeg"), picture);
    EXPECT_EQ(0x89, ReadAll(PathOf("view.PNG")).at(0));
    EXPECT_EQ(0xFF, ReadAll(PathOf("view.jpeg")).at(0));
    std::string const bitmap = PathOf("view.bmp");
    EXPECT_THAT([&] { WritePicture(bitmap, picture); },
                ThrowsMessage<ToolError>(HasSubstr("cannot write " + bitmap + ": ")));
    EXPECT_FALSE(std::filesystem::exists(bitmap));
}

TEST_F(ImageFileTest, KnowsTheExtensionsItWrites) {
    EXPECT_TRUE(IsPictureExtension("a/b.png"));
    EXPECT_TRUE(IsPictureExtension("b.JPG"));
    EXPECT_TRUE(IsPictureExtension("b.jpeg"));
    EXPECT_FALSE(IsPictureExtension("b.bmp"));
    EXPECT_FALSE(IsPictureExtension("b.png/c"));
    EXPECT_FALSE(IsPictureExtension(".png"));
}

}  // namespace
}  // namespace vexmap_host
