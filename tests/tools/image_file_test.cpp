#include "image_file.h"

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <turbojpeg.h>
#include <unistd.h>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "crafted_pictures.h"
#include "tool_error.h"

namespace vexmap_host {
namespace {

using ::testing::HasSubstr;
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

class ImageFileTest : public ::testing::Test {
protected:
    void SetUp() override {
        directory = std::filesystem::path(::testing::TempDir()) /
                    ("vexmap-image-file-" +
                     std::string(::testing::UnitTest::GetInstance()->current_test_info()->name()) +
                     "-" + std::to_string(getpid()));
        std::filesystem::create_directories(directory);
    }
    void TearDown() override { std::filesystem::remove_all(directory); }

    std::string PathOf(std::string const& name) const { return (directory / name).string(); }

    std::filesystem::path directory;
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

TEST_F(ImageFileTest, WritingIntoAMissingDirectoryNamesThePath) {
    std::string const path = PathOf("absent/picture.png");
    EXPECT_THAT([&] { WritePng(path, Gradient(4, 4)); },
                ThrowsMessage<ToolError>(HasSubstr("cannot write " + path)));
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
