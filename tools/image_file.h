#pragma once

#include <string>

#include "rgb_image.h"

namespace vexmap_host {

/// Reads a PNG or JPEG file, told apart by its first bytes; throws ToolError with the reason.
RgbImage ReadImage(std::string const& path);

/// Writes an 8-bit RGB PNG file; throws ToolError with the reason.
void WritePng(std::string const& path, RgbImage const& image);

}  // namespace vexmap_host
