#pragma once

#include "vexmap/view.h"

namespace quorvel::vexmap {

/// One picture as a pan-tilt-zoom camera looking in one direction would show it: a view with the
/// PTZ traits. Guarded as a View.
class SinglePtzView : public View {
public:
    SinglePtzView();
    SinglePtzView(SinglePtzView const& other);
    explicit SinglePtzView(boost::shared_ptr<Camera> const& camera_value);
    SinglePtzView(boost::shared_ptr<Camera> const& camera_value,
                  _DEWARP_PROJECTION projection_value);
    SinglePtzView(boost::shared_ptr<Camera> const& camera_value,
                  _DEWARP_PROJECTION projection_value, _DEWARP_ASPECT_RATIO aspect_ratio_value);
    SinglePtzView(boost::shared_ptr<Camera> const& camera_value,
                  _DEWARP_PROJECTION projection_value, Resolution const& resolution);
    SinglePtzView(boost::shared_ptr<Camera> const& camera_value,
                  _DEWARP_PROJECTION projection_value, Resolution const& resolution,
                  _DEWARP_ASPECT_RATIO aspect_ratio_value);
    SinglePtzView& operator=(SinglePtzView const& other);
    ~SinglePtzView() override;
};

}  // namespace quorvel::vexmap
