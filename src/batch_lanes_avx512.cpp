// AVX-512, 16 lanes. Compiled with -mavx512f -mavx512bw -mavx512vl -mavx512vbmi: nothing here may
// run before Supported() has said yes to all four, so everything but the table itself has internal
// linkage. A processor with the foundation alone (the first generations) takes the AVX2 table.
#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <immintrin.h>
#include <sleef.h>

#include "vexmap/batch_lane_kernels.h"

namespace quorvel::vexmap {
namespace {

struct Avx512Lane {
    using Pack = __m512;
    static constexpr int WIDTH = 16;
    // vzeroupper leaves registers 16 to 31 as they are; zeroing them by an instruction of their
    // own width marks them clean.
    static void Leave() {
        asm volatile(
            "vpxord %%zmm16, %%zmm16, %%zmm16\n\tvpxord %%zmm17, %%zmm17, %%zmm17\n\t"
            "vpxord %%zmm18, %%zmm18, %%zmm18\n\tvpxord %%zmm19, %%zmm19, %%zmm19\n\t"
            "vpxord %%zmm20, %%zmm20, %%zmm20\n\tvpxord %%zmm21, %%zmm21, %%zmm21\n\t"
            "vpxord %%zmm22, %%zmm22, %%zmm22\n\tvpxord %%zmm23, %%zmm23, %%zmm23\n\t"
            "vpxord %%zmm24, %%zmm24, %%zmm24\n\tvpxord %%zmm25, %%zmm25, %%zmm25\n\t"
            "vpxord %%zmm26, %%zmm26, %%zmm26\n\tvpxord %%zmm27, %%zmm27, %%zmm27\n\t"
            "vpxord %%zmm28, %%zmm28, %%zmm28\n\tvpxord %%zmm29, %%zmm29, %%zmm29\n\t"
            "vpxord %%zmm30, %%zmm30, %%zmm30\n\tvpxord %%zmm31, %%zmm31, %%zmm31\n\t"
            "vzeroupper" ::
                : "xmm16", "xmm17", "xmm18", "xmm19", "xmm20", "xmm21", "xmm22", "xmm23", "xmm24",
                  "xmm25", "xmm26", "xmm27", "xmm28", "xmm29", "xmm30", "xmm31");
    }
    // The bytes at sixteen indices, read one by one (on some processors, Zen 4, a gather costs
    // more than its loads apart), and `fill` where a lane is not inside; those lanes read byte 0.
    static __m128i BytesAt(unsigned char const* base, __m512i index, __mmask16 inside, char fill) {
        alignas(64) uint32_t at[16];
        _mm512_store_si512(at, _mm512_maskz_mov_epi32(inside, index));
        __m128i bytes = _mm_cvtsi32_si128(base[at[0]]);
        bytes = _mm_insert_epi8(bytes, base[at[1]], 1);
        bytes = _mm_insert_epi8(bytes, base[at[2]], 2);
        bytes = _mm_insert_epi8(bytes, base[at[3]], 3);
        bytes = _mm_insert_epi8(bytes, base[at[4]], 4);
        bytes = _mm_insert_epi8(bytes, base[at[5]], 5);
        bytes = _mm_insert_epi8(bytes, base[at[6]], 6);
        bytes = _mm_insert_epi8(bytes, base[at[7]], 7);
        bytes = _mm_insert_epi8(bytes, base[at[8]], 8);
        bytes = _mm_insert_epi8(bytes, base[at[9]], 9);
        bytes = _mm_insert_epi8(bytes, base[at[10]], 10);
        bytes = _mm_insert_epi8(bytes, base[at[11]], 11);
        bytes = _mm_insert_epi8(bytes, base[at[12]], 12);
        bytes = _mm_insert_epi8(bytes, base[at[13]], 13);
        bytes = _mm_insert_epi8(bytes, base[at[14]], 14);
        bytes = _mm_insert_epi8(bytes, base[at[15]], 15);
        __m128i const chosen = _mm512_cvtepi32_epi8(_mm512_maskz_set1_epi32(inside, -1));
        return _mm_blendv_epi8(_mm_set1_epi8(fill), bytes, chosen);
    }
    // Where sixteen samples of a plane lie, and how to read them. Along a row of a view's table
    // neighbouring entries lie close together in the source: most groups of sixteen fall within
    // a window of 4 rows of 32 bytes, which four loads and one byte permutation read at once.
    struct Pick {
        bool windowed;
        size_t start;      // the window's first byte, (y0 * stride + x0)
        __m128i place;     // each lane's byte in the window, (y - y0) * 32 + (x - x0)
        __m512i index;     // the plain index, y * stride + x, for a group that no window holds
        __mmask16 inside;  // the lanes that the plain test lets through
    };
    static constexpr uint32_t WINDOW_WIDTH = 32;
    static constexpr uint32_t WINDOW_ROWS = 4;
    // The window starts at the lower of the first and the last lane's row, and `slack` columns
    // left of the lower of their columns, so that a group that runs either way, or bulges a
    // little, fits. It must lie wholly within the plane's bytes (in 64 bits: a window never wraps
    // as a 32-bit index may), and every lane that the plain test lets through must lie in it with
    // the `reach` bytes it reads.
    static Pick Plan(__m512i x, __m512i y, __m512i index, __mmask16 inside, uint32_t stride,
                     uint32_t plane_bytes, uint32_t reach = 1, uint32_t slack = 8) {
        Pick pick{false, 0, _mm_setzero_si128(), index, inside};
        // The lower of the first and the last lane, in every lane.
        auto const lower_end = [](__m512i v) {
            return _mm512_min_epu32(_mm512_broadcastd_epi32(_mm512_castsi512_si128(v)),
                                    _mm512_permutexvar_epi32(_mm512_set1_epi32(15), v));
        };
        __m512i const margin = _mm512_set1_epi32(int(slack));
        __m512i const left = _mm512_sub_epi32(_mm512_max_epu32(lower_end(x), margin), margin);
        __m512i const top = lower_end(y);
        uint32_t const x0 = uint32_t(_mm_cvtsi128_si32(_mm512_castsi512_si128(left)));
        uint32_t const y0 = uint32_t(_mm_cvtsi128_si32(_mm512_castsi512_si128(top)));
        uint64_t const start = uint64_t(y0) * stride + x0;
        if (start + uint64_t(WINDOW_ROWS - 1) * stride + WINDOW_WIDTH > plane_bytes) {
            return pick;
        }
        __m512i const dx = _mm512_sub_epi32(x, left);
        __m512i const dy = _mm512_sub_epi32(y, top);
        __mmask16 const held = _kand_mask16(
            _mm512_cmplt_epu32_mask(dx, _mm512_set1_epi32(int(WINDOW_WIDTH + 1 - reach))),
            _mm512_cmplt_epu32_mask(dy, _mm512_set1_epi32(int(WINDOW_ROWS))));
        if (_kandn_mask16(held, inside) != 0) {
            return pick;
        }
        pick.windowed = true;
        pick.start = size_t(start);
        pick.place = _mm512_cvtepi32_epi8(_mm512_add_epi32(_mm512_slli_epi32(dy, 5), dx));
        return pick;
    }
    // The bytes that the pick names in a plane, `fill` where a lane is not inside.
    static __m128i Read(unsigned char const* plane, uint32_t stride, Pick const& pick, char fill) {
        if (!pick.windowed) {
            return BytesAt(plane, pick.index, pick.inside, fill);
        }
        unsigned char const* row = plane + pick.start;
        auto const load = [&](uint32_t k) {
            return _mm256_loadu_si256(reinterpret_cast<__m256i const*>(row + size_t(k) * stride));
        };
        __m512i const upper = _mm512_inserti64x4(_mm512_castsi256_si512(load(0)), load(1), 1);
        __m512i const lower = _mm512_inserti64x4(_mm512_castsi256_si512(load(2)), load(3), 1);
        __m512i const samples =
            _mm512_permutex2var_epi8(upper, _mm512_castsi128_si512(pick.place), lower);
        return _mm_mask_blend_epi8(pick.inside, _mm_set1_epi8(fill),
                                   _mm512_castsi512_si128(samples));
    }
    /// Sixteen samples of a plane: the lanes' coordinates, their plain index and the plain test.
    struct Lookups {
        __m512i x;
        __m512i y;
        __m512i index;
        __mmask16 inside;
    };
    static Lookups LumaLookups(__m512i entries, BatchLanes::Yuv420Row const& row) {
        __m512i const x = _mm512_and_si512(entries, _mm512_set1_epi32(0xFFFF));
        __m512i const y = _mm512_srli_epi32(entries, 16);
        __m512i const index =
            _mm512_add_epi32(_mm512_mullo_epi32(y, _mm512_set1_epi32(int(row.stride))), x);
        __mmask16 const inside =
            _kand_mask16(_mm512_cmplt_epu32_mask(index, _mm512_set1_epi32(int(row.plane))),
                         _mm512_cmplt_epu32_mask(x, _mm512_set1_epi32(int(row.width))));
        return {x, y, index, inside};
    }
    // The chroma of sixteen blocks, from the table entry of each block's top left pixel: the even
    // entries of the two halves of the block row's top row.
    static Lookups ChromaLookups(__m512i top_left, __m512i top_right,
                                 BatchLanes::Yuv420Row const& row) {
        __m512i const even =
            _mm512_setr_epi32(0, 2, 4, 6, 8, 10, 12, 14, 16, 18, 20, 22, 24, 26, 28, 30);
        __m512i const corners = _mm512_permutex2var_epi32(top_left, even, top_right);
        __m512i const x = _mm512_and_si512(corners, _mm512_set1_epi32(0xFFFF));
        __m512i const chroma_x = _mm512_srli_epi32(x, 1);
        __m512i const chroma_y = _mm512_srli_epi32(corners, 17);
        __m512i const index = _mm512_add_epi32(
            chroma_x, _mm512_mullo_epi32(chroma_y, _mm512_set1_epi32(int(row.chroma_stride))));
        __mmask16 const inside =
            _kand_mask16(_mm512_cmplt_epu32_mask(index, _mm512_set1_epi32(int(row.plane >> 2))),
                         _mm512_cmplt_epu32_mask(x, _mm512_set1_epi32(int(row.width))));
        return {chroma_x, chroma_y, index, inside};
    }
    static constexpr uint32_t SCATTERED_RUNS_TO_LEAVE = 2;
    // Sixteen luma samples of one table row, 16 where the plain test fails, stored at `target`;
    // whether a window held them.
    static bool LumaSixteen(__m512i entries, BatchLanes::Yuv420Row const& row,
                            unsigned char* target) {
        Pick const pick = Plan(LumaLookups(entries, row), row.stride, row.plane);
        _mm_storeu_si128(reinterpret_cast<__m128i*>(target), Read(row.luma, row.stride, pick, 16));
        return pick.windowed;
    }
    static Pick Plan(Lookups const& lookups, uint32_t stride, uint32_t plane_bytes) {
        return Plan(lookups.x, lookups.y, lookups.index, lookups.inside, stride, plane_bytes);
    }
    // The U and V of sixteen blocks in their planes.
    static void Yuv420ChromaSixteen(__m512i top_left, __m512i top_right,
                                    BatchLanes::Yuv420Row const& row, uint32_t first) {
        // One pick for both planes: they share sizes and indices.
        Pick const chroma =
            Plan(ChromaLookups(top_left, top_right, row), row.chroma_stride, row.plane >> 2);
        _mm_storeu_si128(reinterpret_cast<__m128i*>(row.u_out + first),
                         Read(row.u_plane, row.chroma_stride, chroma, char(128)));
        _mm_storeu_si128(reinterpret_cast<__m128i*>(row.v_out + first),
                         Read(row.v_plane, row.chroma_stride, chroma, char(128)));
    }
    // The U V pairs of sixteen blocks, from each block's top left entry: at the index
    // ((y >> 1) * stride + x) with bit 0 cleared, 128 128 where the plain test fails (it asks the
    // pair's V to lie inside too). A pair's column in its row is that index less the row's start,
    // x or x - 1; a window must hold both bytes.
    static void Nv12ChromaSixteen(__m512i top_left, __m512i top_right,
                                  BatchLanes::Yuv420Row const& row, uint32_t first) {
        __m512i const even =
            _mm512_setr_epi32(0, 2, 4, 6, 8, 10, 12, 14, 16, 18, 20, 22, 24, 26, 28, 30);
        __m512i const corners = _mm512_permutex2var_epi32(top_left, even, top_right);
        __m512i const x = _mm512_and_si512(corners, _mm512_set1_epi32(0xFFFF));
        __m512i const chroma_y = _mm512_srli_epi32(corners, 17);
        __m512i const row_start = _mm512_mullo_epi32(chroma_y, _mm512_set1_epi32(int(row.stride)));
        __m512i const index =
            _mm512_and_si512(_mm512_add_epi32(row_start, x), _mm512_set1_epi32(~1));
        uint32_t const limit = row.plane >> 1;
        __mmask16 const inside =
            _kand_mask16(_mm512_cmplt_epu32_mask(_mm512_add_epi32(index, _mm512_set1_epi32(1)),
                                                 _mm512_set1_epi32(int(limit))),
                         _mm512_cmplt_epu32_mask(x, _mm512_set1_epi32(int(row.width))));
        Pick const pick =
            Plan(_mm512_sub_epi32(index, row_start), chroma_y, index, inside, row.stride, limit, 2);
        unsigned char* const target = row.u_out + 2 * first;
        if (!pick.windowed) {
            alignas(64) uint32_t at[16];
            _mm512_store_si512(at, _mm512_maskz_mov_epi32(inside, index));
            static constexpr unsigned char BLACK_PAIR[2] = {128, 128};
            for (uint32_t block = 0; block < 16; ++block) {
                bool const lookup = ((inside >> block) & 1u) != 0;
                std::memcpy(target + 2 * block, lookup ? row.u_plane + at[block] : BLACK_PAIR, 2);
            }
            return;
        }
        unsigned char const* window = row.u_plane + pick.start;
        auto const load = [&](uint32_t k) {
            return _mm256_loadu_si256(
                reinterpret_cast<__m256i const*>(window + size_t(k) * row.stride));
        };
        __m512i const upper = _mm512_inserti64x4(_mm512_castsi256_si512(load(0)), load(1), 1);
        __m512i const lower = _mm512_inserti64x4(_mm512_castsi256_si512(load(2)), load(3), 1);
        // Each lane's place and the byte after it, as the two bytes of one 16-bit lane.
        __m256i const places = _mm256_cvtepu8_epi16(pick.place);
        __m256i const pairs = _mm256_or_si256(
            places, _mm256_slli_epi16(_mm256_add_epi16(places, _mm256_set1_epi16(1)), 8));
        __m512i const samples =
            _mm512_permutex2var_epi8(upper, _mm512_castsi256_si512(pairs), lower);
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(target),
                            _mm256_mask_blend_epi16(inside, _mm256_set1_epi16(int16_t(0x8080)),
                                                    _mm512_castsi512_si256(samples)));
    }
    // Sixteen blocks at a time: the luma of their two rows, then their chroma through `chroma`.
    template <typename ChromaSixteen>
    static uint32_t RemapBlocks(BatchLanes::Yuv420Row const& frame_row, ChromaSixteen chroma) {
        // A copy of its own: the output stores cannot alias it, so its fields stay in registers.
        BatchLanes::Yuv420Row const row = frame_row;
        if (row.plane < 64 || row.plane >= 0x80000000u) {
            return 0;
        }
        uint32_t done = 0;
        uint32_t scattered_runs = 0;
        for (; done + 16 <= row.blocks; done += 16) {
            __m512i const top_left = _mm512_loadu_si512(row.top + 4 * done);
            __m512i const top_right = _mm512_loadu_si512(row.top + 4 * done + 32);
            // How many luma groups of the sixteen blocks a window held: all four, or the row is
            // scattered. A chroma group that no window holds is read sample by sample.
            int const held = int(LumaSixteen(top_left, row, row.top_out + 2 * done)) +
                             int(LumaSixteen(top_right, row, row.top_out + 2 * done + 16)) +
                             int(LumaSixteen(_mm512_loadu_si512(row.bottom + 4 * done), row,
                                             row.bottom_out + 2 * done)) +
                             int(LumaSixteen(_mm512_loadu_si512(row.bottom + 4 * done + 32), row,
                                             row.bottom_out + 2 * done + 16));
            chroma(top_left, top_right, row, done);
            // Rows of a panorama or a wide view lie scattered over the source, and no window
            // holds their groups: the plain loop does those rows at least as fast, so a row whose
            // groups keep missing is left to it.
            scattered_runs = held < 4 ? scattered_runs + 1 : 0;
            if (scattered_runs == SCATTERED_RUNS_TO_LEAVE) {
                done += 16;
                break;
            }
        }
        Leave();
        return done;
    }
    static uint32_t RemapYuv420Blocks(BatchLanes::Yuv420Row const& row) {
        return RemapBlocks(row, &Yuv420ChromaSixteen);
    }
    static uint32_t RemapNv12Blocks(BatchLanes::Yuv420Row const& row) {
        return RemapBlocks(row, &Nv12ChromaSixteen);
    }
    static Pack Load(float const* p) { return _mm512_loadu_ps(p); }
    static void Store(float* p, Pack v) { _mm512_storeu_ps(p, v); }
    static Pack Fill(float v) { return _mm512_set1_ps(v); }
    // Masks are kept as all-ones lanes so that the shared kernels can combine them as packs.
    static Pack FromMask(__mmask16 mask) {
        return _mm512_castsi512_ps(_mm512_maskz_set1_epi32(mask, -1));
    }
    static __mmask16 ToMask(Pack v) {
        return _mm512_test_epi32_mask(_mm512_castps_si512(v), _mm512_castps_si512(v));
    }
    static Pack LessEqual(Pack a, Pack b) { return FromMask(_mm512_cmp_ps_mask(a, b, _CMP_LE_OQ)); }
    static Pack GreaterEqual(Pack a, Pack b) {
        return FromMask(_mm512_cmp_ps_mask(a, b, _CMP_GE_OQ));
    }
    static Pack Or(Pack a, Pack b) {
        return _mm512_castsi512_ps(_mm512_or_si512(_mm512_castps_si512(a), _mm512_castps_si512(b)));
    }
    static Pack Select(Pack mask, Pack yes, Pack no) {
        return _mm512_mask_blend_ps(ToMask(mask), no, yes);
    }
    static Pack IsInfinite(Pack v) {
        Pack const magnitude = _mm512_abs_ps(v);
        return FromMask(
            _mm512_cmp_ps_mask(magnitude, _mm512_set1_ps(__builtin_inff()), _CMP_EQ_OQ));
    }
    // Squares of floats are exact in double; the sum and the root round once each.
    static __m256 Hypot8(__m256 a, __m256 b) {
        __m512d const x = _mm512_cvtps_pd(a);
        __m512d const y = _mm512_cvtps_pd(b);
        return _mm512_cvtpd_ps(
            _mm512_sqrt_pd(_mm512_add_pd(_mm512_mul_pd(x, x), _mm512_mul_pd(y, y))));
    }
    static __m256 High(Pack v) {
        return _mm256_castpd_ps(_mm512_extractf64x4_pd(_mm512_castps_pd(v), 1));
    }
    static Pack Hypot(Pack a, Pack b) {
        __m256 const low = Hypot8(_mm512_castps512_ps256(a), _mm512_castps512_ps256(b));
        __m256 const high = Hypot8(High(a), High(b));
        return _mm512_castpd_ps(_mm512_insertf64x4(_mm512_castps_pd(_mm512_castps256_ps512(low)),
                                                   _mm256_castps_pd(high), 1));
    }
    static Pack Sin(Pack v) { return Sleef_sinf16_u10avx512f(v); }
    static Pack Cos(Pack v) { return Sleef_cosf16_u10avx512f(v); }
    static auto SinCos(Pack v) { return Sleef_sincosf16_u10avx512f(v); }
    static Pack Tan(Pack v) { return Sleef_tanf16_u10avx512f(v); }
    static Pack Atan(Pack v) { return Sleef_atanf16_u10avx512f(v); }
    static Pack Atan2(Pack y, Pack x) { return Sleef_atan2f16_u10avx512f(y, x); }
    static Pack Asin(Pack v) { return Sleef_asinf16_u10avx512f(v); }
    static Pack Acos(Pack v) { return Sleef_acosf16_u10avx512f(v); }
    static Pack Sinh(Pack v) { return Sleef_sinhf16_u10avx512f(v); }
    static Pack Log(Pack v) { return Sleef_logf16_u10avx512f(v); }

    // The point (x, y) in every pair of lanes.
    static Pack Pair(float const* x, float const* y) {
        __m128 const pair = _mm_unpacklo_ps(_mm_load_ss(x), _mm_load_ss(y));
        return _mm512_castpd_ps(_mm512_broadcastsd_pd(_mm_castps_pd(pair)));
    }
    // One span: all seven halvings in every lane, then each pair of lanes takes its own: lanes 0
    // and 1 are m1, 2 and 3 m2, and so on to q in 14 and 15, the order of the table's words.
    static bool StoreOneSpan(unsigned short* cursor, float const* x, float const* y, Pack centre) {
        Pack const half = _mm512_set1_ps(0.5f);
        Pack const p = Pair(x, y);
        Pack const q = Pair(x + 1, y + 1);
        Pack const m4 = _mm512_mul_ps(_mm512_add_ps(p, q), half);
        Pack const m2 = _mm512_mul_ps(_mm512_add_ps(p, m4), half);
        Pack const m6 = _mm512_mul_ps(_mm512_add_ps(m4, q), half);
        Pack const m1 = _mm512_mul_ps(_mm512_add_ps(p, m2), half);
        Pack const m3 = _mm512_mul_ps(_mm512_add_ps(m2, m4), half);
        Pack const m5 = _mm512_mul_ps(_mm512_add_ps(m4, m6), half);
        Pack const m7 = _mm512_mul_ps(_mm512_add_ps(m6, q), half);
        Pack points = _mm512_mask_blend_ps(0x000C, m1, m2);
        points = _mm512_mask_blend_ps(0x0030, points, m3);
        points = _mm512_mask_blend_ps(0x00C0, points, m4);
        points = _mm512_mask_blend_ps(0x0300, points, m5);
        points = _mm512_mask_blend_ps(0x0C00, points, m6);
        points = _mm512_mask_blend_ps(0x3000, points, m7);
        points = _mm512_mask_blend_ps(0xC000, points, q);
        points = _mm512_add_ps(points, centre);
        if (Near(points) != 0xFFFF) {
            return false;
        }
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(cursor),
                            _mm512_cvtepi32_epi16(Whole(points)));
        return true;
    }
    static __mmask16 Near(Pack points) {
        return _mm512_cmp_ps_mask(_mm512_abs_ps(points), _mm512_set1_ps(BatchLanes::NEAR_LIMIT),
                                  _CMP_LT_OQ);
    }
    // Rounded to the nearest, ties to even, which is what adding and taking away the rounder
    // does for a near value; above the largest word it is that word.
    static __m512i Whole(Pack points) {
        __m512i const whole =
            _mm512_cvt_roundps_epi32(points, _MM_FROUND_TO_NEAREST_INT | _MM_FROUND_NO_EXC);
        return _mm512_min_epi32(whole, _mm512_set1_epi32(65535));
    }
    // The entries of one halved point of 16 spans, x in the low word and y in the high one.
    static __m512i Entries(Pack x, Pack y, Pack cx, Pack cy, __mmask16& near) {
        x = _mm512_add_ps(x, cx);
        y = _mm512_add_ps(y, cy);
        near = _kand_mask16(near, _kand_mask16(Near(x), Near(y)));
        return _mm512_or_si512(_mm512_and_si512(Whole(x), _mm512_set1_epi32(0xFFFF)),
                               _mm512_slli_epi32(Whole(y), 16));
    }
    // Sixteen spans with the points in lanes: the halvings of x and of y, eight entries a span
    // by lanes, then an 8 x 8 transpose in each half so that every span's entries lie together.
    // Up to sixteen spans: `spans` of them are read and stored, the lanes beyond are zeros.
    static bool StoreSixteenSpans(unsigned short* cursor, float const* x, float const* y, Pack cx,
                                  Pack cy, int spans) {
        __mmask16 const lanes = __mmask16((1u << spans) - 1u);
        Pack const half = _mm512_set1_ps(0.5f);
        __m512i e[8];
        __mmask16 near = 0xFFFF;
        {
            Pack const p = _mm512_maskz_loadu_ps(lanes, x);
            Pack const q = _mm512_maskz_loadu_ps(lanes, x + 1);
            Pack const m4 = _mm512_mul_ps(_mm512_add_ps(p, q), half);
            Pack const m2 = _mm512_mul_ps(_mm512_add_ps(p, m4), half);
            Pack const m6 = _mm512_mul_ps(_mm512_add_ps(m4, q), half);
            Pack const py = _mm512_maskz_loadu_ps(lanes, y);
            Pack const qy = _mm512_maskz_loadu_ps(lanes, y + 1);
            Pack const n4 = _mm512_mul_ps(_mm512_add_ps(py, qy), half);
            Pack const n2 = _mm512_mul_ps(_mm512_add_ps(py, n4), half);
            Pack const n6 = _mm512_mul_ps(_mm512_add_ps(n4, qy), half);
            e[0] = Entries(_mm512_mul_ps(_mm512_add_ps(p, m2), half),
                           _mm512_mul_ps(_mm512_add_ps(py, n2), half), cx, cy, near);
            e[1] = Entries(m2, n2, cx, cy, near);
            e[2] = Entries(_mm512_mul_ps(_mm512_add_ps(m2, m4), half),
                           _mm512_mul_ps(_mm512_add_ps(n2, n4), half), cx, cy, near);
            e[3] = Entries(m4, n4, cx, cy, near);
            e[4] = Entries(_mm512_mul_ps(_mm512_add_ps(m4, m6), half),
                           _mm512_mul_ps(_mm512_add_ps(n4, n6), half), cx, cy, near);
            e[5] = Entries(m6, n6, cx, cy, near);
            e[6] = Entries(_mm512_mul_ps(_mm512_add_ps(m6, q), half),
                           _mm512_mul_ps(_mm512_add_ps(n6, qy), half), cx, cy, near);
            e[7] = Entries(q, qy, cx, cy, near);
        }
        if (near != 0xFFFF) {
            return false;
        }
        Pack a[8];
        for (int i = 0; i < 8; ++i) {
            a[i] = _mm512_castsi512_ps(e[i]);
        }
        // Within each 128-bit lane: u[m] holds entries 0-3 of span m of the lane's four spans,
        // u[m + 4] entries 4-7.
        Pack t[8];
        for (int i = 0; i < 4; ++i) {
            t[2 * i] = _mm512_unpacklo_ps(a[2 * i], a[2 * i + 1]);
            t[2 * i + 1] = _mm512_unpackhi_ps(a[2 * i], a[2 * i + 1]);
        }
        Pack u[8];
        for (int half_index = 0; half_index < 2; ++half_index) {
            Pack const* tt = t + 4 * half_index;
            u[4 * half_index + 0] = _mm512_shuffle_ps(tt[0], tt[2], 0x44);
            u[4 * half_index + 1] = _mm512_shuffle_ps(tt[0], tt[2], 0xEE);
            u[4 * half_index + 2] = _mm512_shuffle_ps(tt[1], tt[3], 0x44);
            u[4 * half_index + 3] = _mm512_shuffle_ps(tt[1], tt[3], 0xEE);
        }
        // Lanes 0 and 2 of the two halves make spans m and m + 8; lanes 1 and 3 spans m + 4 and
        // m + 12.
        __m512i const even =
            _mm512_setr_epi32(0, 1, 2, 3, 16, 17, 18, 19, 8, 9, 10, 11, 24, 25, 26, 27);
        __m512i const odd =
            _mm512_setr_epi32(4, 5, 6, 7, 20, 21, 22, 23, 12, 13, 14, 15, 28, 29, 30, 31);
        for (int m = 0; m < 4; ++m) {
            Pack const first = _mm512_permutex2var_ps(u[m], even, u[m + 4]);
            Pack const second = _mm512_permutex2var_ps(u[m], odd, u[m + 4]);
            StoreHalves(cursor, m, first, spans);
            StoreHalves(cursor, m + 4, second, spans);
        }
        return true;
    }
    // The low half is span `span`, the high half span `span` + 8; only those below `spans`.
    static void StoreHalves(unsigned short* cursor, int span, Pack entries, int spans) {
        __m512d const both = _mm512_castps_pd(entries);
        if (span < spans) {
            _mm256_storeu_pd(reinterpret_cast<double*>(cursor + 16 * span),
                             _mm512_castpd512_pd256(both));
        }
        if (span + 8 < spans) {
            _mm256_storeu_pd(reinterpret_cast<double*>(cursor + 16 * (span + 8)),
                             _mm512_extractf64x4_pd(both, 1));
        }
    }
    static int StoreEighthSpans(unsigned short* cursor, float const* x, float const* y, int count,
                                float cx, float cy) {
        Pack const centre_x = _mm512_set1_ps(cx);
        Pack const centre_y = _mm512_set1_ps(cy);
        Pack const centre = _mm512_castpd_ps(_mm512_set1_pd(
            __builtin_bit_cast(double, (uint64_t(__builtin_bit_cast(uint32_t, cy)) << 32) |
                                           __builtin_bit_cast(uint32_t, cx))));
        int const spans = count - 1;
        int done = 0;
        while (done < spans) {
            int const block = spans - done < 16 ? spans - done : 16;
            if (!StoreSixteenSpans(cursor + 16 * done, x + done, y + done, centre_x, centre_y,
                                   block)) {
                break;
            }
            done += block;
        }
        while (done < spans && StoreOneSpan(cursor + 16 * done, x + done, y + done, centre)) {
            ++done;
        }
        Leave();
        return done;
    }
};

bool Avx512Supported() {
    return __builtin_cpu_supports("avx512f") && __builtin_cpu_supports("avx512bw") &&
           __builtin_cpu_supports("avx512vl") && __builtin_cpu_supports("avx512vbmi");
}

constexpr BatchLanes AVX512_LANES = lane_kernels::Table<Avx512Lane>("avx512", &Avx512Supported);

}  // namespace

BatchLanes const& BatchLanes::Avx512() {
    return AVX512_LANES;
}

}  // namespace quorvel::vexmap
