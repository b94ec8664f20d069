#include "vexmap/simple_image_map.h"

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <new>

#include <boost/core/checked_delete.hpp>

#include "vexmap/batch_lanes.h"
#include "vexmap/log.h"

namespace quorvel::vexmap {
namespace {

// What a sample that sees nothing shows.
constexpr unsigned char BLACK_LUMA = 16;
constexpr unsigned char BLACK_CHROMA = 128;
constexpr uint32_t BLACK_RGB32 = 0;

// Sizes of a frame record, truncated to 32 bits: the index arithmetic of every routine is done
// in unsigned 32-bit words, where wrap-around is defined and lands outside the plane.
struct Frame {
    explicit Frame(_DEWARP_IMAGE const& image)
        : width(uint32_t(image.info.width)),
          height(uint32_t(image.info.height)),
          stride(uint32_t(image.info.stride)),
          plane(height * stride) {}

    uint32_t width;
    uint32_t height;
    uint32_t stride;
    uint32_t plane;  // bytes of a one-byte-per-pixel plane: height * stride
};

// The look-up of one entry in an 8-bit plane at full resolution, indexed with `x`, which is the
// entry's own x but in the lower rows of a 4 x 4 block. A y beyond the picture falls out through
// the index; the test of the entry's own x keeps a large x from wrapping into the next row.
inline unsigned char Luma(unsigned char const* plane, Frame const& in, unsigned short const* entry,
                          uint32_t x) {
    uint32_t const index = entry[1] * in.stride + x;
    return index < in.plane && entry[0] < in.width ? plane[index] : BLACK_LUMA;
}

inline unsigned char Luma(unsigned char const* plane, Frame const& in,
                          unsigned short const* entry) {
    return Luma(plane, in, entry, entry[0]);
}

// The four luma samples of a 2 x 2 block, from the block's two table rows.
inline void LumaBlock(unsigned char const* plane, Frame const& in, unsigned short const* top,
                      unsigned short const* bottom, unsigned char* top_out,
                      unsigned char* bottom_out) {
    top_out[0] = Luma(plane, in, top);
    top_out[1] = Luma(plane, in, top + 2);
    bottom_out[0] = Luma(plane, in, bottom);
    bottom_out[1] = Luma(plane, in, bottom + 2);
}

}  // namespace

SimpleImageMap::SimpleImageMap() = default;

SimpleImageMap::SimpleImageMap(SimpleImageMap const& other) = default;

SimpleImageMap::SimpleImageMap(int width, int height) {
    SetMapSize(width, height);
}

SimpleImageMap::SimpleImageMap(Resolution const& size) {
    SetMapSize(size);
}

SimpleImageMap& SimpleImageMap::operator=(SimpleImageMap const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "SimpleImageMap");
        return *this;
    }
    image_size = other.image_size;
    map_size = other.map_size;
    map = other.map;
    return *this;
}

SimpleImageMap::~SimpleImageMap() = default;

bool SimpleImageMap::Empty() const {
    return !map;
}

// The word count is the signed 32-bit product, widened with its sign: a negative one fails as an
// array new of that count does, one that wrapped to a positive value goes unnoticed. Nothing is
// assigned before the new table is whole, so a failure leaves the object as it was.
// The signed 32-bit product widened with its sign: a negative count fails the allocation, and
// one that wraps to a positive value is not noticed here (the views refuse such sizes).
int64_t SimpleImageMap::WordCount(int width, int height) {
    return int32_t(uint32_t(width) * uint32_t(height) * 2u);
}

void SimpleImageMap::SetMapSize(int width, int height) {
    ReserveMapSize(width, height);
    std::memset(map.get(), 0xFF, size_t(WordCount(width, height)) * sizeof(unsigned short));
}

void SimpleImageMap::ReserveMapSize(int width, int height) {
    int64_t const words = WordCount(width, height);
    if (words < 0) {
        throw std::bad_array_new_length();
    }
    boost::shared_ptr<unsigned short> table(new unsigned short[size_t(words)],
                                            boost::checked_array_deleter<unsigned short>());
    map = table;
    map_size = Resolution(width, height);
}

void SimpleImageMap::SetMapSize(Resolution const& size) {
    SetMapSize(int(size.x), int(size.y));
}

Resolution SimpleImageMap::GetMapSize() const {
    return map_size;
}

int SimpleImageMap::GetMapWidth() const {
    return int(map_size.x);
}

int SimpleImageMap::GetMapHeight() const {
    return int(map_size.y);
}

// The byte count is worked out in float, (width + width) * height doubled; it is exact up to
// 2^24 bytes and for the usual frame sizes well beyond. Where the float rounds up it is held to
// the table that SetMapSize allocated, so that the fill never runs past it.
void SimpleImageMap::FillMap() {
    if (!map) {
        return;
    }
    float const bytes = (map_size.x + map_size.x) * map_size.y * 2.0f;
    std::memset(map.get(), 0xFF, std::min(size_t(uint64_t(bytes)), TableBytes()));
}

size_t SimpleImageMap::TableBytes() const {
    return size_t(WordCount(GetMapWidth(), GetMapHeight())) * sizeof(unsigned short);
}

void SimpleImageMap::Remap(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination) const {
    RemapRows(source, destination, ALL_ROWS);
}

void SimpleImageMap::RemapRows(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination,
                               Rows rows) const {
    switch (uint32_t(source.info.format)) {
        case DEWARP_IMAGE_FORMAT_RGB32_PACKED:
            RemapRgb32Packed(source, destination, rows);
            return;
        case DEWARP_IMAGE_FORMAT_YUV422A_PACKED:
            RemapYuv422aPacked(source, destination, rows);
            return;
        case DEWARP_IMAGE_FORMAT_YUV422B_PACKED:
            RemapYuv422bPacked(source, destination, rows);
            return;
        case DEWARP_IMAGE_FORMAT_YUV422_PLANAR:
            RemapYuv422Planar(source, destination, rows);
            return;
        case DEWARP_IMAGE_FORMAT_YUV420_PLANAR:
            RemapYuv420Planar(source, destination, rows, BatchLanes::Widest());
            return;
        case DEWARP_IMAGE_FORMAT_YUV411_PLANAR:
            RemapYuv411Planar(source, destination, rows);
            return;
        case DEWARP_IMAGE_FORMAT_NV420_PLANAR:
            RemapNv420Planar(source, destination, rows, BatchLanes::Widest());
            return;
        default:
            Log::err(__LINE__, __FILE__, "Remap", "Unknown image format %d\n",
                     int(source.info.format));
            return;
    }
}

uint32_t SimpleImageMap::BlockRows(_DEWARP_IMAGE_FORMAT format) {
    switch (uint32_t(format)) {
        case DEWARP_IMAGE_FORMAT_RGB32_PACKED:
            return 1;
        case DEWARP_IMAGE_FORMAT_YUV411_PLANAR:
            return 4;
        case DEWARP_IMAGE_FORMAT_YUV422A_PACKED:
        case DEWARP_IMAGE_FORMAT_YUV422B_PACKED:
        case DEWARP_IMAGE_FORMAT_YUV422_PLANAR:
        case DEWARP_IMAGE_FORMAT_YUV420_PLANAR:
        case DEWARP_IMAGE_FORMAT_NV420_PLANAR:
            return 2;
        default:
            return 0;
    }
}

bool SimpleImageMap::RemapRows(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination,
                               uint64_t first_row, uint64_t row_count) const {
    uint64_t const block = BlockRows(source.info.format);
    uint64_t const height = uint32_t(destination.info.height);
    if (block == 0 || row_count > height || first_row > height - row_count ||
        first_row % block != 0) {
        return false;
    }
    uint64_t const end = first_row + row_count;
    if (end % block != 0 && end != height) {
        return false;
    }
    if (row_count > 0) {
        RemapRows(source, destination, Rows{uint32_t(first_row), uint32_t(end)});
    }
    return true;
}

void SimpleImageMap::RemapRgb32Packed(_DEWARP_IMAGE const& source,
                                      _DEWARP_IMAGE& destination) const {
    RemapRgb32Packed(source, destination, ALL_ROWS);
}

void SimpleImageMap::RemapYuv422aPacked(_DEWARP_IMAGE const& source,
                                        _DEWARP_IMAGE& destination) const {
    RemapYuv422aPacked(source, destination, ALL_ROWS);
}

void SimpleImageMap::RemapYuv422bPacked(_DEWARP_IMAGE const& source,
                                        _DEWARP_IMAGE& destination) const {
    RemapYuv422bPacked(source, destination, ALL_ROWS);
}

void SimpleImageMap::RemapYuv422Planar(_DEWARP_IMAGE const& source,
                                       _DEWARP_IMAGE& destination) const {
    RemapYuv422Planar(source, destination, ALL_ROWS);
}

void SimpleImageMap::RemapYuv420Planar(_DEWARP_IMAGE const& source,
                                       _DEWARP_IMAGE& destination) const {
    RemapYuv420Planar(source, destination, ALL_ROWS, BatchLanes::Widest());
}

void SimpleImageMap::RemapWithLanes(BatchLanes const& lanes, _DEWARP_IMAGE const& source,
                                    _DEWARP_IMAGE& destination) const {
    if (source.info.format == DEWARP_IMAGE_FORMAT_YUV420_PLANAR) {
        RemapYuv420Planar(source, destination, ALL_ROWS, lanes);
    } else if (source.info.format == DEWARP_IMAGE_FORMAT_NV420_PLANAR) {
        RemapNv420Planar(source, destination, ALL_ROWS, lanes);
    } else {
        Remap(source, destination);
    }
}

void SimpleImageMap::RemapYuv411Planar(_DEWARP_IMAGE const& source,
                                       _DEWARP_IMAGE& destination) const {
    RemapYuv411Planar(source, destination, ALL_ROWS);
}

void SimpleImageMap::RemapNv420Planar(_DEWARP_IMAGE const& source,
                                      _DEWARP_IMAGE& destination) const {
    RemapNv420Planar(source, destination, ALL_ROWS, BatchLanes::Widest());
}

// Sizes and bounds compare as signed 32-bit values here: a destination width or height of 2^31 or
// more writes nothing, a source width of 2^31 or more gives black. Chosen: an index of 2^31 or
// more is black too, where a signed test would read before the picture.
void SimpleImageMap::RemapRgb32Packed(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination,
                                      Rows band) const {
    Frame const in(source);
    Frame const out(destination);
    int32_t const rows = int32_t(out.height);
    int32_t const columns = int32_t(out.width);
    int32_t const signed_width = int32_t(in.width);
    int32_t const signed_limit = int32_t(in.plane);
    uint32_t const width = signed_width > 0 ? uint32_t(signed_width) : 0;
    uint32_t const limit = signed_limit > 0 ? uint32_t(signed_limit) : 0;
    size_t const pitch = 2 * size_t(uint32_t(GetMapWidth()));
    // Copied as words through memcpy: a frame buffer promises no alignment.
    unsigned char const* const pixels = source.data;
    int32_t const last = int32_t(std::min<int64_t>(rows, int64_t(band.end)));
    for (int32_t row = int32_t(band.first); row < last; ++row) {
        unsigned short const* entry = map.get() + size_t(uint32_t(row)) * pitch;
        unsigned char* target = destination.data + size_t(uint32_t(row) * out.stride) * 4;
        for (int32_t column = 0; column < columns; ++column, entry += 2, target += 4) {
            uint32_t const x = entry[0];
            uint32_t const index = entry[1] * in.stride + x;
            if (index < limit && x < width) {
                std::memcpy(target, pixels + size_t(index) * 4, 4);
            } else {
                std::memcpy(target, &BLACK_RGB32, 4);
            }
        }
    }
}

// In the packed layouts a source pixel's offset is even, and the pair it belongs to starts at
// that offset less 2 when bit 1 is set: clearing bit 1 does the same without a branch.
void SimpleImageMap::RemapYuv422aPacked(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination,
                                        Rows band) const {
    Frame const in(source);
    Frame const out(destination);
    uint32_t const block_columns = out.width >> 1;
    uint32_t const block_rows = out.height >> 1;
    if (block_rows == 0) {
        return;
    }
    uint32_t const limit = in.plane * 2;
    uint32_t const pitch = in.stride * 2;
    size_t const table_pitch = 2 * size_t(uint32_t(GetMapWidth()));
    unsigned char const* const pixels = source.data;
    for (uint32_t row = band.first; row < std::min(2 * block_rows, band.end); ++row) {
        unsigned short const* entry = map.get() + size_t(row) * table_pitch;
        unsigned char* target = destination.data + row * (out.stride * 2);
        for (uint32_t pair = 0; pair < block_columns; ++pair, entry += 4, target += 4) {
            uint32_t const left_x = entry[0];
            uint32_t const left = entry[1] * pitch + left_x * 2;
            uint32_t const right_x = entry[2];
            uint32_t const right = entry[3] * pitch + right_x * 2;
            bool const left_inside = left < limit && left_x < in.width;
            uint32_t const pair_start = left & ~2u;
            // A frame whose stride times height is odd ends in half a pair: its V would lie
            // past the frame, so that pair's chroma is black.
            bool const chroma_inside = left_inside && pair_start + 2 < limit;
            target[0] = chroma_inside ? pixels[pair_start] : BLACK_CHROMA;
            target[1] = left_inside ? pixels[left | 1u] : BLACK_LUMA;
            target[2] = chroma_inside ? pixels[pair_start + 2] : BLACK_CHROMA;
            target[3] = right < limit && right_x < in.width ? pixels[right | 1u] : BLACK_LUMA;
        }
    }
}

void SimpleImageMap::RemapYuv422bPacked(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination,
                                        Rows band) const {
    Frame const in(source);
    Frame const out(destination);
    uint32_t const block_columns = out.width >> 1;
    uint32_t const block_rows = out.height >> 1;
    if (block_rows == 0) {
        return;
    }
    uint32_t const limit = in.plane * 2;
    uint32_t const pitch = in.stride * 2;
    size_t const table_pitch = 2 * size_t(uint32_t(GetMapWidth()));
    unsigned char const* const pixels = source.data;
    for (uint32_t row = band.first; row < std::min(2 * block_rows, band.end); ++row) {
        unsigned short const* entry = map.get() + size_t(row) * table_pitch;
        unsigned char* target = destination.data + row * (out.stride * 2);
        for (uint32_t pair = 0; pair < block_columns; ++pair, entry += 4, target += 4) {
            uint32_t const left_x = entry[0];
            uint32_t const left = entry[1] * pitch + left_x * 2;
            uint32_t const right_x = entry[2];
            uint32_t const right = entry[3] * pitch + right_x * 2;
            uint32_t const pair_start = left & ~2u;
            // Intended: the test is on the pair's start, not on the pixel's own offset as in
            // the U Y V Y layout.
            bool const left_inside = pair_start < limit && left_x < in.width;
            // A frame whose stride times height is odd ends in half a pair: its V would lie
            // past the frame, so that pair's chroma is black.
            bool const chroma_inside = left_inside && pair_start + 3 < limit;
            // Intended: the left pixel shows the first luma of its source pair, not its own.
            target[0] = left_inside ? pixels[pair_start] : BLACK_LUMA;
            target[1] = chroma_inside ? pixels[pair_start + 1] : BLACK_CHROMA;
            target[2] = right < limit && right_x < in.width ? pixels[right] : BLACK_LUMA;
            target[3] = chroma_inside ? pixels[pair_start + 3] : BLACK_CHROMA;
        }
    }
}

// The planar routines walk a block row with one cursor per table row, each read strictly in
// order, and write each block's chroma right after its luma: the planes do not overlap, so the
// order is free.

// Both rows of a block carry chroma, each from its own entry at the block's left column.
void SimpleImageMap::RemapYuv422Planar(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination,
                                       Rows band) const {
    Frame const in(source);
    Frame const out(destination);
    uint32_t const block_columns = out.width >> 1;
    uint32_t const block_rows = out.height >> 1;
    if (block_rows == 0) {
        return;
    }
    uint32_t const chroma_limit = in.plane >> 1;
    unsigned char const* const luma = source.data;
    unsigned char const* const u_plane = source.data + in.plane;
    unsigned char const* const v_plane = u_plane + chroma_limit;
    uint32_t const out_chroma_stride = out.stride >> 1;
    unsigned char* const u_out = destination.data + out.plane;
    unsigned char* const v_out = u_out + (out.plane >> 1);
    size_t const table_pitch = 2 * size_t(uint32_t(GetMapWidth()));
    for (uint32_t block_row = band.first / 2; block_row < std::min(block_rows, band.end / 2);
         ++block_row) {
        uint32_t const row = 2 * block_row;
        unsigned short const* top = map.get() + size_t(row) * table_pitch;
        unsigned short const* bottom = top + table_pitch;
        unsigned char* top_out = destination.data + row * out.stride;
        unsigned char* bottom_out = top_out + out.stride;
        uint32_t const chroma_row = row * out_chroma_stride;
        unsigned char* const top_u = u_out + chroma_row;
        unsigned char* const top_v = v_out + chroma_row;
        unsigned char* const bottom_u = top_u + out_chroma_stride;
        unsigned char* const bottom_v = top_v + out_chroma_stride;
        for (uint32_t column = 0; column < block_columns;
             ++column, top += 4, bottom += 4, top_out += 2, bottom_out += 2) {
            LumaBlock(luma, in, top, bottom, top_out, bottom_out);
            uint32_t const top_index = (uint32_t(top[0]) >> 1) + ((top[1] * in.stride) >> 1);
            bool const top_inside = top_index < chroma_limit && top[0] < in.width;
            top_u[column] = top_inside ? u_plane[top_index] : BLACK_CHROMA;
            top_v[column] = top_inside ? v_plane[top_index] : BLACK_CHROMA;
            uint32_t const bottom_index =
                (uint32_t(bottom[0]) >> 1) + ((bottom[1] * in.stride) >> 1);
            bool const bottom_inside = bottom_index < chroma_limit && bottom[0] < in.width;
            bottom_u[column] = bottom_inside ? u_plane[bottom_index] : BLACK_CHROMA;
            bottom_v[column] = bottom_inside ? v_plane[bottom_index] : BLACK_CHROMA;
        }
    }
}

// One chroma look-up for four pixels: the block's top left entry alone decides U and V.
void SimpleImageMap::RemapYuv420Planar(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination,
                                       Rows band, BatchLanes const& lanes) const {
    Frame const in(source);
    Frame const out(destination);
    uint32_t const block_columns = out.width >> 1;
    uint32_t const block_rows = out.height >> 1;
    if (block_rows == 0) {
        return;
    }
    uint32_t const chroma_limit = in.plane >> 2;
    uint32_t const chroma_stride = in.stride >> 1;
    unsigned char const* const luma = source.data;
    unsigned char const* const u_plane = source.data + in.plane;
    unsigned char const* const v_plane = u_plane + chroma_limit;
    uint32_t const out_chroma_stride = out.stride >> 1;
    unsigned char* const u_out = destination.data + out.plane;
    unsigned char* const v_out = u_out + (out.plane >> 2);
    size_t const table_pitch = 2 * size_t(uint32_t(GetMapWidth()));
    for (uint32_t block_row = band.first / 2; block_row < std::min(block_rows, band.end / 2);
         ++block_row) {
        uint32_t const row = 2 * block_row;
        unsigned short const* top = map.get() + size_t(row) * table_pitch;
        unsigned short const* bottom = top + table_pitch;
        unsigned char* top_out = destination.data + row * out.stride;
        unsigned char* bottom_out = top_out + out.stride;
        unsigned char* const u_target = u_out + block_row * out_chroma_stride;
        unsigned char* const v_target = v_out + block_row * out_chroma_stride;
        uint32_t const done = lanes.remap_yuv420_blocks(BatchLanes::Yuv420Row{
            top, bottom, block_columns, luma, u_plane, v_plane, in.width, in.stride, in.plane,
            chroma_stride, top_out, bottom_out, u_target, v_target});
        top += 4 * done;
        bottom += 4 * done;
        top_out += 2 * done;
        bottom_out += 2 * done;
        for (uint32_t column = done; column < block_columns;
             ++column, top += 4, bottom += 4, top_out += 2, bottom_out += 2) {
            LumaBlock(luma, in, top, bottom, top_out, bottom_out);
            uint32_t const x = top[0];
            uint32_t const index = (x >> 1) + (uint32_t(top[1]) >> 1) * chroma_stride;
            bool const inside = index < chroma_limit && x < in.width;
            u_target[column] = inside ? u_plane[index] : BLACK_CHROMA;
            v_target[column] = inside ? v_plane[index] : BLACK_CHROMA;
        }
    }
}

void SimpleImageMap::RemapYuv411Planar(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination,
                                       Rows band) const {
    Frame const in(source);
    Frame const out(destination);
    uint32_t const block_columns = out.width >> 2;
    uint32_t const block_rows = out.height >> 2;
    if (block_rows == 0) {
        return;
    }
    uint32_t const chroma_limit = in.plane >> 4;
    uint32_t const chroma_stride = in.stride >> 2;
    unsigned char const* const luma = source.data;
    unsigned char const* const u_plane = source.data + in.plane;
    unsigned char const* const v_plane = u_plane + chroma_limit;
    uint32_t const out_chroma_stride = out.stride >> 2;
    unsigned char* const u_out = destination.data + out.plane;
    unsigned char* const v_out = u_out + (out.plane >> 4);
    size_t const table_pitch = 2 * size_t(uint32_t(GetMapWidth()));
    for (uint32_t block_row = band.first / 4; block_row < std::min(block_rows, band.end / 4);
         ++block_row) {
        uint32_t const row = 4 * block_row;
        unsigned short const* first = map.get() + size_t(row) * table_pitch;
        unsigned short const* second = first + table_pitch;
        unsigned short const* third = second + table_pitch;
        unsigned short const* fourth = third + table_pitch;
        unsigned char* first_out = destination.data + row * out.stride;
        unsigned char* second_out = first_out + out.stride;
        unsigned char* third_out = second_out + out.stride;
        unsigned char* fourth_out = third_out + out.stride;
        unsigned char* const u_target = u_out + block_row * out_chroma_stride;
        unsigned char* const v_target = v_out + block_row * out_chroma_stride;
        for (uint32_t column = 0; column < block_columns; ++column) {
            uint32_t const x = first[0];
            uint32_t const index = (x >> 2) + (uint32_t(first[1]) >> 2) * chroma_stride;
            bool const inside = index < chroma_limit && x < in.width;
            for (uint32_t pixel = 0; pixel < 4; ++pixel) {
                *first_out++ = Luma(luma, in, first);
                *second_out++ = Luma(luma, in, second);
                // Intended: the lower two rows index with the x of the block's second row;
                // the bound test still takes the row's own x.
                *third_out++ = Luma(luma, in, third, second[0]);
                *fourth_out++ = Luma(luma, in, fourth, second[0]);
                first += 2;
                second += 2;
                third += 2;
                fourth += 2;
            }
            u_target[column] = inside ? u_plane[index] : BLACK_CHROMA;
            v_target[column] = inside ? v_plane[index] : BLACK_CHROMA;
        }
    }
}

void SimpleImageMap::RemapNv420Planar(_DEWARP_IMAGE const& source, _DEWARP_IMAGE& destination,
                                      Rows band, BatchLanes const& lanes) const {
    Frame const in(source);
    Frame const out(destination);
    uint32_t const block_columns = out.width >> 1;
    uint32_t const block_rows = out.height >> 1;
    if (block_rows == 0) {
        return;
    }
    uint32_t const chroma_limit = in.plane >> 1;
    unsigned char const* const luma = source.data;
    unsigned char const* const chroma = source.data + in.plane;
    unsigned char* const chroma_out = destination.data + out.plane;
    size_t const table_pitch = 2 * size_t(uint32_t(GetMapWidth()));
    for (uint32_t block_row = band.first / 2; block_row < std::min(block_rows, band.end / 2);
         ++block_row) {
        uint32_t const row = 2 * block_row;
        unsigned short const* top = map.get() + size_t(row) * table_pitch;
        unsigned short const* bottom = top + table_pitch;
        unsigned char* top_out = destination.data + row * out.stride;
        unsigned char* bottom_out = top_out + out.stride;
        unsigned char* target = chroma_out + block_row * out.stride;
        uint32_t const done = lanes.remap_nv12_blocks(BatchLanes::Yuv420Row{
            top, bottom, block_columns, luma, chroma, nullptr, in.width, in.stride, in.plane,
            in.stride, top_out, bottom_out, target, nullptr});
        top += 4 * done;
        bottom += 4 * done;
        top_out += 2 * done;
        bottom_out += 2 * done;
        target += 2 * done;
        for (uint32_t column = done; column < block_columns;
             ++column, top += 4, bottom += 4, top_out += 2, bottom_out += 2, target += 2) {
            LumaBlock(luma, in, top, bottom, top_out, bottom_out);
            uint32_t const x = top[0];
            // Bit 0 cleared: the index lands on the U of the pair.
            uint32_t const index = ((uint32_t(top[1]) >> 1) * in.stride + x) & ~1u;
            // The pair's V is tested too: a chroma plane of odd size ends in a lone U, and the
            // byte after it lies past the frame.
            bool const inside = index + 1 < chroma_limit && x < in.width;
            target[0] = inside ? chroma[index] : BLACK_CHROMA;
            target[1] = inside ? chroma[index + 1] : BLACK_CHROMA;
        }
    }
}

}  // namespace quorvel::vexmap
