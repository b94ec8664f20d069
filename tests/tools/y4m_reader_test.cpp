#include "y4m_reader.h"

#include <algorithm>
#include <atomic>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <new>
#include <sstream>
#include <string>
#include <unistd.h>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tool_error.h"

// Counts the allocations of this test binary while asked to, so that a test can show that a frame
// after the first costs none. AddressSanitizer owns the allocator, and the plug-in some tests load
// allocates through it, so under it operator new stays its own and the sanitizer reports each
// allocation to a hook instead. Elsewhere operator new is replaced; the replacement pairs malloc
// with free, which the compiler cannot see through inlining.
#if defined(__SANITIZE_ADDRESS__)
#define VEXMAP_Y4M_TEST_UNDER_ASAN 1
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
#define VEXMAP_Y4M_TEST_UNDER_ASAN 1
#endif
#endif

namespace {
std::atomic<bool> counting{false};
std::atomic<int> allocations{0};

void CountAllocation() {
    if (counting.load()) {
        ++allocations;
    }
}
}  // namespace

#ifdef VEXMAP_Y4M_TEST_UNDER_ASAN
extern "C" {
// NOLINTNEXTLINE(bugprone-reserved-identifier): the sanitizer's name for it
int __sanitizer_install_malloc_and_free_hooks(void (*on_malloc)(void const volatile*, std::size_t),
                                              void (*on_free)(void const volatile*));
}

namespace {
void OnMalloc(void const volatile*, std::size_t) {
    CountAllocation();
}

void OnFree(void const volatile*) {}
}  // namespace
#else
#if defined(__GNUC__) && !defined(__clang__)
#pragma GCC diagnostic ignored "-Wmismatched-new-delete"
#endif

void* operator new(std::size_t size) {
    CountAllocation();
    if (void* const memory = std::malloc(size == 0 ? 1 : size)) {
        return memory;
    }
    throw std::bad_alloc();
}

void operator delete(void* memory) noexcept {
    std::free(memory);
}

void operator delete(void* memory, std::size_t) noexcept {
    std::free(memory);
}
#endif

namespace {
void StartCounting() {
#ifdef VEXMAP_Y4M_TEST_UNDER_ASAN
    static bool const hooked = __sanitizer_install_malloc_and_free_hooks(OnMalloc, OnFree) != 0;
    static_cast<void>(hooked);
#endif
    allocations = 0;
    counting = true;
}
}  // namespace

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
        BadStream{"NineBit", "YUV4MPEG2 W4 H2 C420p9\n",
                  "has the colour space C420p9, 9 bits a sample; vexmap reads 8-bit streams: "
                  "convert with ffmpeg's -pix_fmt yuv420p"},
        BadStream{"TenBit422", "YUV4MPEG2 W4 H2 C422p10\n",
                  "has the colour space C422p10, 10 bits a sample; vexmap reads 8-bit streams: "
                  "convert with ffmpeg's -pix_fmt yuv420p"},
        BadStream{"SixteenBit444", "YUV4MPEG2 W4 H2 C444p16\n",
                  "has the colour space C444p16, 16 bits a sample"},
        BadStream{"TenBitMono", "YUV4MPEG2 W4 H2 Cmono10\n",
                  "has the colour space Cmono10, 10 bits a sample; vexmap reads 8-bit streams: "
                  "convert with ffmpeg's -pix_fmt yuv420p"},
        BadStream{"UnknownColourSpace", "YUV4MPEG2 W4 H2 C410\n",
                  "has the colour space C410, which vexmap does not read (it reads C420jpeg, "
                  "C420mpeg2, C420paldv, C420, C422, C444, C444alpha, C411, Cmono)"},
        BadStream{"UnknownWithDigits", "YUV4MPEG2 W4 H2 C420x10\n",
                  "has the colour space C420x10, which vexmap does not read"},
        BadStream{"TruncatedSecondFourFourFourAlpha",
                  "YUV4MPEG2 W2 H2 C444alpha\nFRAME\n" + FrameBytes(16, 1) + "FRAME\n" +
                      FrameBytes(15, 2),
                  "ends inside frame 2, after 15 of its 16 bytes"},
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

// A stream layout, where its chroma sample of pixel (x, y) is: column x >> shift of row y of
// each chroma plane (row y / 2 for 4:2:0, whose frames are read as they are).
struct Layout {
    char const* name;
    char const* tags;  // of the header, after the size
    ChromaLayout layout;
    bool alpha;
    unsigned shift;
};

Layout const LAYOUTS[] = {{"NoColourSpace", "", ChromaLayout::C420, false, 1},
                          {"C420jpeg", " C420jpeg", ChromaLayout::C420, false, 1},
                          {"C420mpeg2", " C420mpeg2", ChromaLayout::C420, false, 1},
                          {"C420paldv", " C420paldv", ChromaLayout::C420, false, 1},
                          {"C420", " C420", ChromaLayout::C420, false, 1},
                          {"C422", " C422", ChromaLayout::C422, false, 1},
                          {"C444", " C444", ChromaLayout::C444, false, 0},
                          {"C444alpha", " C444alpha", ChromaLayout::C444, true, 0},
                          {"C411", " C411", ChromaLayout::C411, false, 2},
                          {"Cmono", " Cmono", ChromaLayout::MONO, false, 0}};

struct Size {
    int width;
    int height;
};

Size const SIZES[] = {{4, 2}, {1, 1}, {5, 3}, {7, 4}, {6, 5}, {9, 7}, {12, 2}};

std::size_t ChromaColumns(Layout const& layout, int width) {
    return layout.layout == ChromaLayout::MONO
               ? 0
               : (std::size_t(width) + (1u << layout.shift) - 1) >> layout.shift;
}

std::size_t ChromaRows(Layout const& layout, int height) {
    return layout.layout == ChromaLayout::C420 ? (std::size_t(height) + 1) / 2
                                               : std::size_t(height);
}

std::size_t RawBytes(Layout const& layout, Size const& size) {
    std::size_t const luma = std::size_t(size.width) * std::size_t(size.height);
    return luma * (layout.alpha ? 2 : 1) +
           2 * ChromaColumns(layout, size.width) * ChromaRows(layout, size.height);
}

// Bytes that leave no pattern for a slip to hide in, odd sums among them.
std::vector<uint8_t> Scrambled(std::size_t count, uint32_t seed) {
    std::vector<uint8_t> bytes(count);
    for (uint8_t& byte : bytes) {
        seed = seed * 1664525u + 1013904223u;
        byte = uint8_t(seed >> 24);
    }
    return bytes;
}

// The 4:2:0 frame of a raw one, by the definition: each chroma sample is the mean of the stream's
// samples of the pixels its 2 x 2 block covers, those the frame has, rounded half up.
std::vector<uint8_t> PlainFourTwoZero(Layout const& layout, Size const& size,
                                      std::vector<uint8_t> const& raw) {
    if (layout.layout == ChromaLayout::C420) {
        return raw;
    }
    std::size_t const width = std::size_t(size.width);
    std::size_t const height = std::size_t(size.height);
    std::size_t const out_width = (width + 1) / 2;
    std::size_t const out_height = (height + 1) / 2;
    std::vector<uint8_t> frame(raw.begin(), raw.begin() + std::ptrdiff_t(width * height));
    std::size_t const in_width = ChromaColumns(layout, size.width);
    for (std::size_t plane = 0; plane < 2; ++plane) {
        uint8_t const* in = raw.data() + width * height + plane * in_width * height;
        for (std::size_t row = 0; row < out_height; ++row) {
            for (std::size_t column = 0; column < out_width; ++column) {
                double sum = 0.0;
                double count = 0.0;
                for (std::size_t y = 2 * row; y < std::min(2 * row + 2, height); ++y) {
                    for (std::size_t x = 2 * column; x < std::min(2 * column + 2, width); ++x) {
                        sum += in_width == 0 ? 128.0 : in[y * in_width + (x >> layout.shift)];
                        count += 1.0;
                    }
                }
                frame.push_back(uint8_t(std::floor(sum / count + 0.5)));
            }
        }
    }
    return frame;
}

std::string Stream(Layout const& layout, Size const& size, std::string const& frame_line,
                   std::vector<std::vector<uint8_t>> const& frames) {
    std::string stream = "YUV4MPEG2 W" + std::to_string(size.width) + " H" +
                         std::to_string(size.height) + layout.tags + "\n";
    for (std::vector<uint8_t> const& frame : frames) {
        stream += frame_line + "\n" + std::string(frame.begin(), frame.end());
    }
    return stream;
}

class Y4mReaderLayoutTest : public ::testing::TestWithParam<std::tuple<Layout, Size>> {
protected:
    Layout const& layout() const { return std::get<0>(GetParam()); }
    Size const& size() const { return std::get<1>(GetParam()); }
};

TEST_P(Y4mReaderLayoutTest, TellsTheLayoutAndTheRawFrameBytesOfTheHeader) {
    std::istringstream input(Stream(layout(), size(), "FRAME", {}));
    Y4mReader const reader(input, "in.y4m");
    EXPECT_EQ(std::string(layout().tags).substr(layout().tags[0] == '\0' ? 0 : 2),
              reader.Header().colour_space);
    EXPECT_EQ(layout().layout, reader.Header().layout);
    EXPECT_EQ(layout().alpha, reader.Header().alpha);
    EXPECT_EQ(RawBytes(layout(), size()), reader.FrameBytes());
}

TEST_P(Y4mReaderLayoutTest, GivesEachFrameAsFourTwoZeroWithTheMeanOfTheChromaOverEachBlock) {
    std::vector<std::vector<uint8_t>> const raw = {Scrambled(RawBytes(layout(), size()), 1),
                                                   Scrambled(RawBytes(layout(), size()), 2)};
    std::istringstream input(Stream(layout(), size(), "FRAME", raw));
    Y4mReader reader(input, "in.y4m");
    YuvImage frame;
    for (std::vector<uint8_t> const& bytes : raw) {
        ASSERT_TRUE(reader.ReadFrame(frame));
        EXPECT_EQ(size().width, frame.width);
        EXPECT_EQ(size().height, frame.height);
        EXPECT_EQ(PlainFourTwoZero(layout(), size(), bytes), frame.bytes);
    }
    EXPECT_FALSE(reader.ReadFrame(frame));
}

// The frame's storage, the raw frame's and the FRAME line's are kept from frame to frame. A
// pointer alone could match after a free and a new allocation, so allocations are counted.
TEST_P(Y4mReaderLayoutTest, LaterFramesOfTheStreamAllocateNothing) {
    std::vector<std::vector<uint8_t>> raw;
    for (uint32_t seed = 1; seed <= 4; ++seed) {
        raw.push_back(Scrambled(RawBytes(layout(), size()), seed));
    }
    std::istringstream input(
        Stream(layout(), size(), "FRAME Ip XPARAMETER=LONGER_THAN_A_SHORT_STRING", raw));
    Y4mReader reader(input, "in.y4m");
    YuvImage frame;
    StartCounting();
    bool const first = reader.ReadFrame(frame);
    int const first_allocations = allocations.exchange(0);
    uint8_t const* const storage = frame.bytes.data();
    std::size_t const capacity = frame.bytes.capacity();
    bool const later =
        reader.ReadFrame(frame) && reader.ReadFrame(frame) && reader.ReadFrame(frame);
    counting = false;
    ASSERT_TRUE(first && later);
    EXPECT_LT(0, first_allocations);  // shows that the counting works
    EXPECT_EQ(0, allocations.load());
    EXPECT_EQ(storage, frame.bytes.data());
    EXPECT_EQ(capacity, frame.bytes.capacity());
    EXPECT_EQ(PlainFourTwoZero(layout(), size(), raw.back()), frame.bytes);
}

std::string LayoutCaseName(::testing::TestParamInfo<std::tuple<Layout, Size>> const& info) {
    Size const& size = std::get<1>(info.param);
    return std::string(std::get<0>(info.param).name) + "_" + std::to_string(size.width) + "x" +
           std::to_string(size.height);
}

INSTANTIATE_TEST_SUITE_P(Layouts, Y4mReaderLayoutTest,
                         ::testing::Combine(::testing::ValuesIn(LAYOUTS),
                                            ::testing::ValuesIn(SIZES)),
                         LayoutCaseName);

TEST(Y4mReader, ReadsAFourTwoZeroFrameAfterOneOfAnotherLayoutInTheSameImage) {
    Layout const& wide = LAYOUTS[6];  // C444
    std::istringstream first(Stream(wide, {4, 2}, "FRAME", {Scrambled(24, 7)}));
    std::istringstream second(SMALL_HEADER + "FRAME\n" + FrameBytes(12, 3));
    YuvImage frame;
    Y4mReader wide_reader(first, "wide.y4m");
    ASSERT_TRUE(wide_reader.ReadFrame(frame));
    Y4mReader reader(second, "in.y4m");
    ASSERT_TRUE(reader.ReadFrame(frame));
    EXPECT_EQ(AsBytes(FrameBytes(12, 3)), frame.bytes);
}

// ffmpeg's conversions of a 4:4:4 picture the test writes: each layout ffmpeg makes of it, read as
// 4:2:0, against ffmpeg's own 4:2:0 of it. ffmpeg converts with its box filter ("area"), the mean
// the reader takes, and in limited range throughout, as it would make grey full range otherwise.
class Y4mReaderFfmpegTest : public ::testing::Test {
protected:
    static constexpr int WIDTH = 64;
    static constexpr int HEIGHT = 32;
    static constexpr int FRAMES = 2;

    void SetUp() override {
        if (std::system("command -v ffmpeg > /dev/null 2>&1") != 0) {
            GTEST_SKIP() << "ffmpeg is not installed";
        }
        ::testing::TestInfo const* const test =
            ::testing::UnitTest::GetInstance()->current_test_info();
        // Another build's run of the same test may be at work beside this one.
        std::string name = std::string(test->test_suite_name()) + "_" + test->name() + "_" +
                           std::to_string(getpid());
        std::replace(name.begin(), name.end(), '/', '_');
        directory = std::filesystem::path(::testing::TempDir()) / name;
        std::filesystem::remove_all(directory);
        std::filesystem::create_directories(directory);
        WritePicture(PathOf("picture.y4m"));
    }

    void TearDown() override {
        std::error_code ignored;
        std::filesystem::remove_all(directory, ignored);
    }

    std::string PathOf(std::string const& file) const { return (directory / file).string(); }

    // Luma a gradient with a checker of 4-pixel squares on it. Chroma changes in straight lines
    // across, U by one level a pixel and V by three, and down, U by four levels a row and V in a
    // curve: a 4:2:0 block's two columns differ in V, and its two rows in U, by more than the
    // rounding, so that a sample taken from the wrong place shows. Every frame differs.
    static void WritePicture(std::string const& path) {
        std::ofstream file(path, std::ios::binary);
        file << "YUV4MPEG2 W" << WIDTH << " H" << HEIGHT << " F25:1 Ip A1:1 C444\n";
        for (int frame = 0; frame < FRAMES; ++frame) {
            std::string planes;
            for (int plane = 0; plane < 3; ++plane) {
                for (int y = 0; y < HEIGHT; ++y) {
                    for (int x = 0; x < WIDTH; ++x) {
                        int const checker = (x / 4 + y / 4) % 2 * 20;
                        int const value = plane == 0
                                              ? 16 + (3 * x + 2 * y + checker + 5 * frame) % 200
                                          : plane == 1 ? 20 + x + 4 * y + frame
                                                       : 240 - 3 * x - y * y / 32 - frame;
                        planes.push_back(char(uint8_t(value)));
                    }
                }
            }
            file << "FRAME\n" << planes;
        }
    }

    // ffmpeg's stream of `from`, converted as `options` say.
    std::string Convert(std::string const& from, std::string const& options,
                        std::string const& to) const {
        std::string path = PathOf(to);
        std::string const command = "ffmpeg -nostdin -hide_banner -loglevel error -y -i '" + from +
                                    "' " + options + " -f yuv4mpegpipe '" + path + "' 2> '" +
                                    PathOf("ffmpeg.txt") + "'";
        EXPECT_EQ(0, std::system(command.c_str())) << command << "\n" << Text(PathOf("ffmpeg.txt"));
        return path;
    }

    static std::string Text(std::string const& path) {
        std::ifstream file(path, std::ios::binary);
        return std::string(std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>());
    }

    static std::vector<YuvImage> ReadAll(std::string const& path, Y4mHeader* header = nullptr) {
        std::ifstream file(path, std::ios::binary);
        Y4mReader reader(file, path);
        if (header != nullptr) {
            *header = reader.Header();
        }
        std::vector<YuvImage> frames(1);
        while (reader.ReadFrame(frames.back())) {
            frames.emplace_back();
        }
        frames.pop_back();
        return frames;
    }

    std::filesystem::path directory;
};

// ffmpeg rounds its box mean in fixed point, once a pass, where the reader rounds the exact mean
// once: they may part by one level.
constexpr int BOX_ROUNDING_TOLERANCE = 1;
// A 4:1:1 sample's centre lies a pixel beside the 4:2:0 sample's, across which the picture's V
// changes by three levels, on top of the rounding.
constexpr int FOUR_ONE_ONE_TOLERANCE = 4;

struct FfmpegLayout {
    char const* pixel_format;
    char const* colour_space;  // the C tag ffmpeg writes for it
    ChromaLayout layout;
    int chroma_tolerance;  // against ffmpeg's 4:2:0; none is compared for grey, whose chroma is 128
};

class Y4mReaderFfmpegLayoutTest : public Y4mReaderFfmpegTest,
                                  public ::testing::WithParamInterface<FfmpegLayout> {};

TEST_P(Y4mReaderFfmpegLayoutTest, ReadsFfmpegsLayoutAsFfmpegsOwnFourTwoZero) {
    std::string const scale = "-vf scale=in_range=tv:out_range=tv:flags=area -pix_fmt ";
    std::string const picture = PathOf("picture.y4m");
    Y4mHeader header;
    std::vector<YuvImage> const frames =
        ReadAll(Convert(picture, scale + GetParam().pixel_format, "layout.y4m"), &header);
    std::vector<YuvImage> const expected =
        ReadAll(Convert(picture, scale + "yuv420p", "reference.y4m"));
    EXPECT_EQ(GetParam().colour_space, header.colour_space);
    EXPECT_EQ(GetParam().layout, header.layout);
    ASSERT_EQ(std::size_t(FRAMES), frames.size());
    ASSERT_EQ(std::size_t(FRAMES), expected.size());
    std::size_t const luma = std::size_t(WIDTH) * HEIGHT;
    for (std::size_t index = 0; index < frames.size(); ++index) {
        std::vector<uint8_t> const& bytes = frames[index].bytes;
        std::vector<uint8_t> const& reference = expected[index].bytes;
        ASSERT_EQ(reference.size(), bytes.size());
        EXPECT_TRUE(
            std::equal(bytes.begin(), bytes.begin() + std::ptrdiff_t(luma), reference.begin()))
            << "luma of frame " << index + 1;
        int worst = 0;
        for (std::size_t at = luma; at < bytes.size(); ++at) {
            int const wanted = GetParam().layout == ChromaLayout::MONO ? 128 : reference[at];
            worst = std::max(worst, std::abs(int(bytes[at]) - wanted));
        }
        EXPECT_LE(worst, GetParam().chroma_tolerance) << "chroma of frame " << index + 1;
    }
}

std::string FfmpegLayoutName(::testing::TestParamInfo<FfmpegLayout> const& info) {
    return info.param.pixel_format;
}

INSTANTIATE_TEST_SUITE_P(
    Layouts, Y4mReaderFfmpegLayoutTest,
    ::testing::Values(FfmpegLayout{"yuv422p", "422", ChromaLayout::C422, BOX_ROUNDING_TOLERANCE},
                      FfmpegLayout{"yuv444p", "444", ChromaLayout::C444, BOX_ROUNDING_TOLERANCE},
                      FfmpegLayout{"yuv411p", "411", ChromaLayout::C411, FOUR_ONE_ONE_TOLERANCE},
                      FfmpegLayout{"gray", "mono", ChromaLayout::MONO, 0}),
    FfmpegLayoutName);

TEST_F(Y4mReaderFfmpegTest, ReadsTheColourRangeFfmpegMarks) {
    std::string const picture = PathOf("picture.y4m");
    Y4mHeader full;
    ReadAll(Convert(picture, "-pix_fmt yuv420p -color_range pc", "full.y4m"), &full);
    EXPECT_EQ(ColourRange::FULL, full.range);
    Y4mHeader limited;
    ReadAll(Convert(picture, "-pix_fmt yuv422p -color_range tv", "limited.y4m"), &limited);
    EXPECT_EQ(ColourRange::LIMITED, limited.range);
}

}  // namespace
}  // namespace vexmap_host
