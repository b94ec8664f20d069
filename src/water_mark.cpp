#include "vexmap/water_mark.h"

#include "vexmap/defaults.h"
#include "vexmap/log.h"
#include "vexmap/tarvex_brenvia_418.h"

namespace quorvel::vexmap {

WaterMark::WaterMark() = default;

WaterMark::WaterMark(WaterMark const&) = default;

WaterMark::WaterMark(_DEWARP_IMAGE const&) {}

WaterMark& WaterMark::operator=(WaterMark const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "WaterMark::operator=", "Self assignment of %s object\n",
                  "WaterMark");
    }
    return *this;
}

WaterMark::~WaterMark() = default;

bool WaterMark::CheckImage(_DEWARP_IMAGE const&) {
    return true;
}

bool WaterMark::Valid() const {
    return true;
}

_DEWARP_INTERNAL_CAMERA_MODEL WaterMark::GetCameraModel() const {
    return TarvexBrenvia418;
}

_DEWARP_INTERNAL_CAMERA_MOUNT WaterMark::GetCameraMount() const {
    return Defaults::CameraMount;
}

}  // namespace quorvel::vexmap
