#pragma once

/* The records and enumerations that cross the dewarp call surface. Plain data in the global
   namespace, the same in C99 and C++: a record is copied by assignment, an enumeration is a
   32-bit value. Angles are degrees, sizes are pixel counts. */

#include <stdarg.h>
#include <stddef.h>

/* C++ fixes the enumerations to int, so that any int a caller passes is a value of its type and
   out-of-range values are checked, not undefined; C gives them a 32-bit integer type of its own. */
#ifdef __cplusplus
#define VEXMAP_ENUM_INT : int
#else
#define VEXMAP_ENUM_INT
#endif

typedef enum _DEWARP_IMAGE_FORMAT VEXMAP_ENUM_INT {
    DEWARP_IMAGE_FORMAT_RGB32_PACKED = 0,
    DEWARP_IMAGE_FORMAT_YUV422A_PACKED = 1,  // bytes U Y V Y
    DEWARP_IMAGE_FORMAT_YUV422B_PACKED = 2,  // bytes Y U Y V
    DEWARP_IMAGE_FORMAT_YUV422_PLANAR = 3,
    DEWARP_IMAGE_FORMAT_YUV420_PLANAR = 4,
    DEWARP_IMAGE_FORMAT_YUV411_PLANAR = 5,
    DEWARP_IMAGE_FORMAT_NV420_PLANAR = 6  // luma plane, then one plane of interleaved chroma
} _DEWARP_IMAGE_FORMAT;

typedef enum _DEWARP_LOG_LEVEL VEXMAP_ENUM_INT {
    DEWARP_LOG_LEVEL_ERROR = 0,
    DEWARP_LOG_LEVEL_WARNING = 1,
    DEWARP_LOG_LEVEL_INFO = 2,
    DEWARP_LOG_LEVEL_DEBUG = 3,
    DEWARP_LOG_LEVEL_TRACE = 4
} _DEWARP_LOG_LEVEL;

typedef enum _DEWARP_VIEW VEXMAP_ENUM_INT {
    DEWARP_VIEW_SINGLE_PANORAMIC = 0,
    DEWARP_VIEW_DUAL_PANORAMIC = 1,
    DEWARP_VIEW_SINGLE_PTZ = 2,
    DEWARP_VIEW_QUAD_PTZ = 3
} _DEWARP_VIEW;

typedef enum _DEWARP_PROJECTION VEXMAP_ENUM_INT {
    DEWARP_PROJECTION_RECTILINEAR = 0,
    DEWARP_PROJECTION_CYLINDRICAL = 1,
    DEWARP_PROJECTION_EQUIRECTANGULAR = 2,
    DEWARP_PROJECTION_MERCATOR = 3,
    DEWARP_PROJECTION_LAMBERT_CYLINDRICAL = 4,
    DEWARP_PROJECTION_MILLER_CYLINDRICAL = 5,
    DEWARP_PROJECTION_PANNINI = 6,
    DEWARP_PROJECTION_ARCHITECTURAL = 7,
    DEWARP_PROJECTION_EQUIRECTANGULAR_PANNINI = 8
} _DEWARP_PROJECTION;

/// Stored and reported only: the remappers always take the nearest source pixel.
typedef enum _DEWARP_INTERPOLATION VEXMAP_ENUM_INT {
    DEWARP_INTERPOLATION_0 = 0,
    DEWARP_INTERPOLATION_1 = 1,
    DEWARP_INTERPOLATION_2 = 2
} _DEWARP_INTERPOLATION;

/// How the projection's picture is scaled to the output size.
typedef enum _DEWARP_ASPECT_RATIO VEXMAP_ENUM_INT {
    DEWARP_ASPECT_RATIO_FIT = 0,       // uniform; the rest of the output is unmapped
    DEWARP_ASPECT_RATIO_FILL = 1,      // uniform; what lies outside the output is cut
    DEWARP_ASPECT_RATIO_STRETCH = 2,   // each axis by itself
    DEWARP_ASPECT_RATIO_FIT_WIDTH = 3  // the projection's width meets the output's
} _DEWARP_ASPECT_RATIO;

typedef enum _DEWARP_INTERNAL_CAMERA_TYPE VEXMAP_ENUM_INT {
    DEWARP_INTERNAL_CAMERA_TYPE_RECTILINEAR = 0,
    DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE = 1
} _DEWARP_INTERNAL_CAMERA_TYPE;

typedef enum _DEWARP_INTERNAL_CAMERA_MOUNT VEXMAP_ENUM_INT {
    DEWARP_INTERNAL_CAMERA_MOUNT_CEILING = 0,
    DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR = 1,
    DEWARP_INTERNAL_CAMERA_MOUNT_WALL = 2,
    DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL = 3
} _DEWARP_INTERNAL_CAMERA_MOUNT;

/// A frame without its pixels. The stride counts pixels, not bytes.
typedef struct _DEWARP_IMAGE_INFO {
    _DEWARP_IMAGE_FORMAT format;
    size_t width;
    size_t height;
    size_t stride;
} _DEWARP_IMAGE_INFO;

/// A frame with its pixels, every plane one after the other in `data`. The caller owns `data`.
typedef struct _DEWARP_IMAGE {
    _DEWARP_IMAGE_INFO info;
    unsigned char* data;
} _DEWARP_IMAGE;

typedef struct _DEWARP_RESOLUTION {
    size_t width;
    size_t height;
} _DEWARP_RESOLUTION;

/// A view direction in degrees and a zoom factor.
typedef struct _DEWARP_PTZ_POSITION {
    float pan;
    float tilt;
    float roll;
    float zoom;
} _DEWARP_PTZ_POSITION;

/// The reachable positions, each lower bound before its upper bound; angles in degrees.
typedef struct _DEWARP_PTZ_RANGE {
    float pan_min;
    float pan_max;
    float tilt_min;
    float tilt_max;
    float roll_min;
    float roll_max;
    float zoom_min;
    float zoom_max;
} _DEWARP_PTZ_RANGE;

typedef struct _DEWARP_CHANNEL_SETTINGS {
    _DEWARP_VIEW view;
    _DEWARP_PROJECTION projection;
    _DEWARP_ASPECT_RATIO aspect_ratio;
    _DEWARP_INTERPOLATION interpolation;
} _DEWARP_CHANNEL_SETTINGS;

/// The host's log sink: a complete printf format, prefix included, and its arguments.
typedef void (*_DEWARP_LOG_FUNCTION)(char const* format, va_list arguments);

typedef struct _DEWARP_LOG_SETTINGS {
    _DEWARP_LOG_FUNCTION function;  // null for no logging
    _DEWARP_LOG_LEVEL level;        // the highest level that reaches the sink
} _DEWARP_LOG_SETTINGS;

/// A lens and sensor by value. The three fields of view, in degrees, are given independently.
typedef struct _DEWARP_INTERNAL_CAMERA_MODEL {
    _DEWARP_INTERNAL_CAMERA_TYPE type;
    float diagonal_fov;
    float horizontal_fov;
    float vertical_fov;
    size_t width;
    size_t height;
} _DEWARP_INTERNAL_CAMERA_MODEL;
