#pragma once

// The checks and the inner functions behind the call surface, in C++: the engine's own, and its
// tests'. A program using the engine includes vexmap/dewarp.h alone.

#include <exception>

#include "vexmap/code_location.h"
#include "vexmap/dewarp.h"

// The checks of the call surface. Each throws Error located at the given place; most set the last
// error first. The log-level checks only warn.
void Verify(quorvel::vexmap::CodeLocation const& location, float value, float min, float max,
            char const* name);
void Verify(quorvel::vexmap::CodeLocation const& location, void const* pointer, unsigned long size,
            char const* name);
void Verify(quorvel::vexmap::CodeLocation const& location, _DEWARP_LOG_LEVEL level);
void Verify(quorvel::vexmap::CodeLocation const& location, _DEWARP_LOG_SETTINGS const& settings);
void Verify(quorvel::vexmap::CodeLocation const& location, _DEWARP_INTERPOLATION interpolation);
void Verify(quorvel::vexmap::CodeLocation const& location, _DEWARP_PROJECTION projection);
void Verify(quorvel::vexmap::CodeLocation const& location, _DEWARP_VIEW view);
void Verify(quorvel::vexmap::CodeLocation const& location, _DEWARP_ASPECT_RATIO aspect_ratio);
void Verify(quorvel::vexmap::CodeLocation const& location, _DEWARP_IMAGE_FORMAT format);
void Verify(quorvel::vexmap::CodeLocation const& location, _DEWARP_IMAGE_INFO const& info);
void Verify(quorvel::vexmap::CodeLocation const& location, _DEWARP_IMAGE const& image);
void Verify(quorvel::vexmap::CodeLocation const& location, _DEWARP_PTZ_POSITION const& position);
void Verify(quorvel::vexmap::CodeLocation const& location,
            _DEWARP_CHANNEL_SETTINGS const& settings);
void Verify(quorvel::vexmap::CodeLocation const& location, _DEWARP_INTERNAL_CAMERA_TYPE type);
void Verify(quorvel::vexmap::CodeLocation const& location, _DEWARP_INTERNAL_CAMERA_MOUNT mount);
void Verify(quorvel::vexmap::CodeLocation const& location, _DEWARP_INTERNAL_CAMERA_MODEL model);

/// What a caller of the pointer check passes for a size: always 0.
unsigned long SizeOf(_DEWARP_IMAGE_INFO const& info);
unsigned long SizeOf(_DEWARP_IMAGE const* image);

// The inner functions: the handle, the arguments, then the channel. They let out only
// std::exception and its kin; the outer functions turn those into a log line and a result.
int SetLog(_DEWARP_LOG_SETTINGS const* settings);
void* Open(_DEWARP_CHANNEL_SETTINGS const* settings);
void* Open(_DEWARP_INTERNAL_CAMERA_MODEL const* model, _DEWARP_INTERNAL_CAMERA_MOUNT mount,
           _DEWARP_CHANNEL_SETTINGS const* settings);
int SetView(void* channel, _DEWARP_VIEW view);
int SetProjection(void* channel, _DEWARP_VIEW view, _DEWARP_PROJECTION projection);
int SetInterpolation(void* channel, _DEWARP_INTERPOLATION interpolation);
int SetAspectRatio(void* channel, _DEWARP_ASPECT_RATIO aspect_ratio);
int GetSettings(void* channel, _DEWARP_CHANNEL_SETTINGS* settings);
int GetNativeResolution(void* channel, _DEWARP_RESOLUTION* resolution);
int SetPtz(void* channel, _DEWARP_PTZ_POSITION* position);
int GetPtz(void* channel, _DEWARP_PTZ_POSITION* position);
int GetPtzRange(void* channel, _DEWARP_PTZ_RANGE* range);
int CalcPtzPosition(void* channel, int x, int y, float zoom, _DEWARP_PTZ_POSITION* position);
int DewarpImage(void* channel, _DEWARP_IMAGE const* warped, _DEWARP_IMAGE* dewarped);
int PrepareImage(void* channel, _DEWARP_IMAGE_INFO const* dewarped);
int DewarpImageRows(void* channel, _DEWARP_IMAGE const* warped, _DEWARP_IMAGE* dewarped,
                    size_t first_row, size_t row_count);
void Close(void* channel);
int GetModel(void* channel, _DEWARP_INTERNAL_CAMERA_MODEL* model);
int SetModel(void* channel, _DEWARP_INTERNAL_CAMERA_MODEL const* model);
int GetMount(void* channel);
int SetMount(void* channel, _DEWARP_INTERNAL_CAMERA_MOUNT mount);
