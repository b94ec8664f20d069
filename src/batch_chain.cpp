#include "vexmap/batch_chain.h"

#include <typeinfo>

#include <boost/shared_ptr.hpp>

#include "vexmap/batch_trigonometry.h"
#include "vexmap/log.h"
#include "vexmap/map_functors.h"
#include "vexmap/projection_functor.h"
#include "vexmap/spherical_orientation_functor.h"
#include "vexmap/transform_2d_functor.h"
#include "vexmap/trigonometry.h"

// Each kernel below is the Call of its link with the same single-precision operations in the same
// order, only run over arrays; comparisons with zero stand for FloatingPoint::is_zero, which is
// true for both zeros and nothing else. The loops are plain so that the compiler runs several
// lanes at once, and the trigonometry is one BatchTrigonometry call an array.

namespace quorvel::vexmap {
namespace {

constexpr float MILLER_SCALE = 0.8f;
constexpr float MILLER_INVERSE_SCALE = 1.25f;

using B = BatchTrigonometry;

// Arrays that a kernel is given never overlap (VEXMAP_RESTRICT), and a quotient that a test may
// throw away is worked out all the same, as its NaN is harmless: both let the loops run in lanes.
#define VEXMAP_RESTRICT __restrict

void Affine(float const* matrix, float* VEXMAP_RESTRICT x, float* VEXMAP_RESTRICT y, int count) {
    float const m11 = matrix[0], m12 = matrix[1], m13 = matrix[2];
    float const m21 = matrix[3], m22 = matrix[4], m23 = matrix[5];
    for (int i = 0; i < count; ++i) {
        float const px = x[i];
        float const py = y[i];
        x[i] = m11 * px + m12 * py + m13;
        y[i] = m21 * px + m22 * py + m23;
    }
}

// Rotation::SphericalRotation: to a direction, turned from object to inertial, and back.
void SphericalTurn(float const* matrix, float f, float* VEXMAP_RESTRICT x, float* VEXMAP_RESTRICT y,
                   int count, float* VEXMAP_RESTRICT r, float* VEXMAP_RESTRICT s,
                   float* VEXMAP_RESTRICT c) {
    float const m11 = matrix[0], m12 = matrix[1], m13 = matrix[2];
    float const m21 = matrix[3], m22 = matrix[4], m23 = matrix[5];
    float const m31 = matrix[6], m32 = matrix[7], m33 = matrix[8];
    B::hypot(x, y, r, count);
    for (int i = 0; i < count; ++i) {
        c[i] = r[i] / f;
    }
    B::sin(c, s, count);
    B::cos(c, c, count);
    for (int i = 0; i < count; ++i) {
        float const ratio = s[i] / r[i];
        float const k = r[i] == 0.0f ? 0.0f : ratio;
        float const vx = x[i] * k;
        float const vy = y[i] * k;
        float const vz = c[i];
        x[i] = m11 * vx + m12 * vy + m13 * vz;
        y[i] = m21 * vx + m22 * vy + m23 * vz;
        c[i] = m31 * vx + m32 * vy + m33 * vz;
    }
    // r becomes the turned point's distance from the axis, s its angle off it, c its z.
    B::hypot(x, y, r, count);
    B::atan(r, c, s, count);
    for (int i = 0; i < count; ++i) {
        float const ratio = s[i] * f / r[i];
        float const k = r[i] == 0.0f ? 0.0f : ratio;
        x[i] = x[i] * k;
        y[i] = y[i] * k;
    }
}

void RectilinearToFisheye(float f, float* VEXMAP_RESTRICT x, float* VEXMAP_RESTRICT y, int count,
                          float* VEXMAP_RESTRICT q, float* VEXMAP_RESTRICT t) {
    B::hypot(x, y, q, count);
    for (int i = 0; i < count; ++i) {
        q[i] = q[i] / f;
    }
    B::atan(q, t, count);
    for (int i = 0; i < count; ++i) {
        float const ratio = t[i] / q[i];
        float const k = q[i] == 0.0f ? 1.0f : ratio;
        x[i] = x[i] * k;
        y[i] = y[i] * k;
    }
}

// a is f sin l, later its distance from the axis' multiplier; c is f cos l, later the angle.
void CylindricalToFisheye(float f, float* VEXMAP_RESTRICT x, float* VEXMAP_RESTRICT y, int count,
                          float* VEXMAP_RESTRICT a, float* VEXMAP_RESTRICT c,
                          float* VEXMAP_RESTRICT h) {
    for (int i = 0; i < count; ++i) {
        h[i] = x[i] / f;
    }
    B::sin(h, a, count);
    B::cos(h, c, count);
    for (int i = 0; i < count; ++i) {
        a[i] = f * a[i];
        c[i] = f * c[i];
    }
    B::hypot(a, y, h, count);
    B::atan(h, c, c, count);
    for (int i = 0; i < count; ++i) {
        float const k = c[i] * f / h[i];
        x[i] = a[i] * k;
        y[i] = y[i] * k;
    }
}

// The wrap of the longitude and colatitude first: a point over a pole goes to the far side.
void EquirectangularToFisheye(float f, float* VEXMAP_RESTRICT x, float* VEXMAP_RESTRICT y,
                              int count, float* VEXMAP_RESTRICT sin_l, float* VEXMAP_RESTRICT cos_l,
                              float* VEXMAP_RESTRICT sin_a, float* VEXMAP_RESTRICT cos_a) {
    for (int i = 0; i < count; ++i) {
        float const longitude = x[i] / f;
        float const colatitude = Trigonometry::HALF_PI - y[i] / f;
        bool const over_north = 0.0f > colatitude;
        float const reflected = over_north ? -colatitude : colatitude;
        float const turned = over_north ? longitude + Trigonometry::PI : longitude;
        bool const over_south = reflected > Trigonometry::PI;
        x[i] = over_south ? turned + Trigonometry::PI : turned;
        y[i] = over_south ? Trigonometry::PI - (reflected - Trigonometry::PI) : reflected;
    }
    B::sin(y, sin_a, count);
    B::cos(y, cos_a, count);
    B::sin(x, sin_l, count);
    B::cos(x, cos_l, count);
    // sin_l becomes vx, cos_l vz, and cos_a is vy.
    for (int i = 0; i < count; ++i) {
        sin_l[i] = sin_l[i] * sin_a[i];
        cos_l[i] = sin_a[i] * cos_l[i];
    }
    B::hypot(cos_a, sin_l, x, count);
    B::atan(x, cos_l, y, count);
    for (int i = 0; i < count; ++i) {
        float const s = y[i] * f;
        float const h = x[i];
        x[i] = sin_l[i] * s / h;
        y[i] = cos_a[i] * s / h;
    }
}

void MercatorToEquirectangular(float f, float* VEXMAP_RESTRICT y, int count,
                               float* VEXMAP_RESTRICT w) {
    for (int i = 0; i < count; ++i) {
        w[i] = y[i] / f;
    }
    B::sinh(w, w, count);
    B::atan(w, w, count);
    for (int i = 0; i < count; ++i) {
        y[i] = f * w[i];
    }
}

void LambertToEquirectangular(float f, float* VEXMAP_RESTRICT y, int count,
                              float* VEXMAP_RESTRICT w) {
    for (int i = 0; i < count; ++i) {
        w[i] = y[i] / f;
    }
    B::sin(w, w, count);
    for (int i = 0; i < count; ++i) {
        y[i] = f * w[i];
    }
}

void MillerToEquirectangular(float f, float* VEXMAP_RESTRICT y, int count,
                             float* VEXMAP_RESTRICT w) {
    for (int i = 0; i < count; ++i) {
        w[i] = MILLER_SCALE * y[i] / f;
    }
    B::sinh(w, w, count);
    B::atan(w, w, count);
    for (int i = 0; i < count; ++i) {
        y[i] = MILLER_INVERSE_SCALE * f * w[i];
    }
}

// Miller strictly below the horizon, Lambert from it up and for NaN: both worked out, one kept.
void ArchitecturalToEquirectangular(float f, float* VEXMAP_RESTRICT y, int count,
                                    float* VEXMAP_RESTRICT below, float* VEXMAP_RESTRICT above,
                                    float* VEXMAP_RESTRICT w) {
    for (int i = 0; i < count; ++i) {
        below[i] = y[i];
        above[i] = y[i];
    }
    MillerToEquirectangular(f, below, count, w);
    LambertToEquirectangular(f, above, count, w);
    for (int i = 0; i < count; ++i) {
        y[i] = y[i] / f < 0.0f ? below[i] : above[i];
    }
}

// The arctangent of the latitude is taken twice in Pannini's form and once in the other.
void PanniniToEquirectangular(float f, bool twice, float* VEXMAP_RESTRICT x,
                              float* VEXMAP_RESTRICT y, int count, float* VEXMAP_RESTRICT t,
                              float* VEXMAP_RESTRICT c) {
    for (int i = 0; i < count; ++i) {
        c[i] = x[i] / f;
        t[i] = 2.0f;
    }
    B::atan(c, t, t, count);
    B::cos(t, c, count);
    for (int i = 0; i < count; ++i) {
        x[i] = 2.0f * f * t[i];
        y[i] = y[i] / f * (c[i] * c[i]);
    }
    B::atan(y, y, count);
    if (twice) {
        B::atan(y, y, count);
    }
    for (int i = 0; i < count; ++i) {
        y[i] = f * y[i];
    }
}

#undef VEXMAP_RESTRICT

}  // namespace

BatchChain::BatchChain() = default;

BatchChain::BatchChain(MapFunctor& chain) {
    Append(chain);
}

BatchChain::BatchChain(BatchChain const& other) = default;

BatchChain& BatchChain::operator=(BatchChain const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "BatchChain");
        return *this;
    }
    steps = other.steps;
    return *this;
}

BatchChain::~BatchChain() = default;

// The exact class decides: a class derived from a known link may have a Call of its own.
void BatchChain::Append(MapFunctor& link) {
    std::type_info const& type = typeid(link);
    if (type == typeid(MapFunctors)) {
        for (boost::shared_ptr<MapFunctor> const& each :
             static_cast<MapFunctors&>(link).GetLinks()) {
            Append(*each);
        }
    } else if (type == typeid(Transform2dFunctor)) {
        Matrix3x3 const& matrix = static_cast<Transform2dFunctor&>(link).matrix;
        AppendStep(AFFINE, 0.0f);
        float* const m = steps.back().m;
        m[0] = matrix.m11;
        m[1] = matrix.m12;
        m[2] = matrix.m13;
        m[3] = matrix.m21;
        m[4] = matrix.m22;
        m[5] = matrix.m23;
    } else if (type == typeid(SphericalOrientationFunctor)) {
        auto const& turn = static_cast<SphericalOrientationFunctor&>(link);
        RotationMatrix3d const& r = turn.rotation;
        AppendStep(SPHERICAL_TURN, turn.focal_length);
        float* const m = steps.back().m;
        float const rows[9] = {r.m11, r.m12, r.m13, r.m21, r.m22, r.m23, r.m31, r.m32, r.m33};
        for (int i = 0; i < 9; ++i) {
            m[i] = rows[i];
        }
    } else if (type == typeid(ProjectionFunctor)) {
        auto const& projection = static_cast<ProjectionFunctor&>(link);
        AppendConversion(projection.conversion, projection.focal_length);
    } else {
        AppendStep(POINTWISE, 0.0f);
        steps.back().link = &link;
    }
}

// The conversions into Fisheye that the views use: three direct ones, and the others through
// Equirectangular, as the grid composes them.
void BatchChain::AppendConversion(ConversionFunction conversion, float f) {
    struct Known {
        ConversionFunction conversion;
        StepKind first;
        bool via_equirectangular;
    };
    static Known const KNOWN[] = {
        {&Projection::RectilinearToFisheye, RECTILINEAR_TO_FISHEYE, false},
        {&Projection::CylindricalToFisheye, CYLINDRICAL_TO_FISHEYE, false},
        {&Projection::EquirectangularToFisheye, EQUIRECTANGULAR_TO_FISHEYE, false},
        {&Projection::MercatorToFisheye, MERCATOR_TO_EQUIRECTANGULAR, true},
        {&Projection::LambertCylindricalToFisheye, LAMBERT_TO_EQUIRECTANGULAR, true},
        {&Projection::MillerCylindricalToFisheye, MILLER_TO_EQUIRECTANGULAR, true},
        {&Projection::ArchitecturalToFisheye, ARCHITECTURAL_TO_EQUIRECTANGULAR, true},
        {&Projection::PanniniToFisheye, PANNINI_TO_EQUIRECTANGULAR, true},
        {&Projection::EquirectangularPanniniToFisheye, EQUIRECTANGULAR_PANNINI_TO_EQUIRECTANGULAR,
         true},
    };
    for (Known const& known : KNOWN) {
        if (known.conversion == conversion) {
            AppendStep(known.first, f);
            if (known.via_equirectangular) {
                AppendStep(EQUIRECTANGULAR_TO_FISHEYE, f);
            }
            return;
        }
    }
    AppendStep(CONVERSION, f);
    steps.back().conversion = conversion;
}

void BatchChain::AppendStep(StepKind kind, float f) {
    Step step = {};
    step.kind = kind;
    step.f = f;
    steps.push_back(step);
}

void BatchChain::Run(float* x, float* y, int count) {
    if (count <= 0) {
        return;
    }
    std::size_t const needed = 4 * std::size_t(count);
    if (work.size() < needed) {
        work.resize(needed);
    }
    for (Step const& step : steps) {
        RunStep(step, x, y, count);
    }
}

void BatchChain::RunStep(Step const& step, float* x, float* y, int count) {
    float const f = step.f;
    switch (step.kind) {
        case AFFINE:
            Affine(step.m, x, y, count);
            break;
        case SPHERICAL_TURN:
            SphericalTurn(step.m, f, x, y, count, Work(0, count), Work(1, count), Work(2, count));
            break;
        case RECTILINEAR_TO_FISHEYE:
            RectilinearToFisheye(f, x, y, count, Work(0, count), Work(1, count));
            break;
        case CYLINDRICAL_TO_FISHEYE:
            CylindricalToFisheye(f, x, y, count, Work(0, count), Work(1, count), Work(2, count));
            break;
        case EQUIRECTANGULAR_TO_FISHEYE:
            EquirectangularToFisheye(f, x, y, count, Work(0, count), Work(1, count), Work(2, count),
                                     Work(3, count));
            break;
        case MERCATOR_TO_EQUIRECTANGULAR:
            MercatorToEquirectangular(f, y, count, Work(0, count));
            break;
        case LAMBERT_TO_EQUIRECTANGULAR:
            LambertToEquirectangular(f, y, count, Work(0, count));
            break;
        case MILLER_TO_EQUIRECTANGULAR:
            MillerToEquirectangular(f, y, count, Work(0, count));
            break;
        case ARCHITECTURAL_TO_EQUIRECTANGULAR:
            ArchitecturalToEquirectangular(f, y, count, Work(0, count), Work(1, count),
                                           Work(2, count));
            break;
        case PANNINI_TO_EQUIRECTANGULAR:
        case EQUIRECTANGULAR_PANNINI_TO_EQUIRECTANGULAR:
            PanniniToEquirectangular(f, step.kind == PANNINI_TO_EQUIRECTANGULAR, x, y, count,
                                     Work(0, count), Work(1, count));
            break;
        case CONVERSION:
            for (int i = 0; i < count; ++i) {
                Vector2d const point = step.conversion(Vector2d(x[i], y[i]), f);
                x[i] = point.x;
                y[i] = point.y;
            }
            break;
        case POINTWISE:
            for (int i = 0; i < count; ++i) {
                Vector2d const point = step.link->Call(Vector2d(x[i], y[i]));
                x[i] = point.x;
                y[i] = point.y;
            }
            break;
    }
}

}  // namespace quorvel::vexmap
