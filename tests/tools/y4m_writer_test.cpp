#include "y4m_writer.h"

#include <cstdint>
#include <sstream>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tool_error.h"
#include "y4m_reader.h"

namespace vexmap_host {
namespace {

using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

// Byte i holds seed + i, newlines and zeros among them.
YuvImage Numbered(int width, int height, int seed) {
    YuvImage image;
    image.width = width;
    image.height = height;
    image.bytes.resize(YuvImage::FrameBytes(uint64_t(width), uint64_t(height)));
    for (std::size_t index = 0; index < image.bytes.size(); ++index) {
        image.bytes[index] = uint8_t(std::size_t(seed) + index);
    }
    return image;
}

std::string Text(YuvImage const& image) {
    return std::string(image.bytes.begin(), image.bytes.end());
}

TEST(Y4mWriter, WritesNothingBeforeTheFirstFrame) {
    std::ostringstream output;
    Y4mWriter const writer(output, "out.y4m", 25, 1);
    EXPECT_EQ("", output.str());
    EXPECT_EQ(0u, writer.FramesWritten());
}

TEST(Y4mWriter, WritesTheHeaderWithTheFirstFrame) {
    std::ostringstream output;
    Y4mWriter writer(output, "out.y4m", 30000, 1001);
    YuvImage const frame = Numbered(4, 2, 0);
    writer.WriteFrame(frame);
    EXPECT_EQ("YUV4MPEG2 W4 H2 F30000:1001 Ip A1:1 C420jpeg\nFRAME\n" + Text(frame), output.str());
    EXPECT_EQ(1u, writer.FramesWritten());
}

TEST(Y4mWriter, WritesEachLaterFrameAfterItsOwnFrameLine) {
    std::ostringstream output;
    Y4mWriter writer(output, "out.y4m", 25, 1);
    YuvImage const first = Numbered(4, 2, 0);
    YuvImage const second = Numbered(4, 2, 100);
    writer.WriteFrame(first);
    writer.WriteFrame(second);
    EXPECT_EQ(
        "YUV4MPEG2 W4 H2 F25:1 Ip A1:1 C420jpeg\nFRAME\n" + Text(first) + "FRAME\n" + Text(second),
        output.str());
    EXPECT_EQ(2u, writer.FramesWritten());
}

TEST(Y4mWriter, WhatItWritesReadsBackFrameForFrame) {
    std::stringstream stream;
    Y4mWriter writer(stream, "out.y4m", 24, 1);
    for (int seed = 0; seed < 3; ++seed) {
        writer.WriteFrame(Numbered(5, 3, seed * 10));
    }
    Y4mReader reader(stream, "out.y4m");
    EXPECT_EQ(5, reader.Header().width);
    EXPECT_EQ(3, reader.Header().height);
    EXPECT_EQ(24, reader.Header().rate_numerator);
    EXPECT_EQ("420jpeg", reader.Header().colour_space);
    YuvImage frame;
    for (int seed = 0; seed < 3; ++seed) {
        ASSERT_TRUE(reader.ReadFrame(frame));
        EXPECT_EQ(Numbered(5, 3, seed * 10).bytes, frame.bytes);
    }
    EXPECT_FALSE(reader.ReadFrame(frame));
}

TEST(Y4mWriter, RefusesAFrameOfAnotherSizeThanTheFirst) {
    std::ostringstream output;
    Y4mWriter writer(output, "out.y4m", 25, 1);
    writer.WriteFrame(Numbered(4, 2, 0));
    std::string const before = output.str();
    EXPECT_THAT([&] { writer.WriteFrame(Numbered(6, 2, 0)); },
                ThrowsMessage<ToolError>(
                    HasSubstr("cannot write a 6x2 frame to out.y4m, a stream of 4x2 frames")));
    EXPECT_EQ(before, output.str());
    EXPECT_EQ(1u, writer.FramesWritten());
}

TEST(Y4mWriter, RefusesAFrameWhoseBytesDoNotFitItsSize) {
    std::ostringstream output;
    Y4mWriter writer(output, "out.y4m", 25, 1);
    YuvImage frame = Numbered(4, 2, 0);
    frame.bytes.pop_back();
    EXPECT_THAT([&] { writer.WriteFrame(frame); },
                ThrowsMessage<ToolError>(HasSubstr("cannot write a 4x2 frame of 11 bytes")));
    EXPECT_EQ("", output.str());
}

TEST(Y4mWriter, RefusesAnEmptyFrame) {
    std::ostringstream output;
    Y4mWriter writer(output, "out.y4m", 25, 1);
    EXPECT_THAT([&] { writer.WriteFrame(YuvImage()); },
                ThrowsMessage<ToolError>(HasSubstr("cannot write a 0x0 frame")));
}

TEST(Y4mWriter, RefusesARateThatIsNotPositive) {
    std::ostringstream output;
    EXPECT_THAT([&] { Y4mWriter const writer(output, "out.y4m", 0, 1); },
                ThrowsMessage<ToolError>(HasSubstr("cannot write out.y4m at a frame rate of 0:1")));
    EXPECT_THAT([&] { Y4mWriter const writer(output, "out.y4m", 25, -1); },
                ThrowsMessage<ToolError>(HasSubstr("at a frame rate of 25:-1")));
}

// A stream buffer that takes nothing, as a full disc or a closed pipe would.
class RefusingBuffer : public std::streambuf {
protected:
    int_type overflow(int_type) override { return traits_type::eof(); }
    std::streamsize xsputn(char const*, std::streamsize) override { return 0; }
};

TEST(Y4mWriter, SaysWhichFrameAFailedWriteMet) {
    RefusingBuffer buffer;
    std::ostream output(&buffer);
    Y4mWriter writer(output, "standard output", 25, 1);
    EXPECT_THAT([&] { writer.WriteFrame(Numbered(4, 2, 0)); },
                ThrowsMessage<ToolError>(HasSubstr("cannot write frame 1 to standard output")));
    EXPECT_EQ(0u, writer.FramesWritten());
}

TEST(Y4mWriter, WritesTheColourRangeWhenItIsKnown) {
    for (auto [range, tag] : {std::pair{ColourRange::FULL, " XCOLORRANGE=FULL\n"},
                              std::pair{ColourRange::LIMITED, " XCOLORRANGE=LIMITED\n"},
                              std::pair{ColourRange::UNSPECIFIED, " C420jpeg\n"}}) {
        std::ostringstream stream;
        Y4mWriter writer(stream, "out.y4m", 25, 1, range);
        YuvImage frame;
        frame.width = 2;
        frame.height = 2;
        frame.bytes.assign(6, 16);
        writer.WriteFrame(frame);
        std::string const header = stream.str().substr(0, stream.str().find('\n') + 1);
        EXPECT_THAT(header, ::testing::EndsWith(tag));
        std::istringstream back(stream.str());
        EXPECT_EQ(range, Y4mReader(back, "out.y4m").Header().range);
    }
}

TEST(Y4mWriter, StillSaysFourTwoZeroBesideTheColourRange) {
    std::ostringstream output;
    Y4mWriter writer(output, "out.y4m", 25, 1, ColourRange::FULL);
    YuvImage const frame = Numbered(4, 2, 0);
    writer.WriteFrame(frame);
    writer.WriteFrame(frame);
    EXPECT_EQ("YUV4MPEG2 W4 H2 F25:1 Ip A1:1 C420jpeg XCOLORRANGE=FULL\nFRAME\n" + Text(frame) +
                  "FRAME\n" + Text(frame),
              output.str());
}

}  // namespace
}  // namespace vexmap_host
