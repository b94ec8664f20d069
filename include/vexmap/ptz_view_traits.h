#pragma once

#include "vexmap/view_traits.h"

namespace quorvel::vexmap {

/// Traits of the PTZ views: rectilinear pictures of a fixed field that move within the camera's
/// reach. One shared object; any thread.
class PtzViewTraits : public ViewTraits {
public:
    static boost::shared_ptr<ViewTraits const> const PTZ_VIEW_TRAITS;
    static boost::shared_ptr<ViewTraits const> GetPtzViewTraits();

    PtzViewTraits();
    PtzViewTraits(PtzViewTraits const& other);
    PtzViewTraits& operator=(PtzViewTraits const& other);
    ~PtzViewTraits() override;

    _DEWARP_PROJECTION GetDefaultProjection() const override;
    _DEWARP_ASPECT_RATIO GetDefaultAspectRatio() const override;
    _DEWARP_PROJECTION GetCompatibleProjection(Camera const& camera,
                                               _DEWARP_PROJECTION projection) const override;
    PtzRange GetPtzRange(Camera const& camera, FieldOfView const& fov) const override;
    FieldOfView GetTargetFov(Camera const& camera, _DEWARP_PROJECTION projection) const override;
};

}  // namespace quorvel::vexmap
