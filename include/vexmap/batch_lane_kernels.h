#pragma once

// The body of every BatchLanes table, written once over a lane type L, which gives Pack, WIDTH,
// Load, Store, Fill, the comparisons and Select, Hypot, the library's vector functions and Leave.
// Every function of a table ends with L::Leave(), which clears what the wide lanes leave in the
// upper parts of the vector registers: with those parts in use, a processor runs the plain SSE
// code that follows (the caller's, and the whole host's) several times slower. Only
// the three lane files include it, each with its L in an unnamed namespace: every instance then
// stays inside the file compiled for its instructions, and none can stand in for another's.

#include "vexmap/batch_lanes.h"

namespace quorvel::vexmap::lane_kernels {

constexpr float HALF_PI = __builtin_bit_cast(float, 0x3FC90FDBu);  // Trigonometry::HALF_PI
constexpr float PI = __builtin_bit_cast(float, 0x40490FDBu);       // Trigonometry::PI

// Whole packs straight from the arrays; the last part through a padded copy, with zeros in the
// lanes beyond the count.
template <class L, typename Function>
inline void ApplyUnary(float const* x, float* out, int count, Function function) {
    int i = 0;
    for (; i + L::WIDTH <= count; i += L::WIDTH) {
        L::Store(out + i, function(L::Load(x + i)));
    }
    if (i < count) {
        float in_tail[L::WIDTH] = {};
        float out_tail[L::WIDTH];
        for (int k = 0; i + k < count; ++k) {
            in_tail[k] = x[i + k];
        }
        L::Store(out_tail, function(L::Load(in_tail)));
        for (int k = 0; i + k < count; ++k) {
            out[i + k] = out_tail[k];
        }
    }
}

template <class L, typename Function>
inline void ApplyBinary(float const* a, float const* b, float* out, int count, Function function) {
    int i = 0;
    for (; i + L::WIDTH <= count; i += L::WIDTH) {
        L::Store(out + i, function(L::Load(a + i), L::Load(b + i)));
    }
    if (i < count) {
        float a_tail[L::WIDTH] = {};
        float b_tail[L::WIDTH] = {};
        float out_tail[L::WIDTH];
        for (int k = 0; i + k < count; ++k) {
            a_tail[k] = a[i + k];
            b_tail[k] = b[i + k];
        }
        L::Store(out_tail, function(L::Load(a_tail), L::Load(b_tail)));
        for (int k = 0; i + k < count; ++k) {
            out[i + k] = out_tail[k];
        }
    }
}

template <class L>
struct Kernels {
    static void Sin(float const* x, float* out, int count) {
        ApplyUnary<L>(x, out, count, [](auto v) { return L::Sin(v); });
        L::Leave();
    }
    static void Cos(float const* x, float* out, int count) {
        ApplyUnary<L>(x, out, count, [](auto v) { return L::Cos(v); });
        L::Leave();
    }
    // Sine and cosine of the same angles in one call; `cosine` may be the input.
    static void SinCos(float const* x, float* sine, float* cosine, int count) {
        int i = 0;
        for (; i + L::WIDTH <= count; i += L::WIDTH) {
            auto const both = L::SinCos(L::Load(x + i));
            L::Store(sine + i, both.x);
            L::Store(cosine + i, both.y);
        }
        if (i < count) {
            float in_tail[L::WIDTH] = {};
            float sine_tail[L::WIDTH];
            float cosine_tail[L::WIDTH];
            for (int k = 0; i + k < count; ++k) {
                in_tail[k] = x[i + k];
            }
            auto const both = L::SinCos(L::Load(in_tail));
            L::Store(sine_tail, both.x);
            L::Store(cosine_tail, both.y);
            for (int k = 0; i + k < count; ++k) {
                sine[i + k] = sine_tail[k];
                cosine[i + k] = cosine_tail[k];
            }
        }
        L::Leave();
    }
    static void Tan(float const* x, float* out, int count) {
        ApplyUnary<L>(x, out, count, [](auto v) { return L::Tan(v); });
        L::Leave();
    }
    static void Atan(float const* x, float* out, int count) {
        ApplyUnary<L>(x, out, count, [](auto v) { return L::Atan(v); });
        L::Leave();
    }
    static void Atan2(float const* y, float const* x, float* out, int count) {
        ApplyBinary<L>(y, x, out, count, [](auto a, auto b) { return L::Atan2(a, b); });
        L::Leave();
    }
    // At or beyond the ends of the domain the end of the range; NaN fails both tests.
    static void Asin(float const* x, float* out, int count) {
        ApplyUnary<L>(x, out, count, [](auto v) {
            auto const inside =
                L::Select(L::GreaterEqual(v, L::Fill(1.0f)), L::Fill(HALF_PI), L::Asin(v));
            return L::Select(L::LessEqual(v, L::Fill(-1.0f)), L::Fill(-HALF_PI), inside);
        });
        L::Leave();
    }
    static void Acos(float const* x, float* out, int count) {
        ApplyUnary<L>(x, out, count, [](auto v) {
            auto const inside =
                L::Select(L::GreaterEqual(v, L::Fill(1.0f)), L::Fill(0.0f), L::Acos(v));
            return L::Select(L::LessEqual(v, L::Fill(-1.0f)), L::Fill(PI), inside);
        });
        L::Leave();
    }
    static void Sinh(float const* x, float* out, int count) {
        ApplyUnary<L>(x, out, count, [](auto v) { return L::Sinh(v); });
        L::Leave();
    }
    static void Log(float const* x, float* out, int count) {
        ApplyUnary<L>(x, out, count, [](auto v) { return L::Log(v); });
        L::Leave();
    }
    // An infinite side makes the length infinite even beside a NaN, as the C library has it.
    static void Hypot(float const* x, float const* y, float* out, int count) {
        ApplyBinary<L>(x, y, out, count, [](auto a, auto b) {
            auto const infinite = L::Or(L::IsInfinite(a), L::IsInfinite(b));
            return L::Select(infinite, L::Fill(__builtin_inff()), L::Hypot(a, b));
        });
        L::Leave();
    }
};

constexpr float MILLER_SCALE = 0.8f;
constexpr float MILLER_INVERSE_SCALE = 1.25f;

// Arrays that a kernel is given never overlap (VEXMAP_RESTRICT), and a quotient that a test may
// throw away is worked out all the same, as its NaN is harmless: both let the loops run in lanes.
#define VEXMAP_RESTRICT __restrict

// The links of a map chain over arrays, each the Call of its link with the same single-precision
// operations in the same order; comparisons with zero stand for FloatingPoint::is_zero, true for
// both zeros and nothing else. Compiled once for each lane width, with its trigonometry inline.
template <class L>
struct Chain {
    using K = Kernels<L>;

    static void Affine(float const* matrix, float* VEXMAP_RESTRICT x, float* VEXMAP_RESTRICT y,
                       int count) {
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
    static void SphericalTurn(float const* matrix, float f, float* VEXMAP_RESTRICT x,
                              float* VEXMAP_RESTRICT y, int count, float* VEXMAP_RESTRICT r,
                              float* VEXMAP_RESTRICT s, float* VEXMAP_RESTRICT c) {
        float const m11 = matrix[0], m12 = matrix[1], m13 = matrix[2];
        float const m21 = matrix[3], m22 = matrix[4], m23 = matrix[5];
        float const m31 = matrix[6], m32 = matrix[7], m33 = matrix[8];
        K::Hypot(x, y, r, count);
        for (int i = 0; i < count; ++i) {
            c[i] = r[i] / f;
        }
        K::SinCos(c, s, c, count);
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
        K::Hypot(x, y, r, count);
        K::Atan2(r, c, s, count);
        for (int i = 0; i < count; ++i) {
            float const ratio = s[i] * f / r[i];
            float const k = r[i] == 0.0f ? 0.0f : ratio;
            x[i] = x[i] * k;
            y[i] = y[i] * k;
        }
    }

    static void RectilinearToFisheye(float f, float* VEXMAP_RESTRICT x, float* VEXMAP_RESTRICT y,
                                     int count, float* VEXMAP_RESTRICT q,
                                     float* VEXMAP_RESTRICT t) {
        K::Hypot(x, y, q, count);
        for (int i = 0; i < count; ++i) {
            q[i] = q[i] / f;
        }
        K::Atan(q, t, count);
        for (int i = 0; i < count; ++i) {
            float const ratio = t[i] / q[i];
            float const k = q[i] == 0.0f ? 1.0f : ratio;
            x[i] = x[i] * k;
            y[i] = y[i] * k;
        }
    }

    // a is f sin l, later its distance from the axis' multiplier; c is f cos l, later the angle.
    static void CylindricalToFisheye(float f, float* VEXMAP_RESTRICT x, float* VEXMAP_RESTRICT y,
                                     int count, float* VEXMAP_RESTRICT a, float* VEXMAP_RESTRICT c,
                                     float* VEXMAP_RESTRICT h) {
        for (int i = 0; i < count; ++i) {
            h[i] = x[i] / f;
        }
        K::SinCos(h, a, c, count);
        for (int i = 0; i < count; ++i) {
            a[i] = f * a[i];
            c[i] = f * c[i];
        }
        K::Hypot(a, y, h, count);
        K::Atan2(h, c, c, count);
        for (int i = 0; i < count; ++i) {
            float const k = c[i] * f / h[i];
            x[i] = a[i] * k;
            y[i] = y[i] * k;
        }
    }

    // The wrap of the longitude and colatitude first: a point over a pole goes to the far side.
    static void EquirectangularToFisheye(float f, float* VEXMAP_RESTRICT x,
                                         float* VEXMAP_RESTRICT y, int count,
                                         float* VEXMAP_RESTRICT sin_l, float* VEXMAP_RESTRICT cos_l,
                                         float* VEXMAP_RESTRICT sin_a,
                                         float* VEXMAP_RESTRICT cos_a) {
        for (int i = 0; i < count; ++i) {
            float const longitude = x[i] / f;
            float const colatitude = HALF_PI - y[i] / f;
            bool const over_north = 0.0f > colatitude;
            float const reflected = over_north ? -colatitude : colatitude;
            float const turned = over_north ? longitude + PI : longitude;
            bool const over_south = reflected > PI;
            x[i] = over_south ? turned + PI : turned;
            y[i] = over_south ? PI - (reflected - PI) : reflected;
        }
        K::SinCos(y, sin_a, cos_a, count);
        K::SinCos(x, sin_l, cos_l, count);
        // sin_l becomes vx, cos_l vz, and cos_a is vy.
        for (int i = 0; i < count; ++i) {
            sin_l[i] = sin_l[i] * sin_a[i];
            cos_l[i] = sin_a[i] * cos_l[i];
        }
        K::Hypot(cos_a, sin_l, x, count);
        K::Atan2(x, cos_l, y, count);
        for (int i = 0; i < count; ++i) {
            float const s = y[i] * f;
            float const h = x[i];
            x[i] = sin_l[i] * s / h;
            y[i] = cos_a[i] * s / h;
        }
    }

    static void MercatorToEquirectangular(float f, float* VEXMAP_RESTRICT y, int count,
                                          float* VEXMAP_RESTRICT w) {
        for (int i = 0; i < count; ++i) {
            w[i] = y[i] / f;
        }
        K::Sinh(w, w, count);
        K::Atan(w, w, count);
        for (int i = 0; i < count; ++i) {
            y[i] = f * w[i];
        }
    }

    static void LambertToEquirectangular(float f, float* VEXMAP_RESTRICT y, int count,
                                         float* VEXMAP_RESTRICT w) {
        for (int i = 0; i < count; ++i) {
            w[i] = y[i] / f;
        }
        K::Sin(w, w, count);
        for (int i = 0; i < count; ++i) {
            y[i] = f * w[i];
        }
    }

    static void MillerToEquirectangular(float f, float* VEXMAP_RESTRICT y, int count,
                                        float* VEXMAP_RESTRICT w) {
        for (int i = 0; i < count; ++i) {
            w[i] = MILLER_SCALE * y[i] / f;
        }
        K::Sinh(w, w, count);
        K::Atan(w, w, count);
        for (int i = 0; i < count; ++i) {
            y[i] = MILLER_INVERSE_SCALE * f * w[i];
        }
    }

    // Miller strictly below the horizon, Lambert from it up and for NaN: both worked out, one kept.
    static void ArchitecturalToEquirectangular(float f, float* VEXMAP_RESTRICT y, int count,
                                               float* VEXMAP_RESTRICT below,
                                               float* VEXMAP_RESTRICT above,
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
    static void PanniniToEquirectangular(float f, bool twice, float* VEXMAP_RESTRICT x,
                                         float* VEXMAP_RESTRICT y, int count,
                                         float* VEXMAP_RESTRICT t, float* VEXMAP_RESTRICT c) {
        for (int i = 0; i < count; ++i) {
            c[i] = x[i] / f;
            t[i] = 2.0f;
        }
        K::Atan2(c, t, t, count);
        K::Cos(t, c, count);
        for (int i = 0; i < count; ++i) {
            x[i] = 2.0f * f * t[i];
            y[i] = y[i] / f * (c[i] * c[i]);
        }
        K::Atan(y, y, count);
        if (twice) {
            K::Atan(y, y, count);
        }
        for (int i = 0; i < count; ++i) {
            y[i] = f * y[i];
        }
    }

    // One signature for all, so that a build picks a kernel by its kind: the parameters are the
    // link's matrix by rows (p[0] to p[8]) and its focal length (p[9]); the work is four arrays of
    // count floats.
    static void AffineEntry(float const* p, float* x, float* y, int n, float*) {
        Affine(p, x, y, n);
        L::Leave();
    }
    static void SphericalTurnEntry(float const* p, float* x, float* y, int n, float* w) {
        SphericalTurn(p, p[9], x, y, n, w, w + n, w + 2 * n);
        L::Leave();
    }
    static void RectilinearToFisheyeEntry(float const* p, float* x, float* y, int n, float* w) {
        RectilinearToFisheye(p[9], x, y, n, w, w + n);
        L::Leave();
    }
    static void CylindricalToFisheyeEntry(float const* p, float* x, float* y, int n, float* w) {
        CylindricalToFisheye(p[9], x, y, n, w, w + n, w + 2 * n);
        L::Leave();
    }
    static void EquirectangularToFisheyeEntry(float const* p, float* x, float* y, int n, float* w) {
        EquirectangularToFisheye(p[9], x, y, n, w, w + n, w + 2 * n, w + 3 * n);
        L::Leave();
    }
    static void MercatorToEquirectangularEntry(float const* p, float*, float* y, int n, float* w) {
        MercatorToEquirectangular(p[9], y, n, w);
        L::Leave();
    }
    static void LambertToEquirectangularEntry(float const* p, float*, float* y, int n, float* w) {
        LambertToEquirectangular(p[9], y, n, w);
        L::Leave();
    }
    static void MillerToEquirectangularEntry(float const* p, float*, float* y, int n, float* w) {
        MillerToEquirectangular(p[9], y, n, w);
        L::Leave();
    }
    static void ArchitecturalToEquirectangularEntry(float const* p, float*, float* y, int n,
                                                    float* w) {
        ArchitecturalToEquirectangular(p[9], y, n, w, w + n, w + 2 * n);
        L::Leave();
    }
    static void PanniniToEquirectangularEntry(float const* p, float* x, float* y, int n, float* w) {
        PanniniToEquirectangular(p[9], true, x, y, n, w, w + n);
        L::Leave();
    }
    static void EquirectangularPanniniToEquirectangularEntry(float const* p, float* x, float* y,
                                                             int n, float* w) {
        PanniniToEquirectangular(p[9], false, x, y, n, w, w + n);
        L::Leave();
    }
};

#undef VEXMAP_RESTRICT

template <class L>
constexpr BatchLanes Table(char const* name, bool (*supported)()) {
    using K = Kernels<L>;
    using C = Chain<L>;
    return BatchLanes{
        name,
        supported,
        &K::Sin,
        &K::Cos,
        &K::Tan,
        &K::Atan,
        &K::Atan2,
        &K::Asin,
        &K::Acos,
        &K::Sinh,
        &K::Log,
        &K::Hypot,
        &L::StoreEighthSpans,
        {&C::AffineEntry, &C::SphericalTurnEntry, &C::RectilinearToFisheyeEntry,
         &C::CylindricalToFisheyeEntry, &C::EquirectangularToFisheyeEntry,
         &C::MercatorToEquirectangularEntry, &C::LambertToEquirectangularEntry,
         &C::MillerToEquirectangularEntry, &C::ArchitecturalToEquirectangularEntry,
         &C::PanniniToEquirectangularEntry, &C::EquirectangularPanniniToEquirectangularEntry},
        &L::RemapYuv420Blocks,
        &L::RemapNv12Blocks};
}

}  // namespace quorvel::vexmap::lane_kernels
