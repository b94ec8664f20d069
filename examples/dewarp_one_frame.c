/* Dewarps one fisheye frame through the vexmap engine library: opens a channel on a camera fixed
   to a ceiling, turns its virtual pan-tilt-zoom camera, dewarps one frame and closes the channel.

   Build it against an installed vexmap, with CMake (see CMakeLists.txt beside this file) or with
   pkg-config:
       cc -std=c99 dewarp_one_frame.c $(pkg-config --cflags --libs vexmap) -o dewarp_one_frame
   Run it with an optional PGM file name to see the luma of the dewarped picture. */

#include <stdarg.h>
#include <stdio.h>
#include <stdlib.h>

#include <vexmap/dewarp.h>

enum { LENS_SIZE = 1024, VIEW_WIDTH = 640, VIEW_HEIGHT = 480 };

static void log_to_stderr(char const* format, va_list arguments) {
    vfprintf(stderr, format, arguments);
}

/* A fisheye picture, 4:2:0: rings of luma around the centre, each quarter in its own colour. */
static void draw_lens(unsigned char* frame) {
    unsigned char* chroma_u = frame + LENS_SIZE * LENS_SIZE;
    unsigned char* chroma_v = chroma_u + LENS_SIZE * LENS_SIZE / 4;
    int row, column;
    for (row = 0; row < LENS_SIZE; ++row) {
        for (column = 0; column < LENS_SIZE; ++column) {
            long const x = column - LENS_SIZE / 2;
            long const y = row - LENS_SIZE / 2;
            frame[row * LENS_SIZE + column] = (unsigned char)(16 + ((x * x + y * y) >> 10) % 200);
            if (row % 2 == 0 && column % 2 == 0) {
                int const chroma = (row / 2) * (LENS_SIZE / 2) + column / 2;
                chroma_u[chroma] = (unsigned char)(x < 0 ? 90 : 170);
                chroma_v[chroma] = (unsigned char)(y < 0 ? 90 : 170);
            }
        }
    }
}

static int write_pgm(char const* path, unsigned char const* luma) {
    FILE* file = fopen(path, "wb");
    if (file == NULL) {
        return -1;
    }
    fprintf(file, "P5\n%d %d\n255\n", VIEW_WIDTH, VIEW_HEIGHT);
    fwrite(luma, 1, VIEW_WIDTH * VIEW_HEIGHT, file);
    return fclose(file);
}

int main(int argc, char** argv) {
    _DEWARP_LOG_SETTINGS const log = {log_to_stderr, DEWARP_LOG_LEVEL_WARNING};
    _DEWARP_INTERNAL_CAMERA_MODEL const lens = {
        DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, 180.0f, 180.0f, 180.0f, LENS_SIZE, LENS_SIZE};
    _DEWARP_CHANNEL_SETTINGS const settings = {DEWARP_VIEW_SINGLE_PTZ,
                                               DEWARP_PROJECTION_RECTILINEAR,
                                               DEWARP_ASPECT_RATIO_FILL, DEWARP_INTERPOLATION_0};
    _DEWARP_PTZ_POSITION position = {45.0f, 30.0f, 0.0f, 1.5f};
    _DEWARP_IMAGE fisheye = {{DEWARP_IMAGE_FORMAT_YUV420_PLANAR, LENS_SIZE, LENS_SIZE, LENS_SIZE},
                             NULL};
    _DEWARP_IMAGE view = {{DEWARP_IMAGE_FORMAT_YUV420_PLANAR, VIEW_WIDTH, VIEW_HEIGHT, VIEW_WIDTH},
                          NULL};
    unsigned long checksum = 0;
    int status = EXIT_FAILURE;
    int pixel;
    void* channel;

    fisheye.data = malloc(LENS_SIZE * LENS_SIZE * 3 / 2);
    view.data = malloc(VIEW_WIDTH * VIEW_HEIGHT * 3 / 2);
    if (fisheye.data == NULL || view.data == NULL) {
        fprintf(stderr, "out of memory\n");
        return EXIT_FAILURE;
    }
    draw_lens(fisheye.data);

    dewarp_set_log(&log);
    channel = dewarp_internal_open(&lens, DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, &settings);
    if (channel == NULL) {
        fprintf(stderr, "the channel did not open\n");
    } else if (dewarp_set_ptz(channel, &position) != 0) {
        fprintf(stderr, "the position was refused\n");
    } else if (dewarp_image(channel, &fisheye, &view) != 0) {
        fprintf(stderr, "the frame was not dewarped\n");
    } else {
        for (pixel = 0; pixel < VIEW_WIDTH * VIEW_HEIGHT; ++pixel) {
            checksum = (checksum * 31 + view.data[pixel]) % 4294967291UL;
        }
        /* The engine writes back the position it limited the request to. */
        printf("vexmap %s: %dx%d view at pan %.1f, tilt %.1f, zoom %.2f, luma checksum %lu\n",
               VEXMAP_VERSION_STRING, VIEW_WIDTH, VIEW_HEIGHT, position.pan, position.tilt,
               position.zoom, checksum);
        status = EXIT_SUCCESS;
        if (argc > 1 && write_pgm(argv[1], view.data) != 0) {
            fprintf(stderr, "could not write %s\n", argv[1]);
            status = EXIT_FAILURE;
        }
    }
    if (channel != NULL) {
        dewarp_close(channel);
    }
    free(fisheye.data);
    free(view.data);
    return status;
}
