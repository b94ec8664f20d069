#pragma once

#include "vexmap/transform_2d_functor.h"
#include "vexmap/view.h"

namespace quorvel::vexmap {

/// The whole fisheye picture unrolled into one strip. On a ceiling or floor a pan slides the
/// strip round; on a wall a roll turns it. Guarded as a View.
class SinglePanoramicView : public View {
public:
    SinglePanoramicView();
    SinglePanoramicView(SinglePanoramicView const& other);
    explicit SinglePanoramicView(boost::shared_ptr<Camera> const& camera_value);
    SinglePanoramicView(boost::shared_ptr<Camera> const& camera_value,
                        _DEWARP_PROJECTION projection_value);
    SinglePanoramicView(boost::shared_ptr<Camera> const& camera_value,
                        _DEWARP_PROJECTION projection_value,
                        _DEWARP_ASPECT_RATIO aspect_ratio_value);
    SinglePanoramicView(boost::shared_ptr<Camera> const& camera_value,
                        _DEWARP_PROJECTION projection_value, Resolution const& resolution);
    SinglePanoramicView(boost::shared_ptr<Camera> const& camera_value,
                        _DEWARP_PROJECTION projection_value, Resolution const& resolution,
                        _DEWARP_ASPECT_RATIO aspect_ratio_value);
    SinglePanoramicView& operator=(SinglePanoramicView const& other);
    ~SinglePanoramicView() override;

    MapFunctor* GetScaleFunctor(Vector2d const& crop) const override;
    MapFunctor* GetPtzFunctor() override;

protected:
    /// Sets the part of a strip's transform that the mount decides, with the offset's size.
    void PlaceStrip(Transform2dFunctor::_TRANSFORM_2D& transform, float offset) const;
};

}  // namespace quorvel::vexmap
