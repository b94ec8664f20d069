#include "y4m_reader.h"

#include <cstdint>
#include <sstream>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tool_error.h"

namespace vexmap_host {
namespace {

using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

// Byte i of frame f holds f * 16 + i, newlines and zeros among them.
std::string FrameBytes(std::size_t count, int frame) {
    std::string bytes(count, '\0');
    for (std::size_t index = 0; index < count; ++index) {
        bytes[index] = char(uint8_t(std::size_t(frame) * 16 + index));
    }
    return bytes;
}

std::vector<uint8_t> AsBytes(std::string const& text) {
    return std::vector<uint8_t>(text.begin(), text.end());
}

std::string const SMALL_HEADER = "YUV4MPEG2 W4 H2 F30000:1001 It A10:11 C420mpeg2\n";

TEST(Y4mReader, ReadsEveryFieldOfTheHeader) {
    std::istringstream input(SMALL_HEADER);
    Y4mReader const reader(input, "in.y4m");
    Y4mHeader const& header = reader.Header();
    EXPECT_EQ(4, header.width);
    EXPECT_EQ(2, header.height);
    EXPECT_EQ(30000, header.rate_numerator);
    EXPECT_EQ(1001, header.rate_denominator);
    EXPECT_EQ('t', header.interlacing);
    EXPECT_EQ(10, header.aspect_numerator);
    EXPECT_EQ(11, header.aspect_denominator);
    EXPECT_EQ("420mpeg2", header.colour_space);
    EXPECT_EQ(12u, reader.FrameBytes());
}

TEST(Y4mReader, WidthAndHeightAloneAreEnough) {
    std::istringstream input("YUV4MPEG2 W6 H4\n");
    Y4mReader const reader(input, "in.y4m");
    Y4mHeader const& header = reader.Header();
    EXPECT_EQ(25, header.rate_numerator);
    EXPECT_EQ(1, header.rate_denominator);
    EXPECT_EQ('p', header.interlacing);
    EXPECT_EQ(0, header.aspect_numerator);
    EXPECT_EQ(0, header.aspect_denominator);
    EXPECT_EQ("", header.colour_space);
}

TEST(Y4mReader, IgnoresExtensionsAndUnknownTags) {
    std::istringstream input(
        "YUV4MPEG2 W6 H4 F25:1 XYSCSS=420JPEG XCOLORRANGE=LIMITED Zfuture  Ip\n");
    Y4mReader const reader(input, "in.y4m");
    EXPECT_EQ(6, reader.Header().width);
    EXPECT_EQ('p', reader.Header().interlacing);
}

TEST(Y4mReader, ChromaOfAnOddSizeIsRoundedUp) {
    std::istringstream input("YUV4MPEG2 W5 H3\n");
    EXPECT_EQ(15u + 2u * 3u * 2u, Y4mReader(input, "in.y4m").FrameBytes());
}

TEST(Y4mReader, TakesTheLargestSide) {
    std::istringstream input("YUV4MPEG2 W16384 H16384\n");
    EXPECT_EQ(uint64_t(16384) * 16384 * 3 / 2, Y4mReader(input, "in.y4m").FrameBytes());
}

TEST(Y4mReader, ReadsFramesInOrderUntilTheEnd) {
    std::istringstream input(SMALL_HEADER + "FRAME\n" + FrameBytes(12, 1) + "FRAME\n" +
                             FrameBytes(12, 2) + "FRAME\n" + FrameBytes(12, 3));
    Y4mReader reader(input, "in.y4m");
    YuvImage frame;
    for (int number = 1; number <= 3; ++number) {
        ASSERT_TRUE(reader.ReadFrame(frame)) << "frame " << number;
        EXPECT_EQ(4, frame.width);
        EXPECT_EQ(2, frame.height);
        EXPECT_EQ(AsBytes(FrameBytes(12, number)), frame.bytes);
    }
    EXPECT_FALSE(reader.ReadFrame(frame));
    EXPECT_FALSE(reader.ReadFrame(frame));
    EXPECT_EQ(3u, reader.FramesRead());
}

TEST(Y4mReader, AStreamOfNoFrameEndsAtOnce) {
    std::istringstream input(SMALL_HEADER);
    Y4mReader reader(input, "in.y4m");
    YuvImage frame;
    EXPECT_FALSE(reader.ReadFrame(frame));
    EXPECT_EQ(0u, reader.FramesRead());
}

TEST(Y4mReader, IgnoresTheParametersOfAFrame) {
    std::istringstream input(SMALL_HEADER + "FRAME Ib XZ=1\n" + FrameBytes(12, 1));
    Y4mReader reader(input, "in.y4m");
    YuvImage frame;
    ASSERT_TRUE(reader.ReadFrame(frame));
    EXPECT_EQ(AsBytes(FrameBytes(12, 1)), frame.bytes);
}

TEST(Y4mReader, ReusesTheStorageOfALargerFrame) {
    std::istringstream input(SMALL_HEADER + "FRAME\n" + FrameBytes(12, 1));
    Y4mReader reader(input, "in.y4m");
    YuvImage frame;
    frame.bytes.assign(100, 0xEE);
    ASSERT_TRUE(reader.ReadFrame(frame));
    EXPECT_EQ(AsBytes(FrameBytes(12, 1)), frame.bytes);
}

TEST(Y4mReader, HeaderOfTheCapIsTakenAndOneByteMoreIsNot) {
    std::string const start = "YUV4MPEG2 W2 H2 X";
    std::string const fits = start + std::string(Y4mReader::MAX_LINE - start.size() - 1, 'x');
    std::istringstream exact(fits + "\n");
    EXPECT_EQ(2, Y4mReader(exact, "in.y4m").Header().width);
    std::istringstream longer(fits + "x\n");
    EXPECT_THAT(
        [&] { Y4mReader const reader(longer, "in.y4m"); },
        ThrowsMessage<ToolError>(HasSubstr("in.y4m has a stream header longer than 4096 bytes")));
}

TEST(Y4mReader, StopsReadingAHeaderAtTheCap) {
    std::istringstream input("YUV4MPEG2 W2 H2 X" + std::string(1 << 20, 'x'));
    EXPECT_THROW(Y4mReader(input, "in.y4m"), ToolError);
    EXPECT_LE(input.tellg(), std::streampos(Y4mReader::MAX_LINE));
}

struct BadStream {
    char const* name;
    std::string bytes;
    char const* reason;
};

class Y4mReaderTest : public ::testing::TestWithParam<BadStream> {};

// Every refusal names the source and says what is wrong; the header's are made on construction.
TEST_P(Y4mReaderTest, RefusesABadStreamSayingWhy) {
    EXPECT_THAT(
        [] {
            std::istringstream input(GetParam().bytes);
            Y4mReader reader(input, "in.y4m");
            YuvImage frame;
            while (reader.ReadFrame(frame)) {
            }
        },
        ThrowsMessage<ToolError>(HasSubstr(std::string("in.y4m ") + GetParam().reason)));
}

std::string CaseName(::testing::TestParamInfo<BadStream> const& info) {
    return info.param.name;
}

INSTANTIATE_TEST_SUITE_P(
    Refusals, Y4mReaderTest,
    ::testing::Values(
        BadStream{"Empty", "", "is not a YUV4MPEG2 stream"},
        BadStream{"OtherMagic", "YUV4MPEG W4 H2\n", "is not a YUV4MPEG2 stream"},
        BadStream{"MagicRunOn", "YUV4MPEG2X W4 H2\n", "is not a YUV4MPEG2 stream"},
        BadStream{"Png", std::string("\x89PNG\r\n\x1a\n\0\0\0\rIHDR", 16),
                  "is not a YUV4MPEG2 stream"},
        BadStream{"MagicAlone", "YUV4MPEG2", "is not a YUV4MPEG2 stream"},
        BadStream{"HeaderCutShort", "YUV4MPEG2 W4 H2", "ends inside its stream header"},
        BadStream{"NoTags", "YUV4MPEG2\n", "has no frame width (W) in its header"},
        BadStream{"NoWidth", "YUV4MPEG2 H2 F25:1\n", "has no frame width (W) in its header"},
        BadStream{"NoHeight", "YUV4MPEG2 W4 F25:1\n", "has no frame height (H) in its header"},
        BadStream{"ZeroWidth", "YUV4MPEG2 W0 H2\n", "has a frame width that is not a whole"},
        BadStream{"NegativeHeight", "YUV4MPEG2 W4 H-2\n", "has a frame height that is not"},
        BadStream{"WidthBeyondTheCap", "YUV4MPEG2 W16385 H2\n",
                  "has a frame width that is not a whole number from 1 to 16384: W16385"},
        BadStream{"HugeHeight", "YUV4MPEG2 W4 H99999999999999999999999\n",
                  "has a frame height that is not a whole number from 1 to 16384"},
        BadStream{"WidthWithTail", "YUV4MPEG2 W4x H2\n", "has a frame width"},
        BadStream{"EmptyWidth", "YUV4MPEG2 W H2\n", "has a frame width"},
        BadStream{"TenBit", "YUV4MPEG2 W4 H2 C420p10\n",
                  "has the colour space C420p10, 10 bits a sample; vexmap reads 8-bit streams: "
                  "convert with ffmpeg's -pix_fmt yuv420p"},
        BadStream{"TwelveBit444", "YUV4MPEG2 W4 H2 C444p12\n",
                  "has the colour space C444p12, 12 bits a sample"},
        BadStream{"SixteenBitMono", "YUV4MPEG2 W4 H2 Cmono16\n",
                  "has the colour space Cmono16, 16 bits a sample"},
        BadStream{"EmptyColourSpace", "YUV4MPEG2 W4 H2 C\n",
                  "has the colour space C, which vexmap does not read (it reads C420jpeg, "
                  "C420mpeg2, C420paldv, C420, C422, C444, C444alpha, C411, Cmono)"},
        BadStream{"UnknownColourSpace", "YUV4MPEG2 W4 H2 C410\n",
                  "has the colour space C410, which"},
        BadStream{"TruncatedFourTwoTwo", "YUV4MPEG2 W4 H2 C422\nFRAME\n123456789",
                  "ends inside frame 1, after 9 of its 16 bytes"},
        BadStream{"RateWithoutDenominator", "YUV4MPEG2 W4 H2 F25\n", "has a frame rate"},
        BadStream{"ZeroRate", "YUV4MPEG2 W4 H2 F0:1\n", "has a frame rate"},
        BadStream{"RateOverZero", "YUV4MPEG2 W4 H2 F25:0\n", "has a frame rate"},
        BadStream{"RateBeyondInt", "YUV4MPEG2 W4 H2 F4294967296:1\n", "has a frame rate"},
        BadStream{"AspectWithoutColon", "YUV4MPEG2 W4 H2 A1\n", "has a pixel aspect"},
        BadStream{"UnknownInterlacing", "YUV4MPEG2 W4 H2 Ix\n", "has an unknown interlacing"},
        BadStream{"TruncatedFrame", SMALL_HEADER + "FRAME\n" + FrameBytes(11, 1),
                  "ends inside frame 1, after 11 of its 12 bytes"},
        BadStream{"TruncatedSecondFrame",
                  SMALL_HEADER + "FRAME\n" + FrameBytes(12, 1) + "FRAME\n" + FrameBytes(1, 2),
                  "ends inside frame 2, after 1 of its 12 bytes"},
        BadStream{"FrameLineCutShort", SMALL_HEADER + "FRA",
                  "ends inside its FRAME line of frame 1"},
        BadStream{"FrameLineWithoutBytes", SMALL_HEADER + "FRAME\n",
                  "ends inside frame 1, after 0 of its 12 bytes"},
        BadStream{"NoFrameLine", SMALL_HEADER + FrameBytes(12, 1) + "\n",
                  "has a bad FRAME line of frame 1: it does not start with FRAME"},
        BadStream{"FrameLineRunOn", SMALL_HEADER + "FRAMES\n" + FrameBytes(12, 1),
                  "has a bad FRAME line of frame 1"},
        BadStream{"SecondFrameLineLowercase",
                  SMALL_HEADER + "FRAME\n" + FrameBytes(12, 1) + "frame\n" + FrameBytes(12, 2),
                  "has a bad FRAME line of frame 2"},
        BadStream{"FrameLineBeyondTheCap",
                  SMALL_HEADER + "FRAME X" + std::string(Y4mReader::MAX_LINE, 'x') + "\n",
                  "has a FRAME line of frame 1 longer than 4096 bytes"}),
    CaseName);

// A header may promise a frame of hundreds of megabytes; a stream that ends early must not have
// cost them.
TEST(Y4mReader, AHugeFrameThatNeverComesCostsLittleMemory) {
    std::istringstream input("YUV4MPEG2 W16384 H16384\nFRAME\n" + FrameBytes(100, 1));
    Y4mReader reader(input, "in.y4m");
    YuvImage frame;
    EXPECT_THAT([&] { reader.ReadFrame(frame); },
                ThrowsMessage<ToolError>(HasSubstr("ends inside frame 1, after 100 of its")));
    EXPECT_LE(frame.bytes.capacity(), std::size_t(4) << 20);
}

TEST(Y4mReader, ReadsAFrameLargerThanOneReadStep) {
    std::size_t const bytes = YuvImage::FrameBytes(2048, 1024);
    std::istringstream input("YUV4MPEG2 W2048 H1024\nFRAME\n" + FrameBytes(bytes, 3));
    Y4mReader reader(input, "in.y4m");
    YuvImage frame;
    ASSERT_TRUE(reader.ReadFrame(frame));
    EXPECT_EQ(AsBytes(FrameBytes(bytes, 3)), frame.bytes);
}

// One frame of a stream whose header ends in `tags`, its planes given byte by byte.
YuvImage ReadOne(std::string const& tags, std::vector<uint8_t> const& planes) {
    std::istringstream input("YUV4MPEG2 " + tags + "\nFRAME\n" +
                             std::string(planes.begin(), planes.end()));
    Y4mReader reader(input, "in.y4m");
    YuvImage frame;
    EXPECT_TRUE(reader.ReadFrame(frame));
    return frame;
}

// A 4 x 2 frame's luma 0 to 7, then its planes as the layout has them.
std::vector<uint8_t> Planes(std::vector<uint8_t> const& chroma) {
    std::vector<uint8_t> planes(8 + chroma.size());
    for (std::size_t index = 0; index < planes.size(); ++index) {
        planes[index] = index < 8 ? uint8_t(index) : chroma[index - 8];
    }
    return planes;
}

TEST(Y4mReader, ReadsFourTwoTwoAsFourTwoZeroWithEachPairOfChromaRowsAveraged) {
    // U rows 10 11 / 21 30, V rows 100 102 / 200 201: the means round half up.
    YuvImage const frame = ReadOne("W4 H2 C422", Planes({10, 11, 21, 30, 100, 102, 200, 201}));
    EXPECT_EQ((std::vector<uint8_t>{0, 1, 2, 3, 4, 5, 6, 7, 16, 21, 150, 152}), frame.bytes);
}

TEST(Y4mReader, ReadsFourFourFourAsFourTwoZeroWithEachBlockAveraged) {
    YuvImage const frame =
        ReadOne("W4 H2 C444", Planes({1, 2, 3, 4, 5, 6, 7, 9, 100, 100, 0, 0, 100, 101, 0, 1}));
    // (1 + 2 + 5 + 6 + 2) / 4 = 4, (3 + 4 + 7 + 9 + 2) / 4 = 6; (401 + 2) / 4 = 100, 3 / 4 = 0.
    EXPECT_EQ((std::vector<uint8_t>{0, 1, 2, 3, 4, 5, 6, 7, 4, 6, 100, 0}), frame.bytes);
}

TEST(Y4mReader, DropsTheAlphaPlaneOfFourFourFourAlpha) {
    std::vector<uint8_t> planes = Planes(std::vector<uint8_t>(16, 50));
    planes.insert(planes.end(), 8, 255);
    std::istringstream input("YUV4MPEG2 W4 H2 C444alpha\nFRAME\n" +
                             std::string(planes.begin(), planes.end()) + "FRAME\n" +
                             std::string(planes.begin(), planes.end()));
    Y4mReader reader(input, "in.y4m");
    EXPECT_EQ(32u, reader.FrameBytes());
    YuvImage frame;
    ASSERT_TRUE(reader.ReadFrame(frame));
    EXPECT_EQ((std::vector<uint8_t>{0, 1, 2, 3, 4, 5, 6, 7, 50, 50, 50, 50}), frame.bytes);
    EXPECT_TRUE(reader.ReadFrame(frame));  // the alpha plane was not taken for the next frame
    EXPECT_FALSE(reader.ReadFrame(frame));
}

TEST(Y4mReader, ReadsFourOneOneWithOneSampleForEachFourColumns) {
    // 8 x 2: one U and one V a row covers the left four columns, another the right four.
    std::vector<uint8_t> planes(16, 9);
    planes.insert(planes.end(), {10, 20, 30, 41, 100, 110, 120, 130});
    YuvImage const frame = ReadOne("W8 H2 C411", planes);
    std::vector<uint8_t> const chroma(frame.bytes.begin() + 16, frame.bytes.end());
    EXPECT_EQ((std::vector<uint8_t>{20, 20, 31, 31, 110, 110, 120, 120}), chroma);
}

TEST(Y4mReader, ReadsMonochromeWithNeutralChroma) {
    YuvImage const frame = ReadOne("W4 H2 Cmono", Planes({}));
    EXPECT_EQ((std::vector<uint8_t>{0, 1, 2, 3, 4, 5, 6, 7, 128, 128, 128, 128}), frame.bytes);
}

TEST(Y4mReader, FourTwoTwoOfOddSizeKeepsTheLastRowAndColumn) {
    // 3 x 3: chroma 2 x 3 in the stream, 2 x 2 in 4:2:0; the last row stands alone.
    std::vector<uint8_t> planes(9, 1);
    planes.insert(planes.end(), {10, 20, 30, 40, 50, 60, 1, 2, 3, 4, 5, 6});
    YuvImage const frame = ReadOne("W3 H3 C422", planes);
    std::vector<uint8_t> const chroma(frame.bytes.begin() + 9, frame.bytes.end());
    EXPECT_EQ((std::vector<uint8_t>{20, 30, 50, 60, 2, 3, 5, 6}), chroma);
}

TEST(Y4mReader, ConvertedFramesReuseTheirStorage) {
    std::string const frame = "FRAME\n" + FrameBytes(16, 1);
    std::istringstream input("YUV4MPEG2 W4 H2 C422\n" + frame + frame + frame);
    Y4mReader reader(input, "in.y4m");
    YuvImage image;
    ASSERT_TRUE(reader.ReadFrame(image));
    uint8_t const* const storage = image.bytes.data();
    std::size_t const capacity = image.bytes.capacity();
    std::vector<uint8_t> const first = image.bytes;
    while (reader.ReadFrame(image)) {
        EXPECT_EQ(storage, image.bytes.data());
        EXPECT_EQ(capacity, image.bytes.capacity());
        EXPECT_EQ(first, image.bytes);
    }
    EXPECT_EQ(3u, reader.FramesRead());
}

TEST(Y4mReader, ReadsTheColourRange) {
    auto const range_of = [](std::string const& tags) {
        std::istringstream input("YUV4MPEG2 W4 H2" + tags + "\n");
        return Y4mReader(input, "in.y4m").Header().range;
    };
    EXPECT_EQ(ColourRange::FULL, range_of(" XCOLORRANGE=FULL"));
    EXPECT_EQ(ColourRange::LIMITED, range_of(" XCOLORRANGE=LIMITED"));
    EXPECT_EQ(ColourRange::UNSPECIFIED, range_of(""));
    EXPECT_EQ(ColourRange::UNSPECIFIED, range_of(" XCOLORRANGE=WIDE"));
}

TEST(Y4mReader, SizeBeyondThePixelLimitIsRefusedAtTheHeader) {
    std::istringstream input("YUV4MPEG2 W1000 H1000\n");
    EXPECT_THAT([&input] { Y4mReader reader(input, "in.y4m", PictureLimits(999999)); },
                ThrowsMessage<ToolError>(HasSubstr("in.y4m is 1000x1000, 1000000 pixels, beyond "
                                                   "the limit of 999999 pixels")));
}

}  // namespace
}  // namespace vexmap_host
