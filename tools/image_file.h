#pragma once

#include <string>

#include "picture_limits.h"
#include "rgb_image.h"

namespace vexmap_host {

/// High enough that a dewarped view shows no blocks, with 4:4:4 chroma so that thin coloured
/// lines keep their colour.
constexpr int JPEG_QUALITY = 92;
/// A picture file larger than this is refused unread: no sane PNG or JPEG of the largest picture
/// taken comes near it.
constexpr long long MAX_PICTURE_FILE_BYTES = 1LL << 30;

/// Reads a PNG or JPEG file, told apart by its first bytes, into 8-bit RGB. The size its header
/// claims passes `limits` before any pixel buffer is made; throws ToolError with the reason.
RgbImage ReadImage(std::string const& path, PictureLimits const& limits = PictureLimits());

/// Writes an 8-bit RGB PNG file; throws ToolError with the reason.
void WritePng(std::string const& path, RgbImage const& image);

/// Writes a baseline JPEG file of `quality` 1 to 100; throws ToolError with the reason.
void WriteJpeg(std::string const& path, RgbImage const& image, int quality = JPEG_QUALITY);

/// Writes PNG or JPEG as the extension of `name` says (.png, .jpg, .jpeg, in any case) into the
/// file `path`, which may be a temporary stand-in for `name`.
void WritePicture(std::string const& path, std::string const& name, RgbImage const& image);

/// Whether `path` ends in an extension that WritePicture writes.
bool IsPictureExtension(std::string const& path);

}  // namespace vexmap_host
