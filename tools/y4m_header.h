#pragma once

#include <string>

#include "yuv_image.h"

namespace vexmap_host {

/// How the chroma of a stream's frames is laid out: 4:2:0, 4:2:2 (half width, full height),
/// 4:4:4 (full size), 4:1:1 (quarter width, full height) or none.
enum class ChromaLayout { C420, C422, C444, C411, MONO };

/// What the header line of a YUV4MPEG2 stream tells about every frame of it. Ratios are kept as
/// written, numerator and denominator.
struct Y4mHeader {
    int width = 0;
    int height = 0;
    int rate_numerator = 25;  // frames a second, as a ratio; 25:1 when the stream gives none
    int rate_denominator = 1;
    char interlacing = 'p';  // p progressive, t top field first, b bottom first, m mixed, ? unknown
    int aspect_numerator = 0;  // pixel aspect; 0:0 when unknown
    int aspect_denominator = 0;
    std::string colour_space;  // the C tag's value as written; empty when there is none
    ChromaLayout layout = ChromaLayout::C420;
    bool alpha = false;  // a fourth, full-size plane after the chroma planes, read and dropped
    ColourRange range = ColourRange::UNSPECIFIED;  // from XCOLORRANGE
};

}  // namespace vexmap_host
