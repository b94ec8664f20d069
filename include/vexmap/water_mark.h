#pragma once

#include "vexmap/dewarp_types.h"

namespace quorvel::vexmap {

/// The place of a camera identification read from a picture. No picture is looked at: every
/// check passes and the camera is the built-in model on the default mount. A value; any thread.
class WaterMark {
public:
    WaterMark();
    WaterMark(WaterMark const& other);
    explicit WaterMark(_DEWARP_IMAGE const& image);
    WaterMark& operator=(WaterMark const& other);  // copies nothing
    virtual ~WaterMark();

    bool CheckImage(_DEWARP_IMAGE const& image);
    bool Valid() const;
    _DEWARP_INTERNAL_CAMERA_MODEL GetCameraModel() const;
    _DEWARP_INTERNAL_CAMERA_MOUNT GetCameraMount() const;
};

}  // namespace quorvel::vexmap
