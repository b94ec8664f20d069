#pragma once

#include <optional>

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

/// One dewarper driven in the host's calling order, from CreateDewarper to DeleteDewarper.
class DewarpSession {
public:
    /// Throws ToolError when the plug-in gives no dewarper.
    DewarpSession(PluginHost const& host, int mode, DewarpParams const& params);
    DewarpSession(DewarpSession const&) = delete;
    DewarpSession& operator=(DewarpSession const&) = delete;
    virtual ~DewarpSession();

    Dewarper& Get() const { return *dewarper; }
    /// Puts the dewarper in a sub-mode and at a position, for the frames that follow.
    void Aim(int sub_mode, RequestedPosition const& position) const;
    /// Runs `frames` frames of `input` in a sub-mode and returns the last dewarped picture. The
    /// output size is a wish: the dewarper has the last word on it.
    RgbImage Render(int sub_mode, RequestedPosition const& position, RgbImage const& input,
                    int width, int height, int frames) const;
    /// One frame in the host's calling order, converted to and from the dewarper's formats; a
    /// 4:2:0 picture meets a 4:2:0 dewarper without a conversion.
    RgbImage RunFrame(RgbImage const& input, int width, int height) const;
    YuvImage RunFrame(YuvImage const& input, int width, int height) const;

private:
    /// A dewarped frame as the plug-in hands it out; the buffer stays the dewarper's.
    struct Output {
        int width;
        int height;
        unsigned char const* buffer;
        unsigned int size;
        int format;
    };

    template <typename Picture>
    void Feed(Picture const& input) const;
    Output Fetch(int width, int height) const;

    PluginHost const& host;
    Dewarper* dewarper;
};

}  // namespace vexmap_host
