#pragma once

namespace quorvel::vexmap {

/// One width of vector lanes for `BatchTrigonometry`: the same operations, each over an array of
/// floats, for SSE2 (4 lanes, every x86-64 processor), AVX2 with FMA (8) or AVX-512F (16). The
/// wider tables are compiled for their instructions alone and may be called only where the
/// processor has them (`Supported`). Plain data; any thread.
struct BatchLanes {
    /// Below NEAR_LIMIT in magnitude, adding and taking away ROUNDER rounds a float to the nearest
    /// integer, ties to even, as nearbyint does in the default rounding mode, with no call.
    static constexpr float NEAR_LIMIT = 4194304.0f;
    static constexpr float ROUNDER = 12582912.0f;

    using Unary = void (*)(float const* x, float* out, int count);
    /// A link of a map chain over arrays of points, in place: `parameters` holds the link's
    /// matrix by rows and its focal length at index 9, `work` four arrays of `count` floats.
    using ChainKernel = void (*)(float const* parameters, float* x, float* y, int count,
                                 float* work);
    enum ChainKind {
        AFFINE,
        SPHERICAL_TURN,
        RECTILINEAR_TO_FISHEYE,
        CYLINDRICAL_TO_FISHEYE,
        EQUIRECTANGULAR_TO_FISHEYE,
        MERCATOR_TO_EQUIRECTANGULAR,
        LAMBERT_TO_EQUIRECTANGULAR,
        MILLER_TO_EQUIRECTANGULAR,
        ARCHITECTURAL_TO_EQUIRECTANGULAR,
        PANNINI_TO_EQUIRECTANGULAR,
        EQUIRECTANGULAR_PANNINI_TO_EQUIRECTANGULAR,
        CHAIN_KIND_COUNT
    };
    using Binary = void (*)(float const* a, float const* b, float* out, int count);

    char const* name;
    bool (*Supported)();
    Unary sin;
    Unary cos;
    Unary tan;
    Unary atan;
    Binary atan2;  // (y, x)
    Unary asin;    // guarded
    Unary acos;    // guarded
    Unary sinh;
    Unary log;
    Binary hypot;  // in double, as Trigonometry::hypot
    /// Stores the map entries of the spans of 8 between points k - 1 and k of a row, from k = 1
    /// on, exactly as View::StoreSpan does (halved, plus the centre, rounded, clamped, the low 16
    /// bits), and stops before the first span with a coordinate that is far or not a number.
    /// Returns how many spans it stored; the plain path stores the one it stopped at. The SSE2
    /// table stores none.
    int (*store_eighth_spans)(unsigned short* cursor, float const* x, float const* y, int count,
                              float cx, float cy);
    ChainKernel chain[CHAIN_KIND_COUNT];

    static BatchLanes const& Sse2();
    static BatchLanes const& Avx2();
    static BatchLanes const& Avx512();
    /// The widest table that this processor runs.
    static BatchLanes const& Widest();
};

}  // namespace quorvel::vexmap
