#pragma once

#include <cstdint>
#include <ostream>
#include <string>

#include "yuv_image.h"

namespace vexmap_host {

/// Writes 8-bit 4:2:0 frames as a YUV4MPEG2 stream into a stream it does not own: progressive,
/// square pixels, chroma centred in its block, and the colour range when it is known. The header
/// goes out with the first frame, whose size every later frame must have. One thread at a time.
class Y4mWriter {
public:
    /// `name` tells the destination in messages: a path, or "standard output".
    Y4mWriter(std::ostream& stream, std::string const& name, int rate_numerator,
              int rate_denominator, ColourRange range = ColourRange::UNSPECIFIED);
    Y4mWriter(Y4mWriter const&) = delete;
    Y4mWriter& operator=(Y4mWriter const&) = delete;
    virtual ~Y4mWriter();

    uint64_t FramesWritten() const { return frames_written; }
    /// Throws ToolError for a frame of another size than the first, or when the stream fails.
    void WriteFrame(YuvImage const& frame);

private:
    std::ostream& stream;
    std::string name;
    int rate_numerator;
    int rate_denominator;
    ColourRange range;
    int width;  // of every frame, from the first; 0 before it
    int height;
    uint64_t frames_written;
};

}  // namespace vexmap_host
