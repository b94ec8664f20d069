#pragma once

#include <cstdint>
#include <cstdio>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "image_file.h"
#include "rgb_image.h"

namespace vexmap_host {

/// Small picture files whose headers claim a size far beyond what they hold, as an attacker or a
/// broken camera could send: a few hundred bytes that promise gigabytes.
class CraftedPictures {
public:
    /// A valid 8 x 8 PNG whose IHDR says `width` x `height`, its checksum mended so that the
    /// header reads as sound.
    static std::vector<unsigned char> Png(std::string const& scratch, uint32_t width,
                                          uint32_t height) {
        WritePng(scratch, Tiny());
        std::vector<unsigned char> bytes = Read(scratch);
        // Signature (8), chunk length (4), "IHDR" (4), then width and height, big-endian.
        Put32(bytes, 16, width);
        Put32(bytes, 20, height);
        Put32(bytes, 29, Crc32(&bytes[12], 17));  // over the type and the 13 bytes of data
        return bytes;
    }

    /// A valid 8 x 8 baseline JPEG whose frame header says `width` x `height`.
    static std::vector<unsigned char> Jpeg(std::string const& scratch, uint16_t width,
                                           uint16_t height) {
        WriteJpeg(scratch, Tiny());
        std::vector<unsigned char> bytes = Read(scratch);
        for (std::size_t at = 2; at + 8 < bytes.size(); ++at) {
            if (bytes[at] == 0xFF && bytes[at + 1] == 0xC0) {
                // Marker (2), length (2), precision (1), then height and width, big-endian.
                Put16(bytes, at + 5, height);
                Put16(bytes, at + 7, width);
                break;
            }
        }
        return bytes;
    }

    static void Write(std::string const& path, std::vector<unsigned char> const& bytes) {
        std::ofstream(path, std::ios::binary)
            .write(reinterpret_cast<char const*>(bytes.data()), std::streamsize(bytes.size()));
    }

private:
    static RgbImage Tiny() {
        RgbImage image;
        image.width = 8;
        image.height = 8;
        image.pixels.assign(8 * 8 * 3, 120);
        return image;
    }

    static std::vector<unsigned char> Read(std::string const& path) {
        std::ifstream file(path, std::ios::binary);
        return std::vector<unsigned char>((std::istreambuf_iterator<char>(file)),
                                          std::istreambuf_iterator<char>());
    }

    static void Put32(std::vector<unsigned char>& bytes, std::size_t at, uint32_t value) {
        for (std::size_t index = 0; index < 4; ++index) {
            bytes[at + index] = uint8_t(value >> (24 - 8 * index));
        }
    }

    static void Put16(std::vector<unsigned char>& bytes, std::size_t at, uint16_t value) {
        bytes[at] = uint8_t(value >> 8);
        bytes[at + 1] = uint8_t(value);
    }

    // The CRC-32 of PNG chunks (polynomial 0xEDB88320, reflected), bit by bit.
    static uint32_t Crc32(unsigned char const* data, std::size_t size) {
        uint32_t crc = 0xFFFFFFFFu;
        for (std::size_t index = 0; index < size; ++index) {
            crc ^= data[index];
            for (int bit = 0; bit < 8; ++bit) {
                crc = (crc >> 1) ^ (0xEDB88320u & (0u - (crc & 1u)));
            }
        }
        return crc ^ 0xFFFFFFFFu;
    }
};

}  // namespace vexmap_host
