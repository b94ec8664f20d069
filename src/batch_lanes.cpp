#include "vexmap/batch_lanes.h"

#include <emmintrin.h>
#include <sleef.h>

#include "vexmap/batch_lane_kernels.h"

namespace quorvel::vexmap {
namespace {

// SSE2, 4 lanes, which every x86-64 processor has; the library picks its best 4-lane code itself.
struct Sse2Lane {
    using Pack = __m128;
    static constexpr int WIDTH = 4;
    static void Leave() {}
    static uint32_t RemapYuv420Blocks(BatchLanes::Yuv420Row const&) { return 0; }
    static uint32_t RemapNv12Blocks(BatchLanes::Yuv420Row const&) { return 0; }
    static Pack Load(float const* p) { return _mm_loadu_ps(p); }
    static void Store(float* p, Pack v) { _mm_storeu_ps(p, v); }
    static Pack Fill(float v) { return _mm_set1_ps(v); }
    static Pack LessEqual(Pack a, Pack b) { return _mm_cmple_ps(a, b); }
    static Pack GreaterEqual(Pack a, Pack b) { return _mm_cmpge_ps(a, b); }
    static Pack Or(Pack a, Pack b) { return _mm_or_ps(a, b); }
    static Pack Select(Pack mask, Pack yes, Pack no) {
        return _mm_or_ps(_mm_and_ps(mask, yes), _mm_andnot_ps(mask, no));
    }
    static Pack IsInfinite(Pack v) {
        Pack const magnitude = _mm_andnot_ps(_mm_set1_ps(-0.0f), v);
        return _mm_cmpeq_ps(magnitude, _mm_set1_ps(__builtin_inff()));
    }
    // Squares of floats are exact in double; the sum and the root round once each.
    static Pack Hypot2(Pack a, Pack b) {
        __m128d const x = _mm_cvtps_pd(a);
        __m128d const y = _mm_cvtps_pd(b);
        return _mm_cvtpd_ps(_mm_sqrt_pd(_mm_add_pd(_mm_mul_pd(x, x), _mm_mul_pd(y, y))));
    }
    static Pack Hypot(Pack a, Pack b) {
        return _mm_movelh_ps(Hypot2(a, b), Hypot2(_mm_movehl_ps(a, a), _mm_movehl_ps(b, b)));
    }
    static Pack Sin(Pack v) { return Sleef_sinf4_u10(v); }
    static Pack Cos(Pack v) { return Sleef_cosf4_u10(v); }
    static auto SinCos(Pack v) { return Sleef_sincosf4_u10(v); }
    static Pack Tan(Pack v) { return Sleef_tanf4_u10(v); }
    static Pack Atan(Pack v) { return Sleef_atanf4_u10(v); }
    static Pack Atan2(Pack y, Pack x) { return Sleef_atan2f4_u10(y, x); }
    static Pack Asin(Pack v) { return Sleef_asinf4_u10(v); }
    static Pack Acos(Pack v) { return Sleef_acosf4_u10(v); }
    static Pack Sinh(Pack v) { return Sleef_sinhf4_u10(v); }
    static Pack Log(Pack v) { return Sleef_logf4_u10(v); }
    // The plain path's own four-lane store is as fast as this width gets.
    static int StoreEighthSpans(unsigned short*, float const*, float const*, int, float, float) {
        return 0;
    }
};

bool Always() {
    return true;
}

constexpr BatchLanes SSE2_LANES = lane_kernels::Table<Sse2Lane>("sse2", &Always);

BatchLanes const& Choose() {
    __builtin_cpu_init();
    if (BatchLanes::Avx512().Supported()) {
        return BatchLanes::Avx512();
    }
    if (BatchLanes::Avx2().Supported()) {
        return BatchLanes::Avx2();
    }
    return SSE2_LANES;
}

}  // namespace

BatchLanes const& BatchLanes::Sse2() {
    return SSE2_LANES;
}

// Chosen at the first call, once: the processor does not change under a running process.
BatchLanes const& BatchLanes::Widest() {
    static BatchLanes const& widest = Choose();
    return widest;
}

}  // namespace quorvel::vexmap
