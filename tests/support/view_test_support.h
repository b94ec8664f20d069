#pragma once

#include <cmath>
#include <cstdint>
#include <limits>
#include <vector>

#include <boost/shared_ptr.hpp>

#include "vexmap/camera.h"
#include "vexmap/camera_builder.h"
#include "vexmap/map_functor.h"
#include "vexmap/simple_image_map.h"
#include "vexmap/vector_2d.h"

namespace quorvel::vexmap::testing {

constexpr std::uint16_t UNMAPPED = 65535;

/// A square circular fisheye of 180 degrees.
inline boost::shared_ptr<Camera> MakeFisheye(_DEWARP_INTERNAL_CAMERA_MOUNT mount,
                                             std::size_t size = 256) {
    _DEWARP_INTERNAL_CAMERA_MODEL const model = {
        DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, 180.0f, 180.0f, 180.0f, size, size};
    return boost::shared_ptr<Camera>(CameraBuilder::MakeCamera(model, mount));
}

/// Passes points through another link and keeps every point it was given.
class RecordingFunctor : public MapFunctor {
public:
    RecordingFunctor(MapFunctor* inner, boost::shared_ptr<std::vector<Vector2d>> const& inputs)
        : link(inner), seen(inputs) {}
    Vector2d Call(Vector2d const& point) override {
        seen->push_back(point);
        return link->Call(point);
    }

private:
    boost::shared_ptr<MapFunctor> link;
    boost::shared_ptr<std::vector<Vector2d>> seen;
};

/// An entry's word written out plainly: rounded half to even, 65535 above it, NaN and values
/// below the 32-bit range 0, else the low 16 bits of the 32-bit two's complement value.
inline std::uint16_t ExpectedWord(float value) {
    if (std::isnan(value)) {
        return 0;
    }
    double const rounded = std::nearbyint(double(value));
    if (rounded > 65535.0) {
        return UNMAPPED;
    }
    if (rounded < -2147483648.0) {
        return 0;
    }
    std::int64_t const whole = std::int64_t(rounded);
    return std::uint16_t(std::uint64_t(whole) & 0xFFFFu);
}

/// The map's entries as (x, y) word pairs, one vector per entry.
struct Entry {
    std::uint16_t x;
    std::uint16_t y;
    bool operator==(Entry const& other) const { return x == other.x && y == other.y; }
};

inline Entry EntryOf(SimpleImageMap const& map, int column, int row) {
    std::size_t const index =
        2 * (std::size_t(row) * std::size_t(map.GetMapWidth()) + std::size_t(column));
    return Entry{map.GetMap()[index], map.GetMap()[index + 1]};
}

inline std::vector<Entry> Entries(SimpleImageMap const& map) {
    std::vector<Entry> entries;
    for (int row = 0; row < map.GetMapHeight(); ++row) {
        for (int column = 0; column < map.GetMapWidth(); ++column) {
            entries.push_back(EntryOf(map, column, row));
        }
    }
    return entries;
}

inline bool IsUnmapped(Entry const& entry) {
    return entry.x == UNMAPPED && entry.y == UNMAPPED;
}

}  // namespace quorvel::vexmap::testing
