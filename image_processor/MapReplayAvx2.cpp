// Row kernels of MapReplay in AVX2, for pixels of 3 and 4 bytes. Built with -mavx2 and without
// FMA, so that every product and sum of a blend is rounded on its own, as ReplayPixel rounds it.
#include <climits>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <immintrin.h>
#include <type_traits>

#include "MapReplay.h"

namespace {

using Row = MapReplay::Row;
using Source = ReplayPixel::Source;

constexpr int LANES = 8;

// Offsets into the input are worked out in 32 bits: an input of more bytes is left to ReplayPixel.
// `readable` is the count of bytes from the start that ReplayPixel may read: the last row needs
// only its pixels, not its whole stride.
bool FitsInt32(Source const& in, int64_t& readable) {
    if (in.data == nullptr || in.width <= 0 || in.height <= 0 || in.stride <= 0) {
        return false;
    }
    readable = int64_t(in.height - 1) * in.stride + int64_t(in.width) * in.bytes;
    return int64_t(in.height) * in.stride <= INT_MAX && readable <= INT_MAX;
}

struct Lookups {
    __m256i offsets;  // bytes from the start of the input, y * stride + x * bytes
    __m256i inside;   // all ones where the entry names a pixel of the input
};

// Eight entries decoded as ReplayPixel decodes one: x the lower half, y the upper half signed.
Lookups Decode(uint32_t const* entries, Source const& in) {
    __m256i const entry = _mm256_loadu_si256(reinterpret_cast<__m256i const*>(entries));
    __m256i const x = _mm256_and_si256(entry, _mm256_set1_epi32(0xFFFF));
    __m256i const y = _mm256_srai_epi32(entry, 16);
    __m256i const inside =
        _mm256_and_si256(_mm256_and_si256(_mm256_cmpgt_epi32(_mm256_set1_epi32(in.width), x),
                                          _mm256_cmpgt_epi32(_mm256_set1_epi32(in.height), y)),
                         _mm256_cmpgt_epi32(y, _mm256_set1_epi32(-1)));
    __m256i const offsets = _mm256_add_epi32(_mm256_mullo_epi32(y, _mm256_set1_epi32(in.stride)),
                                             _mm256_mullo_epi32(x, _mm256_set1_epi32(in.bytes)));
    return {offsets, inside};
}

// Eight pixels loaded one by one (on some processors, Zen 4, a gather costs more than its loads
// apart), a lane outside the input reading the first pixel and then cleared to zero, which is
// black in every channel.
__m256i LoadEight(Source const& in, Lookups const& lookups) {
    alignas(32) int offsets[LANES];
    _mm256_store_si256(reinterpret_cast<__m256i*>(offsets),
                       _mm256_and_si256(lookups.offsets, lookups.inside));
    int pixels[LANES];
    for (int lane = 0; lane < LANES; ++lane) {
        memcpy(&pixels[lane], in.data + offsets[lane], 4);
    }
    __m256i const loaded = _mm256_setr_epi32(pixels[0], pixels[1], pixels[2], pixels[3], pixels[4],
                                             pixels[5], pixels[6], pixels[7]);
    return _mm256_and_si256(loaded, lookups.inside);
}

// A map's lookups run over the input in curves that the processor's own prefetching cannot
// follow: the lines of the pixels this many columns ahead are asked for early (of `rows` input rows
// from each, 2 for a blend's cell), so that they arrive while the pixels between are done.
constexpr int LOOK_AHEAD = 256;

void PrefetchAhead(Source const& in, Row const& row, int column, int rows) {
    if (column + LOOK_AHEAD + LANES > row.width) {
        return;
    }
    Lookups const lookups = Decode(row.entries + column + LOOK_AHEAD, in);
    alignas(32) int offsets[LANES];
    _mm256_store_si256(reinterpret_cast<__m256i*>(offsets),
                       _mm256_and_si256(lookups.offsets, lookups.inside));
    for (int const offset : offsets) {
        for (int below = 0; below < rows; ++below) {
            _mm_prefetch(reinterpret_cast<char const*>(in.data + offset + below * in.stride),
                         _MM_HINT_T0);
        }
    }
}

int Nearest4(Source const& in, Row const& row) {
    int64_t readable = 0;
    if (!FitsInt32(in, readable)) {
        return 0;
    }
    int column = 0;
    for (; column + LANES <= row.width; column += LANES) {
        PrefetchAhead(in, row, column, 1);
        __m256i const pixels = LoadEight(in, Decode(row.entries + column, in));
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(row.pixels + 4 * column), pixels);
    }
    return column;
}

// Four bytes are read for a pixel of three; a lane whose fourth byte lies past what the input may
// be read stops the kernel there. Each half of the eight is packed to 12 bytes and stored with 16,
// the 4 bytes too many being the next pixels', which the next step writes: so the kernel stops 2
// pixels before the end of the row.
int Nearest3(Source const& in, Row const& row) {
    int64_t readable = 0;
    if (!FitsInt32(in, readable)) {
        return 0;
    }
    __m256i const last_whole = _mm256_set1_epi32(int(readable - 4));
    __m256i const pack = _mm256_setr_epi8(0, 1, 2, 4, 5, 6, 8, 9, 10, 12, 13, 14, -1, -1, -1, -1, 0,
                                          1, 2, 4, 5, 6, 8, 9, 10, 12, 13, 14, -1, -1, -1, -1);
    int column = 0;
    for (; column + LANES + 2 <= row.width; column += LANES) {
        PrefetchAhead(in, row, column, 1);
        Lookups const lookups = Decode(row.entries + column, in);
        __m256i const past =
            _mm256_and_si256(lookups.inside, _mm256_cmpgt_epi32(lookups.offsets, last_whole));
        if (!_mm256_testz_si256(past, past)) {
            break;
        }
        __m256i const pixels = _mm256_shuffle_epi8(LoadEight(in, lookups), pack);
        unsigned char* const target = row.pixels + 3 * column;
        _mm_storeu_si128(reinterpret_cast<__m128i*>(target), _mm256_castsi256_si128(pixels));
        _mm_storeu_si128(reinterpret_cast<__m128i*>(target + 12),
                         _mm256_extracti128_si256(pixels, 1));
    }
    return column;
}

// Two neighbouring pixels of a row as eight float lanes, channel by channel, the fourth lane of
// each of three bytes being zero.
template <int BYTES>
__m256 PixelPair(unsigned char const* p);

template <>
__m256 PixelPair<4>(unsigned char const* p) {
    int64_t pair = 0;
    memcpy(&pair, p, 8);
    return _mm256_cvtepi32_ps(_mm256_cvtepu8_epi32(_mm_cvtsi64_si128(pair)));
}

template <>
__m256 PixelPair<3>(unsigned char const* p) {
    uint32_t first = 0;
    uint16_t second = 0;
    memcpy(&first, p, 4);
    memcpy(&second, p + 4, 2);
    __m128i const bytes = _mm_cvtsi64_si128(int64_t(uint64_t(first) | uint64_t(second) << 32));
    __m128i const spread = _mm_shuffle_epi8(
        bytes, _mm_setr_epi8(0, 1, 2, -1, 3, 4, 5, -1, -1, -1, -1, -1, -1, -1, -1, -1));
    return _mm256_cvtepi32_ps(_mm256_cvtepu8_epi32(spread));
}

// The blend of ReplayPixel::AverageSample for every channel at once: each term is the sample
// times its row weight times its column weight, and the four are summed left to right.
template <int BYTES>
void BlendCell(unsigned char const* p, int stride, float fx, float fy, unsigned char* pixel) {
    float const wx = 1.0f - fx;
    float const wy = 1.0f - fy;
    __m256 const columns = _mm256_setr_ps(wx, wx, wx, wx, fx, fx, fx, fx);
    __m256 const top =
        _mm256_mul_ps(_mm256_mul_ps(PixelPair<BYTES>(p), _mm256_set1_ps(wy)), columns);
    __m256 const bottom =
        _mm256_mul_ps(_mm256_mul_ps(PixelPair<BYTES>(p + stride), _mm256_set1_ps(fy)), columns);
    __m128 sum = _mm_add_ps(_mm256_castps256_ps128(top), _mm256_extractf128_ps(top, 1));
    sum = _mm_add_ps(sum, _mm256_castps256_ps128(bottom));
    sum = _mm_add_ps(sum, _mm256_extractf128_ps(bottom, 1));
    __m128i const samples = _mm_and_si128(_mm_cvttps_epi32(sum), _mm_set1_epi32(0xFF));
    __m128i const packed = _mm_packus_epi16(_mm_packus_epi32(samples, samples), samples);
    uint32_t const word = uint32_t(_mm_cvtsi128_si32(packed));
    memcpy(pixel, &word, BYTES);
}

// One pixel as ReplayPixel::Replay decides, with the blend in vector lanes.
template <int BYTES>
void BlendOne(Source const& in, uint32_t entry, MapReplay::Fraction const& fraction,
              unsigned char* pixel) {
    int const x = ReplayPixel::EntryColumn(entry);
    int const y = ReplayPixel::EntryRow(entry);
    if (y < 0 || x >= in.width || y >= in.height) {
        memset(pixel, 0, BYTES);
        return;
    }
    unsigned char const* source =
        in.data + std::size_t(y) * std::size_t(in.stride) + std::size_t(x) * BYTES;
    if (x != in.width - 1 && y != in.height - 1) {
        BlendCell<BYTES>(source, in.stride, fraction.x, fraction.y, pixel);
    } else {
        memcpy(pixel, source, BYTES);
    }
}

// Eight pixels are worked on in the lane order 0 1 4 5 | 2 3 6 7, which is the order in which
// the two 128-bit halves of the shuffles below hand them out; Unshuffle puts them back.

// The x and the y of eight fractions, in the working order.
void SplitFractions(MapReplay::Fraction const* fractions, __m256& fx, __m256& fy) {
    __m256 const low = _mm256_loadu_ps(&fractions[0].x);
    __m256 const high = _mm256_loadu_ps(&fractions[4].x);
    fx = _mm256_shuffle_ps(low, high, _MM_SHUFFLE(2, 0, 2, 0));
    fy = _mm256_shuffle_ps(low, high, _MM_SHUFFLE(3, 1, 3, 1));
}

__m256i Unshuffle(__m256i pixels) {
    return _mm256_permute4x64_epi64(pixels, _MM_SHUFFLE(3, 1, 2, 0));
}

/// Two neighbouring pixels of a cell row for each of eight cells, 8 bytes a cell starting at its
/// left pixel: `first` holds cells 0 to 3, `second` cells 4 to 7, a cell a 64-bit lane.
struct CellRows {
    __m256i first;
    __m256i second;
};

// Loaded one by one: on some processors (Zen 4) a gather costs more than its loads apart.
__m256i LoadFourCells(unsigned char const* data, int const* offsets) {
    long long cells[4];
    for (int cell = 0; cell < 4; ++cell) {
        memcpy(&cells[cell], data + offsets[cell], 8);
    }
    return _mm256_setr_epi64x(cells[0], cells[1], cells[2], cells[3]);
}

CellRows LoadCellRows(unsigned char const* data, int const* offsets) {
    return {LoadFourCells(data, offsets), LoadFourCells(data, offsets + 4)};
}

// Byte `index` of `first` lanes' pick and the same of `second` lanes', as eight 32-bit samples
// in the working order, as floats. A pick's 8 bytes are: the byte of the cell in the low 64-bit
// lane, zeros, the byte of the cell in the high lane, zeros; then zeros.
__m256 Samples(CellRows const& rows, __m256i first_pick, __m256i second_pick) {
    return _mm256_cvtepi32_ps(_mm256_or_si256(_mm256_shuffle_epi8(rows.first, first_pick),
                                              _mm256_shuffle_epi8(rows.second, second_pick)));
}

// Eight blends at once, a pixel a lane and a channel at a time, with the operations of
// ReplayPixel::AverageSample in its order. A pixel of three bytes is read as part of 8 bytes.
template <int BYTES>
__m256i BlendEight(Source const& in, __m256i offsets, MapReplay::Fraction const* fractions) {
    alignas(32) int cells[LANES];
    _mm256_store_si256(reinterpret_cast<__m256i*>(cells), offsets);
    CellRows const top = LoadCellRows(in.data, cells);
    CellRows const bottom = LoadCellRows(in.data + in.stride, cells);
    __m256 fx;
    __m256 fy;
    SplitFractions(fractions, fx, fy);
    __m256 const one = _mm256_set1_ps(1.0f);
    __m256 const wx = _mm256_sub_ps(one, fx);
    __m256 const wy = _mm256_sub_ps(one, fy);
    // Bytes with the top bit set give zero; adding a channel number keeps them so.
    constexpr char Z = -128;
    constexpr char R = BYTES;  // the right pixel's first byte
    __m256i left_first = _mm256_setr_epi8(0, Z, Z, Z, 8, Z, Z, Z, Z, Z, Z, Z, Z, Z, Z, Z,  //
                                          0, Z, Z, Z, 8, Z, Z, Z, Z, Z, Z, Z, Z, Z, Z, Z);
    __m256i left_second = _mm256_setr_epi8(Z, Z, Z, Z, Z, Z, Z, Z, 0, Z, Z, Z, 8, Z, Z, Z,  //
                                           Z, Z, Z, Z, Z, Z, Z, Z, 0, Z, Z, Z, 8, Z, Z, Z);
    __m256i const right = _mm256_set1_epi8(R);
    __m256i const next_channel = _mm256_set1_epi8(1);
    __m256i pixels = _mm256_setzero_si256();
    for (int shift = 0; shift < 8 * BYTES; shift += 8) {
        __m256i const right_first = _mm256_add_epi8(left_first, right);
        __m256i const right_second = _mm256_add_epi8(left_second, right);
        __m256 sum = _mm256_mul_ps(_mm256_mul_ps(Samples(top, left_first, left_second), wy), wx);
        sum = _mm256_add_ps(
            sum, _mm256_mul_ps(_mm256_mul_ps(Samples(top, right_first, right_second), wy), fx));
        sum = _mm256_add_ps(
            sum, _mm256_mul_ps(_mm256_mul_ps(Samples(bottom, left_first, left_second), fy), wx));
        sum = _mm256_add_ps(
            sum, _mm256_mul_ps(_mm256_mul_ps(Samples(bottom, right_first, right_second), fy), fx));
        __m256i const sample = _mm256_and_si256(_mm256_cvttps_epi32(sum), _mm256_set1_epi32(0xFF));
        pixels = _mm256_or_si256(pixels, _mm256_sll_epi32(sample, _mm_cvtsi32_si128(shift)));
        left_first = _mm256_add_epi8(left_first, next_channel);
        left_second = _mm256_add_epi8(left_second, next_channel);
    }
    return Unshuffle(pixels);
}

void Store(__m256i pixels, unsigned char* target, std::integral_constant<int, 4>) {
    _mm256_storeu_si256(reinterpret_cast<__m256i*>(target), pixels);
}

// Each half packed to 12 bytes and stored with 16: see Nearest3.
void Store(__m256i pixels, unsigned char* target, std::integral_constant<int, 3>) {
    __m256i const pack = _mm256_setr_epi8(0, 1, 2, 4, 5, 6, 8, 9, 10, 12, 13, 14, -1, -1, -1, -1, 0,
                                          1, 2, 4, 5, 6, 8, 9, 10, 12, 13, 14, -1, -1, -1, -1);
    __m256i const packed = _mm256_shuffle_epi8(pixels, pack);
    _mm_storeu_si128(reinterpret_cast<__m128i*>(target), _mm256_castsi256_si128(packed));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(target + 12), _mm256_extracti128_si256(packed, 1));
}

// Eight pixels whose cells all lie inside the input are blended together; a group with any other
// pixel (outside, on the last column or row, or read past the input's end) goes pixel by pixel.
// Three-byte pixels stop 2 pixels before the row's end, as Nearest3 does.
template <int BYTES>
int Blend(Source const& in, Row const& row) {
    int64_t readable = 0;
    if (!FitsInt32(in, readable)) {
        return 0;
    }
    // A cell's bottom row is the last that is read, with 8 bytes from its left pixel.
    __m256i const last_whole = _mm256_set1_epi32(int(readable - 8 - in.stride));
    __m256i const last_column = _mm256_set1_epi32(in.width - 1);
    __m256i const last_row = _mm256_set1_epi32(in.height - 1);
    int const stop = BYTES == 3 ? 2 : 0;
    int column = 0;
    for (; column + LANES + stop <= row.width; column += LANES) {
        PrefetchAhead(in, row, column, 2);
        unsigned char* const target = row.pixels + BYTES * column;
        __m256i const entry =
            _mm256_loadu_si256(reinterpret_cast<__m256i const*>(row.entries + column));
        __m256i const x = _mm256_and_si256(entry, _mm256_set1_epi32(0xFFFF));
        __m256i const y = _mm256_srai_epi32(entry, 16);
        __m256i const offsets =
            _mm256_add_epi32(_mm256_mullo_epi32(y, _mm256_set1_epi32(in.stride)),
                             _mm256_mullo_epi32(x, _mm256_set1_epi32(BYTES)));
        __m256i const whole = _mm256_and_si256(
            _mm256_and_si256(_mm256_cmpgt_epi32(last_column, x), _mm256_cmpgt_epi32(last_row, y)),
            _mm256_cmpgt_epi32(y, _mm256_set1_epi32(-1)));
        __m256i const readable_cells =
            _mm256_andnot_si256(_mm256_cmpgt_epi32(offsets, last_whole), whole);
        if (_mm256_movemask_epi8(readable_cells) == -1) {
            Store(BlendEight<BYTES>(in, offsets, row.fractions + column), target,
                  std::integral_constant<int, BYTES>());
            continue;
        }
        for (int pixel = 0; pixel < LANES; ++pixel) {
            BlendOne<BYTES>(in, row.entries[column + pixel], row.fractions[column + pixel],
                            target + BYTES * pixel);
        }
    }
    return column;
}

}  // namespace

MapReplay::Kernels const& Avx2ReplayKernels() {
    static MapReplay::Kernels const kernels{Nearest3, Nearest4, Blend<3>, Blend<4>};
    return kernels;
}
