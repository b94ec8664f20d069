#pragma once

#include <cstddef>
#include <cstdint>
#include <istream>
#include <string>
#include <vector>

#include "picture_limits.h"
#include "y4m_header.h"
#include "yuv_image.h"

namespace vexmap_host {

/// Reads a YUV4MPEG2 stream of 8-bit frames, one after the other, from a stream it does not own,
/// and gives each as 4:2:0: a frame of another chroma layout (4:2:2, 4:4:4, 4:1:1, none) is
/// converted once as it is read, chroma averaged, in storage kept from frame to frame. The header
/// is read and checked on construction, its size against the picture limits; every failure is a
/// ToolError that names the source. An odd width or height is read as the format lays it out,
/// chroma rounded up. One thread at a time.
class Y4mReader {
public:
    static constexpr std::size_t MAX_LINE = 4096;  // a header or FRAME line, its newline included
    static constexpr int MAX_SIDE = int(PictureLimits::MAX_SIDE);  // beyond it, garbage

    /// `name` tells the source in messages: a path, or "standard input".
    Y4mReader(std::istream& stream, std::string const& name,
              PictureLimits const& limits = PictureLimits());
    Y4mReader(Y4mReader const&) = delete;
    Y4mReader& operator=(Y4mReader const&) = delete;
    virtual ~Y4mReader();

    Y4mHeader const& Header() const { return header; }
    uint64_t FrameBytes() const { return frame_bytes; }  // of a frame as the stream lays it out
    uint64_t FramesRead() const { return frames_read; }
    /// Reads the next frame into `frame`, reusing its storage. Returns false when the stream ends
    /// where a frame would begin; an end anywhere else is a truncation and throws.
    bool ReadFrame(YuvImage& frame);

private:
    /// The next line, valid until the next call; `frame` is the number of the frame whose FRAME
    /// line it is, 0 for the stream header.
    std::string const& ReadLine(std::size_t limit, uint64_t frame);
    static std::string LineName(uint64_t frame);  // for messages
    void ParseTag(std::string const& tag);
    void ParseColourSpace(std::string const& tag);
    /// Reads the frame's bytes into `bytes`, growing it only as the bytes really come.
    void ReadBytes(std::vector<uint8_t>& bytes);
    /// The 4:2:0 frame of the raw one just read.
    void ConvertRaw(YuvImage& frame) const;
    [[noreturn]] void Fail(std::string const& reason) const;

    std::istream& stream;
    std::string name;
    Y4mHeader header;
    uint64_t frame_bytes;
    uint64_t frames_read;
    std::vector<uint8_t> raw;  // a frame in the stream's layout, when that is not 4:2:0
    std::string line;          // the line last read
};

}  // namespace vexmap_host
