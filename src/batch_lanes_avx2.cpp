// AVX2 with FMA, 8 lanes. Compiled with -mavx2 -mfma: nothing here may run before Supported()
// has said yes, so everything but the table itself has internal linkage.
#include <immintrin.h>
#include <sleef.h>

#include "vexmap/batch_lane_kernels.h"

namespace quorvel::vexmap {
namespace {

struct Avx2Lane {
    using Pack = __m256;
    static constexpr int WIDTH = 8;
    // The library's code and ours use only the sixteen registers that vzeroupper clears.
    static void Leave() { _mm256_zeroupper(); }
    static uint32_t RemapYuv420Blocks(BatchLanes::Yuv420Row const&) { return 0; }
    static Pack Load(float const* p) { return _mm256_loadu_ps(p); }
    static void Store(float* p, Pack v) { _mm256_storeu_ps(p, v); }
    static Pack Fill(float v) { return _mm256_set1_ps(v); }
    static Pack LessEqual(Pack a, Pack b) { return _mm256_cmp_ps(a, b, _CMP_LE_OQ); }
    static Pack GreaterEqual(Pack a, Pack b) { return _mm256_cmp_ps(a, b, _CMP_GE_OQ); }
    static Pack Or(Pack a, Pack b) { return _mm256_or_ps(a, b); }
    static Pack Select(Pack mask, Pack yes, Pack no) { return _mm256_blendv_ps(no, yes, mask); }
    static Pack IsInfinite(Pack v) {
        Pack const magnitude = _mm256_andnot_ps(_mm256_set1_ps(-0.0f), v);
        return _mm256_cmp_ps(magnitude, _mm256_set1_ps(__builtin_inff()), _CMP_EQ_OQ);
    }
    // Squares of floats are exact in double; the sum and the root round once each.
    static __m128 Hypot4(__m128 a, __m128 b) {
        __m256d const x = _mm256_cvtps_pd(a);
        __m256d const y = _mm256_cvtps_pd(b);
        return _mm256_cvtpd_ps(
            _mm256_sqrt_pd(_mm256_add_pd(_mm256_mul_pd(x, x), _mm256_mul_pd(y, y))));
    }
    static Pack Hypot(Pack a, Pack b) {
        __m128 const low = Hypot4(_mm256_castps256_ps128(a), _mm256_castps256_ps128(b));
        __m128 const high = Hypot4(_mm256_extractf128_ps(a, 1), _mm256_extractf128_ps(b, 1));
        return _mm256_insertf128_ps(_mm256_castps128_ps256(low), high, 1);
    }
    static Pack Sin(Pack v) { return Sleef_sinf8_u10avx2(v); }
    static Pack Cos(Pack v) { return Sleef_cosf8_u10avx2(v); }
    static auto SinCos(Pack v) { return Sleef_sincosf8_u10avx2(v); }
    static Pack Tan(Pack v) { return Sleef_tanf8_u10avx2(v); }
    static Pack Atan(Pack v) { return Sleef_atanf8_u10avx2(v); }
    static Pack Atan2(Pack y, Pack x) { return Sleef_atan2f8_u10avx2(y, x); }
    static Pack Asin(Pack v) { return Sleef_asinf8_u10avx2(v); }
    static Pack Acos(Pack v) { return Sleef_acosf8_u10avx2(v); }
    static Pack Sinh(Pack v) { return Sleef_sinhf8_u10avx2(v); }
    static Pack Log(Pack v) { return Sleef_logf8_u10avx2(v); }

    // The point (x, y) in every pair of lanes.
    static Pack Pair(float const* x, float const* y) {
        __m128 const pair = _mm_unpacklo_ps(_mm_load_ss(x), _mm_load_ss(y));
        return _mm256_castpd_ps(_mm256_broadcastsd_pd(_mm_castps_pd(pair)));
    }
    static __m256i Words(Pack points, Pack rounder, __m256i largest) {
        __m256i const whole =
            _mm256_cvttps_epi32(_mm256_sub_ps(_mm256_add_ps(points, rounder), rounder));
        __m256i const clamped = _mm256_min_epi32(whole, largest);
        // The low 16 bits, sign-extended, so that the saturating pack keeps them as they are.
        return _mm256_srai_epi32(_mm256_slli_epi32(clamped, 16), 16);
    }
    // All seven halvings in every lane, then each pair of lanes takes its own: the first register
    // holds m1 to m4, the second m5 to q, the order of the table's words.
    static int StoreEighthSpans(unsigned short* cursor, float const* x, float const* y, int count,
                                float cx, float cy) {
        Pack const half = _mm256_set1_ps(0.5f);
        Pack const centre = _mm256_setr_ps(cx, cy, cx, cy, cx, cy, cx, cy);
        Pack const low = _mm256_set1_ps(-BatchLanes::NEAR_LIMIT);
        Pack const high = _mm256_set1_ps(BatchLanes::NEAR_LIMIT);
        Pack const rounder = _mm256_set1_ps(BatchLanes::ROUNDER);
        __m256i const largest = _mm256_set1_epi32(65535);
        int done = 0;
        for (int k = 1; k < count; ++k, ++done) {
            Pack const p = Pair(x + k - 1, y + k - 1);
            Pack const q = Pair(x + k, y + k);
            Pack const m4 = _mm256_mul_ps(_mm256_add_ps(p, q), half);
            Pack const m2 = _mm256_mul_ps(_mm256_add_ps(p, m4), half);
            Pack const m6 = _mm256_mul_ps(_mm256_add_ps(m4, q), half);
            Pack const m1 = _mm256_mul_ps(_mm256_add_ps(p, m2), half);
            Pack const m3 = _mm256_mul_ps(_mm256_add_ps(m2, m4), half);
            Pack const m5 = _mm256_mul_ps(_mm256_add_ps(m4, m6), half);
            Pack const m7 = _mm256_mul_ps(_mm256_add_ps(m6, q), half);
            Pack const first = _mm256_add_ps(
                _mm256_blend_ps(_mm256_blend_ps(_mm256_blend_ps(m1, m2, 0x0C), m3, 0x30), m4, 0xC0),
                centre);
            Pack const second = _mm256_add_ps(
                _mm256_blend_ps(_mm256_blend_ps(_mm256_blend_ps(m5, m6, 0x0C), m7, 0x30), q, 0xC0),
                centre);
            Pack const near = _mm256_and_ps(_mm256_and_ps(_mm256_cmp_ps(first, low, _CMP_GT_OQ),
                                                          _mm256_cmp_ps(first, high, _CMP_LT_OQ)),
                                            _mm256_and_ps(_mm256_cmp_ps(second, low, _CMP_GT_OQ),
                                                          _mm256_cmp_ps(second, high, _CMP_LT_OQ)));
            if (_mm256_movemask_ps(near) != 0xFF) {
                break;
            }
            // The pack interleaves the two registers by 128-bit halves; the permute restores the
            // order.
            __m256i const packed =
                _mm256_packs_epi32(Words(first, rounder, largest), Words(second, rounder, largest));
            _mm256_storeu_si256(reinterpret_cast<__m256i*>(cursor + 16 * done),
                                _mm256_permute4x64_epi64(packed, 0xD8));
        }
        Leave();
        return done;
    }
};

bool Avx2Supported() {
    return __builtin_cpu_supports("avx2") && __builtin_cpu_supports("fma");
}

constexpr BatchLanes AVX2_LANES = lane_kernels::Table<Avx2Lane>("avx2", &Avx2Supported);

}  // namespace

BatchLanes const& BatchLanes::Avx2() {
    return AVX2_LANES;
}

}  // namespace quorvel::vexmap
