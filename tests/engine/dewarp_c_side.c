/* The engine's call surface as a C99 program sees it: compiled as C, strictly. */

#include "dewarp_c_side.h"

#define AS_VALUE(expression) expression,

size_t const c_record_layout[] = {VEXMAP_RECORD_LAYOUT(AS_VALUE)};
size_t const c_record_layout_count = sizeof c_record_layout / sizeof c_record_layout[0];

int c_dewarp_one_frame(unsigned char* input, unsigned char* output) {
    _DEWARP_INTERNAL_CAMERA_MODEL model = {
        DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, 180.0f, 180.0f, 180.0f, 64, 64};
    _DEWARP_CHANNEL_SETTINGS settings = {DEWARP_VIEW_SINGLE_PTZ, DEWARP_PROJECTION_RECTILINEAR,
                                         DEWARP_ASPECT_RATIO_STRETCH, DEWARP_INTERPOLATION_0};
    _DEWARP_PTZ_POSITION position = {30.0f, 40.0f, 0.0f, 1.0f};
    _DEWARP_IMAGE warped = {{DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 64, 64, 64}, NULL};
    _DEWARP_IMAGE dewarped = {{DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 32, 24, 32}, NULL};
    int result = -1;
    void* channel = dewarp_internal_open(&model, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, &settings);
    if (channel == NULL) {
        return -1;
    }
    warped.data = input;
    dewarped.data = output;
    if (dewarp_set_ptz(channel, &position) == 0) {
        result = dewarp_image(channel, &warped, &dewarped);
    }
    dewarp_close(channel);
    return result;
}
