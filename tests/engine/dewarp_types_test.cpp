#include "vexmap/dewarp_types.h"

#include <cstddef>
#include <iterator>

#include <gtest/gtest.h>

#include "dewarp_c_side.h"

namespace {

TEST(DewarpTypes, EnumerationsAreThirtyTwoBitValues) {
    EXPECT_EQ(4u, sizeof(_DEWARP_IMAGE_FORMAT));
    EXPECT_EQ(4u, sizeof(_DEWARP_LOG_LEVEL));
    EXPECT_EQ(4u, sizeof(_DEWARP_VIEW));
    EXPECT_EQ(4u, sizeof(_DEWARP_PROJECTION));
    EXPECT_EQ(4u, sizeof(_DEWARP_INTERPOLATION));
    EXPECT_EQ(4u, sizeof(_DEWARP_ASPECT_RATIO));
    EXPECT_EQ(4u, sizeof(_DEWARP_INTERNAL_CAMERA_TYPE));
    EXPECT_EQ(4u, sizeof(_DEWARP_INTERNAL_CAMERA_MOUNT));
}

TEST(DewarpTypes, EnumeratorsCarryTheirInterfaceValues) {
    EXPECT_EQ(0, DEWARP_IMAGE_FORMAT_RGB32_PACKED);
    EXPECT_EQ(1, DEWARP_IMAGE_FORMAT_YUV422A_PACKED);
    EXPECT_EQ(2, DEWARP_IMAGE_FORMAT_YUV422B_PACKED);
    EXPECT_EQ(3, DEWARP_IMAGE_FORMAT_YUV422_PLANAR);
    EXPECT_EQ(4, DEWARP_IMAGE_FORMAT_YUV420_PLANAR);
    EXPECT_EQ(5, DEWARP_IMAGE_FORMAT_YUV411_PLANAR);
    EXPECT_EQ(6, DEWARP_IMAGE_FORMAT_NV420_PLANAR);
    EXPECT_EQ(0, DEWARP_LOG_LEVEL_ERROR);
    EXPECT_EQ(1, DEWARP_LOG_LEVEL_WARNING);
    EXPECT_EQ(2, DEWARP_LOG_LEVEL_INFO);
    EXPECT_EQ(3, DEWARP_LOG_LEVEL_DEBUG);
    EXPECT_EQ(4, DEWARP_LOG_LEVEL_TRACE);
    EXPECT_EQ(0, DEWARP_VIEW_SINGLE_PANORAMIC);
    EXPECT_EQ(1, DEWARP_VIEW_DUAL_PANORAMIC);
    EXPECT_EQ(2, DEWARP_VIEW_SINGLE_PTZ);
    EXPECT_EQ(3, DEWARP_VIEW_QUAD_PTZ);
    EXPECT_EQ(0, DEWARP_PROJECTION_RECTILINEAR);
    EXPECT_EQ(1, DEWARP_PROJECTION_CYLINDRICAL);
    EXPECT_EQ(2, DEWARP_PROJECTION_EQUIRECTANGULAR);
    EXPECT_EQ(3, DEWARP_PROJECTION_MERCATOR);
    EXPECT_EQ(4, DEWARP_PROJECTION_LAMBERT_CYLINDRICAL);
    EXPECT_EQ(5, DEWARP_PROJECTION_MILLER_CYLINDRICAL);
    EXPECT_EQ(6, DEWARP_PROJECTION_PANNINI);
    EXPECT_EQ(7, DEWARP_PROJECTION_ARCHITECTURAL);
    EXPECT_EQ(8, DEWARP_PROJECTION_EQUIRECTANGULAR_PANNINI);
    EXPECT_EQ(0, DEWARP_INTERPOLATION_0);
    EXPECT_EQ(1, DEWARP_INTERPOLATION_1);
    EXPECT_EQ(2, DEWARP_INTERPOLATION_2);
    EXPECT_EQ(0, DEWARP_ASPECT_RATIO_FIT);
    EXPECT_EQ(1, DEWARP_ASPECT_RATIO_FILL);
    EXPECT_EQ(2, DEWARP_ASPECT_RATIO_STRETCH);
    EXPECT_EQ(3, DEWARP_ASPECT_RATIO_FIT_WIDTH);
    EXPECT_EQ(0, DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR);
    EXPECT_EQ(1, DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE);
    EXPECT_EQ(0, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    EXPECT_EQ(1, DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR);
    EXPECT_EQ(2, DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    EXPECT_EQ(3, DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL);
}

TEST(DewarpTypes, AnImageBeginsWithItsDescription) {
    EXPECT_EQ(0u, offsetof(_DEWARP_IMAGE, info));
    EXPECT_EQ(0u, offsetof(_DEWARP_IMAGE_INFO, format));
    EXPECT_EQ(8u, offsetof(_DEWARP_IMAGE_INFO, width));
    EXPECT_EQ(16u, offsetof(_DEWARP_IMAGE_INFO, height));
    EXPECT_EQ(24u, offsetof(_DEWARP_IMAGE_INFO, stride));
    EXPECT_EQ(32u, offsetof(_DEWARP_IMAGE, data));
}

TEST(DewarpTypes, RecordsKeepTheirFieldOrder) {
    EXPECT_EQ(8u, offsetof(_DEWARP_RESOLUTION, height));
    EXPECT_EQ(0u, offsetof(_DEWARP_PTZ_POSITION, pan));
    EXPECT_EQ(4u, offsetof(_DEWARP_PTZ_POSITION, tilt));
    EXPECT_EQ(8u, offsetof(_DEWARP_PTZ_POSITION, roll));
    EXPECT_EQ(12u, offsetof(_DEWARP_PTZ_POSITION, zoom));
    EXPECT_EQ(32u, sizeof(_DEWARP_PTZ_RANGE));
    EXPECT_EQ(4u, offsetof(_DEWARP_PTZ_RANGE, pan_max));
    EXPECT_EQ(8u, offsetof(_DEWARP_PTZ_RANGE, tilt_min));
    EXPECT_EQ(16u, offsetof(_DEWARP_PTZ_RANGE, roll_min));
    EXPECT_EQ(28u, offsetof(_DEWARP_PTZ_RANGE, zoom_max));
    EXPECT_EQ(4u, offsetof(_DEWARP_CHANNEL_SETTINGS, projection));
    EXPECT_EQ(8u, offsetof(_DEWARP_CHANNEL_SETTINGS, aspect_ratio));
    EXPECT_EQ(12u, offsetof(_DEWARP_CHANNEL_SETTINGS, interpolation));
    EXPECT_EQ(8u, offsetof(_DEWARP_LOG_SETTINGS, level));
    EXPECT_EQ(4u, offsetof(_DEWARP_INTERNAL_CAMERA_MODEL, diagonal_fov));
    EXPECT_EQ(8u, offsetof(_DEWARP_INTERNAL_CAMERA_MODEL, horizontal_fov));
    EXPECT_EQ(12u, offsetof(_DEWARP_INTERNAL_CAMERA_MODEL, vertical_fov));
    EXPECT_EQ(16u, offsetof(_DEWARP_INTERNAL_CAMERA_MODEL, width));
    EXPECT_EQ(24u, offsetof(_DEWARP_INTERNAL_CAMERA_MODEL, height));
}

// A C program and the engine must agree on every record byte for byte; C gives an enumeration a
// type of its own choosing, so its size is part of what is compared.
TEST(DewarpTypes, CLaysEveryRecordOutAsCppDoes) {
    struct Figure {
        char const* expression;
        size_t value;
    };
#define AS_FIGURE(expression) Figure{#expression, expression},
    Figure const figures[] = {VEXMAP_RECORD_LAYOUT(AS_FIGURE)};
#undef AS_FIGURE
    ASSERT_EQ(std::size(figures), c_record_layout_count);
    for (size_t index = 0; index < std::size(figures); ++index) {
        EXPECT_EQ(figures[index].value, c_record_layout[index]) << figures[index].expression;
    }
}

}  // namespace
