#pragma once

/* The call surface of the vexmap engine: plain C functions over channel handles, the same from
   C99 and from C++. A channel is one camera (lens, sensor size and mount) and one view of it
   (single or quad PTZ, single or dual panorama); each frame given to dewarp_image comes out as
   that view, through a table of source positions built when the view or its position changes.

   Nothing thrown inside the engine passes this surface: each function logs a failure through the
   sink of dewarp_set_log and returns -1 (null from the open calls), most with errno set; 0 is
   success. A handle is the channel itself and is checked against null only; it belongs to the
   caller from the open call to dewarp_close. Settings and positions may come from any thread; the
   frames of one channel come from one thread at a time, except for the bands of
   dewarp_image_rows. Angles are degrees, sizes pixels. */

#include "vexmap/dewarp_types.h"
#include "vexmap/version.h"

/* The engine library exports these functions and nothing else; a program that links the engine
   statically gets them like any other function. */
#if defined(__GNUC__)
#define DEWARP_API __attribute__((visibility("default")))
#else
#define DEWARP_API
#endif

#ifdef __cplusplus
extern "C" {
#endif

/* Installs the process-wide log sink and its level (0 errors to 2 information); null stops
   logging. */
DEWARP_API int dewarp_set_log(_DEWARP_LOG_SETTINGS const* settings);

/* A channel without a camera: calls that need a view fail until dewarp_internal_set_model. Null
   settings take the defaults. */
DEWARP_API void* dewarp_open(_DEWARP_CHANNEL_SETTINGS const* settings);
/* A channel on a camera model fixed on a mount. Null settings take the defaults, with the
   camera's own projection and aspect ratio. */
DEWARP_API void* dewarp_internal_open(_DEWARP_INTERNAL_CAMERA_MODEL const* model,
                                      _DEWARP_INTERNAL_CAMERA_MOUNT mount,
                                      _DEWARP_CHANNEL_SETTINGS const* settings);
/* 0 for any handle that is not null, also one that was closed. */
DEWARP_API int dewarp_channel_valid(void* channel);
DEWARP_API void dewarp_close(void* channel);

DEWARP_API int dewarp_set_view(void* channel, _DEWARP_VIEW view);
DEWARP_API int dewarp_set_projection(void* channel, _DEWARP_VIEW view,
                                     _DEWARP_PROJECTION projection);
/* Stored and reported only: the nearest source pixel is taken whatever it says. */
DEWARP_API int dewarp_set_interpolation(void* channel, _DEWARP_INTERPOLATION interpolation);
DEWARP_API int dewarp_set_aspect_ratio(void* channel, _DEWARP_ASPECT_RATIO aspect_ratio);
DEWARP_API int dewarp_get_settings(void* channel, _DEWARP_CHANNEL_SETTINGS* settings);
DEWARP_API int dewarp_get_native_resolution(void* channel, _DEWARP_RESOLUTION* resolution);

/* Moves the view; the position is limited to what the view can show and written back. A null
   position sends the view home. */
DEWARP_API int dewarp_set_ptz(void* channel, _DEWARP_PTZ_POSITION* position);
DEWARP_API int dewarp_get_ptz(void* channel, _DEWARP_PTZ_POSITION* position);
DEWARP_API int dewarp_get_ptz_range(void* channel, _DEWARP_PTZ_RANGE* range);
/* The position that looks at pixel (x, y) of the dewarped picture, at the given zoom. */
DEWARP_API int dewarp_calc_ptz_position(void* channel, int x, int y, float zoom,
                                        _DEWARP_PTZ_POSITION* position);

/* Dewarps one frame into the caller's buffer, at the size and in the layout that `dewarped`
   describes. Both buffers stay the caller's. */
DEWARP_API int dewarp_image(void* channel, _DEWARP_IMAGE const* warped, _DEWARP_IMAGE* dewarped);

/* For a host that shares a frame out over its own threads: dewarp_prepare_image builds the table
   for frames of the size in `dewarped` now, under the channel's write lock, and
   dewarp_image_rows then dewarps rows first_row to first_row + row_count - 1 of a frame of that
   size through it, as dewarp_image would write them, building nothing. Any number of threads may
   run dewarp_image_rows on one prepared channel at once, on bands of one frame or of several. A
   band starts on a block of the layout and ends on one or at the last row: whole rows for RGB32,
   pairs for the 4:2:2 and 4:2:0 layouts, fours for 4:1:1. A change of view, position or size
   drops the table; dewarp_image_rows then fails with EINVAL until the channel is prepared again.
   Added in version 1.1. */
DEWARP_API int dewarp_prepare_image(void* channel, _DEWARP_IMAGE_INFO const* dewarped);
DEWARP_API int dewarp_image_rows(void* channel, _DEWARP_IMAGE const* warped,
                                 _DEWARP_IMAGE* dewarped, size_t first_row, size_t row_count);

DEWARP_API int dewarp_internal_get_model(void* channel, _DEWARP_INTERNAL_CAMERA_MODEL* model);
/* A new model puts the camera on the default mount (wall). */
DEWARP_API int dewarp_internal_set_model(void* channel, _DEWARP_INTERNAL_CAMERA_MODEL const* model);
/* The mount; 2 for a null handle; -1 if something was thrown. */
DEWARP_API int dewarp_internal_get_mount(void* channel);
DEWARP_API int dewarp_internal_set_mount(void* channel, _DEWARP_INTERNAL_CAMERA_MOUNT mount);

#ifdef __cplusplus
} /* extern "C" */
#endif
