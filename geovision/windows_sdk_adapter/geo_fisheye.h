#pragma once

/* libgeofisheye 1.0.0, soname libgeofisheye.so.1: Geovision's closed fisheye library, declared
 * as its own C header declares it. The plug-in never calls these functions by name: it opens the
 * library at run time and takes the types of its function pointers from here.
 *
 * Chosen here, since nothing else fixes them: geo_fisheye_create_object takes no argument, and
 * an object starts with a public head (output size, internal view mode and mount) that callers
 * read directly; the library's private state follows the head. */

#include <assert.h>
#include <stddef.h>
#include <stdint.h>

#ifndef __cplusplus
#include <stdbool.h>
#endif

#ifdef __cplusplus
extern "C" {
#endif

/* The library's process-wide state; opaque. */
typedef struct geo_fisheye_context geo_fisheye_context;

/* One dewarped picture source. Only the head is public; the library allocates the object and
 * keeps its private state after the head. */
typedef struct geo_fisheye {
    float output_width; /* the output rectangle, in pixels */
    float output_height;
    int32_t view_mode;  /* internal view: 0, 1, 2 or 3 */
    int32_t mount_type; /* internal mount: 0 ceiling, 1 wall, 2 floor */
} geo_fisheye;

/* What geo_fisheye_init_object is told of the source pictures. */
typedef struct geo_fisheye_source_description {
    int32_t width;  /* pixels */
    int32_t height; /* pixels */
    int32_t format; /* 1, 24-bit R, G, B: the only one */
    bool enabled;
} geo_fisheye_source_description;

/* A rendered picture, 4 bytes a pixel R, G, B, A, rows packed; allocated by the library. */
typedef struct geo_fisheye_render_result {
    uint8_t* pixels;
    int32_t width;
    int32_t height;
} geo_fisheye_render_result;

/* One word of the controller record: a float unless the index says integer. */
typedef union geo_fisheye_controller_word {
    float value;
    int32_t integer;
} geo_fisheye_controller_word;

/* Word indices of the controller record. Angles are degrees, zoom a field of view in degrees;
 * views 0 and 1 hold one value a layout. */
enum geo_fisheye_controller_index {
    GEO_FISHEYE_VIEW0_PAN = 0,   /* 0 to 3, a layout each */
    GEO_FISHEYE_VIEW0_TILT = 4,  /* 4 to 7 */
    GEO_FISHEYE_VIEW0_ZOOM = 8,  /* 8 to 11 */
    GEO_FISHEYE_VIEW1_PAN = 12,  /* 12 to 14 */
    GEO_FISHEYE_VIEW1_TILT = 15, /* 15 to 17 */
    GEO_FISHEYE_VIEW1_ZOOM = 18, /* 18 to 20 */
    GEO_FISHEYE_RESERVED_21 = 21,
    GEO_FISHEYE_VIEW3_PAN = 22,
    GEO_FISHEYE_VIEW3_TILT = 23,
    GEO_FISHEYE_VIEW3_ZOOM = 24,
    GEO_FISHEYE_SOURCE_CENTER_X = 25, /* source pixels */
    GEO_FISHEYE_SOURCE_CENTER_Y = 26,
    GEO_FISHEYE_SOURCE_RADIUS = 27,
    GEO_FISHEYE_RESERVED_28 = 28,
    GEO_FISHEYE_VIEW_MODE = 29,  /* integer */
    GEO_FISHEYE_MOUNT_TYPE = 30, /* integer */
    GEO_FISHEYE_CONTROLLER_WORDS = 31
};

enum geo_fisheye_layout_count {
    GEO_FISHEYE_VIEW0_LAYOUTS = 4,
    GEO_FISHEYE_VIEW1_LAYOUTS = 3,
    GEO_FISHEYE_VIEW3_LAYOUTS = 1
};

typedef struct geo_fisheye_controller_info {
    geo_fisheye_controller_word words[GEO_FISHEYE_CONTROLLER_WORDS];
} geo_fisheye_controller_info;

static_assert(sizeof(geo_fisheye_controller_word) == 4, "a controller word is 32 bits");
static_assert(sizeof(geo_fisheye_controller_info) == 124, "the controller record is 31 words");
static_assert(offsetof(geo_fisheye_render_result, pixels) == 0, "the pixels come first");
static_assert(offsetof(geo_fisheye_render_result, width) == sizeof(uint8_t*),
              "the sizes follow the pixels");
static_assert(offsetof(geo_fisheye_render_result, height) == sizeof(uint8_t*) + 4,
              "the sizes are 32 bits");
static_assert(sizeof(geo_fisheye) == 16, "the public head is four words");

bool geo_fisheye_init(geo_fisheye_context** context);
/* May null *context; a caller that finds it null makes a new one. */
void geo_fisheye_shutdown(geo_fisheye_context** context);

geo_fisheye* geo_fisheye_create_object(void);
bool geo_fisheye_init_object(geo_fisheye_context* context,
                             geo_fisheye_source_description const* description,
                             geo_fisheye* object);
/* Frees the object and nulls *object. */
void geo_fisheye_release_object(geo_fisheye** object);

void geo_fisheye_update_object_bounds(geo_fisheye* object, float x, float y, float width,
                                      float height);
/* Copies one source picture of the size given to geo_fisheye_init_object. */
bool geo_fisheye_update_object_image(geo_fisheye* object, uint8_t const* image);

bool geo_fisheye_create_render_result(geo_fisheye_context* context, int32_t width, int32_t height,
                                      geo_fisheye* object, geo_fisheye_render_result** result);
/* Frees the result and nulls *result. */
void geo_fisheye_release_render_result(geo_fisheye_render_result** result);

void geo_fisheye_get_object_controller_info(geo_fisheye const* object,
                                            geo_fisheye_controller_info* info);
void geo_fisheye_set_object_controller_info(geo_fisheye_controller_info const* info,
                                            geo_fisheye* object);

/* The layout under an output point, or -1. */
int32_t geo_fisheye_get_object_layout_id(geo_fisheye const* object, float x, float y);

void geo_fisheye_change_object_view_mode(geo_fisheye* object, int32_t view_mode);
void geo_fisheye_change_object_mount_type(geo_fisheye* object, int32_t mount_type);
void geo_fisheye_change_object_source_filter(geo_fisheye* object, int32_t filter, float first,
                                             float second, float third);

/* Relative moves: degrees added to pan and tilt, and a factor that narrows the field of view. */
void geo_fisheye_pan_tilt_object(geo_fisheye* object, int32_t layout, float pan, float tilt);
void geo_fisheye_zoom_object(geo_fisheye* object, int32_t layout, float factor);

/* Absolute position of a layout: degrees, and a field of view in degrees. */
void geo_fisheye_set_object_pan_tilt(geo_fisheye* object, int32_t layout, float pan, float tilt);
void geo_fisheye_set_object_zoom(geo_fisheye* object, int32_t layout, float zoom);

/* The direction, in degrees, in which a source pixel looks. */
void geo_fisheye_calculate_object_pan_tilt(float x, float y, geo_fisheye const* object, float* pan,
                                           float* tilt);

#ifdef __cplusplus
}
#endif
