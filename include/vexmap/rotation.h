#pragma once

#include "vexmap/rotation_matrix_3d.h"
#include "vexmap/vector_2d.h"
#include "vexmap/vector_3d.h"

namespace quorvel::vexmap {

/// Turns a point of an image plane of focal length f through a rotation matrix, always by way of a
/// direction in space. Static functions only; pure, any thread.
class Rotation {
public:
    Rotation();
    Rotation(Rotation const& other);
    Rotation& operator=(Rotation const& other);  // nothing to copy
    virtual ~Rotation();

    /// An equidistant (spherical) image point to a direction: the radius over f is the angle
    /// off the axis.
    static Vector3d SphericalToVector3d(Vector2d const& p, float f);
    static Vector2d Vector3dToSpherical(Vector3d const& v, float f);
    static Vector2d SphericalRotation(Vector2d const& p, float f, RotationMatrix3d const& m);
    static Vector2d InverseSphericalRotation(Vector2d const& p, float f, RotationMatrix3d const& m);
    static Vector2d RectilinearRotation(Vector2d const& p, float f, RotationMatrix3d const& m);
    static Vector2d InverseRectilinearRotation(Vector2d const& p, float f,
                                               RotationMatrix3d const& m);
    /// The point is shifted before the turn and the result scaled and shifted back.
    static Vector2d RectilinearRotation(Vector2d const& p, float f, RotationMatrix3d const& m,
                                        Vector2d const& shift, float scale);
    static Vector2d InverseRectilinearRotation(Vector2d const& p, float f,
                                               RotationMatrix3d const& m, Vector2d const& shift,
                                               float scale);
    static Vector3d EquirectangularToVector3d(Vector2d const& p, float f);
    static Vector2d Vector3dToEquirectangular(Vector3d const& v, float f);
};

}  // namespace quorvel::vexmap
