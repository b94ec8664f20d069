#pragma once

#include <string>

#include "picture_limits.h"
#include "rgb_image.h"

namespace vexmap_host {

/// High enough that a dewarped view shows no blocks. JPEGs are written with full-resolution
/// chroma (4:4:4): a view's thin coloured lines and edges keep their colour, for somewhat larger
/// files than 4:2:0 gives.
constexpr int JPEG_QUALITY = 90;
/// A picture file larger than this is refused unread: no sane PNG or JPEG of the largest picture
/// taken comes near it.
constexpr long long MAX_PICTURE_FILE_BYTES = 1LL << 30;

/// Reads a PNG or JPEG file, told apart by its first bytes, into 8-bit RGB: grey, palette, 16-bit
/// and alpha PNGs (alpha over black) and grey or CMYK JPEGs are converted. The size its header
/// claims passes `limits` before any pixel buffer is made; a file larger than
/// MAX_PICTURE_FILE_BYTES, or one whose first bytes are no picture's, is refused unread. Throws
/// ToolError with the path and the reason.
RgbImage ReadImage(std::string const& path, PictureLimits const& limits = PictureLimits());

/// Writes an 8-bit RGB PNG file through stdio; throws ToolError with the path and the system's
/// reason, a full disc included.
void WritePng(std::string const& path, RgbImage const& image);

/// Writes a baseline 4:4:4 JPEG file of `quality` 1 to 100 (a value outside is clamped); throws
/// ToolError with the path and the reason.
void WriteJpeg(std::string const& path, RgbImage const& image, int quality = JPEG_QUALITY);

/// Writes PNG or JPEG as the extension of `name` says (.png, .jpg, .jpeg, in any case) into the
/// file `path`, which may be a temporary stand-in for `name`.
void WritePicture(std::string const& path, std::string const& name, RgbImage const& image);
/// Writes PNG or JPEG as the extension of `path` says.
void WritePicture(std::string const& path, RgbImage const& image);

/// Whether `path` ends in an extension that WritePicture writes.
bool IsPictureExtension(std::string const& path);

}  // namespace vexmap_host
