#pragma once

#include <cstdint>
#include <vector>

namespace vexmap_host {

/// A picture as the tool reads and writes it: rows top down, 8-bit red, green, blue per pixel.
struct RgbImage {
    int width = 0;
    int height = 0;
    std::vector<uint8_t> pixels;  // width * height * 3 bytes
};

}  // namespace vexmap_host
