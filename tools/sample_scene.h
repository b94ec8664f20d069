#pragma once

#include "rgb_image.h"

namespace vexmap_host {

/// The built-in sample: a box-shaped room with tiled floor and gridded walls, seen from its middle
/// through an equidistant fisheye lens of 180 degrees that looks at the floor. The image circle
/// fills the square picture.
struct SampleFisheye {
    RgbImage image;
    int circle_x;
    int circle_y;
    int circle_radius;
};

SampleFisheye MakeSampleFisheye(int size);  // a size x size picture; size is even and positive

}  // namespace vexmap_host
