#include <cstdint>
#include <cstring>
#include <random>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "ImageProcessor.h"
#include "MapReplay.h"

namespace {

using Fraction = ImageProcessorPrivateData::Fraction;
constexpr uint32_t NO_PIXEL = ImageProcessorPrivateData::NO_PIXEL;
constexpr unsigned char PADDING = 0xA5;

// The replay as the processor has always done it, pixel by pixel with its own blend, kept here
// as the reference that every row kernel must meet byte for byte.
void ReferenceReplay(ImageData const& input, uint32_t const* map, Fraction const* fractions,
                     int interpolation, ImageData& output, int width, int height) {
    int const bytes = output.BitsPerPixel / 8;
    for (int row = 0; row < height; ++row) {
        unsigned char* pixel = output.Data + std::size_t(row) * std::size_t(output.Stride);
        std::size_t const first = std::size_t(row) * std::size_t(width);
        for (int column = 0; column < width; ++column, pixel += bytes) {
            uint32_t const entry = map[first + std::size_t(column)];
            int const x = int(entry & 0xFFFFu);
            int const y = int((entry >> 16) ^ 0x8000u) - 0x8000;
            if (y < 0 || x >= input.Width || y >= input.Height) {
                memset(pixel, 0, std::size_t(bytes));
                continue;
            }
            unsigned char const* p = input.Data + std::size_t(y) * std::size_t(input.Stride) +
                                     std::size_t(x) * std::size_t(bytes);
            if (interpolation == 0 || x == input.Width - 1 || y == input.Height - 1) {
                memcpy(pixel, p, std::size_t(bytes));
                continue;
            }
            float const fx = fractions[first + std::size_t(column)].x;
            float const fy = fractions[first + std::size_t(column)].y;
            for (int channel = 0; channel < bytes; ++channel) {
                unsigned char const* s = p + channel;
                unsigned char const* n = s + input.Stride;
                float const sum = float(s[0]) * (1.0f - fy) * (1.0f - fx) +
                                  float(s[bytes]) * (1.0f - fy) * fx +
                                  float(n[0]) * fy * (1.0f - fx) + float(n[bytes]) * fy * fx;
                pixel[channel] = static_cast<unsigned char>(uint32_t(int(sum)) & 0xFFu);
            }
        }
    }
}

struct KernelSet {
    char const* name;
    MapReplay::Kernels const* kernels;
};

std::vector<KernelSet> Available() {
    std::vector<KernelSet> sets = {{"plain", &MapReplay::Plain()}};
    if (__builtin_cpu_supports("avx2")) {
        sets.push_back({"avx2", &MapReplay::Avx2()});
    }
    return sets;
}

/// A picture over a buffer of exactly the bytes a replay may read or write: up to the last pixel
/// of the last row, so that a read or write past it is caught by the address sanitizer.
struct Picture {
    Picture(int width, int height, int stride, int pixel_bytes)
        : bytes(std::size_t(height - 1) * std::size_t(stride) +
                std::size_t(width) * std::size_t(pixel_bytes)) {
        image.Width = width;
        image.Height = height;
        image.Stride = stride;
        image.BitsPerPixel = pixel_bytes * 8;
        image.Data = this->bytes.data();
        image.OwnsData = false;
    }
    Picture(Picture const&) = delete;
    Picture& operator=(Picture const&) = delete;
    ~Picture() { image.Data = nullptr; }

    std::vector<unsigned char> bytes;
    ImageData image;
};

// Entries of every kind: inside, on the last column and row, negative rows, no pixel, columns and
// rows past the input; fractions anywhere in [0, 1], the ends included.
void RandomMap(std::mt19937& random, int input_width, int input_height, std::size_t count,
               std::vector<uint32_t>& map, std::vector<Fraction>& fractions) {
    std::uniform_int_distribution<int> kind(0, 9);
    std::uniform_int_distribution<int> column(0, input_width - 1);
    std::uniform_int_distribution<int> row(0, input_height - 1);
    std::uniform_real_distribution<float> fraction(0.0f, 1.0f);
    map.resize(count);
    fractions.resize(count);
    for (std::size_t i = 0; i < count; ++i) {
        int x = column(random);
        int y = row(random);
        switch (kind(random)) {
            case 0:
                x = input_width - 1;
                break;
            case 1:
                y = input_height - 1;
                break;
            case 2:
                y = -1 - row(random) % 3;
                break;
            case 3:
                x = input_width + column(random) % 4;
                break;
            case 4:
                y = input_height + row(random) % 4;
                break;
            default:
                break;
        }
        map[i] = kind(random) == 0 ? NO_PIXEL : ReplayPixel::PackEntry(x, y);
        float const fx = fraction(random);
        float const fy = fraction(random);
        fractions[i] = Fraction{i % 17 == 0 ? 1.0f : fx, i % 13 == 0 ? 0.0f : fy};
    }
}

class MapReplayTest : public ::testing::TestWithParam<KernelSet> {};

TEST_P(MapReplayTest, WritesByteForByteWhatTheReferenceWritesOnRandomMapsAndSizes) {
    std::mt19937 random(20261125);
    std::uniform_int_distribution<int> side(1, 40);
    std::uniform_int_distribution<int> padding(0, 5);
    for (int bytes = 1; bytes <= 4; ++bytes) {
        for (int trial = 0; trial < 60; ++trial) {
            int const input_width = side(random);
            int const input_height = side(random);
            Picture input(input_width, input_height, input_width * bytes + padding(random), bytes);
            for (unsigned char& byte : input.bytes) {
                byte = static_cast<unsigned char>(random());
            }
            int const width = side(random);
            int const height = 1 + trial % 4;
            int const stride = width * bytes + padding(random);
            std::vector<uint32_t> map;
            std::vector<Fraction> fractions;
            RandomMap(random, input_width, input_height, std::size_t(width * height), map,
                      fractions);
            for (int interpolation : {0, 1, 2}) {
                Picture ours(width, height, stride, bytes);
                Picture expected(width, height, stride, bytes);
                std::fill(ours.bytes.begin(), ours.bytes.end(), PADDING);
                std::fill(expected.bytes.begin(), expected.bytes.end(), PADDING);
                MapReplay(input.image, map.data(), fractions.data())
                    .Into(ours.image, width, height, interpolation, *GetParam().kernels);
                ReferenceReplay(input.image, map.data(), fractions.data(), interpolation,
                                expected.image, width, height);
                ASSERT_EQ(ours.bytes, expected.bytes)
                    << bytes << " bytes, input " << input_width << "x" << input_height
                    << ", output " << width << "x" << height << ", interpolation " << interpolation;
            }
        }
    }
}

// Pixels that always lie inside, over a wide row, so that the kernels run whole steps and not only
// the tails the random sizes give them.
TEST_P(MapReplayTest, WideRowsOfInsidePixelsMatchTheReference) {
    std::mt19937 random(7);
    for (int bytes : {3, 4}) {
        Picture input(300, 200, 300 * bytes + 3, bytes);
        for (unsigned char& byte : input.bytes) {
            byte = static_cast<unsigned char>(random());
        }
        int const width = 643;
        int const height = 5;
        std::vector<uint32_t> map(std::size_t(width * height));
        std::vector<Fraction> fractions(map.size());
        std::uniform_real_distribution<float> fraction(0.0f, 1.0f);
        for (std::size_t i = 0; i < map.size(); ++i) {
            map[i] = ReplayPixel::PackEntry(int(i * 7 % 300), int(i * 3 % 200));
            fractions[i] = Fraction{fraction(random), fraction(random)};
        }
        for (int interpolation : {0, 2}) {
            Picture ours(width, height, width * bytes, bytes);
            Picture expected(width, height, width * bytes, bytes);
            MapReplay(input.image, map.data(), fractions.data())
                .Into(ours.image, width, height, interpolation, *GetParam().kernels);
            ReferenceReplay(input.image, map.data(), fractions.data(), interpolation,
                            expected.image, width, height);
            ASSERT_EQ(ours.bytes, expected.bytes) << bytes << " bytes, " << interpolation;
        }
    }
}

// The input's very last pixel, read with four bytes for three, would run past the buffer: that
// lookup is left to the plain path (the address sanitizer sees any overrun).
TEST_P(MapReplayTest, TheLastPixelOfTheInputIsReadWithinItsBuffer) {
    Picture input(16, 4, 48, 3);
    for (std::size_t i = 0; i < input.bytes.size(); ++i) {
        input.bytes[i] = static_cast<unsigned char>(i);
    }
    std::vector<uint32_t> const map(32, ReplayPixel::PackEntry(15, 3));
    std::vector<Fraction> const fractions(32, Fraction{0.5f, 0.5f});
    Picture ours(32, 1, 96, 3);
    MapReplay(input.image, map.data(), fractions.data())
        .Into(ours.image, 32, 1, 0, *GetParam().kernels);
    for (int column = 0; column < 32; ++column) {
        ASSERT_EQ(ours.bytes[std::size_t(column) * 3 + 2], input.bytes.back()) << column;
    }
}

TEST(MapReplay, AProcessorReplaysItsOwnMapAsTheReferenceDoes) {
    for (int interpolation : {0, 2}) {
        ImageProcessorParams params;
        params.InputWidth = 301;
        params.InputHeight = 297;
        params.InputStride = 301 * 3 + 1;
        params.InputBits = 24;
        params.CircleX = 150;
        params.CircleY = 148;
        params.CircleRadius = 148;
        params.OwnInput = true;
        params.OutputWidth = 242;
        params.OutputHeight = 120;
        params.OutputStride = 242 * 3;
        params.OwnOutput = true;
        params.CacheOutput = true;
        params.OutputInterpolation = interpolation;
        params.PanoramaWidth = 300;
        params.PanoramaHeight = 80;
        params.PanoramaStride = 300 * 3;
        params.OwnPanorama = true;
        params.CachePanorama = true;
        params.PanoramaInterpolation = interpolation;
        ImageProcessor processor;
        processor.SetParameters(params);
        processor.SetPanTiltZoom(35.0, 20.0, 0.8);
        processor.ProcessImage();
        processor.ProcessPanoramaImage();
        std::mt19937 random(3);
        ImageData& input = processor.Input();
        for (std::size_t i = 0; i < input.ByteCount(); ++i) {
            input.Data[i] = static_cast<unsigned char>(random());
        }
        processor.ProcessImage();
        processor.ProcessPanoramaImage();
        ImageProcessorPrivateData const& data = processor.PrivateData();
        ImageData ptz = processor.PtzOutput();
        ImageData panorama = processor.PanoramaOutput();
        ReferenceReplay(input, data.PtzMap.data(), data.PtzFractions.data(), interpolation, ptz,
                        params.OutputWidth, params.OutputHeight);
        ReferenceReplay(input, data.PanoramaMap.data(), data.PanoramaFractions.data(),
                        interpolation, panorama, params.PanoramaWidth, params.PanoramaHeight);
        ASSERT_EQ(0, memcmp(ptz.Data, processor.PtzOutput().Data, ptz.ByteCount()));
        ASSERT_EQ(0, memcmp(panorama.Data, processor.PanoramaOutput().Data, panorama.ByteCount()));
    }
}

INSTANTIATE_TEST_SUITE_P(EveryInstructionSet, MapReplayTest, ::testing::ValuesIn(Available()),
                         [](testing::TestParamInfo<KernelSet> const& set) {
                             return std::string(set.param.name);
                         });

}  // namespace
