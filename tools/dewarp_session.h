#pragma once

#include <functional>
#include <optional>
#include <vector>

#include "plugin_host.h"
#include "rgb_image.h"
#include "yuv_image.h"

namespace vexmap_host {

/// A position asked for on the command line; what is not given stays at the dewarper's own value.
struct RequestedPosition {
    std::optional<float> pan;
    std::optional<float> tilt;
    std::optional<float> zoom;
};

/// A position as the dewarper holds it, in its own units.
struct Position {
    float pan = 0.0f;
    float tilt = 0.0f;
    float zoom = 0.0f;
};

struct FrameSize {
    int width = 0;
    int height = 0;
};

/// A still's view, and the position the dewarper had once it had taken the first frame.
template <typename Picture>
struct RenderedView {
    Picture picture;
    Position position;
};

/// One dewarper driven in the host's calling order, from CreateDewarper to DeleteDewarper, with
/// the working buffers of its frames. One thread at a time.
class DewarpSession {
public:
    /// Throws ToolError when the plug-in gives no dewarper. `range` is that of the 4:2:0 frames
    /// given and returned, for a dewarper whose frames are RGB.
    DewarpSession(PluginHost const& host, int mode, DewarpParams const& params,
                  ColourRange range = ColourRange::LIMITED);
    DewarpSession(DewarpSession const&) = delete;
    DewarpSession& operator=(DewarpSession const&) = delete;
    virtual ~DewarpSession();

    Dewarper& Get() const { return *dewarper; }
    /// Puts the dewarper in a sub-mode and at a position, for the frames that follow.
    void Aim(int sub_mode, RequestedPosition const& position) const;
    Position CurrentPosition() const;
    /// The size at which frames of `width` x `height` go in: one column or row more, copied from
    /// the last, for a dewarper whose 4:2:0 frames take even sizes only. Asks the dewarper for
    /// its input buffer, as a host's first frame does.
    FrameSize FedSize(int width, int height) const;
    /// Runs `frames` frames of a still in a sub-mode and returns the last dewarped picture. The
    /// still is converted into the dewarper's format once and copied in for each frame, as a
    /// decoder writes a frame, so a frame costs what a stream's does. `each_frame` hears the
    /// count of frames done. The output size is a wish: the dewarper has the last word on it.
    template <typename Picture>
    RenderedView<Picture> Render(int sub_mode, RequestedPosition const& position,
                                 Picture const& input, int width, int height, int frames,
                                 std::function<void(int)> const& each_frame = {}) const;
    /// One frame in the host's calling order, converted to and from the dewarper's formats; a
    /// 4:2:0 picture meets a 4:2:0 dewarper without a conversion.
    RgbImage RunFrame(RgbImage const& input, int width, int height) const;
    YuvImage RunFrame(YuvImage const& input, int width, int height) const;
    /// The same into `view`, whose storage is reused from frame to frame.
    void RunFrame(YuvImage const& input, int width, int height, YuvImage& view) const;

private:
    /// A dewarped frame as the plug-in hands it out; the buffer stays the dewarper's.
    struct Output {
        int width;
        int height;
        unsigned char const* buffer;
        unsigned int size;
        int format;
    };
    struct InputBuffer {
        unsigned char* bytes;
        unsigned int size;
        int format;
    };

    InputBuffer Request(int width, int height) const;
    template <typename Picture>
    void Feed(Picture const& input) const;
    Output Fetch(int width, int height) const;
    RgbImage PaddedToEven(RgbImage const& input) const;
    YuvImage const& PaddedToEven(YuvImage const& input) const;
    void Decode(Output const& output, RgbImage& picture) const;
    void Decode(Output const& output, YuvImage& picture) const;

    PluginHost const& host;
    Dewarper* dewarper;
    ColourRange range;
    mutable std::optional<int> input_format;  // learnt from the first input buffer
    mutable YuvImage padded;                  // an odd-sized frame grown to even sides
};

}  // namespace vexmap_host
