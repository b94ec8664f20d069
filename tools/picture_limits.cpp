#include "picture_limits.h"

#include "tool_error.h"

namespace vexmap_host {

PictureLimits::PictureLimits() : max_pixels(DEFAULT_MAX_PIXELS) {}

PictureLimits::PictureLimits(uint64_t pixels) : max_pixels(pixels) {}

void PictureLimits::Check(std::string const& what, uint64_t width, uint64_t height) const {
    std::string const size = std::to_string(width) + "x" + std::to_string(height);
    if (width == 0 || height == 0) {
        throw ToolError(what + " has an empty size of " + size);
    }
    if (width > MAX_SIDE || height > MAX_SIDE) {
        throw ToolError(what + " is " + size + ", beyond the limit of " + std::to_string(MAX_SIDE) +
                        " pixels a side");
    }
    // Both sides are at most 2^14 here, so the product cannot overflow.
    if (width * height > max_pixels) {
        throw ToolError(what + " is " + size + ", " + std::to_string(width * height) +
                        " pixels, beyond the limit of " + std::to_string(max_pixels) +
                        " pixels (--max-pixels)");
    }
}

}  // namespace vexmap_host
