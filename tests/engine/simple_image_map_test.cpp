#include "vexmap/simple_image_map.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <new>
#include <random>
#include <string>
#include <thread>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "available_lanes.h"
#include "recording_log_sink.h"
#include "vexmap/batch_lanes.h"

namespace quorvel::vexmap {
namespace {

using ::testing::Each;
using ::testing::ElementsAre;
using ::testing::Not;

constexpr unsigned char MARKER = 0xA5;  // what a destination holds before a remap
constexpr size_t SLACK = 16;  // bytes after the last plane: the packed layouts read up to two past
constexpr unsigned short UNMAPPED = SimpleImageMap::MAX_MAP_VALUE;

_DEWARP_IMAGE_FORMAT const ALL_FORMATS[] = {
    DEWARP_IMAGE_FORMAT_RGB32_PACKED,   DEWARP_IMAGE_FORMAT_YUV422A_PACKED,
    DEWARP_IMAGE_FORMAT_YUV422B_PACKED, DEWARP_IMAGE_FORMAT_YUV422_PLANAR,
    DEWARP_IMAGE_FORMAT_YUV420_PLANAR,  DEWARP_IMAGE_FORMAT_YUV411_PLANAR,
    DEWARP_IMAGE_FORMAT_NV420_PLANAR};

std::string NameOf(_DEWARP_IMAGE_FORMAT format) {
    switch (format) {
        case DEWARP_IMAGE_FORMAT_RGB32_PACKED:
            return "Rgb32Packed";
        case DEWARP_IMAGE_FORMAT_YUV422A_PACKED:
            return "Yuv422aPacked";
        case DEWARP_IMAGE_FORMAT_YUV422B_PACKED:
            return "Yuv422bPacked";
        case DEWARP_IMAGE_FORMAT_YUV422_PLANAR:
            return "Yuv422Planar";
        case DEWARP_IMAGE_FORMAT_YUV420_PLANAR:
            return "Yuv420Planar";
        case DEWARP_IMAGE_FORMAT_YUV411_PLANAR:
            return "Yuv411Planar";
        case DEWARP_IMAGE_FORMAT_NV420_PLANAR:
            return "Nv420Planar";
    }
    return "Format" + std::to_string(int(format));
}

// The side of a block: whole blocks only are written.
uint32_t BlockSide(_DEWARP_IMAGE_FORMAT format) {
    switch (format) {
        case DEWARP_IMAGE_FORMAT_RGB32_PACKED:
            return 1;
        case DEWARP_IMAGE_FORMAT_YUV411_PLANAR:
            return 4;
        default:
            return 2;
    }
}

// Every plane of a frame, one after the other, as the layouts place them.
size_t FrameBytes(_DEWARP_IMAGE_FORMAT format, uint32_t height, uint32_t stride) {
    size_t const plane = height * stride;
    switch (format) {
        case DEWARP_IMAGE_FORMAT_RGB32_PACKED:
            return plane * 4;
        case DEWARP_IMAGE_FORMAT_YUV422A_PACKED:
        case DEWARP_IMAGE_FORMAT_YUV422B_PACKED:
            return plane * 2;
        case DEWARP_IMAGE_FORMAT_YUV422_PLANAR:
            return plane + 2 * (plane >> 1);
        case DEWARP_IMAGE_FORMAT_YUV420_PLANAR:
            return plane + 2 * (plane >> 2);
        case DEWARP_IMAGE_FORMAT_YUV411_PLANAR:
            return plane + 2 * (plane >> 4);
        case DEWARP_IMAGE_FORMAT_NV420_PLANAR:
            return plane + (plane >> 1);
    }
    return plane * 4;
}

/// A frame record over bytes of its own. The buffer is sized from the 32-bit height and stride,
/// so the other fields may hold anything.
struct Picture {
    Picture(_DEWARP_IMAGE_FORMAT format, size_t width, size_t height, size_t stride,
            unsigned char fill = MARKER)
        : bytes(FrameBytes(format, uint32_t(height), uint32_t(stride)) + SLACK, fill),
          image{{format, width, height, stride}, nullptr} {
        image.data = bytes.data();
    }
    Picture(Picture const& other) : bytes(other.bytes), image(other.image) {
        image.data = bytes.data();
    }
    Picture& operator=(Picture const&) = delete;

    std::vector<unsigned char> bytes;
    _DEWARP_IMAGE image;
};

// Numbered bytes that do not repeat every 256, so a look-up one row or plane off shows.
Picture Numbered(_DEWARP_IMAGE_FORMAT format, size_t width, size_t height, size_t stride) {
    Picture picture(format, width, height, stride);
    for (size_t i = 0; i < picture.bytes.size(); ++i) {
        picture.bytes[i] = static_cast<unsigned char>(i * 7 + 3 + i / 251);
    }
    return picture;
}

// `count` bytes from `first` on.
std::vector<unsigned char> Slice(std::vector<unsigned char> const& bytes, size_t first,
                                 size_t count) {
    return std::vector<unsigned char>(bytes.data() + first, bytes.data() + first + count);
}

void Set(SimpleImageMap const& map, uint32_t column, uint32_t row, unsigned short x,
         unsigned short y) {
    unsigned short* const entry =
        map.GetMap() + 2 * (size_t(row) * uint32_t(map.GetMapWidth()) + column);
    entry[0] = x;
    entry[1] = y;
}

void SetAll(SimpleImageMap const& map, unsigned short x, unsigned short y) {
    for (uint32_t row = 0; row < uint32_t(map.GetMapHeight()); ++row) {
        for (uint32_t column = 0; column < uint32_t(map.GetMapWidth()); ++column) {
            Set(map, column, row, x, y);
        }
    }
}

::testing::AssertionResult SameBytes(std::vector<unsigned char> const& expected,
                                     std::vector<unsigned char> const& actual) {
    if (expected.size() != actual.size()) {
        return ::testing::AssertionFailure()
               << "sizes " << expected.size() << " and " << actual.size();
    }
    size_t differences = 0;
    size_t first = 0;
    for (size_t i = 0; i < expected.size(); ++i) {
        if (expected[i] != actual[i] && differences++ == 0) {
            first = i;
        }
    }
    if (differences == 0) {
        return ::testing::AssertionSuccess();
    }
    return ::testing::AssertionFailure()
           << differences << " bytes differ, the first at " << first << ": expected "
           << int(expected[first]) << ", got " << int(actual[first]);
}

// The plain reference: one output pixel or block at a time, straight from the layout tables.
struct Entry {
    uint32_t x;
    uint32_t y;
};

Entry At(SimpleImageMap const& map, uint32_t column, uint32_t row) {
    unsigned short const* const entry =
        map.GetMap() + 2 * (size_t(row) * uint32_t(map.GetMapWidth()) + column);
    return {entry[0], entry[1]};
}

struct Sizes {
    explicit Sizes(_DEWARP_IMAGE const& image)
        : width(uint32_t(image.info.width)),
          height(uint32_t(image.info.height)),
          stride(uint32_t(image.info.stride)),
          plane(height * stride) {}
    uint32_t width;
    uint32_t height;
    uint32_t stride;
    uint32_t plane;
};

unsigned char ReferenceLuma(_DEWARP_IMAGE const& source, Entry entry) {
    Sizes const in(source);
    uint32_t const index = entry.y * in.stride + entry.x;
    return index < in.plane && entry.x < in.width ? source.data[index] : 16;
}

void ReferenceLumaBlock(SimpleImageMap const& map, _DEWARP_IMAGE const& source,
                        _DEWARP_IMAGE& destination, uint32_t first_column, uint32_t first_row,
                        uint32_t side) {
    Sizes const out(destination);
    for (uint32_t row = first_row; row < first_row + side; ++row) {
        for (uint32_t column = first_column; column < first_column + side; ++column) {
            destination.data[row * out.stride + column] =
                ReferenceLuma(source, At(map, column, row));
        }
    }
}

void ReferenceRgb32(SimpleImageMap const& map, _DEWARP_IMAGE const& source,
                    _DEWARP_IMAGE& destination) {
    Sizes const in(source);
    Sizes const out(destination);
    for (int32_t row = 0; row < int32_t(out.height); ++row) {
        for (int32_t column = 0; column < int32_t(out.width); ++column) {
            Entry const e = At(map, uint32_t(column), uint32_t(row));
            int32_t const index = int32_t(e.x + e.y * in.stride);
            bool const inside =
                index >= 0 && index < int32_t(in.plane) && int32_t(e.x) < int32_t(in.width);
            for (uint32_t byte = 0; byte < 4; ++byte) {
                destination.data[(uint32_t(row) * out.stride + uint32_t(column)) * 4 + byte] =
                    inside ? source.data[uint32_t(index) * 4 + byte] : 0;
            }
        }
    }
}

void ReferencePacked(SimpleImageMap const& map, _DEWARP_IMAGE const& source,
                     _DEWARP_IMAGE& destination, bool y_first) {
    Sizes const in(source);
    Sizes const out(destination);
    uint32_t const limit = in.plane * 2;
    for (uint32_t row = 0; row < 2 * (out.height >> 1); ++row) {
        for (uint32_t pair = 0; pair < (out.width >> 1); ++pair) {
            Entry const left = At(map, 2 * pair, row);
            Entry const right = At(map, 2 * pair + 1, row);
            uint32_t const b = left.y * (in.stride * 2) + left.x * 2;
            uint32_t const m = (b & 2) != 0 ? b - 2 : b;
            uint32_t const own = right.y * (in.stride * 2) + right.x * 2;
            bool const right_inside = own < limit && right.x < in.width;
            unsigned char* const target = destination.data + row * (out.stride * 2) + 4 * pair;
            if (!y_first) {  // U Y V Y
                bool const inside = b < limit && left.x < in.width;
                bool const chroma = inside && m + 2 < limit;  // a V past the frame is black
                target[0] = chroma ? source.data[m] : 128;
                target[1] = inside ? source.data[b | 1] : 16;
                target[2] = chroma ? source.data[m + 2] : 128;
                target[3] = right_inside ? source.data[own | 1] : 16;
            } else {  // Y U Y V
                bool const inside = m < limit && left.x < in.width;
                bool const chroma = inside && m + 3 < limit;  // a V past the frame is black
                target[0] = inside ? source.data[m] : 16;
                target[1] = chroma ? source.data[m + 1] : 128;
                target[2] = right_inside ? source.data[own] : 16;
                target[3] = chroma ? source.data[m + 3] : 128;
            }
        }
    }
}

void ReferenceYuv422Planar(SimpleImageMap const& map, _DEWARP_IMAGE const& source,
                           _DEWARP_IMAGE& destination) {
    Sizes const in(source);
    Sizes const out(destination);
    for (uint32_t r = 0; r < (out.height >> 1); ++r) {
        for (uint32_t c = 0; c < (out.width >> 1); ++c) {
            ReferenceLumaBlock(map, source, destination, 2 * c, 2 * r, 2);
            for (uint32_t k = 2 * r; k < 2 * r + 2; ++k) {
                Entry const e = At(map, 2 * c, k);
                uint32_t const index = (e.x >> 1) + ((e.y * in.stride) >> 1);
                bool const inside = index < (in.plane >> 1) && e.x < in.width;
                uint32_t const u = out.plane + k * (out.stride >> 1) + c;
                destination.data[u] = inside ? source.data[in.plane + index] : 128;
                destination.data[u + (out.plane >> 1)] =
                    inside ? source.data[in.plane + (in.plane >> 1) + index] : 128;
            }
        }
    }
}

void ReferenceYuv420Planar(SimpleImageMap const& map, _DEWARP_IMAGE const& source,
                           _DEWARP_IMAGE& destination) {
    Sizes const in(source);
    Sizes const out(destination);
    for (uint32_t r = 0; r < (out.height >> 1); ++r) {
        for (uint32_t c = 0; c < (out.width >> 1); ++c) {
            ReferenceLumaBlock(map, source, destination, 2 * c, 2 * r, 2);
            Entry const e = At(map, 2 * c, 2 * r);
            uint32_t const index = (e.x >> 1) + (e.y >> 1) * (in.stride >> 1);
            bool const inside = index < (in.plane >> 2) && e.x < in.width;
            uint32_t const u = out.plane + r * (out.stride >> 1) + c;
            destination.data[u] = inside ? source.data[in.plane + index] : 128;
            destination.data[u + (out.plane >> 2)] =
                inside ? source.data[in.plane + (in.plane >> 2) + index] : 128;
        }
    }
}

void ReferenceYuv411Planar(SimpleImageMap const& map, _DEWARP_IMAGE const& source,
                           _DEWARP_IMAGE& destination) {
    Sizes const in(source);
    Sizes const out(destination);
    for (uint32_t r = 0; r < (out.height >> 2); ++r) {
        for (uint32_t c = 0; c < (out.width >> 2); ++c) {
            for (uint32_t row = 4 * r; row < 4 * r + 4; ++row) {
                for (uint32_t column = 4 * c; column < 4 * c + 4; ++column) {
                    Entry const own = At(map, column, row);
                    uint32_t const x = row - 4 * r < 2 ? own.x : At(map, column, 4 * r + 1).x;
                    uint32_t const index = own.y * in.stride + x;
                    destination.data[row * out.stride + column] =
                        index < in.plane && own.x < in.width ? source.data[index] : 16;
                }
            }
            Entry const e = At(map, 4 * c, 4 * r);
            uint32_t const index = (e.x >> 2) + (e.y >> 2) * (in.stride >> 2);
            bool const inside = index < (in.plane >> 4) && e.x < in.width;
            uint32_t const u = out.plane + r * (out.stride >> 2) + c;
            destination.data[u] = inside ? source.data[in.plane + index] : 128;
            destination.data[u + (out.plane >> 4)] =
                inside ? source.data[in.plane + (in.plane >> 4) + index] : 128;
        }
    }
}

void ReferenceNv420Planar(SimpleImageMap const& map, _DEWARP_IMAGE const& source,
                          _DEWARP_IMAGE& destination) {
    Sizes const in(source);
    Sizes const out(destination);
    for (uint32_t r = 0; r < (out.height >> 1); ++r) {
        for (uint32_t c = 0; c < (out.width >> 1); ++c) {
            ReferenceLumaBlock(map, source, destination, 2 * c, 2 * r, 2);
            Entry const e = At(map, 2 * c, 2 * r);
            uint32_t const index = ((e.y >> 1) * in.stride + e.x) & ~1u;
            bool const inside = index + 1 < (in.plane >> 1) && e.x < in.width;
            uint32_t const target = out.plane + r * out.stride + 2 * c;
            destination.data[target] = inside ? source.data[in.plane + index] : 128;
            destination.data[target + 1] = inside ? source.data[in.plane + index + 1] : 128;
        }
    }
}

void ReferenceRemap(SimpleImageMap const& map, _DEWARP_IMAGE const& source,
                    _DEWARP_IMAGE& destination) {
    switch (source.info.format) {
        case DEWARP_IMAGE_FORMAT_RGB32_PACKED:
            return ReferenceRgb32(map, source, destination);
        case DEWARP_IMAGE_FORMAT_YUV422A_PACKED:
            return ReferencePacked(map, source, destination, false);
        case DEWARP_IMAGE_FORMAT_YUV422B_PACKED:
            return ReferencePacked(map, source, destination, true);
        case DEWARP_IMAGE_FORMAT_YUV422_PLANAR:
            return ReferenceYuv422Planar(map, source, destination);
        case DEWARP_IMAGE_FORMAT_YUV420_PLANAR:
            return ReferenceYuv420Planar(map, source, destination);
        case DEWARP_IMAGE_FORMAT_YUV411_PLANAR:
            return ReferenceYuv411Planar(map, source, destination);
        case DEWARP_IMAGE_FORMAT_NV420_PLANAR:
            return ReferenceNv420Planar(map, source, destination);
    }
}

// The bytes of `picture` that a remap writes, read back in plane order.
std::vector<unsigned char> WrittenBytes(Picture const& picture) {
    Sizes const out(picture.image);
    _DEWARP_IMAGE_FORMAT const format = picture.image.info.format;
    uint32_t const side = BlockSide(format);
    uint32_t const columns = out.width / side * side;
    uint32_t const rows = out.height / side * side;
    std::vector<unsigned char> written;
    auto take = [&](uint32_t offset, uint32_t count) {
        std::vector<unsigned char> const part = Slice(picture.bytes, offset, count);
        written.insert(written.end(), part.begin(), part.end());
    };
    for (uint32_t row = 0; row < rows; ++row) {
        switch (format) {
            case DEWARP_IMAGE_FORMAT_RGB32_PACKED:
                take(row * out.stride * 4, columns * 4);
                break;
            case DEWARP_IMAGE_FORMAT_YUV422A_PACKED:
            case DEWARP_IMAGE_FORMAT_YUV422B_PACKED:
                take(row * out.stride * 2, columns * 2);
                break;
            default:
                take(row * out.stride, columns);
        }
    }
    switch (format) {
        case DEWARP_IMAGE_FORMAT_YUV422_PLANAR:
            for (uint32_t plane = 0; plane < 2; ++plane) {
                for (uint32_t row = 0; row < rows; ++row) {
                    take(out.plane + plane * (out.plane >> 1) + row * (out.stride >> 1),
                         columns / 2);
                }
            }
            break;
        case DEWARP_IMAGE_FORMAT_YUV420_PLANAR:
            for (uint32_t plane = 0; plane < 2; ++plane) {
                for (uint32_t row = 0; row < rows / 2; ++row) {
                    take(out.plane + plane * (out.plane >> 2) + row * (out.stride >> 1),
                         columns / 2);
                }
            }
            break;
        case DEWARP_IMAGE_FORMAT_YUV411_PLANAR:
            for (uint32_t plane = 0; plane < 2; ++plane) {
                for (uint32_t row = 0; row < rows / 4; ++row) {
                    take(out.plane + plane * (out.plane >> 4) + row * (out.stride >> 2),
                         columns / 4);
                }
            }
            break;
        case DEWARP_IMAGE_FORMAT_NV420_PLANAR:
            for (uint32_t row = 0; row < rows / 2; ++row) {
                take(out.plane + row * out.stride, columns);
            }
            break;
        default:
            break;
    }
    return written;
}

// Black in the same order as WrittenBytes reads it.
std::vector<unsigned char> BlackBytes(Picture const& picture) {
    Picture black(picture);
    Sizes const out(picture.image);
    _DEWARP_IMAGE_FORMAT const format = picture.image.info.format;
    size_t const luma_bytes = size_t(out.plane);
    for (size_t i = 0; i < black.bytes.size(); ++i) {
        switch (format) {
            case DEWARP_IMAGE_FORMAT_RGB32_PACKED:
                black.bytes[i] = 0;
                break;
            case DEWARP_IMAGE_FORMAT_YUV422A_PACKED:
                black.bytes[i] = i % 2 == 0 ? 128 : 16;
                break;
            case DEWARP_IMAGE_FORMAT_YUV422B_PACKED:
                black.bytes[i] = i % 2 == 0 ? 16 : 128;
                break;
            default:
                black.bytes[i] = i < luma_bytes ? 16 : 128;
        }
    }
    return WrittenBytes(black);
}

/// A map of the destination's size whose entries all hold (x, y), run over `source`.
Picture RemapEverywhere(_DEWARP_IMAGE const& source, size_t width, size_t height, unsigned short x,
                        unsigned short y) {
    SimpleImageMap const map{int(width), int(height)};
    SetAll(map, x, y);
    Picture destination(source.info.format, width, height, width);
    map.Remap(source, destination.image);
    return destination;
}

TEST(SimpleImageMap, DefaultConstructedMapHasNoTable) {
    SimpleImageMap const map;
    EXPECT_TRUE(map.Empty());
    EXPECT_EQ(nullptr, map.GetMap());
    EXPECT_EQ(0, map.GetMapWidth());
    EXPECT_EQ(0, map.GetMapHeight());
}

TEST(SimpleImageMap, NewTableHasEveryEntryUnmapped) {
    SimpleImageMap const map(3, 2);
    ASSERT_FALSE(map.Empty());
    std::vector<unsigned short> const words(map.GetMap(), map.GetMap() + 12);
    EXPECT_THAT(words, Each(UNMAPPED));
    EXPECT_EQ(3, map.GetMapWidth());
    EXPECT_EQ(2, map.GetMapHeight());
    EXPECT_EQ(Resolution(3, 2), map.GetMapSize());
}

TEST(SimpleImageMap, ConstructorFromResolutionTruncatesTheSizes) {
    Resolution size(7, 5);
    size /= 2.0f;  // in place, so not floored: 3.5 x 2.5
    SimpleImageMap const map(size);
    EXPECT_EQ(3, map.GetMapWidth());
    EXPECT_EQ(2, map.GetMapHeight());
    EXPECT_EQ(3.0f, map.GetMapSize().x);
    EXPECT_EQ(2.0f, map.GetMapSize().y);
}

TEST(SimpleImageMap, SetMapSizeFromResolutionTruncatesTheSizes) {
    Resolution size(9, 3);
    size /= 2.0f;
    SimpleImageMap map;
    map.SetMapSize(size);
    EXPECT_EQ(4, map.GetMapWidth());
    EXPECT_EQ(1, map.GetMapHeight());
}

TEST(SimpleImageMap, GettersTruncateAFractionalMapSize) {
    SimpleImageMap map(4, 4);
    map.map_size = Resolution(10, 6);
    map.map_size /= 4.0f;  // 2.5 x 1.5
    EXPECT_EQ(2, map.GetMapWidth());
    EXPECT_EQ(1, map.GetMapHeight());
    EXPECT_EQ(2.5f, map.GetMapSize().x);
}

TEST(SimpleImageMap, CopySharesTheTableAndCarriesTheSizes) {
    SimpleImageMap original(2, 2);
    original.image_size = Resolution(640, 480);
    SimpleImageMap const copy(original);
    EXPECT_EQ(original.GetMap(), copy.GetMap());
    EXPECT_EQ(2, original.map.use_count());
    EXPECT_EQ(Resolution(2, 2), copy.GetMapSize());
    EXPECT_EQ(Resolution(640, 480), copy.image_size);
    Set(original, 1, 1, 7, 8);
    EXPECT_EQ(7u, At(copy, 1, 1).x);
}

TEST(SimpleImageMap, AssignmentSharesTheTableAndCopiesBothSizes) {
    SimpleImageMap source(4, 3);
    source.image_size = Resolution(1936, 1936);
    SimpleImageMap target(1, 1);
    target = source;
    EXPECT_EQ(source.GetMap(), target.GetMap());
    EXPECT_EQ(4, target.GetMapWidth());
    EXPECT_EQ(3, target.GetMapHeight());
    EXPECT_EQ(Resolution(1936, 1936), target.image_size);
}

TEST(SimpleImageMap, AssigningAnEmptyMapDropsTheTable) {
    SimpleImageMap target(2, 2);
    target = SimpleImageMap();
    EXPECT_TRUE(target.Empty());
    EXPECT_EQ(0, target.GetMapWidth());
}

TEST(SimpleImageMap, SetMapSizeOnACopyLeavesTheFirstObjectsEntriesUnchanged) {
    SimpleImageMap first(2, 2);
    Set(first, 0, 0, 11, 12);
    unsigned short* const table = first.GetMap();
    SimpleImageMap copy(first);
    copy.SetMapSize(2, 2);
    EXPECT_NE(table, copy.GetMap());
    EXPECT_EQ(table, first.GetMap());
    EXPECT_EQ(11u, At(first, 0, 0).x);
    EXPECT_EQ(12u, At(first, 0, 0).y);
    EXPECT_EQ(uint32_t(UNMAPPED), At(copy, 0, 0).x);
    EXPECT_EQ(1, first.map.use_count());
}

TEST(SimpleImageMap, SelfAssignmentLogsAWarningAndKeepsTheTable) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    SimpleImageMap map(3, 3);
    Set(map, 2, 2, 5, 6);
    unsigned short* const table = map.GetMap();
    SimpleImageMap& same = map;
    map = same;
    EXPECT_EQ(table, map.GetMap());
    EXPECT_EQ(1, map.map.use_count());
    EXPECT_EQ(5u, At(map, 2, 2).x);
    EXPECT_EQ(3, map.GetMapWidth());
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of %s object\n", lines[0].format);
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of SimpleImageMap object\n", lines[0].text);
}

TEST(SimpleImageMap, FillMapSetsEveryEntryBackToUnmapped) {
    SimpleImageMap map(5, 3);
    SetAll(map, 1, 2);
    map.FillMap();
    std::vector<unsigned short> const words(map.GetMap(), map.GetMap() + 30);
    EXPECT_THAT(words, Each(UNMAPPED));
}

TEST(SimpleImageMap, FillMapWithoutATableDoesNothing) {
    SimpleImageMap map;
    map.map_size = Resolution(4, 4);  // a size without a table
    map.FillMap();
    EXPECT_TRUE(map.Empty());
}

TEST(SimpleImageMap, SetMapSizeGivesAFreshBlankTable) {
    SimpleImageMap map(2, 2);
    SetAll(map, 0, 0);
    unsigned short* const old_table = map.GetMap();
    SimpleImageMap const keeper(map);
    map.SetMapSize(3, 1);
    EXPECT_NE(old_table, map.GetMap());
    EXPECT_EQ(3, map.GetMapWidth());
    EXPECT_EQ(1, map.GetMapHeight());
    std::vector<unsigned short> const words(map.GetMap(), map.GetMap() + 6);
    EXPECT_THAT(words, Each(UNMAPPED));
    EXPECT_EQ(0u, At(keeper, 1, 1).y);
}

// The builders' form: a table of the size for the builder to fill, the old one left to its other
// holders, and the same refusal of a size whose word count is negative.
TEST(SimpleImageMap, ReserveMapSizeGivesAFreshTableOfTheSizeAndLeavesTheOldOneToItsHolders) {
    SimpleImageMap map(2, 2);
    SetAll(map, 7, 8);
    SimpleImageMap const keeper(map);
    map.ReserveMapSize(5, 3);
    EXPECT_NE(keeper.GetMap(), map.GetMap());
    EXPECT_EQ(5, map.GetMapWidth());
    EXPECT_EQ(3, map.GetMapHeight());
    SetAll(map, 1, 2);
    EXPECT_EQ(7u, At(keeper, 1, 1).x);
    EXPECT_EQ(8u, At(keeper, 1, 1).y);
    unsigned short* const table = map.GetMap();
    EXPECT_THROW(map.ReserveMapSize(40000, 40000), std::bad_alloc);
    EXPECT_EQ(table, map.GetMap());
    EXPECT_EQ(5, map.GetMapWidth());
}

TEST(SimpleImageMap, NegativeWordCountMakesSetMapSizeThrowBadAllocAndKeepsTheOldTable) {
    SimpleImageMap map(2, 3);
    map.image_size = Resolution(100, 50);
    Set(map, 1, 2, 9, 10);
    unsigned short* const table = map.GetMap();
    EXPECT_THROW(map.SetMapSize(-1, 3), std::bad_alloc);
    EXPECT_THROW(map.SetMapSize(40000, 40000), std::bad_alloc);  // 3.2e9 words: negative in 32 bits
    EXPECT_EQ(table, map.GetMap());
    EXPECT_EQ(2, map.GetMapWidth());
    EXPECT_EQ(3, map.GetMapHeight());
    EXPECT_EQ(Resolution(100, 50), map.image_size);
    EXPECT_EQ(9u, At(map, 1, 2).x);
    EXPECT_EQ(10u, At(map, 1, 2).y);
    EXPECT_THROW(SimpleImageMap(5, -2), std::bad_alloc);
}

TEST(SimpleImageMap, WordCountThatWrapsToAPositiveValueIsNotNoticed) {
    SimpleImageMap map;
    map.SetMapSize(65536, 32768);  // 2^32 words, 0 in 32 bits
    EXPECT_FALSE(map.Empty());
    EXPECT_EQ(65536, map.GetMapWidth());
    EXPECT_EQ(32768, map.GetMapHeight());
    map.SetMapSize(-2, -3);  // two negatives make a positive count
    EXPECT_EQ(-2, map.GetMapWidth());
    EXPECT_EQ(-3, map.GetMapHeight());
}

struct RemapCase {
    _DEWARP_IMAGE_FORMAT format;
    uint32_t width;  // destination
    uint32_t height;
    uint32_t stride;
    uint32_t source_width;
    uint32_t source_height;
    uint32_t source_stride;
    uint32_t extra_map_columns;  // the map's pitch is its own, not the destination's
};

std::string CaseName(::testing::TestParamInfo<RemapCase> const& info) {
    RemapCase const& c = info.param;
    return NameOf(c.format) + "To" + std::to_string(c.width) + "x" + std::to_string(c.height) +
           "Stride" + std::to_string(c.stride) + "From" + std::to_string(c.source_width) + "x" +
           std::to_string(c.source_height) + "Stride" + std::to_string(c.source_stride) + "Pitch" +
           std::to_string(c.width + c.extra_map_columns);
}

std::vector<RemapCase> Cases() {
    struct Size {
        uint32_t width;
        uint32_t height;
    };
    Size const destinations[] = {{1, 1}, {2, 2}, {3, 5},   {5, 3},  {7, 9},
                                 {4, 4}, {8, 6}, {16, 12}, {33, 17}};
    RemapCase const sources[] = {{DEWARP_IMAGE_FORMAT_RGB32_PACKED, 0, 0, 0, 13, 11, 16, 0},
                                 {DEWARP_IMAGE_FORMAT_RGB32_PACKED, 0, 0, 0, 40, 30, 40, 3},
                                 {DEWARP_IMAGE_FORMAT_RGB32_PACKED, 0, 0, 0, 6, 5, 7, 0}};
    std::vector<RemapCase> cases;
    for (_DEWARP_IMAGE_FORMAT const format : ALL_FORMATS) {
        for (Size const size : destinations) {
            for (uint32_t const padding : {0u, 3u}) {
                for (RemapCase source : sources) {
                    source.format = format;
                    source.width = size.width;
                    source.height = size.height;
                    source.stride = size.width + padding;
                    cases.push_back(source);
                }
            }
        }
    }
    return cases;
}

/// Random coordinates with every kind of entry that matters: unmapped ones, x at the width, y at
/// the height, points just outside the picture, and wild 16-bit words.
void FillRandomly(SimpleImageMap const& map, uint32_t source_width, uint32_t source_height,
                  unsigned seed) {
    std::mt19937 random(seed);
    auto below = [&random](uint32_t bound) {
        return static_cast<unsigned short>(
            std::uniform_int_distribution<uint32_t>(0, bound - 1)(random));
    };
    auto word = [](uint32_t value) { return static_cast<unsigned short>(value); };
    for (uint32_t row = 0; row < uint32_t(map.GetMapHeight()); ++row) {
        for (uint32_t column = 0; column < uint32_t(map.GetMapWidth()); ++column) {
            switch (below(20)) {
                case 0:
                case 1:
                    Set(map, column, row, UNMAPPED, UNMAPPED);
                    break;
                case 2:
                    Set(map, column, row, word(source_width), below(source_height));
                    break;
                case 3:
                    Set(map, column, row, below(source_width), word(source_height));
                    break;
                case 4:
                    Set(map, column, row, word(source_width - 1 + below(3)),
                        word(source_height - 1 + below(3)));
                    break;
                case 5:
                    Set(map, column, row, below(65536), below(65536));
                    break;
                case 6:
                    Set(map, column, row, below(source_width + 4), below(source_height + 4));
                    break;
                default:
                    Set(map, column, row, below(source_width), below(source_height));
            }
        }
    }
}

class SimpleImageMapTest : public ::testing::TestWithParam<RemapCase> {};

TEST_P(SimpleImageMapTest, MatchesThePlainReferenceAndLeavesTheRestOfTheBufferAlone) {
    RemapCase const& c = GetParam();
    Picture const source = Numbered(c.format, c.source_width, c.source_height, c.source_stride);
    SimpleImageMap const map(int(c.width + c.extra_map_columns), int(c.height));
    for (unsigned seed = 1; seed <= 3; ++seed) {
        FillRandomly(map, c.source_width, c.source_height, seed * 7919u + c.width * 31u + c.height);
        Picture expected(c.format, c.width, c.height, c.stride);
        ReferenceRemap(map, source.image, expected.image);
        Picture actual(c.format, c.width, c.height, c.stride);
        map.Remap(source.image, actual.image);
        EXPECT_TRUE(SameBytes(expected.bytes, actual.bytes)) << "seed " << seed;
    }
}

INSTANTIATE_TEST_SUITE_P(FormatsAndSizes, SimpleImageMapTest, ::testing::ValuesIn(Cases()),
                         CaseName);

TEST(SimpleImageMap, EachRoutineMatchesTheReferenceWhenCalledByName) {
    using Routine = void (SimpleImageMap::*)(_DEWARP_IMAGE const&, _DEWARP_IMAGE&) const;
    Routine const routines[] = {
        &SimpleImageMap::RemapRgb32Packed,   &SimpleImageMap::RemapYuv422aPacked,
        &SimpleImageMap::RemapYuv422bPacked, &SimpleImageMap::RemapYuv422Planar,
        &SimpleImageMap::RemapYuv420Planar,  &SimpleImageMap::RemapYuv411Planar,
        &SimpleImageMap::RemapNv420Planar};
    SimpleImageMap const map(12, 8);
    FillRandomly(map, 20, 14, 99);
    for (int i = 0; i < 7; ++i) {
        _DEWARP_IMAGE_FORMAT const format = ALL_FORMATS[i];
        Picture const source = Numbered(format, 20, 14, 22);
        Picture expected(format, 12, 8, 12);
        ReferenceRemap(map, source.image, expected.image);
        Picture actual(format, 12, 8, 12);
        (map.*routines[i])(source.image, actual.image);
        EXPECT_TRUE(SameBytes(expected.bytes, actual.bytes)) << NameOf(format);
    }
}

TEST(SimpleImageMap, BlankMapGivesAnAllBlackPictureInEveryFormat) {
    for (_DEWARP_IMAGE_FORMAT const format : ALL_FORMATS) {
        Picture const source = Numbered(format, 16, 16, 16);
        SimpleImageMap const map(8, 8);
        Picture destination(format, 8, 8, 8);
        map.Remap(source.image, destination.image);
        std::vector<unsigned char> const written = WrittenBytes(destination);
        EXPECT_EQ(BlackBytes(destination), written) << NameOf(format);
        EXPECT_FALSE(written.empty());
    }
}

TEST(SimpleImageMap, BlackIsLuma16Chroma128AndRgbWordZero) {
    Picture const source = Numbered(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 4, 4, 4);
    Picture const picture = RemapEverywhere(source.image, 2, 2, UNMAPPED, UNMAPPED);
    EXPECT_THAT(Slice(picture.bytes, 0, 6), ElementsAre(16, 16, 16, 16, 128, 128));
    Picture const rgb_source = Numbered(DEWARP_IMAGE_FORMAT_RGB32_PACKED, 4, 4, 4);
    Picture const rgb = RemapEverywhere(rgb_source.image, 1, 1, UNMAPPED, UNMAPPED);
    EXPECT_THAT(Slice(rgb.bytes, 0, 4), ElementsAre(0, 0, 0, 0));
    Picture const uyvy_source = Numbered(DEWARP_IMAGE_FORMAT_YUV422A_PACKED, 4, 4, 4);
    Picture const uyvy = RemapEverywhere(uyvy_source.image, 2, 2, UNMAPPED, UNMAPPED);
    EXPECT_THAT(Slice(uyvy.bytes, 0, 4), ElementsAre(128, 16, 128, 16));
    Picture const yuyv_source = Numbered(DEWARP_IMAGE_FORMAT_YUV422B_PACKED, 4, 4, 4);
    Picture const yuyv = RemapEverywhere(yuyv_source.image, 2, 2, UNMAPPED, UNMAPPED);
    EXPECT_THAT(Slice(yuyv.bytes, 0, 4), ElementsAre(16, 128, 16, 128));
}

TEST(SimpleImageMap, UnmappedEntryGivesBlackForAnySourceSizeBelow65536) {
    struct Size {
        size_t width;
        size_t height;
        size_t stride;
    };
    Size const sizes[] = {{4, 3, 4}, {65535, 2, 65535}, {1, 65535, 1}, {300, 20, 65535}};
    for (_DEWARP_IMAGE_FORMAT const format : ALL_FORMATS) {
        for (Size const size : sizes) {
            Picture const source = Numbered(format, size.width, size.height, size.stride);
            Picture const picture = RemapEverywhere(source.image, 4, 4, UNMAPPED, UNMAPPED);
            EXPECT_EQ(BlackBytes(picture), WrittenBytes(picture))
                << NameOf(format) << " from " << size.width << " x " << size.height;
        }
    }
}

TEST(SimpleImageMap, XAtTheSourceWidthGivesBlackAlthoughItsIndexIsInside) {
    for (_DEWARP_IMAGE_FORMAT const format : ALL_FORMATS) {
        Picture const source = Numbered(format, 4, 3, 4);
        Picture const picture = RemapEverywhere(source.image, 4, 4, 4, 0);  // index 4 of 12
        EXPECT_EQ(BlackBytes(picture), WrittenBytes(picture)) << NameOf(format);
        Picture const inside = RemapEverywhere(source.image, 4, 4, 3, 0);
        EXPECT_NE(BlackBytes(inside), WrittenBytes(inside)) << NameOf(format);
    }
}

TEST(SimpleImageMap, YAtTheSourceHeightGivesBlack) {
    for (_DEWARP_IMAGE_FORMAT const format : ALL_FORMATS) {
        Picture const source = Numbered(format, 8, 8, 8);
        Picture const picture = RemapEverywhere(source.image, 4, 4, 0, 8);
        EXPECT_EQ(BlackBytes(picture), WrittenBytes(picture)) << NameOf(format);
        Picture const last_row = RemapEverywhere(source.image, 4, 4, 0, 7);
        EXPECT_NE(BlackBytes(last_row), WrittenBytes(last_row)) << NameOf(format);
    }
}

TEST(SimpleImageMap, YBeyondThePictureFallsOutThroughTheIndexAlone) {
    Picture const source = Numbered(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 8, 8, 8);
    Picture const picture = RemapEverywhere(source.image, 2, 2, 1, 40000);
    EXPECT_EQ(BlackBytes(picture), WrittenBytes(picture));
}

TEST(SimpleImageMap, ChromaOfA420BlockDependsOnItsTopLeftEntryOnly) {
    Picture const source = Numbered(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 8, 8, 8);
    SimpleImageMap const map(2, 2);
    Set(map, 0, 0, 2, 2);
    Set(map, 1, 0, 5, 1);
    Set(map, 0, 1, 6, 7);
    Set(map, 1, 1, 1, 6);
    Picture before(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 2, 2, 2);
    map.Remap(source.image, before.image);
    Set(map, 1, 0, UNMAPPED, UNMAPPED);
    Set(map, 0, 1, UNMAPPED, UNMAPPED);
    Set(map, 1, 1, UNMAPPED, UNMAPPED);
    Picture after(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 2, 2, 2);
    map.Remap(source.image, after.image);
    EXPECT_EQ(source.bytes[2 * 8 + 2], after.bytes[0]);
    EXPECT_THAT(Slice(after.bytes, 1, 3), ElementsAre(16, 16, 16));
    EXPECT_EQ(source.bytes[64 + 1 * 4 + 1], after.bytes[4]);       // U at (1, 1) of 4 x 4
    EXPECT_EQ(source.bytes[64 + 16 + 1 * 4 + 1], after.bytes[5]);  // V likewise
    EXPECT_EQ(before.bytes[4], after.bytes[4]);
    EXPECT_EQ(before.bytes[5], after.bytes[5]);
}

TEST(SimpleImageMap, DestinationNarrowerOrLowerThanABlockIsUntouched) {
    struct Size {
        size_t width;
        size_t height;
    };
    for (_DEWARP_IMAGE_FORMAT const format : ALL_FORMATS) {
        if (format == DEWARP_IMAGE_FORMAT_RGB32_PACKED) {
            continue;
        }
        size_t const small = format == DEWARP_IMAGE_FORMAT_YUV411_PLANAR ? 3 : 1;
        Picture const source = Numbered(format, 16, 16, 16);
        for (Size const size : {Size{small, small}, Size{small, 8}, Size{8, small}}) {
            SimpleImageMap const map{int(size.width), int(size.height)};
            SetAll(map, 1, 1);
            Picture destination(format, size.width, size.height, size.width);
            map.Remap(source.image, destination.image);
            EXPECT_THAT(destination.bytes, Each(MARKER))
                << NameOf(format) << " " << size.width << " x " << size.height;
        }
    }
}

TEST(SimpleImageMap, FifthRowOfADestinationOfHeightFiveIsUntouched) {
    for (_DEWARP_IMAGE_FORMAT const format : ALL_FORMATS) {
        if (BlockSide(format) != 2) {
            continue;
        }
        Picture const source = Numbered(format, 16, 16, 16);
        SimpleImageMap const map(4, 5);
        SetAll(map, 3, 3);
        Picture destination(format, 4, 5, 4);
        map.Remap(source.image, destination.image);
        size_t const row_bytes = format == DEWARP_IMAGE_FORMAT_YUV422A_PACKED ||
                                         format == DEWARP_IMAGE_FORMAT_YUV422B_PACKED
                                     ? 8
                                     : 4;
        std::vector<unsigned char> const fourth =
            Slice(destination.bytes, 3 * row_bytes, row_bytes);
        std::vector<unsigned char> const fifth = Slice(destination.bytes, 4 * row_bytes, row_bytes);
        EXPECT_THAT(fourth, Not(Each(MARKER))) << NameOf(format);
        EXPECT_THAT(fifth, Each(MARKER)) << NameOf(format);
    }
}

TEST(SimpleImageMap, Yuv411DoesWholeFourByFourBlocksOnly) {
    Picture const source = Numbered(DEWARP_IMAGE_FORMAT_YUV411_PLANAR, 16, 16, 16);
    SimpleImageMap const map(7, 6);
    SetAll(map, 2, 2);
    Picture destination(DEWARP_IMAGE_FORMAT_YUV411_PLANAR, 7, 6, 7);
    map.Remap(source.image, destination.image);
    for (size_t row = 0; row < 6; ++row) {
        for (size_t column = 0; column < 7; ++column) {
            bool const written = row < 4 && column < 4;
            EXPECT_EQ(written ? source.bytes[2 * 16 + 2] : MARKER,
                      destination.bytes[row * 7 + column])
                << row << ", " << column;
        }
    }
}

TEST(SimpleImageMap, DestinationSizeDrivesTheWalkAndTheMapGivesOnlyThePitch) {
    Picture const source = Numbered(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 8, 8, 8);
    SimpleImageMap const map(5, 4);  // wider than the 2 x 2 destination
    Set(map, 0, 1, 3, 4);            // second table row starts five entries in
    Set(map, 2, 0, 7, 7);            // beyond the destination: never read
    Picture destination(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 2, 2, 2);
    map.Remap(source.image, destination.image);
    EXPECT_THAT(Slice(destination.bytes, 0, 4), ElementsAre(16, 16, source.bytes[4 * 8 + 3], 16));
}

TEST(SimpleImageMap, Yuv422bLeftPixelShowsTheFirstLumaOfItsSourcePairNotItsOwn) {
    Picture const source = Numbered(DEWARP_IMAGE_FORMAT_YUV422B_PACKED, 8, 4, 8);
    SimpleImageMap const map(2, 2);
    SetAll(map, 5, 1);  // the odd pixel of a source pair: bytes Y4 U Y5 V from 24
    Picture destination(DEWARP_IMAGE_FORMAT_YUV422B_PACKED, 2, 2, 2);
    map.Remap(source.image, destination.image);
    uint32_t const own = 1 * 16 + 5 * 2;
    EXPECT_EQ(source.bytes[own - 2], destination.bytes[0]);  // Y4, not Y5
    EXPECT_EQ(source.bytes[own - 1], destination.bytes[1]);  // U
    EXPECT_EQ(source.bytes[own], destination.bytes[2]);      // the right pixel keeps its own
    EXPECT_EQ(source.bytes[own + 1], destination.bytes[3]);  // V
}

TEST(SimpleImageMap, Yuv422aLeftPixelShowsItsOwnLuma) {
    Picture const source = Numbered(DEWARP_IMAGE_FORMAT_YUV422A_PACKED, 8, 4, 8);
    SimpleImageMap const map(2, 2);
    SetAll(map, 5, 1);  // bytes U Y4 V Y5 from 24
    Picture destination(DEWARP_IMAGE_FORMAT_YUV422A_PACKED, 2, 2, 2);
    map.Remap(source.image, destination.image);
    uint32_t const own = 1 * 16 + 5 * 2;
    EXPECT_THAT(Slice(destination.bytes, 0, 4),
                ElementsAre(source.bytes[own - 2], source.bytes[own + 1], source.bytes[own],
                            source.bytes[own + 1]));
}

TEST(SimpleImageMap, PackedLayoutsMakeTheirBoundTestOnDifferentOffsets) {
    // Three pixels in one row: the odd pixel just past the end has its pair's start inside.
    Picture const uyvy_source = Numbered(DEWARP_IMAGE_FORMAT_YUV422A_PACKED, 3, 1, 3);
    Picture const uyvy = RemapEverywhere(uyvy_source.image, 2, 2, 0, 1);  // pixel 3, byte 6
    EXPECT_THAT(Slice(uyvy.bytes, 0, 4), ElementsAre(128, 16, 128, 16));
    Picture const yuyv_source = Numbered(DEWARP_IMAGE_FORMAT_YUV422B_PACKED, 3, 1, 3);
    Picture const yuyv = RemapEverywhere(yuyv_source.image, 2, 2, 0, 1);
    // The pair's start passes where the pixel's own offset fails: its luma shows. Its V would
    // lie past the six bytes of the frame, so its chroma is black.
    EXPECT_THAT(Slice(yuyv.bytes, 0, 4), ElementsAre(yuyv_source.bytes[4], 128, 16, 128));
}

TEST(SimpleImageMap, APackedPairCutByTheEndOfAnOddFrameHasBlackChroma) {
    // Three pixels in one row: six bytes, the last pair holds U Y and no V.
    Picture const uyvy_source = Numbered(DEWARP_IMAGE_FORMAT_YUV422A_PACKED, 3, 1, 3);
    Picture const uyvy = RemapEverywhere(uyvy_source.image, 2, 2, 2, 0);  // byte 4, pair at 4
    EXPECT_THAT(Slice(uyvy.bytes, 0, 4),
                ElementsAre(128, uyvy_source.bytes[5], 128, uyvy_source.bytes[5]));
    Picture const yuyv_source = Numbered(DEWARP_IMAGE_FORMAT_YUV422B_PACKED, 3, 1, 3);
    Picture const yuyv = RemapEverywhere(yuyv_source.image, 2, 2, 2, 0);
    EXPECT_THAT(Slice(yuyv.bytes, 0, 4),
                ElementsAre(yuyv_source.bytes[4], 128, yuyv_source.bytes[4], 128));
}

TEST(SimpleImageMap, AnNvChromaPlaneOfOddSizeEndsInBlackRatherThanPastTheFrame) {
    // 31 x 2: a chroma plane of 31 bytes, whose last even index has no V after it.
    Picture const source = Numbered(DEWARP_IMAGE_FORMAT_NV420_PLANAR, 31, 2, 31);
    Picture const destination = RemapEverywhere(source.image, 2, 2, 30, 1);
    EXPECT_THAT(Slice(destination.bytes, 4, 2), ElementsAre(128, 128));
}

TEST(SimpleImageMap, Yuv411LowerRowsIndexWithTheXOfTheBlocksSecondRow) {
    Picture const source = Numbered(DEWARP_IMAGE_FORMAT_YUV411_PLANAR, 16, 16, 16);
    SimpleImageMap const map(4, 4);
    for (uint32_t column = 0; column < 4; ++column) {
        Set(map, column, 0, static_cast<unsigned short>(column), 0);
        Set(map, column, 1, static_cast<unsigned short>(column + 8), 1);
        Set(map, column, 2, static_cast<unsigned short>(column + 4), 2);
        Set(map, column, 3, static_cast<unsigned short>(column + 12), 3);
    }
    Picture destination(DEWARP_IMAGE_FORMAT_YUV411_PLANAR, 4, 4, 4);
    map.Remap(source.image, destination.image);
    for (uint32_t column = 0; column < 4; ++column) {
        EXPECT_EQ(source.bytes[0 * 16 + column], destination.bytes[0 * 4 + column]);
        EXPECT_EQ(source.bytes[1 * 16 + column + 8], destination.bytes[1 * 4 + column]);
        EXPECT_EQ(source.bytes[2 * 16 + column + 8], destination.bytes[2 * 4 + column]);
        EXPECT_EQ(source.bytes[3 * 16 + column + 8], destination.bytes[3 * 4 + column]);
    }
}

TEST(SimpleImageMap, Yuv411LowerRowsTestTheirOwnXAgainstTheWidth) {
    Picture const source = Numbered(DEWARP_IMAGE_FORMAT_YUV411_PLANAR, 16, 16, 16);
    SimpleImageMap const map(4, 4);
    SetAll(map, 3, 1);
    Set(map, 0, 2, 16, 2);  // own x at the width: black, although the shared x is inside
    Set(map, 1, 1, 20, 1);  // the second row's x at 20 is itself black ...
    Set(map, 1, 2, 2, 2);   // ... yet below it indexes row 3, column 4 of the plane
    Picture destination(DEWARP_IMAGE_FORMAT_YUV411_PLANAR, 4, 4, 4);
    map.Remap(source.image, destination.image);
    EXPECT_EQ(16, destination.bytes[2 * 4 + 0]);
    EXPECT_EQ(16, destination.bytes[1 * 4 + 1]);
    EXPECT_EQ(source.bytes[2 * 16 + 20], destination.bytes[2 * 4 + 1]);
    EXPECT_EQ(source.bytes[1 * 16 + 3], destination.bytes[3 * 4 + 0]);
}

TEST(SimpleImageMap, UnknownFormatLogsAnErrorAndLeavesTheDestinationUnchanged) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    Picture source = Numbered(DEWARP_IMAGE_FORMAT_RGB32_PACKED, 4, 4, 4);
    source.image.info.format = static_cast<_DEWARP_IMAGE_FORMAT>(7);
    SimpleImageMap const map(4, 4);
    SetAll(map, 1, 1);
    Picture destination(DEWARP_IMAGE_FORMAT_RGB32_PACKED, 4, 4, 4);
    map.Remap(source.image, destination.image);
    EXPECT_THAT(destination.bytes, Each(MARKER));
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: ERROR - Unknown image format %d\n", lines[0].format);
    EXPECT_EQ("VEXMAP: ERROR - Unknown image format 7\n", lines[0].text);
}

TEST(SimpleImageMap, NegativeFormatIsUnknownAsWell) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    Picture source = Numbered(DEWARP_IMAGE_FORMAT_RGB32_PACKED, 4, 4, 4);
    source.image.info.format = static_cast<_DEWARP_IMAGE_FORMAT>(-1);
    SimpleImageMap const map(4, 4);
    Picture destination(DEWARP_IMAGE_FORMAT_RGB32_PACKED, 4, 4, 4);
    map.Remap(source.image, destination.image);
    EXPECT_THAT(destination.bytes, Each(MARKER));
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: ERROR - Unknown image format -1\n", lines[0].text);
}

TEST(SimpleImageMap, DestinationFormatIsNotRead) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    Picture const source = Numbered(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 8, 8, 8);
    SimpleImageMap const map(4, 4);
    FillRandomly(map, 8, 8, 5);
    Picture expected(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 4, 4, 4);
    ReferenceRemap(map, source.image, expected.image);
    Picture actual(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 4, 4, 4);
    actual.image.info.format = static_cast<_DEWARP_IMAGE_FORMAT>(9);
    map.Remap(source.image, actual.image);
    EXPECT_TRUE(SameBytes(expected.bytes, actual.bytes));
    EXPECT_EQ(0u, sink.Count());
}

TEST(SimpleImageMap, ImageSizesAreTruncatedTo32Bits) {
    size_t const high = size_t(1) << 32;
    Picture const source = Numbered(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 8, 8, 8);
    Picture wide_source(source);
    wide_source.image.info.width += high;
    wide_source.image.info.height += high;
    wide_source.image.info.stride += high;
    SimpleImageMap const map(4, 4);
    FillRandomly(map, 8, 8, 11);
    Picture expected(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 4, 4, 4);
    map.Remap(source.image, expected.image);
    Picture actual(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 4, 4, 4);
    actual.image.info.width += high;
    actual.image.info.height += high;
    actual.image.info.stride += high;
    map.Remap(wide_source.image, actual.image);
    EXPECT_TRUE(SameBytes(expected.bytes, actual.bytes));
}

TEST(SimpleImageMap, Rgb32DestinationSizeOf2To31OrMoreWritesNothing) {
    Picture const source = Numbered(DEWARP_IMAGE_FORMAT_RGB32_PACKED, 4, 4, 4);
    SimpleImageMap const map(2, 2);
    SetAll(map, 1, 1);
    Picture wide(DEWARP_IMAGE_FORMAT_RGB32_PACKED, 2, 1, 2);
    wide.image.info.width = 0x80000000u;  // negative as a signed 32-bit value
    map.Remap(source.image, wide.image);
    EXPECT_THAT(wide.bytes, Each(MARKER));
    Picture tall(DEWARP_IMAGE_FORMAT_RGB32_PACKED, 1, 1, 1);
    tall.image.info.height = 0xFFFFFFFFu;
    map.Remap(source.image, tall.image);
    EXPECT_THAT(tall.bytes, Each(MARKER));
}

TEST(SimpleImageMap, Rgb32SourceWidthOf2To31OrMoreIsAllBlackWhileYuvReadsOn) {
    Picture rgb_source = Numbered(DEWARP_IMAGE_FORMAT_RGB32_PACKED, 4, 4, 4);
    rgb_source.image.info.width = 0x80000000u;
    Picture const rgb = RemapEverywhere(rgb_source.image, 2, 2, 1, 1);
    EXPECT_EQ(BlackBytes(rgb), WrittenBytes(rgb));
    Picture yuv_source = Numbered(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 4, 4, 4);
    yuv_source.image.info.width = 0x80000000u;
    Picture const yuv = RemapEverywhere(yuv_source.image, 2, 2, 1, 1);
    EXPECT_EQ(yuv_source.bytes[5], yuv.bytes[0]);
}

TEST(SimpleImageMap, Rgb32IndexOf2To31OrMoreIsBlack) {
    Picture const source = Numbered(DEWARP_IMAGE_FORMAT_RGB32_PACKED, 40000, 1, 40000);
    Picture const picture = RemapEverywhere(source.image, 1, 1, 0, 65535);  // 2621400000
    EXPECT_THAT(Slice(picture.bytes, 0, 4), ElementsAre(0, 0, 0, 0));
}

TEST(SimpleImageMap, Rgb32CopiesWholeWordsAtEachStride) {
    Picture const source = Numbered(DEWARP_IMAGE_FORMAT_RGB32_PACKED, 5, 3, 6);
    SimpleImageMap const map(2, 1);
    Set(map, 0, 0, 4, 2);
    Set(map, 1, 0, 5, 0);  // at the width, inside the stride: black
    Picture destination(DEWARP_IMAGE_FORMAT_RGB32_PACKED, 2, 1, 3);
    map.Remap(source.image, destination.image);
    size_t const from = (2 * 6 + 4) * 4;
    EXPECT_THAT(Slice(destination.bytes, 0, 12),
                ElementsAre(source.bytes[from], source.bytes[from + 1], source.bytes[from + 2],
                            source.bytes[from + 3], 0, 0, 0, 0, MARKER, MARKER, MARKER, MARKER));
}

TEST(SimpleImageMap, ManyThreadsMayRemapThroughOneMapAtOnce) {
    Picture const source = Numbered(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 64, 48, 64);
    SimpleImageMap const map(32, 24);
    FillRandomly(map, 64, 48, 3);
    Picture expected(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 32, 24, 32);
    ReferenceRemap(map, source.image, expected.image);
    std::vector<Picture> results(4, Picture(DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 32, 24, 32));
    std::vector<std::thread> threads;
    for (Picture& result : results) {
        result.image.data = result.bytes.data();
        threads.emplace_back([&map, &source, &result] {
            for (int frame = 0; frame < 200; ++frame) {
                map.Remap(source.image, result.image);
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    for (Picture const& result : results) {
        EXPECT_TRUE(SameBytes(expected.bytes, result.bytes));
    }
}

}  // namespace
}  // namespace quorvel::vexmap

namespace quorvel::vexmap {
namespace {

// A map of scattered source positions over a 40 x 31 source, some outside, for the band tests.
SimpleImageMap ScatteredMap(int width, int height) {
    SimpleImageMap map(width, height);
    std::mt19937 random(17);
    std::uniform_int_distribution<int> x(0, 44);
    std::uniform_int_distribution<int> y(0, 34);
    for (uint32_t row = 0; row < uint32_t(height); ++row) {
        for (uint32_t column = 0; column < uint32_t(width); ++column) {
            Set(map, column, row, static_cast<unsigned short>(x(random)),
                static_cast<unsigned short>(y(random)));
        }
    }
    return map;
}

// Bands of every block-aligned split, in any order, give the frame that one Remap gives.
TEST(SimpleImageMapRows, BandsInAnyOrderMakeTheWholeFrameInEveryLayout) {
    for (_DEWARP_IMAGE_FORMAT const format : ALL_FORMATS) {
        for (int const height : {24, 27}) {
            SimpleImageMap const map = ScatteredMap(20, height);
            Picture const source = Numbered(format, 40, 31, 44);
            Picture whole(format, 20, size_t(height), 22);
            map.Remap(source.image, whole.image);
            uint32_t const block = SimpleImageMap::BlockRows(format);
            for (uint32_t const band : {block, 2 * block, 3 * block, 8u}) {
                uint32_t const rows = band - band % block;
                Picture banded(format, 20, size_t(height), 22);
                std::vector<uint64_t> firsts;
                for (uint64_t first = 0; first < uint64_t(height); first += rows) {
                    firsts.push_back(first);
                }
                std::reverse(firsts.begin(), firsts.end());
                for (uint64_t const first : firsts) {
                    uint64_t const count = std::min<uint64_t>(rows, uint64_t(height) - first);
                    ASSERT_TRUE(map.RemapRows(source.image, banded.image, first, count))
                        << NameOf(format) << " rows " << first << " + " << count;
                }
                EXPECT_EQ(whole.bytes, banded.bytes)
                    << NameOf(format) << ", height " << height << ", bands of " << rows;
            }
        }
    }
}

// A band writes its own rows and nothing else: a band and the rest around it touch different
// bytes, and together they are the frame.
TEST(SimpleImageMapRows, ABandLeavesTheOtherRowsAsTheyWere) {
    for (_DEWARP_IMAGE_FORMAT const format : ALL_FORMATS) {
        SimpleImageMap const map = ScatteredMap(20, 24);
        Picture const source = Numbered(format, 40, 31, 44);
        Picture whole(format, 20, 24, 22);
        map.Remap(source.image, whole.image);
        Picture band(format, 20, 24, 22);
        ASSERT_TRUE(map.RemapRows(source.image, band.image, 8, 8));
        Picture rest(format, 20, 24, 22);
        ASSERT_TRUE(map.RemapRows(source.image, rest.image, 0, 8));
        ASSERT_TRUE(map.RemapRows(source.image, rest.image, 16, 8));
        for (size_t i = 0; i < whole.bytes.size(); ++i) {
            ASSERT_TRUE(band.bytes[i] == MARKER || rest.bytes[i] == MARKER)
                << NameOf(format) << " byte " << i << " written by both";
            unsigned char const together = band.bytes[i] != MARKER ? band.bytes[i] : rest.bytes[i];
            ASSERT_EQ(whole.bytes[i], together) << NameOf(format) << " byte " << i;
        }
    }
}

TEST(SimpleImageMapRows, ABandOffTheBlocksOrPastTheEndIsRefusedAndWritesNothing) {
    SimpleImageMap const map = ScatteredMap(20, 27);
    Picture const source = Numbered(DEWARP_IMAGE_FORMAT_YUV411_PLANAR, 40, 31, 44);
    Picture target(DEWARP_IMAGE_FORMAT_YUV411_PLANAR, 20, 27, 22);
    std::vector<unsigned char> const before = target.bytes;
    EXPECT_FALSE(map.RemapRows(source.image, target.image, 2, 4));   // starts inside a block
    EXPECT_FALSE(map.RemapRows(source.image, target.image, 4, 6));   // ends inside a block
    EXPECT_FALSE(map.RemapRows(source.image, target.image, 24, 4));  // runs past row 27
    EXPECT_FALSE(map.RemapRows(source.image, target.image, 28, 0));  // starts past the end
    EXPECT_FALSE(map.RemapRows(source.image, target.image, 0, ~uint64_t(0)));
    _DEWARP_IMAGE unknown = source.image;
    unknown.info.format = static_cast<_DEWARP_IMAGE_FORMAT>(7);
    EXPECT_FALSE(map.RemapRows(unknown, target.image, 0, 4));
    EXPECT_EQ(before, target.bytes);
    EXPECT_TRUE(map.RemapRows(source.image, target.image, 24, 3));  // the last rows, to the end
    EXPECT_TRUE(map.RemapRows(source.image, target.image, 8, 0));   // no rows: nothing to do
}

}  // namespace
}  // namespace quorvel::vexmap

namespace quorvel::vexmap {
namespace {

class SimpleImageMapLanesTest : public testing::TestWithParam<BatchLanes const*> {};

// The layouts that have vector kernels.
constexpr _DEWARP_IMAGE_FORMAT VECTOR_LAYOUTS[] = {DEWARP_IMAGE_FORMAT_YUV420_PLANAR,
                                                   DEWARP_IMAGE_FORMAT_NV420_PLANAR};

// Random tables (inside, on the edges, past them, unmapped) over random sizes and strides: every
// lane width writes the frame that the plain path writes, byte for byte, and nothing else.
TEST_P(SimpleImageMapLanesTest, WritesTheFrameOfThePlainPathByteForByte) {
    std::mt19937 random(23);
    for (int round = 0; round < 120; ++round) {
        _DEWARP_IMAGE_FORMAT const format = VECTOR_LAYOUTS[round % 2];
        std::uniform_int_distribution<int> side(1, 90);
        uint32_t const source_width = uint32_t(side(random)) + 1;
        uint32_t const source_height = uint32_t(side(random)) + 1;
        uint32_t const source_stride = source_width + uint32_t(round % 3) * 5;
        int const width = 2 * side(random) + round % 2;
        int const height = 2 * (side(random) / 3) + round % 2;
        SimpleImageMap map(width, height);
        std::uniform_int_distribution<int> x(0, int(source_width) + 3);
        std::uniform_int_distribution<int> y(0, int(source_height) + 3);
        std::uniform_int_distribution<int> oddity(0, 19);
        for (uint32_t row = 0; row < uint32_t(height); ++row) {
            for (uint32_t column = 0; column < uint32_t(width); ++column) {
                int const odd = oddity(random);
                unsigned short const ex =
                    odd == 0 ? UNMAPPED : static_cast<unsigned short>(x(random));
                unsigned short const ey = odd == 1 ? 65000 : static_cast<unsigned short>(y(random));
                Set(map, column, row, ex, ey);
            }
        }
        Picture const source = Numbered(format, source_width, source_height, source_stride);
        Picture plain(format, size_t(width), size_t(height), size_t(width) + 3);
        Picture lanes(format, size_t(width), size_t(height), size_t(width) + 3);
        map.RemapWithLanes(BatchLanes::Sse2(), source.image, plain.image);
        map.RemapWithLanes(*GetParam(), source.image, lanes.image);
        ASSERT_EQ(plain.bytes, lanes.bytes)
            << NameOf(format) << " round " << round << ": " << width << "x" << height << " from "
            << source_width << "x" << source_height << " stride " << source_stride;
    }
}

// The 1080p frame of a real view from a 2880 fisheye, where the wide lanes do nearly all of it.
TEST_P(SimpleImageMapLanesTest, WritesTheFrameOfThePlainPathForALargeView) {
    SimpleImageMap map(1920, 1080);
    for (uint32_t row = 0; row < 1080; ++row) {
        for (uint32_t column = 0; column < 1920; ++column) {
            Set(map, column, row, static_cast<unsigned short>(column * 3 / 2 + row / 7),
                static_cast<unsigned short>(row * 2 + column / 11));
        }
    }
    for (_DEWARP_IMAGE_FORMAT const format : VECTOR_LAYOUTS) {
        Picture const source = Numbered(format, 2880, 2880, 2880);
        Picture plain(format, 1920, 1080, 1920);
        Picture lanes(format, 1920, 1080, 1920);
        map.RemapWithLanes(BatchLanes::Sse2(), source.image, plain.image);
        map.RemapWithLanes(*GetParam(), source.image, lanes.image);
        EXPECT_TRUE(plain.bytes == lanes.bytes) << NameOf(format);
    }
}

// Tables as views make them: neighbouring entries close together, turned, scaled and shifted so
// that they run over every edge of the source, with a stride wider than the source, a few entries
// unmapped, and sources narrower than the lanes' windows. The wide lanes read most such groups
// through one window of the source; every frame is the plain path's, byte for byte.
TEST_P(SimpleImageMapLanesTest, WritesTheFrameOfThePlainPathForSmoothTablesOverEveryEdge) {
    struct Source {
        uint32_t width;
        uint32_t height;
        uint32_t stride;
    };
    Source const sources[] = {
        {200, 150, 200}, {200, 150, 203}, {30, 90, 30}, {64, 8, 70}, {101, 61, 101}};
    int const width = 96;
    int const height = 64;
    int round = 0;
    for (int pass = 0; pass < 2 * 5; ++pass) {
        _DEWARP_IMAGE_FORMAT const format = VECTOR_LAYOUTS[pass % 2];
        Source const& from = sources[pass / 2];
        Picture const source = Numbered(format, from.width, from.height, from.stride);
        for (float const scale : {0.4f, 0.73f, 1.3f}) {
            for (float const degrees : {0.0f, 7.0f, 90.0f, 185.0f, 300.0f}) {
                for (float const shift : {-40.0f, 0.0f, 0.7f, 1.0f}) {
                    ++round;
                    float const turn = degrees * 3.14159265f / 180.0f;
                    float const along_x = scale * std::cos(turn);
                    float const along_y = scale * std::sin(turn);
                    SimpleImageMap map(width, height);
                    for (int row = 0; row < height; ++row) {
                        for (int column = 0; column < width; ++column) {
                            float const x = shift * float(from.width) + along_x * float(column) -
                                            along_y * float(row);
                            float const y = shift * float(from.height) + along_y * float(column) +
                                            along_x * float(row);
                            bool const unmapped = (row * width + column) % 97 == 0;
                            Set(map, uint32_t(column), uint32_t(row),
                                unmapped ? UNMAPPED
                                         : static_cast<unsigned short>(std::lround(x) & 0xFFFF),
                                unmapped ? UNMAPPED
                                         : static_cast<unsigned short>(std::lround(y) & 0xFFFF));
                        }
                    }
                    Picture plain(format, width, height, width);
                    Picture lanes(format, width, height, width);
                    map.RemapWithLanes(BatchLanes::Sse2(), source.image, plain.image);
                    map.RemapWithLanes(*GetParam(), source.image, lanes.image);
                    ASSERT_EQ(plain.bytes, lanes.bytes)
                        << NameOf(format) << " round " << round << ": source " << from.width << "x"
                        << from.height << " stride " << from.stride << ", scale " << scale << ", "
                        << degrees << " degrees, shift " << shift;
                }
            }
        }
    }
}

INSTANTIATE_TEST_SUITE_P(EveryLaneWidthOfThisProcessor, SimpleImageMapLanesTest,
                         testing::ValuesIn(AvailableLanes()), LanesName);

}  // namespace
}  // namespace quorvel::vexmap
