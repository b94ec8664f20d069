// Reads the fuzz input as a YUV4MPEG2 stream, frame after frame, until its end or a refusal. A
// refusal is a ToolError and is the reader doing its work; a crash, a leak or a hang is a finding.
#include <cstddef>
#include <cstdint>
#include <sstream>
#include <string>

#include "tool_error.h"
#include "y4m_reader.h"
#include "yuv_image.h"

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, std::size_t size) {
    std::istringstream input(std::string(reinterpret_cast<char const*>(data), size));
    try {
        vexmap_host::Y4mReader reader(input, "the fuzz input");
        vexmap_host::YuvImage frame;
        while (reader.ReadFrame(frame)) {
        }
    } catch (vexmap_host::ToolError const&) {
    }
    return 0;
}
