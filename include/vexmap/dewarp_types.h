#pragma once

// The records and enumerations that cross the dewarp call surface. Plain data in the global
// namespace: a record is copied by assignment, an enumeration is a 32-bit value (any int a host
// passes is a value of it, so out-of-range values are checked, not undefined). Angles are
// degrees, sizes are pixel counts.

#include <cstdarg>
#include <cstddef>

enum _DEWARP_IMAGE_FORMAT : int {
    DEWARP_IMAGE_FORMAT_RGB32_PACKED = 0,
    DEWARP_IMAGE_FORMAT_YUV422A_PACKED = 1,  // bytes U Y V Y
    DEWARP_IMAGE_FORMAT_YUV422B_PACKED = 2,  // bytes Y U Y V
    DEWARP_IMAGE_FORMAT_YUV422_PLANAR = 3,
    DEWARP_IMAGE_FORMAT_YUV420_PLANAR = 4,
    DEWARP_IMAGE_FORMAT_YUV411_PLANAR = 5,
    DEWARP_IMAGE_FORMAT_NV420_PLANAR = 6  // luma plane, then one plane of interleaved chroma
};

enum _DEWARP_LOG_LEVEL : int {
    DEWARP_LOG_LEVEL_ERROR = 0,
    DEWARP_LOG_LEVEL_WARNING = 1,
    DEWARP_LOG_LEVEL_INFO = 2,
    DEWARP_LOG_LEVEL_DEBUG = 3,
    DEWARP_LOG_LEVEL_TRACE = 4
};

enum _DEWARP_VIEW : int {
    DEWARP_VIEW_SINGLE_PANORAMIC = 0,
    DEWARP_VIEW_DUAL_PANORAMIC = 1,
    DEWARP_VIEW_SINGLE_PTZ = 2,
    DEWARP_VIEW_QUAD_PTZ = 3
};

enum _DEWARP_PROJECTION : int {
    DEWARP_PROJECTION_RECTILINEAR = 0,
    DEWARP_PROJECTION_CYLINDRICAL = 1,
    DEWARP_PROJECTION_EQUIRECTANGULAR = 2,
    DEWARP_PROJECTION_MERCATOR = 3,
    DEWARP_PROJECTION_LAMBERT_CYLINDRICAL = 4,
    DEWARP_PROJECTION_MILLER_CYLINDRICAL = 5,
    DEWARP_PROJECTION_PANNINI = 6,
    DEWARP_PROJECTION_ARCHITECTURAL = 7,
    DEWARP_PROJECTION_EQUIRECTANGULAR_PANNINI = 8
};

/// Stored and reported only: the remappers always take the nearest source pixel.
enum _DEWARP_INTERPOLATION : int {
    DEWARP_INTERPOLATION_0 = 0,
    DEWARP_INTERPOLATION_1 = 1,
    DEWARP_INTERPOLATION_2 = 2
};

/// How the projection's picture is scaled to the output size.
enum _DEWARP_ASPECT_RATIO : int {
    DEWARP_ASPECT_RATIO_FIT = 0,       // uniform; the rest of the output is unmapped
    DEWARP_ASPECT_RATIO_FILL = 1,      // uniform; what lies outside the output is cut
    DEWARP_ASPECT_RATIO_STRETCH = 2,   // each axis by itself
    DEWARP_ASPECT_RATIO_FIT_WIDTH = 3  // the projection's width meets the output's
};

enum _DEWARP_INTERNAL_CAMERA_TYPE : int {
    DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR = 0,
    DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE = 1
};

enum _DEWARP_INTERNAL_CAMERA_MOUNT : int {
    DEWARP_INTERNAL_CAMERA_MOUNT_CEILING = 0,
    DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR = 1,
    DEWARP_INTERNAL_CAMERA_MOUNT_WALL = 2,
    DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL = 3
};

/// A frame without its pixels. The stride counts pixels, not bytes.
struct _DEWARP_IMAGE_INFO {
    _DEWARP_IMAGE_FORMAT format;
    size_t width;
    size_t height;
    size_t stride;
};

/// A frame with its pixels, every plane one after the other in `data`. The caller owns `data`.
struct _DEWARP_IMAGE {
    _DEWARP_IMAGE_INFO info;
    unsigned char* data;
};

struct _DEWARP_RESOLUTION {
    size_t width;
    size_t height;
};

/// A view direction in degrees and a zoom factor.
struct _DEWARP_PTZ_POSITION {
    float pan;
    float tilt;
    float roll;
    float zoom;
};

/// The reachable positions, each lower bound before its upper bound; angles in degrees.
struct _DEWARP_PTZ_RANGE {
    float pan_min;
    float pan_max;
    float tilt_min;
    float tilt_max;
    float roll_min;
    float roll_max;
    float zoom_min;
    float zoom_max;
};

struct _DEWARP_CHANNEL_SETTINGS {
    _DEWARP_VIEW view;
    _DEWARP_PROJECTION projection;
    _DEWARP_ASPECT_RATIO aspect_ratio;
    _DEWARP_INTERPOLATION interpolation;
};

/// The host's log sink: a complete printf format, prefix included, and its arguments.
typedef void (*_DEWARP_LOG_FUNCTION)(char const* format, va_list arguments);

struct _DEWARP_LOG_SETTINGS {
    _DEWARP_LOG_FUNCTION function;  // null for no logging
    _DEWARP_LOG_LEVEL level;        // the highest level that reaches the sink
};

/// A lens and sensor by value. The three fields of view, in degrees, are given independently.
struct _DEWARP_INTERNAL_CAMERA_MODEL {
    _DEWARP_INTERNAL_CAMERA_TYPE type;
    float diagonal_fov;
    float horizontal_fov;
    float vertical_fov;
    size_t width;
    size_t height;
};
