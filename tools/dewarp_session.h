#pragma once

#include <optional>

#include "plugin_host.h"
#include "rgb_image.h"

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
    /// Runs `frames` frames of `input` in a sub-mode and returns the last dewarped picture. The
    /// output size is a wish: the dewarper has the last word on it.
    RgbImage Render(int sub_mode, RequestedPosition const& position, RgbImage const& input,
                    int width, int height, int frames) const;

private:
    RgbImage RunFrame(RgbImage const& input, int width, int height) const;

    PluginHost const& host;
    Dewarper* dewarper;
};

}  // namespace vexmap_host
