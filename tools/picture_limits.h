#pragma once

#include <cstdint>
#include <string>

namespace vexmap_host {

/// The largest picture the tool takes in or makes: at most MAX_SIDE pixels a side and at most
/// a given number of pixels in all. Checked on the size a header or an option claims, before any
/// buffer of that size exists, so that a few crafted bytes cannot cost gigabytes. A value; any
/// thread.
class PictureLimits {
public:
    static constexpr uint64_t MAX_SIDE = 16384;
    static constexpr uint64_t DEFAULT_MAX_PIXELS = MAX_SIDE * MAX_SIDE;

    PictureLimits();  // the defaults
    explicit PictureLimits(uint64_t max_pixels);
    PictureLimits(PictureLimits const&) = default;
    PictureLimits& operator=(PictureLimits const&) = default;
    virtual ~PictureLimits() = default;

    uint64_t MaxPixels() const { return max_pixels; }
    /// Throws ToolError naming `what` (a file, a stream, an option), the size and the limit it
    /// passes, when a side is 0 or above MAX_SIDE or the pixels are more than MaxPixels().
    void Check(std::string const& what, uint64_t width, uint64_t height) const;

private:
    uint64_t max_pixels;
};

}  // namespace vexmap_host
