#pragma once

#include "vexmap/dewarp_types.h"
#include "vexmap/map_functor.h"
#include "vexmap/projection.h"
#include "vexmap/vector_2d.h"

namespace quorvel::vexmap {

/// The link of a map chain that changes projection: one conversion of the grid and a focal length,
/// applied to each point. Owns the table that turns a pair of projections into a conversion. A
/// failed Set leaves the functor as it was. One thread.
class ProjectionFunctor : public MapFunctor {
public:
    /// The public projections with the same values, then the internal ones.
    enum _PROJECTION : int {
        PROJECTION_RECTILINEAR = 0,
        PROJECTION_CYLINDRICAL = 1,
        PROJECTION_EQUIRECTANGULAR = 2,
        PROJECTION_MERCATOR = 3,
        PROJECTION_LAMBERT_CYLINDRICAL = 4,
        PROJECTION_MILLER_CYLINDRICAL = 5,
        PROJECTION_PANNINI = 6,
        PROJECTION_ARCHITECTURAL = 7,
        PROJECTION_EQUIRECTANGULAR_PANNINI = 8,
        PROJECTION_STEREOGRAPHIC = 9,
        PROJECTION_ORTHOGRAPHIC = 10,
        PROJECTION_EQUISOLID = 11,
        PROJECTION_RESERVED = 12,
        PROJECTION_FISHEYE = 13,
        PROJECTION_SPHERICAL = 14,
        PROJECTION_MIRROR = 15
    };

    ProjectionFunctor();  // EquirectangularToEquirectangular, NaN focal length, identity scale
    ProjectionFunctor(ProjectionFunctor const& other);
    ProjectionFunctor(ConversionFunction function, float f, Vector2d const& scale_value);
    /// From b to a: with two projections the first is where to go.
    ProjectionFunctor(_DEWARP_PROJECTION a, _DEWARP_PROJECTION b, float f,
                      Vector2d const& scale_value);
    /// From the camera's image to the projection.
    ProjectionFunctor(_DEWARP_INTERNAL_CAMERA_TYPE camera, _DEWARP_PROJECTION projection, float f,
                      Vector2d const& scale_value);
    /// From the projection to the camera's image.
    ProjectionFunctor(_DEWARP_PROJECTION projection, _DEWARP_INTERNAL_CAMERA_TYPE camera, float f,
                      Vector2d const& scale_value);
    ProjectionFunctor& operator=(ProjectionFunctor const& other);
    ~ProjectionFunctor() override;

    void Set(ConversionFunction function, float f, Vector2d const& scale_value);
    void Set(_DEWARP_PROJECTION a, _DEWARP_PROJECTION b, float f, Vector2d const& scale_value);
    void Set(_DEWARP_INTERNAL_CAMERA_TYPE camera, _DEWARP_PROJECTION projection, float f,
             Vector2d const& scale_value);
    void Set(_DEWARP_PROJECTION projection, _DEWARP_INTERNAL_CAMERA_TYPE camera, float f,
             Vector2d const& scale_value);
    /// The conversion at the focal length; the scale takes no part.
    Vector2d Call(Vector2d const& point) override;
    void Reset();

    static _PROJECTION ConvertCamera(_DEWARP_INTERNAL_CAMERA_TYPE camera);
    /// The conversion from one projection to another; throws for a pair outside the table.
    static ConversionFunction GetProjection(_PROJECTION from, _PROJECTION to);
    static ConversionFunction GetProjection(_DEWARP_INTERNAL_CAMERA_TYPE camera,
                                            _DEWARP_PROJECTION projection);
    static ConversionFunction GetProjection(_DEWARP_PROJECTION projection,
                                            _DEWARP_INTERNAL_CAMERA_TYPE camera);

    ConversionFunction conversion;  // never null
    float focal_length;
    Vector2d scale;  // stored, copied and reset; Call does not use it

private:
    void Store(ConversionFunction function, float f, Vector2d const& scale_value);
};

}  // namespace quorvel::vexmap
