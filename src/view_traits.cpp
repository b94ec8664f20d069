#include "vexmap/view_traits.h"

#include <cerrno>

#include "vexmap/code_location.h"
#include "vexmap/defaults.h"
#include "vexmap/error.h"
#include "vexmap/floating_point.h"
#include "vexmap/log.h"
#include "vexmap/projection.h"

namespace quorvel::vexmap {
namespace {

constexpr char const* SOURCE = "src/view_traits";

[[noreturn]] void Fail(char const* class_name, char const* function, int line, int code,
                       char const* message) {
    Error::SetLastError(code);
    throw Error(CodeLocation(SOURCE, class_name, function, line), code, "%s", message);
}

}  // namespace

ViewTraits::ViewTraits() = default;

ViewTraits::ViewTraits(ViewTraits const&) = default;

ViewTraits& ViewTraits::operator=(ViewTraits const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "ViewTraits");
    }
    return *this;
}

ViewTraits::~ViewTraits() = default;

_DEWARP_PROJECTION ViewTraits::GetDefaultProjection() const {
    return Defaults::Projection;
}

_DEWARP_ASPECT_RATIO ViewTraits::GetDefaultAspectRatio() const {
    return Defaults::AspectRatio;
}

// Pannini projections need a horizon, which a camera looking straight up or down lacks.
_DEWARP_PROJECTION ViewTraits::GetCompatibleProjection(Camera const& camera,
                                                       _DEWARP_PROJECTION projection) const {
    if (static_cast<unsigned int>(projection) > DEWARP_PROJECTION_EQUIRECTANGULAR_PANNINI) {
        return Substitute(projection);
    }
    if (projection != DEWARP_PROJECTION_PANNINI &&
        projection != DEWARP_PROJECTION_EQUIRECTANGULAR_PANNINI) {
        return projection;
    }
    _DEWARP_INTERNAL_CAMERA_MOUNT const mount = camera.GetMount();
    if (mount == DEWARP_INTERNAL_CAMERA_MOUNT_CEILING ||
        mount == DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR) {
        return Substitute(projection);
    }
    return projection;
}

// The word "substituted" stands beside the new projection's name, as intended.
_DEWARP_PROJECTION ViewTraits::Substitute(_DEWARP_PROJECTION projection) const {
    Log::warn(__LINE__, __FILE__, "GetCompatibleProjection",
              "The %s projection is unsupported by this view\n",
              Projection::GetName(projection).c_str());
    _DEWARP_PROJECTION const substitute = GetDefaultProjection();
    Log::info(__LINE__, __FILE__, "GetCompatibleProjection",
              "The %s projection will be substituted\n", Projection::GetName(substitute).c_str());
    return substitute;
}

PtzRange ViewTraits::GetPtzRange(Camera const&, FieldOfView const&) const {
    return PtzRange::EmptyPtzRange;
}

FieldOfView ViewTraits::GetTargetFov(Camera const&, _DEWARP_PROJECTION) const {
    return FieldOfView::ZeroFieldOfView;
}

// The class of the location is "ViewBuilder", as it has always been reported.
ProjectionInfo ViewTraits::GetProjectionInfo(Camera const& camera, _DEWARP_PROJECTION projection) {
    return MeasureProjection(camera, projection, GetTargetFov(camera, projection), "ViewBuilder",
                             "GetProjectionInfo");
}

ProjectionInfo ViewTraits::MeasureProjection(Camera const& camera, _DEWARP_PROJECTION projection,
                                             FieldOfView const& target, char const* class_name,
                                             char const* function) {
    ProjectionInfo info;
    info.field_of_view = target;
    info.resolution = camera.GetProjectionResolution(info.field_of_view, projection);
    // Only the vertical extent is cut to what the camera's own projection map covers.
    Resolution const map_size = camera.GetProjectionMapSize(projection);
    FieldOfView const map_field = camera.GetProjectionFieldOfView(map_size, projection);
    if (FloatingPoint::is_greater(info.field_of_view.vertical, map_field.vertical)) {
        info.field_of_view.vertical = map_field.vertical;
        info.resolution.y = map_size.y;
    }
    if (!info.resolution.Valid()) {
        Fail(class_name, function, __LINE__, EDOM, "Invalid projection resolution");
    }
    if (!info.field_of_view.Valid()) {
        Fail(class_name, function, __LINE__, EDOM, "Invalid projection field-of-view");
    }
    return info;
}

}  // namespace quorvel::vexmap
