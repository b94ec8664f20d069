#include "image_file.h"

#include <cstring>
#include <fstream>
#include <iterator>
#include <memory>
#include <png.h>
#include <turbojpeg.h>

#include "tool_error.h"

namespace vexmap_host {
namespace {

std::vector<unsigned char> ReadBytes(std::string const& path) {
    std::ifstream file(path, std::ios::binary);
    if (!file) {
        throw ToolError("cannot read " + path + ": " + strerror(errno));
    }
    std::vector<unsigned char> bytes((std::istreambuf_iterator<char>(file)),
                                     std::istreambuf_iterator<char>());
    if (file.bad()) {
        throw ToolError("cannot read " + path);
    }
    return bytes;
}

bool StartsWith(std::vector<unsigned char> const& bytes,
                std::initializer_list<unsigned char> magic) {
    return bytes.size() >= magic.size() && std::equal(magic.begin(), magic.end(), bytes.begin());
}

RgbImage DecodePng(std::string const& path, std::vector<unsigned char> const& bytes) {
    png_image png;
    memset(&png, 0, sizeof png);
    png.version = PNG_IMAGE_VERSION;
    if (png_image_begin_read_from_memory(&png, bytes.data(), bytes.size()) == 0) {
        throw ToolError(path + " is not a readable PNG file: " + png.message);
    }
    png.format = PNG_FORMAT_RGB;
    RgbImage image;
    image.width = int(png.width);
    image.height = int(png.height);
    image.pixels.resize(PNG_IMAGE_SIZE(png));
    if (png_image_finish_read(&png, nullptr, image.pixels.data(), 0, nullptr) == 0) {
        std::string const reason = png.message;
        png_image_free(&png);
        throw ToolError(path + " is not a readable PNG file: " + reason);
    }
    return image;
}

RgbImage DecodeJpeg(std::string const& path, std::vector<unsigned char> const& bytes) {
    std::unique_ptr<void, int (*)(tjhandle)> decoder(tjInitDecompress(), tjDestroy);
    if (decoder == nullptr) {
        throw ToolError("cannot start the JPEG decoder");
    }
    int width = 0;
    int height = 0;
    int subsampling = 0;
    int colorspace = 0;
    if (tjDecompressHeader3(decoder.get(), bytes.data(), static_cast<unsigned long>(bytes.size()),
                            &width, &height, &subsampling, &colorspace) != 0) {
        throw ToolError(path + " is not a readable JPEG file: " + tjGetErrorStr2(decoder.get()));
    }
    RgbImage image;
    image.width = width;
    image.height = height;
    image.pixels.resize(std::size_t(width) * std::size_t(height) * 3);
    if (tjDecompress2(decoder.get(), bytes.data(), static_cast<unsigned long>(bytes.size()),
                      image.pixels.data(), width, 0, height, TJPF_RGB, 0) != 0) {
        throw ToolError(path + " is not a readable JPEG file: " + tjGetErrorStr2(decoder.get()));
    }
    return image;
}

}  // namespace

RgbImage ReadImage(std::string const& path) {
    std::vector<unsigned char> const bytes = ReadBytes(path);
    if (StartsWith(bytes, {0x89, 'P', 'N', 'G', '\r', '\n', 0x1A, '\n'})) {
        return DecodePng(path, bytes);
    }
    if (StartsWith(bytes, {0xFF, 0xD8, 0xFF})) {
        return DecodeJpeg(path, bytes);
    }
    throw ToolError(path + " is neither a PNG nor a JPEG file");
}

void WritePng(std::string const& path, RgbImage const& image) {
    png_image png;
    memset(&png, 0, sizeof png);
    png.version = PNG_IMAGE_VERSION;
    png.width = png_uint_32(image.width);
    png.height = png_uint_32(image.height);
    png.format = PNG_FORMAT_RGB;
    if (png_image_write_to_file(&png, path.c_str(), 0, image.pixels.data(), 0, nullptr) == 0) {
        throw ToolError("cannot write " + path + ": " + png.message);
    }
}

}  // namespace vexmap_host
