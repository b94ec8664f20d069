#pragma once

#include <boost/shared_ptr.hpp>

#include "vexmap/camera.h"
#include "vexmap/dewarp_types.h"
#include "vexmap/field_of_view.h"
#include "vexmap/ptz_position.h"
#include "vexmap/ptz_range.h"
#include "vexmap/resolution.h"
#include "vexmap/vector_2d.h"
#include "vexmap/view_traits.h"

namespace quorvel::vexmap {

/// One way of looking at a camera: output size, aspect ratio, projection and PTZ position, and
/// the size and extent of the whole projected picture. Setters never store: they classify the
/// change and call the matching On...Change, whose base versions store and whose overrides react.
/// Shares the camera with its channel. No lock: the channel's lock guards every call.
class AbstractView {
public:
    AbstractView();
    AbstractView(AbstractView const& other);
    explicit AbstractView(boost::shared_ptr<ViewTraits const> const& traits_value);
    AbstractView(boost::shared_ptr<ViewTraits const> const& traits_value,
                 boost::shared_ptr<Camera> const& camera_value);
    AbstractView(boost::shared_ptr<ViewTraits const> const& traits_value,
                 boost::shared_ptr<Camera> const& camera_value,
                 _DEWARP_PROJECTION projection_value);
    AbstractView(boost::shared_ptr<ViewTraits const> const& traits_value,
                 boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value,
                 _DEWARP_ASPECT_RATIO aspect_ratio_value);
    AbstractView(boost::shared_ptr<ViewTraits const> const& traits_value,
                 boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value,
                 Resolution const& resolution);
    AbstractView(boost::shared_ptr<ViewTraits const> const& traits_value,
                 boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value,
                 Resolution const& resolution, _DEWARP_ASPECT_RATIO aspect_ratio_value);
    explicit AbstractView(boost::shared_ptr<Camera> const& camera_value);
    AbstractView(boost::shared_ptr<Camera> const& camera_value,
                 _DEWARP_PROJECTION projection_value);
    AbstractView(boost::shared_ptr<Camera> const& camera_value,
                 _DEWARP_ASPECT_RATIO aspect_ratio_value);
    AbstractView(boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value,
                 _DEWARP_ASPECT_RATIO aspect_ratio_value);
    AbstractView(boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value,
                 Resolution const& resolution);
    AbstractView(boost::shared_ptr<Camera> const& camera_value, _DEWARP_PROJECTION projection_value,
                 Resolution const& resolution, _DEWARP_ASPECT_RATIO aspect_ratio_value);
    AbstractView& operator=(AbstractView const& other);
    virtual ~AbstractView();

    // The change protocol. The old values arrive by reference to the live fields, so an override
    // reads them before calling the base, which stores the new ones.
    virtual void OnAspectRatioChange(_DEWARP_ASPECT_RATIO old_ratio,
                                     _DEWARP_ASPECT_RATIO new_ratio);
    virtual void OnSizeChange(Resolution const& old_size, Resolution const& new_size);
    virtual void OnOutputChange(Resolution const& old_size, _DEWARP_ASPECT_RATIO old_ratio,
                                Resolution const& new_size, _DEWARP_ASPECT_RATIO new_ratio);
    virtual void OnZoomChange(PtzPosition const& old_ptz, PtzPosition const& new_ptz);
    virtual void OnOrientationChange(PtzPosition const& old_ptz, PtzPosition const& new_ptz);
    virtual void OnPtzChange(PtzPosition const& old_ptz, PtzPosition const& new_ptz);

    virtual ProjectionInfo CalcProjectionMapSize(Camera const& camera_value,
                                                 _DEWARP_PROJECTION projection_value);
    virtual void InitProjectionInfo(Camera const& camera_value,
                                    _DEWARP_PROJECTION projection_value);
    virtual void SetAspectRatio(_DEWARP_ASPECT_RATIO ratio);
    /// The first size always counts as a change, however an invalid size compares.
    virtual void SetDewarpedSize(Resolution const& size);
    virtual void SetDewarpedSize(Resolution const& size, _DEWARP_ASPECT_RATIO ratio);
    virtual Resolution GetProjectionSize() const;
    /// The part of the output, in pixels, that the picture covers.
    virtual Vector2d GetCropSize();
    /// The position within the range deflated by what the picture covers at its zoom, so that
    /// the picture's edge and not its centre stops at a limit.
    virtual PtzPosition LimitPtz(PtzPosition const& position) const;
    /// The zoom at which a picture centred on the position just stays inside the range.
    virtual float BestZoom(PtzPosition const& position) const;
    virtual PtzPosition const& GetPtz() const;
    /// Stores the limited position through the change protocol and returns it.
    virtual PtzPosition const& SetPtz(PtzPosition const& position);
    virtual PtzPosition const& ResetPtz();
    virtual PtzRange GetPtzRange() const;
    /// A position looking at a point of the camera's picture; the view's own does not change.
    virtual PtzPosition CalcPtzPosition(Vector2d const& point, float zoom) const;
    virtual void DewarpImage(_DEWARP_IMAGE const& warped, _DEWARP_IMAGE& dewarped) = 0;

    /// Throw EFAULT when there is none.
    Camera& GetCamera() const;
    ViewTraits const& GetTraits() const;

    _DEWARP_ASPECT_RATIO GetAspectRatio() const { return aspect_ratio; }
    _DEWARP_PROJECTION GetProjection() const { return projection; }
    Resolution const& GetDewarpedSize() const { return dewarped_size; }
    FieldOfView const& GetFieldOfView() const { return field_of_view; }

protected:
    boost::shared_ptr<ViewTraits const> traits;
    boost::shared_ptr<Camera> camera;
    _DEWARP_ASPECT_RATIO aspect_ratio;
    _DEWARP_PROJECTION projection;  // fixed for the life of the object
    Resolution dewarped_size;       // invalid until the first frame unless given
    Resolution projection_size;
    FieldOfView field_of_view;
    PtzPosition ptz;
};

}  // namespace quorvel::vexmap
