#pragma once

/* libfisheyesw (soname libfisheyesw.so.3), the closed fisheye dewarping library, as its own C
 * header declares it. The plug-in takes types from here and never calls these functions directly:
 * it reaches them at run time through VivotekLibraryInstance. */

#include <stddef.h>
#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

/* Which fields of a Fisheye_Option the library reads. */
enum {
    FISHEYE_OPTION_SETUP = 0x20FF, /* inputWidth through dewarpType, and the output rectangle */
    FISHEYE_OPTION_WALL_PAN = 0x0100,
    FISHEYE_OPTION_TILT = 0x0200,
    FISHEYE_OPTION_PAN = 0x0400,
    FISHEYE_OPTION_ZOOM = 0x0800,
    FISHEYE_OPTION_ROTATION = 0x1000
};

/* Settings for one Fisheye_SetOption; only the fields named by `flags` are read. Little-endian,
 * 112 bytes. */
typedef struct Fisheye_Option {
    uint32_t flags;
    uint32_t reserved;
    int32_t inputWidth;
    int32_t inputHeight;
    int32_t inputStride;
    int32_t inputFormat;
    unsigned char* input;
    int32_t outputWidth;
    int32_t outputHeight;
    int32_t outputStride;
    int32_t outputFormat;
    unsigned char* output;
    int32_t centerX;
    int32_t centerY;
    int32_t radius;
    int32_t mount;      /* 0 wall, 1 ceiling, 2 floor */
    int32_t dewarpType; /* 0 one view, 1 panorama, 2 dual panorama */
    float wallPan;      /* pan of a wall camera */
    float tilt;
    float pan; /* pan of a ceiling or floor camera */
    int32_t zoom;
    float rotation; /* turn of a panorama */
    int32_t left;
    int32_t top;
    int32_t width;
    int32_t height;
} Fisheye_Option;

/* Every function returns 0 on success. */
int Fisheye_Initial(void** handle, unsigned int version);
int Fisheye_Release(void** handle);
int Fisheye_SetModelName(void* handle, char const* name);
int Fisheye_SetOption(void* handle, void* option);
int Fisheye_OneFrame(void* handle);

#ifdef __cplusplus
}

static_assert(sizeof(Fisheye_Option) == 112, "Fisheye_Option is 112 bytes");
static_assert(offsetof(Fisheye_Option, flags) == 0, "Fisheye_Option::flags");
static_assert(offsetof(Fisheye_Option, reserved) == 4, "Fisheye_Option::reserved");
static_assert(offsetof(Fisheye_Option, inputWidth) == 8, "Fisheye_Option::inputWidth");
static_assert(offsetof(Fisheye_Option, inputHeight) == 12, "Fisheye_Option::inputHeight");
static_assert(offsetof(Fisheye_Option, inputStride) == 16, "Fisheye_Option::inputStride");
static_assert(offsetof(Fisheye_Option, inputFormat) == 20, "Fisheye_Option::inputFormat");
static_assert(offsetof(Fisheye_Option, input) == 24, "Fisheye_Option::input");
static_assert(offsetof(Fisheye_Option, outputWidth) == 32, "Fisheye_Option::outputWidth");
static_assert(offsetof(Fisheye_Option, outputHeight) == 36, "Fisheye_Option::outputHeight");
static_assert(offsetof(Fisheye_Option, outputStride) == 40, "Fisheye_Option::outputStride");
static_assert(offsetof(Fisheye_Option, outputFormat) == 44, "Fisheye_Option::outputFormat");
static_assert(offsetof(Fisheye_Option, output) == 48, "Fisheye_Option::output");
static_assert(offsetof(Fisheye_Option, centerX) == 56, "Fisheye_Option::centerX");
static_assert(offsetof(Fisheye_Option, centerY) == 60, "Fisheye_Option::centerY");
static_assert(offsetof(Fisheye_Option, radius) == 64, "Fisheye_Option::radius");
static_assert(offsetof(Fisheye_Option, mount) == 68, "Fisheye_Option::mount");
static_assert(offsetof(Fisheye_Option, dewarpType) == 72, "Fisheye_Option::dewarpType");
static_assert(offsetof(Fisheye_Option, wallPan) == 76, "Fisheye_Option::wallPan");
static_assert(offsetof(Fisheye_Option, tilt) == 80, "Fisheye_Option::tilt");
static_assert(offsetof(Fisheye_Option, pan) == 84, "Fisheye_Option::pan");
static_assert(offsetof(Fisheye_Option, zoom) == 88, "Fisheye_Option::zoom");
static_assert(offsetof(Fisheye_Option, rotation) == 92, "Fisheye_Option::rotation");
static_assert(offsetof(Fisheye_Option, left) == 96, "Fisheye_Option::left");
static_assert(offsetof(Fisheye_Option, top) == 100, "Fisheye_Option::top");
static_assert(offsetof(Fisheye_Option, width) == 104, "Fisheye_Option::width");
static_assert(offsetof(Fisheye_Option, height) == 108, "Fisheye_Option::height");
#endif
