#include "vexmap/dual_panoramic_view.h"

#include "vexmap/floating_point.h"
#include "vexmap/log.h"
#include "vexmap/transform_2d_functor.h"

namespace quorvel::vexmap {
namespace {

// Rows above the middle show the strip's left half and rows below it the right half; both walk
// the same strip rows. The divisions truncate toward zero.
Vector2d StackedRowShift(int y, int left, int bottom) {
    if (y < 0) {
        return Vector2d(float(left), float(-bottom / 2));
    }
    return Vector2d(float(-left), float(bottom / 2));
}

}  // namespace

DualPanoramicView::DualPanoramicView() = default;

DualPanoramicView::DualPanoramicView(DualPanoramicView const& other) = default;

DualPanoramicView::DualPanoramicView(boost::shared_ptr<Camera> const& camera_value,
                                     _DEWARP_PROJECTION projection_value)
    : SinglePanoramicView(camera_value, projection_value) {}

DualPanoramicView& DualPanoramicView::operator=(DualPanoramicView const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "DualPanoramicView");
        return *this;
    }
    SinglePanoramicView::operator=(other);
    return *this;
}

DualPanoramicView::~DualPanoramicView() = default;

Resolution DualPanoramicView::DualResolution(Resolution const& r) {
    return Resolution(r.x * 0.5f, r.y * 2.0f);
}

Resolution DualPanoramicView::SingleResolution(Resolution const& r) {
    return Resolution(r.x * 2.0f, r.y * 0.5f);
}

Resolution DualPanoramicView::GetProjectionSize() const {
    return DualResolution(Resolution(projection_size));
}

Vector2d DualPanoramicView::GetDualCropSize() {
    Resolution const strip = SingleResolution(dewarped_size);
    float const aspect = projection_size.AspectRatio();
    switch (aspect_ratio) {
        case DEWARP_ASPECT_RATIO_FIT:
            return strip.BestFit(aspect);
        case DEWARP_ASPECT_RATIO_FIT_WIDTH:
            if (FloatingPoint::is_less(strip.AspectRatio(), aspect)) {
                return strip.BestFit(aspect);
            }
            return dewarped_size;
        default:
            return dewarped_size;
    }
}

// The scale fits the strip to the strip-shaped output. The offset is a quarter of an
// output-shaped crop, or half of a strip-shaped one.
MapFunctor* DualPanoramicView::GetScaleFunctor(Vector2d const& crop) const {
    Resolution const strip = SingleResolution(dewarped_size);
    Transform2dFunctor::_TRANSFORM_2D transform = GetScaleTransform(strip);
    bool strip_shaped = false;
    switch (aspect_ratio) {
        case DEWARP_ASPECT_RATIO_FILL:
        case DEWARP_ASPECT_RATIO_STRETCH:
            break;
        case DEWARP_ASPECT_RATIO_FIT_WIDTH:
            strip_shaped =
                FloatingPoint::is_less(strip.AspectRatio(), projection_size.AspectRatio());
            break;
        default:  // fit, and values above the known ones
            strip_shaped = true;
            break;
    }
    PlaceStrip(transform, crop.y * (strip_shaped ? 0.5f : 0.25f));
    return new Transform2dFunctor(transform);
}

void DualPanoramicView::BuildMap() {
    BuildDualMap();
}

// The stacked picture covers the output, or the best fit of the stacked shape when the strip
// does not fill it. Costs the chain calls of a single strip of the output's size.
void DualPanoramicView::BuildDualMap() {
    Vector2d const dual_crop = GetDualCropSize();
    Resolution const& output = dewarped_size;
    Vector2d covered = output;
    if (dual_crop != output) {
        covered = output.BestFit(DualResolution(projection_size).AspectRatio());
    }
    BuildShiftedMap(dual_crop, covered, 8, StackedRowShift);
}

}  // namespace quorvel::vexmap
