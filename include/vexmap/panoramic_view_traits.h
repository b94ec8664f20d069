#pragma once

#include "vexmap/view_traits.h"

namespace quorvel::vexmap {

/// Traits of the panoramas: the whole picture unrolled, turning in pan on a ceiling or floor and
/// in roll on a wall. One shared object; any thread.
class PanoramicViewTraits : public ViewTraits {
public:
    static boost::shared_ptr<ViewTraits const> const PANORAMIC_VIEW_TRAITS;
    static boost::shared_ptr<ViewTraits const> GetPanoramicViewTraits();

    PanoramicViewTraits();
    PanoramicViewTraits(PanoramicViewTraits const& other);
    PanoramicViewTraits& operator=(PanoramicViewTraits const& other);
    ~PanoramicViewTraits() override;

    _DEWARP_PROJECTION GetDefaultProjection() const override;
    _DEWARP_ASPECT_RATIO GetDefaultAspectRatio() const override;
    PtzRange GetPtzRange(Camera const& camera, FieldOfView const& fov) const override;
    FieldOfView GetTargetFov(Camera const& camera, _DEWARP_PROJECTION projection) const override;
};

}  // namespace quorvel::vexmap
