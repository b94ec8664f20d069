#pragma once

#include <cstddef>
#include <cstdint>
#include <istream>
#include <string>

#include "y4m_header.h"
#include "yuv_image.h"

namespace vexmap_host {

/// Reads a YUV4MPEG2 stream of 8-bit 4:2:0 frames, one after the other, from a stream it does not
/// own. The header is read and checked on construction; every failure is a ToolError that names
/// the source. An odd width or height is read as the format lays it out, chroma rounded up: the
/// dewarper's pixel format, not the reader, decides whether it can take it. One thread at a time.
class Y4mReader {
public:
    static constexpr std::size_t MAX_LINE = 4096;  // a header or FRAME line, its newline included
    static constexpr int MAX_SIDE = 16384;         // pixels; beyond it a size is taken as garbage

    /// `name` tells the source in messages: a path, or "standard input".
    Y4mReader(std::istream& stream, std::string const& name);
    Y4mReader(Y4mReader const&) = delete;
    Y4mReader& operator=(Y4mReader const&) = delete;
    virtual ~Y4mReader();

    Y4mHeader const& Header() const { return header; }
    uint64_t FrameBytes() const { return frame_bytes; }
    uint64_t FramesRead() const { return frames_read; }
    /// Reads the next frame into `frame`, reusing its storage. Returns false when the stream ends
    /// where a frame would begin; an end anywhere else is a truncation and throws.
    bool ReadFrame(YuvImage& frame);

private:
    std::string ReadLine(std::size_t limit, std::string const& what);
    void ParseTag(std::string const& tag);
    [[noreturn]] void Fail(std::string const& reason) const;

    std::istream& stream;
    std::string name;
    Y4mHeader header;
    uint64_t frame_bytes;
    uint64_t frames_read;
};

}  // namespace vexmap_host
