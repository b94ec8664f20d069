#include "vexmap/abstract_view.h"

#include <cerrno>

#include "vexmap/code_location.h"
#include "vexmap/defaults.h"
#include "vexmap/error.h"
#include "vexmap/floating_point.h"
#include "vexmap/log.h"
#include "vexmap/panoramic_view_traits.h"

namespace quorvel::vexmap {
namespace {

constexpr float DEGREES_PER_RADIAN = 57.29578f;

Resolution InvalidSize() {
    return Resolution(Vector2d::InvalidVector);
}

// The room from a value to the nearer bound of an interval held upper bound first.
float RoomToNearerBound(Vector2d const& interval, float value) {
    float const up = interval.x - value;
    float const down = value - interval.y;
    return FloatingPoint::is_less(up, down) ? up : down;
}

}  // namespace

AbstractView::AbstractView() : AbstractView(PanoramicViewTraits::GetPanoramicViewTraits()) {}

AbstractView::AbstractView(AbstractView const& other) = default;

AbstractView::AbstractView(boost::shared_ptr<ViewTraits const> const& traits_value)
    : traits(traits_value),
      aspect_ratio(Defaults::AspectRatio),
      projection(Defaults::Projection),
      dewarped_size(InvalidSize()),
      projection_size(InvalidSize()),
      field_of_view(FieldOfView::InvalidFieldOfView),
      ptz(PtzPosition::Identity) {}

AbstractView::AbstractView(boost::shared_ptr<ViewTraits const> const& traits_value,
                           boost::shared_ptr<Camera> const& camera_value)
    : AbstractView(traits_value, camera_value, Defaults::Projection, InvalidSize(),
                   Defaults::AspectRatio) {}

AbstractView::AbstractView(boost::shared_ptr<ViewTraits const> const& traits_value,
                           boost::shared_ptr<Camera> const& camera_value,
                           _DEWARP_PROJECTION projection_value)
    : AbstractView(traits_value, camera_value, projection_value, InvalidSize(),
                   Defaults::AspectRatio) {}

AbstractView::AbstractView(boost::shared_ptr<ViewTraits const> const& traits_value,
                           boost::shared_ptr<Camera> const& camera_value,
                           _DEWARP_PROJECTION projection_value,
                           _DEWARP_ASPECT_RATIO aspect_ratio_value)
    : AbstractView(traits_value, camera_value, projection_value, InvalidSize(),
                   aspect_ratio_value) {}

AbstractView::AbstractView(boost::shared_ptr<ViewTraits const> const& traits_value,
                           boost::shared_ptr<Camera> const& camera_value,
                           _DEWARP_PROJECTION projection_value, Resolution const& resolution)
    : AbstractView(traits_value, camera_value, projection_value, resolution,
                   Defaults::AspectRatio) {}

// Every constructor with a camera ends here. An error of the projection leaves the constructor,
// so no half-built view is ever cached.
AbstractView::AbstractView(boost::shared_ptr<ViewTraits const> const& traits_value,
                           boost::shared_ptr<Camera> const& camera_value,
                           _DEWARP_PROJECTION projection_value, Resolution const& resolution,
                           _DEWARP_ASPECT_RATIO aspect_ratio_value)
    : traits(traits_value),
      camera(camera_value),
      aspect_ratio(aspect_ratio_value),
      projection(projection_value),
      dewarped_size(resolution),
      projection_size(InvalidSize()),
      field_of_view(FieldOfView::InvalidFieldOfView),
      ptz(PtzPosition::Identity) {
    InitProjectionInfo(GetCamera(), projection);
}

AbstractView::AbstractView(boost::shared_ptr<Camera> const& camera_value)
    : AbstractView(PanoramicViewTraits::GetPanoramicViewTraits(), camera_value) {}

AbstractView::AbstractView(boost::shared_ptr<Camera> const& camera_value,
                           _DEWARP_PROJECTION projection_value)
    : AbstractView(PanoramicViewTraits::GetPanoramicViewTraits(), camera_value, projection_value) {}

AbstractView::AbstractView(boost::shared_ptr<Camera> const& camera_value,
                           _DEWARP_ASPECT_RATIO aspect_ratio_value)
    : AbstractView(PanoramicViewTraits::GetPanoramicViewTraits(), camera_value,
                   Defaults::Projection, aspect_ratio_value) {}

AbstractView::AbstractView(boost::shared_ptr<Camera> const& camera_value,
                           _DEWARP_PROJECTION projection_value,
                           _DEWARP_ASPECT_RATIO aspect_ratio_value)
    : AbstractView(PanoramicViewTraits::GetPanoramicViewTraits(), camera_value, projection_value,
                   aspect_ratio_value) {}

AbstractView::AbstractView(boost::shared_ptr<Camera> const& camera_value,
                           _DEWARP_PROJECTION projection_value, Resolution const& resolution)
    : AbstractView(PanoramicViewTraits::GetPanoramicViewTraits(), camera_value, projection_value,
                   resolution) {}

AbstractView::AbstractView(boost::shared_ptr<Camera> const& camera_value,
                           _DEWARP_PROJECTION projection_value, Resolution const& resolution,
                           _DEWARP_ASPECT_RATIO aspect_ratio_value)
    : AbstractView(PanoramicViewTraits::GetPanoramicViewTraits(), camera_value, projection_value,
                   resolution, aspect_ratio_value) {}

AbstractView& AbstractView::operator=(AbstractView const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "AbstractView");
        return *this;
    }
    traits = other.traits;
    camera = other.camera;
    aspect_ratio = other.aspect_ratio;
    projection = other.projection;
    dewarped_size = other.dewarped_size;
    projection_size = other.projection_size;
    field_of_view = other.field_of_view;
    ptz = other.ptz;
    return *this;
}

AbstractView::~AbstractView() = default;

void AbstractView::OnAspectRatioChange(_DEWARP_ASPECT_RATIO, _DEWARP_ASPECT_RATIO new_ratio) {
    aspect_ratio = new_ratio;
}

void AbstractView::OnSizeChange(Resolution const&, Resolution const& new_size) {
    dewarped_size = new_size;
}

void AbstractView::OnOutputChange(Resolution const&, _DEWARP_ASPECT_RATIO,
                                  Resolution const& new_size, _DEWARP_ASPECT_RATIO new_ratio) {
    dewarped_size = new_size;
    aspect_ratio = new_ratio;
}

void AbstractView::OnZoomChange(PtzPosition const&, PtzPosition const& new_ptz) {
    ptz = new_ptz;
}

void AbstractView::OnOrientationChange(PtzPosition const&, PtzPosition const& new_ptz) {
    ptz = new_ptz;
}

void AbstractView::OnPtzChange(PtzPosition const&, PtzPosition const& new_ptz) {
    ptz = new_ptz;
}

ProjectionInfo AbstractView::CalcProjectionMapSize(Camera const& camera_value,
                                                   _DEWARP_PROJECTION projection_value) {
    return ViewTraits::MeasureProjection(camera_value, projection_value,
                                         GetTraits().GetTargetFov(camera_value, projection_value),
                                         "AbstractView", "CalcProjectionMapSize");
}

void AbstractView::InitProjectionInfo(Camera const& camera_value,
                                      _DEWARP_PROJECTION projection_value) {
    ProjectionInfo const info = CalcProjectionMapSize(camera_value, projection_value);
    projection_size = info.resolution;
    field_of_view = info.field_of_view;
    Log::info(__LINE__, __FILE__, "InitProjectionInfo",
              "ABSTRACT_VIEW Projection size = (%f, %f)\n", double(projection_size.x),
              double(projection_size.y));
    Log::info(__LINE__, __FILE__, "InitProjectionInfo", "ABSTRACT_VIEW Projection FOV = (%f, %f)\n",
              double(field_of_view.horizontal * DEGREES_PER_RADIAN),
              double(field_of_view.vertical * DEGREES_PER_RADIAN));
}

void AbstractView::SetAspectRatio(_DEWARP_ASPECT_RATIO ratio) {
    if (ratio != aspect_ratio) {
        OnAspectRatioChange(aspect_ratio, ratio);
    }
}

void AbstractView::SetDewarpedSize(Resolution const& size) {
    if (!(size != dewarped_size) && dewarped_size.Valid()) {
        return;
    }
    OnSizeChange(dewarped_size, size);
}

void AbstractView::SetDewarpedSize(Resolution const& size, _DEWARP_ASPECT_RATIO ratio) {
    if (!(size != dewarped_size) && dewarped_size.Valid()) {
        if (ratio != aspect_ratio) {
            OnAspectRatioChange(aspect_ratio, ratio);
        }
        return;
    }
    if (ratio == aspect_ratio) {
        OnSizeChange(dewarped_size, size);
    } else {
        OnOutputChange(dewarped_size, aspect_ratio, size, ratio);
    }
}

Resolution AbstractView::GetProjectionSize() const {
    return projection_size;
}

Vector2d AbstractView::GetCropSize() {
    switch (aspect_ratio) {
        case DEWARP_ASPECT_RATIO_FIT:
            return dewarped_size.BestFit(projection_size.AspectRatio());
        case DEWARP_ASPECT_RATIO_FIT_WIDTH:
            if (FloatingPoint::is_less(dewarped_size.AspectRatio(),
                                       projection_size.AspectRatio())) {
                return dewarped_size.BestFit(projection_size.AspectRatio());
            }
            return dewarped_size;
        default:
            return dewarped_size;
    }
}

PtzPosition AbstractView::LimitPtz(PtzPosition const& position) const {
    PtzRange range = GetPtzRange();
    float const zoom = range.LimitZoom(position.zoom);
    FieldOfView const seen = field_of_view / zoom;
    range.Deflate(seen);
    return range.Limit(position);
}

float AbstractView::BestZoom(PtzPosition const& position) const {
    PtzRange const range = GetPtzRange();
    float const d = RoomToNearerBound(range.pan, position.orientation.pan);
    float const e = RoomToNearerBound(range.tilt, position.orientation.tilt);
    float const a = field_of_view.horizontal * 0.5f / d;
    float const b = field_of_view.vertical * 0.5f / e;
    return range.LimitZoom(FloatingPoint::is_greater(a, b) ? a : b);
}

PtzPosition const& AbstractView::GetPtz() const {
    return ptz;
}

// No tolerance on the zoom: any difference, or a NaN on either side, is a change.
PtzPosition const& AbstractView::SetPtz(PtzPosition const& position) {
    PtzPosition const limited = LimitPtz(position);
    bool const orientation_differs = ptz.orientation != limited.orientation;
    bool const zoom_differs = !(ptz.zoom == limited.zoom);
    if (orientation_differs && zoom_differs) {
        OnPtzChange(ptz, limited);
    } else if (orientation_differs) {
        OnOrientationChange(ptz, limited);
    } else if (zoom_differs) {
        OnZoomChange(ptz, limited);
    }
    return ptz;
}

PtzPosition const& AbstractView::ResetPtz() {
    PtzPosition identity;
    identity.SetIdentity();
    return SetPtz(identity);
}

PtzRange AbstractView::GetPtzRange() const {
    return GetTraits().GetPtzRange(GetCamera(), field_of_view);
}

PtzPosition AbstractView::CalcPtzPosition(Vector2d const& point, float zoom) const {
    Vector2d const hit = GetCamera().MapHitPoint(point);
    PtzPosition result = LimitPtz(PtzPosition(EulerAngles(hit.x, hit.y, 0.0f), zoom));
    float const best = BestZoom(result);
    result.zoom = FloatingPoint::is_less(zoom, best) ? zoom : best;
    return result;
}

Camera& AbstractView::GetCamera() const {
    if (!camera) {
        Error::SetLastError(EFAULT);
        throw Error(CodeLocation("src/abstract_view", "AbstractView", "GetCamera", __LINE__),
                    EFAULT, "Invalid camera");
    }
    return *camera;
}

ViewTraits const& AbstractView::GetTraits() const {
    if (!traits) {
        Error::SetLastError(EFAULT);
        throw Error(CodeLocation("src/abstract_view", "AbstractView", "GetTraits", __LINE__),
                    EFAULT, "Invalid traits");
    }
    return *traits;
}

}  // namespace quorvel::vexmap
