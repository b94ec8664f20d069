#pragma once

#include <boost/shared_ptr.hpp>

#include "vexmap/camera.h"
#include "vexmap/dewarp_types.h"
#include "vexmap/field_of_view.h"
#include "vexmap/ptz_range.h"
#include "vexmap/resolution.h"

namespace quorvel::vexmap {

/// The size and extent of a projected picture at the camera's scale.
struct ProjectionInfo {
    Resolution resolution;
    FieldOfView field_of_view;
};

/// What a family of views may do with a camera: the field of view it aims at, how far its
/// position may move, which projections it accepts. Stateless; the two shared objects are built
/// at load and only read afterwards, so any thread may use them.
class ViewTraits {
public:
    ViewTraits();
    ViewTraits(ViewTraits const& other);
    ViewTraits& operator=(ViewTraits const& other);  // nothing to copy
    virtual ~ViewTraits();

    virtual _DEWARP_PROJECTION GetDefaultProjection() const;
    virtual _DEWARP_ASPECT_RATIO GetDefaultAspectRatio() const;
    /// The projection if this family can show it on the camera, else the family's default, with
    /// a warning and an info line.
    virtual _DEWARP_PROJECTION GetCompatibleProjection(Camera const& camera,
                                                       _DEWARP_PROJECTION projection) const;
    virtual PtzRange GetPtzRange(Camera const& camera, FieldOfView const& fov) const;
    virtual FieldOfView GetTargetFov(Camera const& camera, _DEWARP_PROJECTION projection) const;
    /// The target field of view and the pixels it takes, its vertical part cut to what the
    /// camera's projection map covers.
    virtual ProjectionInfo GetProjectionInfo(Camera const& camera, _DEWARP_PROJECTION projection);

    /// The steps after the target field, shared with the views: its resolution on this camera,
    /// the vertical cut to what the camera's own projection map covers, and the validity checks.
    /// An error is located at the given class and function.
    static ProjectionInfo MeasureProjection(Camera const& camera, _DEWARP_PROJECTION projection,
                                            FieldOfView const& target, char const* class_name,
                                            char const* function);

protected:
    /// The warning, the family's default and the info line that replace a projection.
    _DEWARP_PROJECTION Substitute(_DEWARP_PROJECTION projection) const;
};

}  // namespace quorvel::vexmap
