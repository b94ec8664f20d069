#include "y4m_writer.h"

#include "tool_error.h"

namespace vexmap_host {
namespace {

std::string SizeText(int width, int height) {
    return std::to_string(width) + "x" + std::to_string(height);
}

}  // namespace

Y4mWriter::Y4mWriter(std::ostream& destination, std::string const& destination_name, int numerator,
                     int denominator, ColourRange colour_range)
    : stream(destination),
      name(destination_name),
      rate_numerator(numerator),
      rate_denominator(denominator),
      range(colour_range),
      width(0),
      height(0),
      frames_written(0) {
    if (numerator <= 0 || denominator <= 0) {
        throw ToolError("cannot write " + name + " at a frame rate of " +
                        std::to_string(numerator) + ":" + std::to_string(denominator));
    }
}

Y4mWriter::~Y4mWriter() = default;

// Each frame is flushed, so that a reader at the other end of a pipe gets it at once and a
// failed write shows on the frame that met it.
void Y4mWriter::WriteFrame(YuvImage const& frame) {
    if (frame.width <= 0 || frame.height <= 0 ||
        frame.bytes.size() != YuvImage::FrameBytes(uint64_t(frame.width), uint64_t(frame.height))) {
        throw ToolError("cannot write a " + SizeText(frame.width, frame.height) + " frame of " +
                        std::to_string(frame.bytes.size()) + " bytes to " + name);
    }
    if (frames_written == 0) {
        width = frame.width;
        height = frame.height;
        stream << "YUV4MPEG2 W" << width << " H" << height << " F" << rate_numerator << ":"
               << rate_denominator << " Ip A1:1 C420jpeg";
        if (range != ColourRange::UNSPECIFIED) {
            stream << (range == ColourRange::FULL ? " XCOLORRANGE=FULL" : " XCOLORRANGE=LIMITED");
        }
        stream << "\n";
    } else if (frame.width != width || frame.height != height) {
        throw ToolError("cannot write a " + SizeText(frame.width, frame.height) + " frame to " +
                        name + ", a stream of " + SizeText(width, height) + " frames");
    }
    stream << "FRAME\n";
    stream.write(reinterpret_cast<char const*>(frame.bytes.data()),
                 std::streamsize(frame.bytes.size()));
    stream.flush();
    if (!stream) {
        throw ToolError("cannot write frame " + std::to_string(frames_written + 1) + " to " + name);
    }
    ++frames_written;
}

}  // namespace vexmap_host
