#pragma once

/* What the C side of the engine tests reports: the layout of every public record as a C compiler
   sees it, and a frame dewarped through calls made from C. Both sides list the layout through
   VEXMAP_RECORD_LAYOUT, so that each figure is compared with the same expression in C++. */

#include <stddef.h>

#include "vexmap/dewarp.h"

#define VEXMAP_RECORD_LAYOUT(FIGURE)                              \
    FIGURE(sizeof(_DEWARP_IMAGE_FORMAT))                          \
    FIGURE(sizeof(_DEWARP_LOG_LEVEL))                             \
    FIGURE(sizeof(_DEWARP_VIEW))                                  \
    FIGURE(sizeof(_DEWARP_PROJECTION))                            \
    FIGURE(sizeof(_DEWARP_INTERPOLATION))                         \
    FIGURE(sizeof(_DEWARP_ASPECT_RATIO))                          \
    FIGURE(sizeof(_DEWARP_INTERNAL_CAMERA_TYPE))                  \
    FIGURE(sizeof(_DEWARP_INTERNAL_CAMERA_MOUNT))                 \
    FIGURE(sizeof(_DEWARP_IMAGE_INFO))                            \
    FIGURE(offsetof(_DEWARP_IMAGE_INFO, width))                   \
    FIGURE(offsetof(_DEWARP_IMAGE_INFO, height))                  \
    FIGURE(offsetof(_DEWARP_IMAGE_INFO, stride))                  \
    FIGURE(sizeof(_DEWARP_IMAGE))                                 \
    FIGURE(offsetof(_DEWARP_IMAGE, data))                         \
    FIGURE(sizeof(_DEWARP_RESOLUTION))                            \
    FIGURE(offsetof(_DEWARP_RESOLUTION, height))                  \
    FIGURE(sizeof(_DEWARP_PTZ_POSITION))                          \
    FIGURE(offsetof(_DEWARP_PTZ_POSITION, zoom))                  \
    FIGURE(sizeof(_DEWARP_PTZ_RANGE))                             \
    FIGURE(offsetof(_DEWARP_PTZ_RANGE, zoom_max))                 \
    FIGURE(sizeof(_DEWARP_CHANNEL_SETTINGS))                      \
    FIGURE(offsetof(_DEWARP_CHANNEL_SETTINGS, interpolation))     \
    FIGURE(sizeof(_DEWARP_LOG_SETTINGS))                          \
    FIGURE(offsetof(_DEWARP_LOG_SETTINGS, level))                 \
    FIGURE(sizeof(_DEWARP_INTERNAL_CAMERA_MODEL))                 \
    FIGURE(offsetof(_DEWARP_INTERNAL_CAMERA_MODEL, vertical_fov)) \
    FIGURE(offsetof(_DEWARP_INTERNAL_CAMERA_MODEL, width))        \
    FIGURE(offsetof(_DEWARP_INTERNAL_CAMERA_MODEL, height))

#ifdef __cplusplus
extern "C" {
#endif

/* The figures of VEXMAP_RECORD_LAYOUT in their order, as C has them. */
extern size_t const c_record_layout[];
extern size_t const c_record_layout_count;

/* Opens a ceiling camera of 64 x 64 pixels from C, looks at pan 30, tilt 40, zoom 1 and
   dewarps `input` (4:2:0) into `output` (4:2:0, 32 x 24); 0 on success. */
int c_dewarp_one_frame(unsigned char* input, unsigned char* output);

#ifdef __cplusplus
}
#endif
