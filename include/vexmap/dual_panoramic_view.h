#pragma once

#include "vexmap/single_panoramic_view.h"

namespace quorvel::vexmap {

/// A strip twice as wide and half as tall as the output, cut in two and stacked: the left half
/// above, the right half below, so that a full turn fits a screen of ordinary shape. Guarded as
/// a View.
class DualPanoramicView : public SinglePanoramicView {
public:
    DualPanoramicView();
    DualPanoramicView(DualPanoramicView const& other);
    DualPanoramicView(boost::shared_ptr<Camera> const& camera_value,
                      _DEWARP_PROJECTION projection_value);
    DualPanoramicView& operator=(DualPanoramicView const& other);
    ~DualPanoramicView() override;

    /// A strip in stacked form: half as wide, twice as tall.
    static Resolution DualResolution(Resolution const& r);
    /// Stacked output in strip form: twice as wide, half as tall.
    static Resolution SingleResolution(Resolution const& r);

    /// The stacked shape of the projection.
    Resolution GetProjectionSize() const override;
    MapFunctor* GetScaleFunctor(Vector2d const& crop) const override;
    void BuildMap() override;
    /// The part of the strip-shaped output that the picture covers.
    Vector2d GetDualCropSize();
    void BuildDualMap();
};

}  // namespace quorvel::vexmap
