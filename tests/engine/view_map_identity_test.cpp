// The builders run rows of points in lanes with vector trigonometry; their maps must stay the
// maps that the plain arithmetic made: on every map at least 99.9 percent of the entries equal,
// and no coordinate more than one source pixel away.

#include <cstdint>
#include <cstdlib>
#include <sstream>
#include <string>
#include <vector>

#include <boost/shared_ptr.hpp>
#include <gtest/gtest.h>

#include "reference_map.h"
#include "vexmap/camera_builder.h"
#include "vexmap/dual_panoramic_view.h"
#include "vexmap/error.h"
#include "vexmap/quad_ptz_view.h"
#include "vexmap/single_panoramic_view.h"
#include "vexmap/single_ptz_view.h"
#include "vexmap/tarvex_brenvia_418.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

constexpr double LEAST_EQUAL_SHARE = 0.999;

enum ViewKind { SINGLE_PTZ, QUAD_PTZ, SINGLE_PANORAMA, DUAL_PANORAMA };

struct Position {
    float pan_degrees;
    float tilt_degrees;
    float zoom;
};

struct Case {
    int camera_side;  // a square sensor, the built-in lens
    _DEWARP_INTERNAL_CAMERA_MOUNT mount;
    ViewKind kind;
    _DEWARP_PROJECTION projection;
    _DEWARP_ASPECT_RATIO aspect_ratio;
    int width;
    int height;
    Position position;
};

std::string Describe(Case const& c) {
    std::ostringstream text;
    text << "camera " << c.camera_side << ", mount " << c.mount << ", view " << c.kind
         << ", projection " << c.projection << ", aspect " << c.aspect_ratio << ", " << c.width
         << "x" << c.height << ", pan " << c.position.pan_degrees << " tilt "
         << c.position.tilt_degrees << " zoom " << c.position.zoom;
    return text.str();
}

View* MakeView(boost::shared_ptr<Camera> const& camera, Case const& c) {
    switch (c.kind) {
        case SINGLE_PTZ:
            return new SinglePtzView(camera, c.projection);
        case QUAD_PTZ:
            return new QuadPtzView(camera, c.projection);
        case SINGLE_PANORAMA:
            return new SinglePanoramicView(camera, c.projection);
        case DUAL_PANORAMA:
            return new DualPanoramicView(camera, c.projection);
    }
    return nullptr;
}

struct Comparison {
    std::size_t entries = 0;
    std::size_t equal = 0;
    int largest_move = 0;
};

Comparison Compare(SimpleImageMap const& map, reference::Map const& expected) {
    Comparison result;
    result.entries = expected.words.size() / 2;
    unsigned short const* words = map.GetMap();
    for (std::size_t i = 0; i < result.entries; ++i) {
        int const dx = std::abs(int(words[2 * i]) - int(expected.words[2 * i]));
        int const dy = std::abs(int(words[2 * i + 1]) - int(expected.words[2 * i + 1]));
        result.equal += dx == 0 && dy == 0 ? 1 : 0;
        result.largest_move = std::max({result.largest_move, dx, dy});
    }
    return result;
}

// Builds the view's map both ways; false when the view refuses the case (a panorama with a
// projection that its mount does not take).
bool CheckCase(Case const& c, Comparison& comparison) {
    _DEWARP_INTERNAL_CAMERA_MODEL model = GetTarvexBrenvia418Camera();
    model.width = uint64_t(c.camera_side);
    model.height = uint64_t(c.camera_side);
    boost::shared_ptr<Camera> const camera(CameraBuilder::MakeCamera(model, c.mount));
    boost::shared_ptr<View> view;
    try {
        view.reset(MakeView(camera, c));
    } catch (Error const&) {
        return false;
    }
    view->SetAspectRatio(c.aspect_ratio);
    view->SetDewarpedSize(Resolution(float(c.width), float(c.height)));
    view->SetPtz(
        PtzPosition(EulerAngles(Trigonometry::degrees_to_radians(c.position.pan_degrees),
                                Trigonometry::degrees_to_radians(c.position.tilt_degrees), 0.0f),
                    c.position.zoom));
    reference::Map const expected = reference::MapOf(*view);
    view->BuildMap();
    comparison = Compare(*view->GetImageMap(), expected);
    return true;
}

void ExpectSameMaps(std::vector<Case> const& cases) {
    int built = 0;
    for (Case const& c : cases) {
        Comparison comparison;
        if (!CheckCase(c, comparison)) {
            continue;
        }
        ++built;
        ASSERT_GE(double(comparison.equal), LEAST_EQUAL_SHARE * double(comparison.entries))
            << Describe(c) << ": " << comparison.entries - comparison.equal << " of "
            << comparison.entries << " entries differ";
        ASSERT_LE(comparison.largest_move, 1) << Describe(c);
    }
    EXPECT_GT(built, 0);
}

std::vector<_DEWARP_INTERNAL_CAMERA_MOUNT> const MOUNTS = {
    DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR,
    DEWARP_INTERNAL_CAMERA_MOUNT_WALL, DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL};

std::vector<_DEWARP_PROJECTION> const PROJECTIONS = {DEWARP_PROJECTION_RECTILINEAR,
                                                     DEWARP_PROJECTION_CYLINDRICAL,
                                                     DEWARP_PROJECTION_EQUIRECTANGULAR,
                                                     DEWARP_PROJECTION_MERCATOR,
                                                     DEWARP_PROJECTION_LAMBERT_CYLINDRICAL,
                                                     DEWARP_PROJECTION_MILLER_CYLINDRICAL,
                                                     DEWARP_PROJECTION_PANNINI,
                                                     DEWARP_PROJECTION_ARCHITECTURAL,
                                                     DEWARP_PROJECTION_EQUIRECTANGULAR_PANNINI};

std::vector<_DEWARP_ASPECT_RATIO> const ASPECT_RATIOS = {
    DEWARP_ASPECT_RATIO_FIT, DEWARP_ASPECT_RATIO_FILL, DEWARP_ASPECT_RATIO_FIT_WIDTH,
    DEWARP_ASPECT_RATIO_STRETCH};

std::vector<ViewKind> const KINDS = {SINGLE_PTZ, QUAD_PTZ, SINGLE_PANORAMA, DUAL_PANORAMA};

// Every mount, view, projection and aspect ratio, on a small odd output, at rest and moved.
TEST(ViewMapIdentity, EveryMountViewProjectionAndAspectRatioKeepsThePlainMap) {
    std::vector<Case> cases;
    for (auto const mount : MOUNTS) {
        for (auto const kind : KINDS) {
            for (auto const projection : PROJECTIONS) {
                for (auto const ratio : ASPECT_RATIOS) {
                    for (Position const position :
                         {Position{0.0f, 0.0f, 1.0f}, Position{37.0f, -21.0f, 1.7f}}) {
                        cases.push_back(
                            Case{1936, mount, kind, projection, ratio, 331, 197, position});
                    }
                }
            }
        }
    }
    ExpectSameMaps(cases);
}

// Positions across the range of a PTZ view and of a panorama, on each mount.
TEST(ViewMapIdentity, AGridOfPositionsKeepsThePlainMap) {
    std::vector<Case> cases;
    for (auto const mount : MOUNTS) {
        for (auto const kind : KINDS) {
            for (float pan = -170.0f; pan <= 180.0f; pan += 50.0f) {
                for (float tilt = -80.0f; tilt <= 80.0f; tilt += 40.0f) {
                    for (float const zoom : {0.6f, 1.0f, 2.5f, 6.0f}) {
                        cases.push_back(Case{1936, mount, kind, DEWARP_PROJECTION_RECTILINEAR,
                                             DEWARP_ASPECT_RATIO_FILL, 160, 90,
                                             Position{pan, tilt, zoom}});
                    }
                }
            }
        }
    }
    ExpectSameMaps(cases);
}

// Sizes from a few pixels to the odd and the large, sensors of several sizes.
TEST(ViewMapIdentity, SizesOfOutputAndSensorKeepThePlainMap) {
    std::vector<Case> cases;
    for (int const side : {512, 1936, 2880, 4000}) {
        for (auto const kind : KINDS) {
            for (auto const& [width, height] : {std::pair{8, 8}, std::pair{9, 3}, std::pair{17, 40},
                                                std::pair{640, 480}, std::pair{1281, 721}}) {
                cases.push_back(Case{side, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, kind,
                                     kind == SINGLE_PANORAMA || kind == DUAL_PANORAMA
                                         ? DEWARP_PROJECTION_CYLINDRICAL
                                         : DEWARP_PROJECTION_RECTILINEAR,
                                     DEWARP_ASPECT_RATIO_FIT, width, height,
                                     Position{20.0f, 30.0f, 1.2f}});
            }
        }
    }
    ExpectSameMaps(cases);
}

// The views of the benchmarks (a 2880 sensor, 1080p and 4K) and of the host tool's built-in
// sample (a 1024 sensor, the tool's default sizes), at their full size.
TEST(ViewMapIdentity, TheBenchmarkAndSampleViewsKeepThePlainMap) {
    std::vector<Case> cases;
    for (auto const& [width, height] : {std::pair{1920, 1080}, std::pair{3840, 2160}}) {
        cases.push_back(Case{2880, DEWARP_INTERNAL_CAMERA_MOUNT_WALL, SINGLE_PTZ,
                             DEWARP_PROJECTION_RECTILINEAR, DEWARP_ASPECT_RATIO_FILL, width, height,
                             Position{30.0f, 0.0f, 1.0f}});
        cases.push_back(Case{2880, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, DUAL_PANORAMA,
                             DEWARP_PROJECTION_CYLINDRICAL, DEWARP_ASPECT_RATIO_FILL, width, height,
                             Position{0.0f, 0.0f, 1.0f}});
        cases.push_back(Case{2880, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, SINGLE_PANORAMA,
                             DEWARP_PROJECTION_CYLINDRICAL, DEWARP_ASPECT_RATIO_FILL, width, height,
                             Position{0.0f, 0.0f, 1.0f}});
        cases.push_back(Case{2880, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, QUAD_PTZ,
                             DEWARP_PROJECTION_RECTILINEAR, DEWARP_ASPECT_RATIO_FILL, width, height,
                             Position{0.0f, 45.0f, 1.0f}});
    }
    for (auto const mount : MOUNTS) {
        cases.push_back(Case{1024, mount, SINGLE_PTZ, DEWARP_PROJECTION_RECTILINEAR,
                             DEWARP_ASPECT_RATIO_FIT, 960, 544, Position{0.0f, 0.0f, 1.0f}});
        for (auto const kind : {SINGLE_PANORAMA, DUAL_PANORAMA}) {
            for (auto const& [width, height] : {std::pair{1024, 256}, std::pair{1024, 512}}) {
                cases.push_back(Case{1024, mount, kind, DEWARP_PROJECTION_CYLINDRICAL,
                                     DEWARP_ASPECT_RATIO_FIT, width, height,
                                     Position{0.0f, 0.0f, 1.0f}});
            }
        }
    }
    ExpectSameMaps(cases);
}

}  // namespace
}  // namespace quorvel::vexmap
