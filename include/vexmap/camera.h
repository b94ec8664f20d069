#pragma once

#include <string>

#include "vexmap/dewarp_types.h"
#include "vexmap/field_of_view.h"
#include "vexmap/ptz_position.h"
#include "vexmap/resolution.h"
#include "vexmap/vector_2d.h"

namespace quorvel::vexmap {

/// A lens on a sensor, fixed in a given way: the image size and fields of view, how a point of the
/// warped image relates to a direction, and how large a picture each projection needs to show what
/// the lens saw. Keeps the model twice: converted to radians and floats for computing, and as the
/// caller gave it. Guarded by its channel's lock; const operations change nothing.
class Camera {
public:
    /// 140 degrees in radians. Nothing reads it at present.
    static float const MaxRectilinearFov;

    Camera();  // rectilinear, no size or field, mounted on a wall
    Camera(Camera const& other);
    Camera(_DEWARP_INTERNAL_CAMERA_MODEL const& model, _DEWARP_INTERNAL_CAMERA_MOUNT mount);
    Camera& operator=(Camera const& other);
    virtual ~Camera();

    virtual _DEWARP_PROJECTION GetDefaultProjection() const;
    virtual _DEWARP_ASPECT_RATIO GetDefaultAspectRatio() const;
    /// Where a picture of the given size sits: half its height up on a ceiling, down on a floor,
    /// centred on a wall. The projection is not used.
    virtual Vector2d GetShift(_DEWARP_PROJECTION projection, Vector2d const& size) const;
    virtual Vector2d GetScale() const;
    /// The pixels a projection needs to carry the whole camera picture: the image's four edge
    /// midpoints through the conversion from the projection to the camera's image.
    virtual Resolution GetProjectionMapSize(_DEWARP_PROJECTION projection) const;
    virtual FieldOfView GetProjectionFieldOfView(Resolution const& resolution,
                                                 _DEWARP_PROJECTION projection) const;
    virtual Resolution GetProjectionResolution(FieldOfView const& field_of_view,
                                               _DEWARP_PROJECTION projection) const;
    /// Pixels per radian at the centre, from half the width and half the horizontal field.
    virtual float GetFocalLength() const;
    virtual PtzPosition GetHomePosition() const = 0;
    /// The direction, pan and tilt in radians, of a point hit in the warped image.
    virtual Vector2d MapHitPoint(Vector2d const& point) const = 0;

    void SetCameraModel(_DEWARP_INTERNAL_CAMERA_MODEL const& model);  // the mount stays
    void SetCameraMount(_DEWARP_INTERNAL_CAMERA_MOUNT mount);
    static std::string GetCameraTypeName(_DEWARP_INTERNAL_CAMERA_TYPE type);
    void LogCameraInfo() const;
    /// A field of view to the size in pixels that it covers at this camera's focal length.
    Vector2d GetPtzOffset(Vector2d const& point) const;

    _DEWARP_INTERNAL_CAMERA_TYPE GetType() const { return m_eType; }
    FieldOfView const& GetFieldOfView() const { return m_FieldOfView; }
    Resolution const& GetResolution() const { return m_Resolution; }
    _DEWARP_INTERNAL_CAMERA_MODEL const& GetModel() const { return m_Model; }
    _DEWARP_INTERNAL_CAMERA_MOUNT GetMount() const { return m_eMount; }

protected:
    _DEWARP_INTERNAL_CAMERA_TYPE m_eType;
    FieldOfView m_FieldOfView;
    Resolution m_Resolution;
    _DEWARP_INTERNAL_CAMERA_MODEL m_Model;
    _DEWARP_INTERNAL_CAMERA_MOUNT m_eMount;
};

}  // namespace quorvel::vexmap
