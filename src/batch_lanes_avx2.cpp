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
    // a < b for unsigned 32-bit lanes, through the signed compare with the sign bits flipped.
    static __m256i Below(__m256i a, __m256i b) {
        __m256i const sign = _mm256_set1_epi32(int(0x80000000u));
        return _mm256_cmpgt_epi32(_mm256_xor_si256(b, sign), _mm256_xor_si256(a, sign));
    }
    // The low byte of each of eight dwords, in order, as eight bytes.
    static __m128i LowBytes(__m256i dwords) {
        __m256i const bytes = _mm256_shuffle_epi8(
            dwords, _mm256_setr_epi8(0, 4, 8, 12, -1, -1, -1, -1, -1, -1, -1, -1, -1, -1, -1, -1, 0,
                                     4, 8, 12, -1, -1, -1, -1, -1, -1, -1, -1, -1, -1, -1, -1));
        return _mm256_castsi256_si128(
            _mm256_permutevar8x32_epi32(bytes, _mm256_setr_epi32(0, 4, 1, 1, 1, 1, 1, 1)));
    }
    // The bytes at eight indices, read one by one (on some processors, Zen 4, a gather costs more
    // than its loads apart), and `fill` where a lane is not inside; those lanes read byte 0.
    static __m128i BytesAt(unsigned char const* base, __m256i index, __m256i inside, char fill) {
        alignas(32) uint32_t at[8];
        _mm256_store_si256(reinterpret_cast<__m256i*>(at), _mm256_and_si256(index, inside));
        __m128i bytes = _mm_cvtsi32_si128(base[at[0]]);
        bytes = _mm_insert_epi8(bytes, base[at[1]], 1);
        bytes = _mm_insert_epi8(bytes, base[at[2]], 2);
        bytes = _mm_insert_epi8(bytes, base[at[3]], 3);
        bytes = _mm_insert_epi8(bytes, base[at[4]], 4);
        bytes = _mm_insert_epi8(bytes, base[at[5]], 5);
        bytes = _mm_insert_epi8(bytes, base[at[6]], 6);
        bytes = _mm_insert_epi8(bytes, base[at[7]], 7);
        return _mm_blendv_epi8(_mm_set1_epi8(fill), bytes, LowBytes(inside));
    }
    // Eight luma samples of one table row, 16 where the plain test fails.
    static __m128i LumaEight(__m256i entries, BatchLanes::Yuv420Row const& row) {
        __m256i const x = _mm256_and_si256(entries, _mm256_set1_epi32(0xFFFF));
        __m256i const y = _mm256_srli_epi32(entries, 16);
        __m256i const index =
            _mm256_add_epi32(_mm256_mullo_epi32(y, _mm256_set1_epi32(int(row.stride))), x);
        __m256i const inside = _mm256_and_si256(Below(index, _mm256_set1_epi32(int(row.plane))),
                                                Below(x, _mm256_set1_epi32(int(row.width))));
        return BytesAt(row.luma, index, inside, 16);
    }
    // Eight chroma samples from one plane, 128 where the plain test fails.
    static __m128i ChromaEight(__m256i index, __m256i inside, unsigned char const* plane) {
        return BytesAt(plane, index, inside, char(128));
    }
    // NV12 goes through the plain loop here: its chroma pairs gain nothing from loads apart.
    static uint32_t RemapNv12Blocks(BatchLanes::Yuv420Row const&) { return 0; }
    static uint32_t RemapYuv420Blocks(BatchLanes::Yuv420Row const& frame_row) {
        // A copy of its own: the output stores cannot alias it, so its fields stay in registers.
        BatchLanes::Yuv420Row const row = frame_row;
        if (row.plane < 64 || row.plane >= 0x80000000u) {
            return 0;
        }
        uint32_t const chroma_limit = row.plane >> 2;
        uint32_t done = 0;
        for (; done + 8 <= row.blocks; done += 8) {
            __m256i const top_left =
                _mm256_loadu_si256(reinterpret_cast<__m256i const*>(row.top + 4 * done));
            __m256i const top_right =
                _mm256_loadu_si256(reinterpret_cast<__m256i const*>(row.top + 4 * done + 16));
            __m256i const bottom_left =
                _mm256_loadu_si256(reinterpret_cast<__m256i const*>(row.bottom + 4 * done));
            __m256i const bottom_right =
                _mm256_loadu_si256(reinterpret_cast<__m256i const*>(row.bottom + 4 * done + 16));
            _mm_storel_epi64(reinterpret_cast<__m128i*>(row.top_out + 2 * done),
                             LumaEight(top_left, row));
            _mm_storel_epi64(reinterpret_cast<__m128i*>(row.top_out + 2 * done + 8),
                             LumaEight(top_right, row));
            _mm_storel_epi64(reinterpret_cast<__m128i*>(row.bottom_out + 2 * done),
                             LumaEight(bottom_left, row));
            _mm_storel_epi64(reinterpret_cast<__m128i*>(row.bottom_out + 2 * done + 8),
                             LumaEight(bottom_right, row));
            // The table entry of each block's top left pixel: the even entries of the top row.
            __m256i const corners = _mm256_permute4x64_epi64(
                _mm256_castps_si256(_mm256_shuffle_ps(_mm256_castsi256_ps(top_left),
                                                      _mm256_castsi256_ps(top_right), 0x88)),
                0xD8);
            __m256i const x = _mm256_and_si256(corners, _mm256_set1_epi32(0xFFFF));
            __m256i const y = _mm256_srli_epi32(corners, 16);
            __m256i const index =
                _mm256_add_epi32(_mm256_srli_epi32(x, 1),
                                 _mm256_mullo_epi32(_mm256_srli_epi32(y, 1),
                                                    _mm256_set1_epi32(int(row.chroma_stride))));
            __m256i const inside =
                _mm256_and_si256(Below(index, _mm256_set1_epi32(int(chroma_limit))),
                                 Below(x, _mm256_set1_epi32(int(row.width))));
            _mm_storel_epi64(reinterpret_cast<__m128i*>(row.u_out + done),
                             ChromaEight(index, inside, row.u_plane));
            _mm_storel_epi64(reinterpret_cast<__m128i*>(row.v_out + done),
                             ChromaEight(index, inside, row.v_plane));
        }
        Leave();
        return done;
    }
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
