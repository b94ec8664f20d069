#pragma once

#include <cstdint>

namespace quorvel::vexmap {

/// One width of vector lanes: the engine's kernels over arrays (the trigonometry of
/// `BatchTrigonometry`, the links of `BatchChain`, the span store of the map builders, the 4:2:0
/// remap), the same operations for SSE2 (4 lanes, every x86-64 processor), AVX2 with FMA (8) or
/// AVX-512 (16). The wider tables are compiled for their instructions alone and may be called
/// only where the processor has them (`Supported`). Plain data; any thread.
struct BatchLanes {
    /// One block row of SimpleImageMap::RemapYuv420Planar: the table rows of its two output rows,
    /// the source planes and the Frame numbers of its test (all 32-bit, as the plain path has
    /// them), and where the block row's luma rows and chroma samples go.
    struct Yuv420Row {
        unsigned short const* top;
        unsigned short const* bottom;
        uint32_t blocks;
        unsigned char const* luma;
        unsigned char const* u_plane;
        unsigned char const* v_plane;
        uint32_t width;
        uint32_t stride;
        uint32_t plane;  // luma bytes, height * stride; each chroma plane is a quarter
        uint32_t chroma_stride;
        unsigned char* top_out;
        unsigned char* bottom_out;
        unsigned char* u_out;
        unsigned char* v_out;
    };

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
    /// Blocks of a Yuv420Row from the first on, as many as the lanes take at once, written as the
    /// plain path writes them; returns how many, and the plain loop finishes the row. It reads
    /// only bytes of the planes that it samples, and takes a row only when the luma plane holds at
    /// least 64 bytes and less than 2^31. The SSE2 table does none.
    uint32_t (*remap_yuv420_blocks)(Yuv420Row const& row);
    /// The same for SimpleImageMap::RemapNv420Planar, through the same record: `u_plane` is the
    /// plane of U V pairs, `chroma_stride` its row's bytes (the luma stride), `u_out` the block
    /// row's pairs; `v_plane` and `v_out` are not read. Only the AVX-512 table does any.
    uint32_t (*remap_nv12_blocks)(Yuv420Row const& row);

    static BatchLanes const& Sse2();
    static BatchLanes const& Avx2();
    static BatchLanes const& Avx512();
    /// The widest table that this processor runs.
    static BatchLanes const& Widest();
};

}  // namespace quorvel::vexmap
