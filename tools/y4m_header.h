#pragma once

#include <string>

namespace vexmap_host {

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
    std::string colour_space;  // the C tag's value; empty when there is none
};

}  // namespace vexmap_host
