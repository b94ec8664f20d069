#include "vexmap/single_ptz_view.h"

#include "vexmap/log.h"
#include "vexmap/ptz_view_traits.h"

namespace quorvel::vexmap {

SinglePtzView::SinglePtzView() : View(PtzViewTraits::GetPtzViewTraits()) {}

SinglePtzView::SinglePtzView(SinglePtzView const& other) = default;

SinglePtzView::SinglePtzView(boost::shared_ptr<Camera> const& camera_value)
    : View(PtzViewTraits::GetPtzViewTraits(), camera_value) {}

SinglePtzView::SinglePtzView(boost::shared_ptr<Camera> const& camera_value,
                             _DEWARP_PROJECTION projection_value)
    : View(PtzViewTraits::GetPtzViewTraits(), camera_value, projection_value) {}

SinglePtzView::SinglePtzView(boost::shared_ptr<Camera> const& camera_value,
                             _DEWARP_PROJECTION projection_value,
                             _DEWARP_ASPECT_RATIO aspect_ratio_value)
    : View(PtzViewTraits::GetPtzViewTraits(), camera_value, projection_value, aspect_ratio_value) {}

SinglePtzView::SinglePtzView(boost::shared_ptr<Camera> const& camera_value,
                             _DEWARP_PROJECTION projection_value, Resolution const& resolution)
    : View(PtzViewTraits::GetPtzViewTraits(), camera_value, projection_value, resolution) {}

SinglePtzView::SinglePtzView(boost::shared_ptr<Camera> const& camera_value,
                             _DEWARP_PROJECTION projection_value, Resolution const& resolution,
                             _DEWARP_ASPECT_RATIO aspect_ratio_value)
    : View(PtzViewTraits::GetPtzViewTraits(), camera_value, projection_value, resolution,
           aspect_ratio_value) {}

SinglePtzView& SinglePtzView::operator=(SinglePtzView const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "SinglePtzView");
        return *this;
    }
    View::operator=(other);
    return *this;
}

SinglePtzView::~SinglePtzView() = default;

}  // namespace quorvel::vexmap
