#include "sample_scene.h"

#include <algorithm>
#include <array>
#include <cmath>

namespace vexmap_host {
namespace {

constexpr double PI = 3.14159265358979323846;
constexpr int SUPERSAMPLING = 2;  // per axis, against jagged grid lines

// The room in metres around the lens: x right, y down the picture, z along the optical axis
// towards the floor.
constexpr double HALF_WIDTH = 3.0;
constexpr double HALF_DEPTH = 2.0;
constexpr double FLOOR_DISTANCE = 2.5;
constexpr double TILE = 0.5;
constexpr double LINE = 0.035;

using Colour = std::array<double, 3>;

bool OnGridLine(double a, double b) {
    auto const near_line = [](double value) {
        double const offset = value / TILE - std::floor(value / TILE);
        return offset < LINE / TILE || offset > 1.0 - LINE / TILE;
    };
    return near_line(a) || near_line(b);
}

Colour Wall(Colour const& paint, double a, double b) {
    return OnGridLine(a, b) ? Colour{245, 245, 245} : paint;
}

Colour Floor(double x, double y) {
    if (OnGridLine(x, y)) {
        return {30, 30, 30};
    }
    bool const dark = (int(std::floor(x / TILE)) + int(std::floor(y / TILE))) % 2 != 0;
    return dark ? Colour{110, 110, 120} : Colour{215, 210, 200};
}

// What a ray from the lens in direction (dx, dy, dz), with dz >= 0, hits first.
Colour Trace(double dx, double dy, double dz) {
    double const huge = 1e30;
    double const tx = dx != 0.0 ? HALF_WIDTH / std::abs(dx) : huge;
    double const ty = dy != 0.0 ? HALF_DEPTH / std::abs(dy) : huge;
    double const tz = dz > 0.0 ? FLOOR_DISTANCE / dz : huge;
    double const t = std::min({tx, ty, tz});
    double const x = t * dx;
    double const y = t * dy;
    double const z = t * dz;
    if (t == tz) {
        return Floor(x, y);
    }
    if (t == tx) {
        return Wall(dx > 0 ? Colour{190, 70, 60} : Colour{70, 160, 80}, y, z);
    }
    return Wall(dy > 0 ? Colour{60, 90, 180} : Colour{210, 180, 60}, x, z);
}

}  // namespace

SampleFisheye MakeSampleFisheye(int size) {
    SampleFisheye sample;
    sample.circle_x = size / 2;
    sample.circle_y = size / 2;
    sample.circle_radius = size / 2;
    RgbImage& image = sample.image;
    image.width = size;
    image.height = size;
    image.pixels.assign(std::size_t(size) * std::size_t(size) * 3, 0);
    double const radius = sample.circle_radius;
    int const samples = SUPERSAMPLING * SUPERSAMPLING;
    for (int row = 0; row < size; ++row) {
        for (int column = 0; column < size; ++column) {
            Colour sum{0, 0, 0};
            for (int sub = 0; sub < samples; ++sub) {
                double const sx = column + (sub % SUPERSAMPLING + 0.5) / SUPERSAMPLING;
                double const sy = row + (sub / SUPERSAMPLING + 0.5) / SUPERSAMPLING;
                double const ux = (sx - sample.circle_x) / radius;
                double const uy = (sy - sample.circle_y) / radius;
                double const r = std::hypot(ux, uy);
                if (r > 1.0) {
                    continue;  // outside the image circle: black
                }
                // Equidistant lens: the angle off the axis grows in proportion to the radius.
                double const theta = r * PI / 2;
                double const phi = std::atan2(uy, ux);
                Colour const hit = Trace(std::sin(theta) * std::cos(phi),
                                         std::sin(theta) * std::sin(phi), std::cos(theta));
                for (std::size_t channel = 0; channel < 3; ++channel) {
                    sum[channel] += hit[channel];
                }
            }
            uint8_t* pixel =
                &image.pixels[(std::size_t(row) * std::size_t(size) + std::size_t(column)) * 3];
            for (std::size_t channel = 0; channel < 3; ++channel) {
                pixel[channel] = uint8_t(std::lround(sum[channel] / samples));
            }
        }
    }
    return sample;
}

}  // namespace vexmap_host
