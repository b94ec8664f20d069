#include "image_file.h"

#include <algorithm>
#include <cctype>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <fcntl.h>
#include <memory>
#include <png.h>
#include <turbojpeg.h>
#include <unistd.h>
#include <vector>

#include <sys/stat.h>

#include "path_text.h"
#include "tool_error.h"

namespace vexmap_host {
namespace {

using JpegHandle = std::unique_ptr<void, int (*)(tjhandle)>;

/// Closes an open file on the way out.
struct Descriptor {
    int file;
    ~Descriptor() { close(file); }
};

// A library's message on one line, without the line end some of them carry.
std::string OneLine(char const* text) {
    std::string line = text != nullptr ? text : "unknown reason";
    std::replace(line.begin(), line.end(), '\n', ' ');
    while (!line.empty() && std::isspace(static_cast<unsigned char>(line.back()))) {
        line.pop_back();
    }
    return line;
}

bool IsJpegName(std::string const& path) {
    std::string const extension = ExtensionOf(path);
    return extension == "jpg" || extension == "jpeg";
}

bool StartsWith(std::vector<unsigned char> const& bytes,
                std::initializer_list<unsigned char> magic) {
    return bytes.size() >= magic.size() && std::equal(magic.begin(), magic.end(), bytes.begin());
}

bool IsPng(std::vector<unsigned char> const& bytes) {
    return StartsWith(bytes, {0x89, 'P', 'N', 'G', '\r', '\n', 0x1A, '\n'});
}

bool IsJpeg(std::vector<unsigned char> const& bytes) {
    return StartsWith(bytes, {0xFF, 0xD8, 0xFF});
}

// Enough bytes to tell a PNG (8) or a JPEG (3) by their start.
constexpr std::size_t SIGNATURE_BYTES = 8;

// The whole file, read with the system's calls so that a folder or a device gives its own error
// text rather than a stream library's. A file that does not start as a picture is refused after
// its first bytes, so that a film or a device that never ends is not read into memory.
std::vector<unsigned char> ReadBytes(std::string const& path) {
    int const file = open(path.c_str(), O_RDONLY | O_CLOEXEC);
    if (file < 0) {
        throw ToolError("cannot read " + path + ": " + strerror(errno));
    }
    Descriptor const closer{file};
    struct stat status = {};
    if (fstat(file, &status) != 0) {
        throw ToolError("cannot read " + path + ": " + strerror(errno));
    }
    if (S_ISDIR(status.st_mode)) {
        throw ToolError("cannot read " + path + ": it is a directory");
    }
    if (S_ISREG(status.st_mode) && status.st_size > MAX_PICTURE_FILE_BYTES) {
        throw ToolError(path + " holds " + std::to_string(status.st_size) +
                        " bytes, more than any picture vexmap takes");
    }
    std::vector<unsigned char> bytes;
    bool told = false;
    unsigned char chunk[65536];
    for (;;) {
        ssize_t const got = read(file, chunk, sizeof chunk);
        if (got < 0 && errno == EINTR) {
            continue;
        }
        if (got < 0) {
            throw ToolError("cannot read " + path + ": " + strerror(errno));
        }
        if (got == 0) {
            break;
        }
        bytes.insert(bytes.end(), chunk, chunk + got);
        if (!told && bytes.size() >= SIGNATURE_BYTES) {
            told = true;
            if (!IsPng(bytes) && !IsJpeg(bytes)) {
                throw ToolError(path + " is neither a PNG nor a JPEG file");
            }
            if (S_ISREG(status.st_mode)) {
                bytes.reserve(std::size_t(status.st_size));
            }
        }
        if (bytes.size() > std::size_t(MAX_PICTURE_FILE_BYTES)) {
            throw ToolError(path + " holds more bytes than any picture vexmap takes");
        }
    }
    if (bytes.empty()) {
        throw ToolError(path + " is empty");
    }
    return bytes;
}

RgbImage DecodePng(std::string const& path, std::vector<unsigned char> const& bytes,
                   PictureLimits const& limits) {
    png_image png;
    memset(&png, 0, sizeof png);
    png.version = PNG_IMAGE_VERSION;
    if (png_image_begin_read_from_memory(&png, bytes.data(), bytes.size()) == 0) {
        throw ToolError(path + " is not a readable PNG file: " + OneLine(png.message));
    }
    std::unique_ptr<png_image, void (*)(png_image*)> reading(&png, png_image_free);
    limits.Check(path, png.width, png.height);
    png.format = PNG_FORMAT_RGB;
    RgbImage image;
    image.width = int(png.width);
    image.height = int(png.height);
    image.pixels.resize(PNG_IMAGE_SIZE(png));
    // A camera's picture has no alpha worth keeping; transparent parts are chosen to show black.
    png_color const black = {0, 0, 0};
    if (png_image_finish_read(&png, &black, image.pixels.data(), 0, nullptr) == 0) {
        throw ToolError(path + " is not a readable PNG file: " + OneLine(png.message));
    }
    return image;
}

RgbImage DecodeJpeg(std::string const& path, std::vector<unsigned char> const& bytes,
                    PictureLimits const& limits) {
    JpegHandle decoder(tjInitDecompress(), tjDestroy);
    if (decoder == nullptr) {
        throw ToolError("cannot start the JPEG decoder");
    }
    int width = 0;
    int height = 0;
    int subsampling = 0;
    int colorspace = 0;
    if (tjDecompressHeader3(decoder.get(), bytes.data(), static_cast<unsigned long>(bytes.size()),
                            &width, &height, &subsampling, &colorspace) != 0) {
        throw ToolError(path +
                        " is not a readable JPEG file: " + OneLine(tjGetErrorStr2(decoder.get())));
    }
    if (width <= 0 || height <= 0) {
        throw ToolError(path + " is not a readable JPEG file: its header gives no size");
    }
    limits.Check(path, uint64_t(width), uint64_t(height));
    std::size_t const pixels = std::size_t(width) * std::size_t(height);
    RgbImage image;
    image.width = width;
    image.height = height;
    // The decoder turns CMYK and YCCK files into CMYK only: they are converted to RGB here.
    bool const ink = colorspace == TJCS_CMYK || colorspace == TJCS_YCCK;
    std::vector<unsigned char> decoded(pixels * (ink ? 4 : 3));
    if (tjDecompress2(decoder.get(), bytes.data(), static_cast<unsigned long>(bytes.size()),
                      decoded.data(), width, 0, height, ink ? TJPF_CMYK : TJPF_RGB, 0) != 0) {
        throw ToolError(path +
                        " is not a readable JPEG file: " + OneLine(tjGetErrorStr2(decoder.get())));
    }
    if (!ink) {
        image.pixels = std::move(decoded);
        return image;
    }
    // CMYK JPEGs hold their samples inverted (255 is no ink), as the programs that write them do;
    // without a colour profile each colour is what its ink and the black ink leave of white.
    image.pixels.resize(pixels * 3);
    for (std::size_t index = 0; index < pixels; ++index) {
        unsigned char const* sample = &decoded[index * 4];
        unsigned char* pixel = &image.pixels[index * 3];
        for (std::size_t channel = 0; channel < 3; ++channel) {
            pixel[channel] = uint8_t((unsigned(sample[channel]) * sample[3] + 127) / 255);
        }
    }
    return image;
}

using OutputStream = std::unique_ptr<FILE, int (*)(FILE*)>;

OutputStream OpenToWrite(std::string const& path) {
    OutputStream file(fopen(path.c_str(), "wb"), fclose);
    if (file == nullptr) {
        throw ToolError("cannot write " + path + ": " + strerror(errno));
    }
    return file;
}

// The buffered end of the file reaches the disc here, so a full disc shows here too.
void CloseWritten(std::string const& path, OutputStream file) {
    if (fflush(file.get()) != 0) {
        throw ToolError("cannot write " + path + ": " + strerror(errno));
    }
    if (fclose(file.release()) != 0) {
        throw ToolError("cannot write " + path + ": " + strerror(errno));
    }
}

void RequireWhole(RgbImage const& image) {
    if (image.width <= 0 || image.height <= 0 ||
        image.pixels.size() != std::size_t(image.width) * std::size_t(image.height) * 3) {
        throw ToolError("cannot write a " + std::to_string(image.width) + "x" +
                        std::to_string(image.height) + " picture of " +
                        std::to_string(image.pixels.size()) + " bytes");
    }
}

}  // namespace

RgbImage ReadImage(std::string const& path, PictureLimits const& limits) {
    std::vector<unsigned char> const bytes = ReadBytes(path);
    if (IsPng(bytes)) {
        return DecodePng(path, bytes, limits);
    }
    if (IsJpeg(bytes)) {
        return DecodeJpeg(path, bytes, limits);
    }
    throw ToolError(path + " is neither a PNG nor a JPEG file");
}

void WritePng(std::string const& path, RgbImage const& image) {
    RequireWhole(image);
    OutputStream file = OpenToWrite(path);
    png_image png;
    memset(&png, 0, sizeof png);
    png.version = PNG_IMAGE_VERSION;
    png.width = png_uint_32(image.width);
    png.height = png_uint_32(image.height);
    png.format = PNG_FORMAT_RGB;
    if (png_image_write_to_stdio(&png, file.get(), 0, image.pixels.data(), 0, nullptr) == 0) {
        // A failed write leaves libpng's own words ("Write Error"); the system's say why.
        int const reason = errno;
        std::string const why = ferror(file.get()) != 0 ? strerror(reason) : OneLine(png.message);
        throw ToolError("cannot write " + path + ": " + why);
    }
    CloseWritten(path, std::move(file));
}

void WriteJpeg(std::string const& path, RgbImage const& image, int quality) {
    RequireWhole(image);
    JpegHandle encoder(tjInitCompress(), tjDestroy);
    if (encoder == nullptr) {
        throw ToolError("cannot start the JPEG encoder");
    }
    unsigned char* encoded = nullptr;
    unsigned long size = 0;
    if (tjCompress2(encoder.get(), image.pixels.data(), image.width, 0, image.height, TJPF_RGB,
                    &encoded, &size, TJSAMP_444, std::clamp(quality, 1, 100), 0) != 0) {
        tjFree(encoded);
        throw ToolError("cannot encode " + path + ": " + OneLine(tjGetErrorStr2(encoder.get())));
    }
    std::unique_ptr<unsigned char, void (*)(unsigned char*)> owned(encoded, tjFree);
    OutputStream file = OpenToWrite(path);
    if (fwrite(encoded, 1, size, file.get()) != size) {
        throw ToolError("cannot write " + path + ": " + strerror(errno));
    }
    CloseWritten(path, std::move(file));
}

void WritePicture(std::string const& path, std::string const& name, RgbImage const& image) {
    if (IsJpegName(name)) {
        WriteJpeg(path, image);
    } else if (ExtensionOf(name) == "png") {
        WritePng(path, image);
    } else {
        throw ToolError("cannot write " + name + ": vexmap writes .png, .jpg and .jpeg pictures");
    }
}

void WritePicture(std::string const& path, RgbImage const& image) {
    WritePicture(path, path, image);
}

bool IsPictureExtension(std::string const& path) {
    return ExtensionOf(path) == "png" || IsJpegName(path);
}

}  // namespace vexmap_host
