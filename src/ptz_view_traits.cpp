#include "vexmap/ptz_view_traits.h"

#include <cerrno>

#include "vexmap/code_location.h"
#include "vexmap/error.h"
#include "vexmap/log.h"

namespace quorvel::vexmap {

boost::shared_ptr<ViewTraits const> const PtzViewTraits::PTZ_VIEW_TRAITS(new PtzViewTraits());

boost::shared_ptr<ViewTraits const> PtzViewTraits::GetPtzViewTraits() {
    return PTZ_VIEW_TRAITS;
}

PtzViewTraits::PtzViewTraits() = default;

PtzViewTraits::PtzViewTraits(PtzViewTraits const& other) = default;

PtzViewTraits& PtzViewTraits::operator=(PtzViewTraits const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "PtzViewTraits");
    }
    return *this;
}

PtzViewTraits::~PtzViewTraits() = default;

_DEWARP_PROJECTION PtzViewTraits::GetDefaultProjection() const {
    return DEWARP_PROJECTION_RECTILINEAR;
}

_DEWARP_ASPECT_RATIO PtzViewTraits::GetDefaultAspectRatio() const {
    return DEWARP_ASPECT_RATIO_FILL;
}

// A PTZ picture is what a rectilinear lens would see; the camera plays no part.
_DEWARP_PROJECTION PtzViewTraits::GetCompatibleProjection(Camera const&,
                                                          _DEWARP_PROJECTION projection) const {
    if (projection == DEWARP_PROJECTION_RECTILINEAR) {
        return projection;
    }
    return Substitute(projection);
}

// Looking down or up, the range is widened by the view's own field so that Deflate, which
// narrows by the field, leaves the centre free to reach the constant's bounds.
PtzRange PtzViewTraits::GetPtzRange(Camera const& camera, FieldOfView const& fov) const {
    PtzRange range;
    switch (camera.GetMount()) {
        case DEWARP_INTERNAL_CAMERA_MOUNT_CEILING:
            range = PtzRange::CeilingPtzRange;
            range.Inflate(fov);
            break;
        case DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR:
            range = PtzRange::FloorPtzRange;
            range.Inflate(fov);
            break;
        case DEWARP_INTERNAL_CAMERA_MOUNT_WALL:
        case DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL:
            range.Set(camera.GetFieldOfView(), PtzRange::InfiniteZoomRange);
            break;
        default:
            Error::SetLastError(EINVAL);
            throw Error(
                CodeLocation("src/ptz_view_traits", "PtzViewTraits", "GetPtzRange", __LINE__),
                EINVAL, "Invalid camera mount");
    }
    return range;
}

FieldOfView PtzViewTraits::GetTargetFov(Camera const&, _DEWARP_PROJECTION) const {
    return FieldOfView::PtzFieldOfView;
}

}  // namespace quorvel::vexmap
