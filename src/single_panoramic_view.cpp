#include "vexmap/single_panoramic_view.h"

#include "vexmap/log.h"
#include "vexmap/panoramic_view_traits.h"
#include "vexmap/transform_2d_functor.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {

SinglePanoramicView::SinglePanoramicView() : View(PanoramicViewTraits::GetPanoramicViewTraits()) {}

SinglePanoramicView::SinglePanoramicView(SinglePanoramicView const& other) = default;

SinglePanoramicView::SinglePanoramicView(boost::shared_ptr<Camera> const& camera_value)
    : View(PanoramicViewTraits::GetPanoramicViewTraits(), camera_value) {}

SinglePanoramicView::SinglePanoramicView(boost::shared_ptr<Camera> const& camera_value,
                                         _DEWARP_PROJECTION projection_value)
    : View(PanoramicViewTraits::GetPanoramicViewTraits(), camera_value, projection_value) {}

SinglePanoramicView::SinglePanoramicView(boost::shared_ptr<Camera> const& camera_value,
                                         _DEWARP_PROJECTION projection_value,
                                         _DEWARP_ASPECT_RATIO aspect_ratio_value)
    : View(PanoramicViewTraits::GetPanoramicViewTraits(), camera_value, projection_value,
           aspect_ratio_value) {}

SinglePanoramicView::SinglePanoramicView(boost::shared_ptr<Camera> const& camera_value,
                                         _DEWARP_PROJECTION projection_value,
                                         Resolution const& resolution)
    : View(PanoramicViewTraits::GetPanoramicViewTraits(), camera_value, projection_value,
           resolution) {}

SinglePanoramicView::SinglePanoramicView(boost::shared_ptr<Camera> const& camera_value,
                                         _DEWARP_PROJECTION projection_value,
                                         Resolution const& resolution,
                                         _DEWARP_ASPECT_RATIO aspect_ratio_value)
    : View(PanoramicViewTraits::GetPanoramicViewTraits(), camera_value, projection_value,
           resolution, aspect_ratio_value) {}

SinglePanoramicView& SinglePanoramicView::operator=(SinglePanoramicView const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "SinglePanoramicView");
        return *this;
    }
    View::operator=(other);
    return *this;
}

SinglePanoramicView::~SinglePanoramicView() = default;

// Unlike a PTZ picture the offset of a strip is not scaled by the zoom: intended.
MapFunctor* SinglePanoramicView::GetScaleFunctor(Vector2d const& crop) const {
    Transform2dFunctor::_TRANSFORM_2D transform = GetScaleTransform(dewarped_size);
    PlaceStrip(transform, crop.y * 0.5f);
    return new Transform2dFunctor(transform);
}

// Looking up or down the strip is stretched twice and moved towards the horizon, up for a
// ceiling (an offset is positive upward, so its sign is turned round), down for a floor; an
// inverted wall turns it half round.
void SinglePanoramicView::PlaceStrip(Transform2dFunctor::_TRANSFORM_2D& transform,
                                     float offset) const {
    switch (GetCamera().GetMount()) {
        case DEWARP_INTERNAL_CAMERA_MOUNT_CEILING:
            transform.offset_y = -offset;
            transform.scale_y = transform.scale_y * 2.0f;
            break;
        case DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR:
            transform.offset_y = offset;
            transform.scale_y = transform.scale_y * 2.0f;
            break;
        case DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL:
            transform.angle = Trigonometry::PI;
            break;
        default:
            break;
    }
}

// Looking up or down a pan turns the picture about the lens axis, which slides the strip round;
// on a wall only a roll moves it, as a turn of the output plane.
MapFunctor* SinglePanoramicView::GetPtzFunctor() {
    _DEWARP_INTERNAL_CAMERA_MOUNT const mount = GetCamera().GetMount();
    if (mount == DEWARP_INTERNAL_CAMERA_MOUNT_CEILING ||
        mount == DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR) {
        return View::GetPtzFunctor();
    }
    Transform2dFunctor::_TRANSFORM_2D transform = {};
    transform.scale_x = 1.0f;
    transform.scale_y = 1.0f;
    transform.angle = -ptz.orientation.roll;
    return new Transform2dFunctor(transform);
}

}  // namespace quorvel::vexmap
