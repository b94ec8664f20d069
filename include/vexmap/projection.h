#pragma once

#include <string>

#include "vexmap/dewarp_types.h"
#include "vexmap/vector_2d.h"
#include "vexmap/vector_3d.h"

namespace quorvel::vexmap {

/// One conversion of the grid: a point of the source picture to the target picture, both at the
/// focal length f. Plain functions with no state, so that a functor can hold one by pointer.
typedef Vector2d (*ConversionFunction)(Vector2d const& p, float f);

/// How directions lie on a flat picture, for thirteen projections: a focal length, a field of view
/// and a resolution formula for each, and a conversion for every ordered pair of projections.
/// Pixels with the origin at the centre, x right, y up; angles in radians; f in pixels per radian
/// at the centre. Static functions only, all in 32-bit float; pure, any thread.
class Projection {
public:
    static Vector2d const ZeroShift;      // (0, 0)
    static Vector2d const IdentityScale;  // (0, 0): a stored value that nothing multiplies by

    Projection();
    Projection(Projection const& other);
    Projection& operator=(Projection const& other);
    virtual ~Projection();

    /// The name of one of the nine public projections, spelled as the interface reports it; any
    /// other value warns and gives "<unknown>".
    static std::string GetName(_DEWARP_PROJECTION projection);

    /// The focal length at which a point r pixels from the centre lies at the angle a: half a
    /// width and half a field, not whole ones.
    static float RectilinearFocalLength(float r, float a);
    static float StereographicFocalLength(float r, float a);
    static float OrthographicFocalLength(float r, float a);
    static float EquisolidFocalLength(float r, float a);
    static float FisheyeFocalLength(float r, float a);
    static float EquirectangularFocalLength(float r, float a);
    static float CylindricalFocalLength(float r, float a);
    static float MercatorFocalLength(float r, float a);
    static float LambertCylindricalFocalLength(float r, float a);
    static float MillerCylindricalFocalLength(float r, float a);
    static float ArchitecturalFocalLength(float r, float a);
    static float PanniniFocalLength(float r, float a);
    static float EquirectangularPanniniFocalLength(float r, float a);

    /// The whole horizontal and vertical field that a picture of the whole size `resolution`
    /// shows at the focal length f.
    static Vector2d RectilinearFieldOfView(Vector2d const& resolution, float f);
    static Vector2d StereographicFieldOfView(Vector2d const& resolution, float f);
    static Vector2d OrthographicFieldOfView(Vector2d const& resolution, float f);
    static Vector2d EquisolidFieldOfView(Vector2d const& resolution, float f);
    static Vector2d FisheyeFieldOfView(Vector2d const& resolution, float f);
    static Vector2d EquirectangularFieldOfView(Vector2d const& resolution, float f);
    static Vector2d CylindricalFieldOfView(Vector2d const& resolution, float f);
    static Vector2d MercatorFieldOfView(Vector2d const& resolution, float f);
    static Vector2d LambertCylindricalFieldOfView(Vector2d const& resolution, float f);
    static Vector2d MillerCylindricalFieldOfView(Vector2d const& resolution, float f);
    static Vector2d ArchitecturalFieldOfView(Vector2d const& resolution, float f);
    static Vector2d PanniniFieldOfView(Vector2d const& resolution, float f);
    static Vector2d EquirectangularPanniniFieldOfView(Vector2d const& resolution, float f);

    /// The whole width and height, in pixels and not floored, of a picture that shows the whole
    /// field `fov` at the focal length f.
    static Vector2d RectilinearResolution(Vector2d const& fov, float f);
    static Vector2d StereographicResolution(Vector2d const& fov, float f);
    static Vector2d OrthographicResolution(Vector2d const& fov, float f);
    static Vector2d EquisolidResolution(Vector2d const& fov, float f);
    static Vector2d FisheyeResolution(Vector2d const& fov, float f);
    static Vector2d EquirectangularResolution(Vector2d const& fov, float f);
    static Vector2d CylindricalResolution(Vector2d const& fov, float f);
    static Vector2d MercatorResolution(Vector2d const& fov, float f);
    static Vector2d LambertCylindricalResolution(Vector2d const& fov, float f);
    static Vector2d MillerCylindricalResolution(Vector2d const& fov, float f);
    static Vector2d ArchitecturalResolution(Vector2d const& fov, float f);
    static Vector2d PanniniResolution(Vector2d const& fov, float f);
    static Vector2d EquirectangularPanniniResolution(Vector2d const& fov, float f);

    // The conversions, source by source, every target in the same order. Each is a
    // ConversionFunction. Same-projection members return the point; nothing converts out of
    // Spherical but SphericalToSpherical. NaN marks a point that has no image, and it flows
    // through later stages. StereographicToEquirectangular, and every conversion that goes
    // through it, gives a latitude in radians as y where all others give pixels.
    static Vector2d EquirectangularToEquirectangular(Vector2d const& p, float f);
    static Vector2d EquirectangularToRectilinear(Vector2d const& p, float f);
    static Vector2d EquirectangularToStereographic(Vector2d const& p, float f);
    static Vector2d EquirectangularToOrthographic(Vector2d const& p, float f);
    static Vector2d EquirectangularToEquisolid(Vector2d const& p, float f);
    static Vector2d EquirectangularToCylindrical(Vector2d const& p, float f);
    static Vector2d EquirectangularToFisheye(Vector2d const& p, float f);
    static Vector2d EquirectangularToMercator(Vector2d const& p, float f);
    static Vector2d EquirectangularToLambertCylindrical(Vector2d const& p, float f);
    static Vector2d EquirectangularToMillerCylindrical(Vector2d const& p, float f);
    static Vector2d EquirectangularToPannini(Vector2d const& p, float f);
    static Vector2d EquirectangularToArchitectural(Vector2d const& p, float f);
    static Vector2d EquirectangularToEquirectangularPannini(Vector2d const& p, float f);
    static Vector2d EquirectangularToMirror(Vector2d const& p, float f);
    static Vector2d EquirectangularToSpherical(Vector2d const& p, float f);

    static Vector2d RectilinearToEquirectangular(Vector2d const& p, float f);
    static Vector2d RectilinearToRectilinear(Vector2d const& p, float f);
    static Vector2d RectilinearToStereographic(Vector2d const& p, float f);
    static Vector2d RectilinearToOrthographic(Vector2d const& p, float f);
    static Vector2d RectilinearToEquisolid(Vector2d const& p, float f);
    static Vector2d RectilinearToCylindrical(Vector2d const& p, float f);
    static Vector2d RectilinearToFisheye(Vector2d const& p, float f);
    static Vector2d RectilinearToMercator(Vector2d const& p, float f);
    static Vector2d RectilinearToLambertCylindrical(Vector2d const& p, float f);
    static Vector2d RectilinearToMillerCylindrical(Vector2d const& p, float f);
    static Vector2d RectilinearToPannini(Vector2d const& p, float f);
    static Vector2d RectilinearToArchitectural(Vector2d const& p, float f);
    static Vector2d RectilinearToEquirectangularPannini(Vector2d const& p, float f);
    static Vector2d RectilinearToMirror(Vector2d const& p, float f);
    static Vector2d RectilinearToSpherical(Vector2d const& p, float f);

    static Vector2d StereographicToEquirectangular(Vector2d const& p, float f);
    static Vector2d StereographicToRectilinear(Vector2d const& p, float f);
    static Vector2d StereographicToStereographic(Vector2d const& p, float f);
    static Vector2d StereographicToOrthographic(Vector2d const& p, float f);
    static Vector2d StereographicToEquisolid(Vector2d const& p, float f);
    static Vector2d StereographicToCylindrical(Vector2d const& p, float f);
    static Vector2d StereographicToFisheye(Vector2d const& p, float f);
    static Vector2d StereographicToMercator(Vector2d const& p, float f);
    static Vector2d StereographicToLambertCylindrical(Vector2d const& p, float f);
    static Vector2d StereographicToMillerCylindrical(Vector2d const& p, float f);
    static Vector2d StereographicToPannini(Vector2d const& p, float f);
    static Vector2d StereographicToArchitectural(Vector2d const& p, float f);
    static Vector2d StereographicToEquirectangularPannini(Vector2d const& p, float f);
    static Vector2d StereographicToMirror(Vector2d const& p, float f);
    static Vector2d StereographicToSpherical(Vector2d const& p, float f);

    static Vector2d OrthographicToEquirectangular(Vector2d const& p, float f);
    static Vector2d OrthographicToRectilinear(Vector2d const& p, float f);
    static Vector2d OrthographicToStereographic(Vector2d const& p, float f);
    static Vector2d OrthographicToOrthographic(Vector2d const& p, float f);
    static Vector2d OrthographicToEquisolid(Vector2d const& p, float f);
    static Vector2d OrthographicToCylindrical(Vector2d const& p, float f);
    static Vector2d OrthographicToFisheye(Vector2d const& p, float f);
    static Vector2d OrthographicToMercator(Vector2d const& p, float f);
    static Vector2d OrthographicToLambertCylindrical(Vector2d const& p, float f);
    static Vector2d OrthographicToMillerCylindrical(Vector2d const& p, float f);
    static Vector2d OrthographicToPannini(Vector2d const& p, float f);
    static Vector2d OrthographicToArchitectural(Vector2d const& p, float f);
    static Vector2d OrthographicToEquirectangularPannini(Vector2d const& p, float f);
    static Vector2d OrthographicToMirror(Vector2d const& p, float f);
    static Vector2d OrthographicToSpherical(Vector2d const& p, float f);

    static Vector2d EquisolidToEquirectangular(Vector2d const& p, float f);
    static Vector2d EquisolidToRectilinear(Vector2d const& p, float f);
    static Vector2d EquisolidToStereographic(Vector2d const& p, float f);
    static Vector2d EquisolidToOrthographic(Vector2d const& p, float f);
    static Vector2d EquisolidToEquisolid(Vector2d const& p, float f);
    static Vector2d EquisolidToCylindrical(Vector2d const& p, float f);
    static Vector2d EquisolidToFisheye(Vector2d const& p, float f);
    static Vector2d EquisolidToMercator(Vector2d const& p, float f);
    static Vector2d EquisolidToLambertCylindrical(Vector2d const& p, float f);
    static Vector2d EquisolidToMillerCylindrical(Vector2d const& p, float f);
    static Vector2d EquisolidToPannini(Vector2d const& p, float f);
    static Vector2d EquisolidToArchitectural(Vector2d const& p, float f);
    static Vector2d EquisolidToEquirectangularPannini(Vector2d const& p, float f);
    static Vector2d EquisolidToMirror(Vector2d const& p, float f);
    static Vector2d EquisolidToSpherical(Vector2d const& p, float f);

    static Vector2d CylindricalToEquirectangular(Vector2d const& p, float f);
    static Vector2d CylindricalToRectilinear(Vector2d const& p, float f);
    static Vector2d CylindricalToStereographic(Vector2d const& p, float f);
    static Vector2d CylindricalToOrthographic(Vector2d const& p, float f);
    static Vector2d CylindricalToEquisolid(Vector2d const& p, float f);
    static Vector2d CylindricalToCylindrical(Vector2d const& p, float f);
    static Vector2d CylindricalToFisheye(Vector2d const& p, float f);
    static Vector2d CylindricalToMercator(Vector2d const& p, float f);
    static Vector2d CylindricalToLambertCylindrical(Vector2d const& p, float f);
    static Vector2d CylindricalToMillerCylindrical(Vector2d const& p, float f);
    static Vector2d CylindricalToPannini(Vector2d const& p, float f);
    static Vector2d CylindricalToArchitectural(Vector2d const& p, float f);
    static Vector2d CylindricalToEquirectangularPannini(Vector2d const& p, float f);
    static Vector2d CylindricalToMirror(Vector2d const& p, float f);
    static Vector2d CylindricalToSpherical(Vector2d const& p, float f);

    static Vector2d FisheyeToEquirectangular(Vector2d const& p, float f);
    static Vector2d FisheyeToRectilinear(Vector2d const& p, float f);
    static Vector2d FisheyeToStereographic(Vector2d const& p, float f);
    static Vector2d FisheyeToOrthographic(Vector2d const& p, float f);
    static Vector2d FisheyeToEquisolid(Vector2d const& p, float f);
    static Vector2d FisheyeToCylindrical(Vector2d const& p, float f);
    static Vector2d FisheyeToFisheye(Vector2d const& p, float f);
    static Vector2d FisheyeToMercator(Vector2d const& p, float f);
    static Vector2d FisheyeToLambertCylindrical(Vector2d const& p, float f);
    static Vector2d FisheyeToMillerCylindrical(Vector2d const& p, float f);
    static Vector2d FisheyeToPannini(Vector2d const& p, float f);
    static Vector2d FisheyeToArchitectural(Vector2d const& p, float f);
    static Vector2d FisheyeToEquirectangularPannini(Vector2d const& p, float f);
    static Vector2d FisheyeToMirror(Vector2d const& p, float f);
    static Vector2d FisheyeToSpherical(Vector2d const& p, float f);

    static Vector2d MercatorToEquirectangular(Vector2d const& p, float f);
    static Vector2d MercatorToRectilinear(Vector2d const& p, float f);
    static Vector2d MercatorToStereographic(Vector2d const& p, float f);
    static Vector2d MercatorToOrthographic(Vector2d const& p, float f);
    static Vector2d MercatorToEquisolid(Vector2d const& p, float f);
    static Vector2d MercatorToCylindrical(Vector2d const& p, float f);
    static Vector2d MercatorToFisheye(Vector2d const& p, float f);
    static Vector2d MercatorToMercator(Vector2d const& p, float f);
    static Vector2d MercatorToLambertCylindrical(Vector2d const& p, float f);
    static Vector2d MercatorToMillerCylindrical(Vector2d const& p, float f);
    static Vector2d MercatorToPannini(Vector2d const& p, float f);
    static Vector2d MercatorToArchitectural(Vector2d const& p, float f);
    static Vector2d MercatorToEquirectangularPannini(Vector2d const& p, float f);
    static Vector2d MercatorToMirror(Vector2d const& p, float f);
    static Vector2d MercatorToSpherical(Vector2d const& p, float f);

    static Vector2d LambertCylindricalToEquirectangular(Vector2d const& p, float f);
    static Vector2d LambertCylindricalToRectilinear(Vector2d const& p, float f);
    static Vector2d LambertCylindricalToStereographic(Vector2d const& p, float f);
    static Vector2d LambertCylindricalToOrthographic(Vector2d const& p, float f);
    static Vector2d LambertCylindricalToEquisolid(Vector2d const& p, float f);
    static Vector2d LambertCylindricalToCylindrical(Vector2d const& p, float f);
    static Vector2d LambertCylindricalToFisheye(Vector2d const& p, float f);
    static Vector2d LambertCylindricalToMercator(Vector2d const& p, float f);
    static Vector2d LambertCylindricalToLambertCylindrical(Vector2d const& p, float f);
    static Vector2d LambertCylindricalToMillerCylindrical(Vector2d const& p, float f);
    static Vector2d LambertCylindricalToPannini(Vector2d const& p, float f);
    static Vector2d LambertCylindricalToArchitectural(Vector2d const& p, float f);
    static Vector2d LambertCylindricalToEquirectangularPannini(Vector2d const& p, float f);
    static Vector2d LambertCylindricalToMirror(Vector2d const& p, float f);
    static Vector2d LambertCylindricalToSpherical(Vector2d const& p, float f);

    static Vector2d MillerCylindricalToEquirectangular(Vector2d const& p, float f);
    static Vector2d MillerCylindricalToRectilinear(Vector2d const& p, float f);
    static Vector2d MillerCylindricalToStereographic(Vector2d const& p, float f);
    static Vector2d MillerCylindricalToOrthographic(Vector2d const& p, float f);
    static Vector2d MillerCylindricalToEquisolid(Vector2d const& p, float f);
    static Vector2d MillerCylindricalToCylindrical(Vector2d const& p, float f);
    static Vector2d MillerCylindricalToFisheye(Vector2d const& p, float f);
    static Vector2d MillerCylindricalToMercator(Vector2d const& p, float f);
    static Vector2d MillerCylindricalToLambertCylindrical(Vector2d const& p, float f);
    static Vector2d MillerCylindricalToMillerCylindrical(Vector2d const& p, float f);
    static Vector2d MillerCylindricalToPannini(Vector2d const& p, float f);
    static Vector2d MillerCylindricalToArchitectural(Vector2d const& p, float f);
    static Vector2d MillerCylindricalToEquirectangularPannini(Vector2d const& p, float f);
    static Vector2d MillerCylindricalToMirror(Vector2d const& p, float f);
    static Vector2d MillerCylindricalToSpherical(Vector2d const& p, float f);

    static Vector2d PanniniToEquirectangular(Vector2d const& p, float f);
    static Vector2d PanniniToRectilinear(Vector2d const& p, float f);
    static Vector2d PanniniToStereographic(Vector2d const& p, float f);
    static Vector2d PanniniToOrthographic(Vector2d const& p, float f);
    static Vector2d PanniniToEquisolid(Vector2d const& p, float f);
    static Vector2d PanniniToCylindrical(Vector2d const& p, float f);
    static Vector2d PanniniToFisheye(Vector2d const& p, float f);
    static Vector2d PanniniToMercator(Vector2d const& p, float f);
    static Vector2d PanniniToLambertCylindrical(Vector2d const& p, float f);
    static Vector2d PanniniToMillerCylindrical(Vector2d const& p, float f);
    static Vector2d PanniniToPannini(Vector2d const& p, float f);
    static Vector2d PanniniToArchitectural(Vector2d const& p, float f);
    static Vector2d PanniniToEquirectangularPannini(Vector2d const& p, float f);
    static Vector2d PanniniToMirror(Vector2d const& p, float f);
    static Vector2d PanniniToSpherical(Vector2d const& p, float f);

    static Vector2d ArchitecturalToEquirectangular(Vector2d const& p, float f);
    static Vector2d ArchitecturalToRectilinear(Vector2d const& p, float f);
    static Vector2d ArchitecturalToStereographic(Vector2d const& p, float f);
    static Vector2d ArchitecturalToOrthographic(Vector2d const& p, float f);
    static Vector2d ArchitecturalToEquisolid(Vector2d const& p, float f);
    static Vector2d ArchitecturalToCylindrical(Vector2d const& p, float f);
    static Vector2d ArchitecturalToFisheye(Vector2d const& p, float f);
    static Vector2d ArchitecturalToMercator(Vector2d const& p, float f);
    static Vector2d ArchitecturalToLambertCylindrical(Vector2d const& p, float f);
    static Vector2d ArchitecturalToMillerCylindrical(Vector2d const& p, float f);
    static Vector2d ArchitecturalToPannini(Vector2d const& p, float f);
    static Vector2d ArchitecturalToArchitectural(Vector2d const& p, float f);
    static Vector2d ArchitecturalToEquirectangularPannini(Vector2d const& p, float f);
    static Vector2d ArchitecturalToMirror(Vector2d const& p, float f);
    static Vector2d ArchitecturalToSpherical(Vector2d const& p, float f);

    static Vector2d EquirectangularPanniniToEquirectangular(Vector2d const& p, float f);
    static Vector2d EquirectangularPanniniToRectilinear(Vector2d const& p, float f);
    static Vector2d EquirectangularPanniniToStereographic(Vector2d const& p, float f);
    static Vector2d EquirectangularPanniniToOrthographic(Vector2d const& p, float f);
    static Vector2d EquirectangularPanniniToEquisolid(Vector2d const& p, float f);
    static Vector2d EquirectangularPanniniToCylindrical(Vector2d const& p, float f);
    static Vector2d EquirectangularPanniniToFisheye(Vector2d const& p, float f);
    static Vector2d EquirectangularPanniniToMercator(Vector2d const& p, float f);
    static Vector2d EquirectangularPanniniToLambertCylindrical(Vector2d const& p, float f);
    static Vector2d EquirectangularPanniniToMillerCylindrical(Vector2d const& p, float f);
    static Vector2d EquirectangularPanniniToPannini(Vector2d const& p, float f);
    static Vector2d EquirectangularPanniniToArchitectural(Vector2d const& p, float f);
    static Vector2d EquirectangularPanniniToEquirectangularPannini(Vector2d const& p, float f);
    static Vector2d EquirectangularPanniniToMirror(Vector2d const& p, float f);
    static Vector2d EquirectangularPanniniToSpherical(Vector2d const& p, float f);

    static Vector2d MirrorToEquirectangular(Vector2d const& p, float f);
    static Vector2d MirrorToRectilinear(Vector2d const& p, float f);
    static Vector2d MirrorToStereographic(Vector2d const& p, float f);
    static Vector2d MirrorToOrthographic(Vector2d const& p, float f);
    static Vector2d MirrorToEquisolid(Vector2d const& p, float f);
    static Vector2d MirrorToCylindrical(Vector2d const& p, float f);
    static Vector2d MirrorToFisheye(Vector2d const& p, float f);
    static Vector2d MirrorToMercator(Vector2d const& p, float f);
    static Vector2d MirrorToLambertCylindrical(Vector2d const& p, float f);
    static Vector2d MirrorToMillerCylindrical(Vector2d const& p, float f);
    static Vector2d MirrorToPannini(Vector2d const& p, float f);
    static Vector2d MirrorToArchitectural(Vector2d const& p, float f);
    static Vector2d MirrorToEquirectangularPannini(Vector2d const& p, float f);
    static Vector2d MirrorToMirror(Vector2d const& p, float f);
    static Vector2d MirrorToSpherical(Vector2d const& p, float f);

    static Vector2d SphericalToSpherical(Vector2d const& p, float f);

    /// The axis of view, the centre of the picture, is -z here; the longitude is not wrapped.
    static Vector3d EquirectangularToVector3d(Vector2d const& p, float f);
    static Vector2d Vector3dToEquirectangular(Vector3d const& v, float f);
};

}  // namespace quorvel::vexmap
