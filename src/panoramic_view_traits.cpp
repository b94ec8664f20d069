#include "vexmap/panoramic_view_traits.h"

#include <cerrno>

#include "vexmap/code_location.h"
#include "vexmap/error.h"
#include "vexmap/floating_point.h"
#include "vexmap/log.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

[[noreturn]] void Fail(char const* function, int line, char const* message) {
    Error::SetLastError(EINVAL);
    throw Error(CodeLocation("src/panoramic_view_traits", "PanoramicViewTraits", function, line),
                EINVAL, "%s", message);
}

bool LooksUpOrDown(_DEWARP_INTERNAL_CAMERA_MOUNT mount) {
    return mount == DEWARP_INTERNAL_CAMERA_MOUNT_CEILING ||
           mount == DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR;
}

}  // namespace

boost::shared_ptr<ViewTraits const> const PanoramicViewTraits::PANORAMIC_VIEW_TRAITS(
    new PanoramicViewTraits());

boost::shared_ptr<ViewTraits const> PanoramicViewTraits::GetPanoramicViewTraits() {
    return PANORAMIC_VIEW_TRAITS;
}

PanoramicViewTraits::PanoramicViewTraits() = default;

PanoramicViewTraits::PanoramicViewTraits(PanoramicViewTraits const& other) = default;

PanoramicViewTraits& PanoramicViewTraits::operator=(PanoramicViewTraits const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "PanoramicViewTraits");
    }
    return *this;
}

PanoramicViewTraits::~PanoramicViewTraits() = default;

_DEWARP_PROJECTION PanoramicViewTraits::GetDefaultProjection() const {
    return DEWARP_PROJECTION_CYLINDRICAL;
}

_DEWARP_ASPECT_RATIO PanoramicViewTraits::GetDefaultAspectRatio() const {
    return DEWARP_ASPECT_RATIO_FIT;
}

// A panorama turns in pan on a ceiling or floor and in roll on a wall.
PtzRange PanoramicViewTraits::GetPtzRange(Camera const& camera, FieldOfView const&) const {
    switch (camera.GetMount()) {
        case DEWARP_INTERNAL_CAMERA_MOUNT_CEILING:
            return PtzRange::CeilingPanoramicRange;
        case DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR:
            return PtzRange::FloorPanoramicRange;
        case DEWARP_INTERNAL_CAMERA_MOUNT_WALL:
            return PtzRange::WallPanoramicRange;
        case DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL:
            return PtzRange::InvertedWallPanoramicRange;
    }
    Fail("GetPtzRange", __LINE__, "Invalid camera mount");
}

// Looking up or down, a cylindrical strip covers a quarter turn up from the horizon and the
// others twice that; a wall camera's panorama shows what the camera sees, pannini projections at
// most half a turn each way.
FieldOfView PanoramicViewTraits::GetTargetFov(Camera const& camera,
                                              _DEWARP_PROJECTION projection) const {
    if (static_cast<unsigned int>(projection) > DEWARP_PROJECTION_EQUIRECTANGULAR_PANNINI) {
        Fail("GetTargetFov", __LINE__, "Invalid projection");
    }
    FieldOfView target;
    _DEWARP_INTERNAL_CAMERA_MOUNT const mount = camera.GetMount();
    if (LooksUpOrDown(mount)) {
        target = mount == DEWARP_INTERNAL_CAMERA_MOUNT_CEILING ? FieldOfView::CeilingFieldOfView
                                                               : FieldOfView::FloorFieldOfView;
        switch (projection) {
            case DEWARP_PROJECTION_CYLINDRICAL:
                break;
            case DEWARP_PROJECTION_RECTILINEAR:
            case DEWARP_PROJECTION_PANNINI:
            case DEWARP_PROJECTION_EQUIRECTANGULAR_PANNINI:
                Fail("GetTargetFov", __LINE__, "Invalid projection for this orientation");
            default:
                target.vertical = target.vertical * 2.0f;
                break;
        }
        return target;
    }
    switch (projection) {
        case DEWARP_PROJECTION_RECTILINEAR:
            return camera.GetProjectionFieldOfView(
                camera.GetProjectionMapSize(DEWARP_PROJECTION_RECTILINEAR),
                DEWARP_PROJECTION_RECTILINEAR);
        case DEWARP_PROJECTION_PANNINI:
        case DEWARP_PROJECTION_EQUIRECTANGULAR_PANNINI:
            target = camera.GetFieldOfView();
            if (FloatingPoint::is_greater(target.horizontal, Trigonometry::PI)) {
                target.horizontal = Trigonometry::PI;
            }
            if (FloatingPoint::is_greater(target.vertical, Trigonometry::PI)) {
                target.vertical = Trigonometry::PI;
            }
            return target;
        default:
            return camera.GetFieldOfView();
    }
}

}  // namespace quorvel::vexmap
