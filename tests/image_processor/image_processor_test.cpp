#include <array>
#include <cmath>
#include <cstdint>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "ImageProcessor.h"

namespace {

using Rgb = std::array<int, 3>;
constexpr Rgb BLACK{0, 0, 0};
constexpr uint32_t NO_PIXEL = ImageProcessorPrivateData::NO_PIXEL;

// A processor that owns all three pictures, the outputs of one size, 24 bits a pixel.
class ImageProcessorTest : public ::testing::Test {
protected:
    void Configure(int input_width, int input_height, int circle_x, int circle_y, int radius,
                   int output_width, int output_height, int interpolation, bool flip = false) {
        params.InputWidth = input_width;
        params.InputHeight = input_height;
        params.InputStride = input_width * 3;
        params.InputBits = 24;
        params.CircleX = circle_x;
        params.CircleY = circle_y;
        params.CircleRadius = radius;
        params.OwnInput = true;
        params.OutputWidth = output_width;
        params.OutputHeight = output_height;
        params.OutputStride = output_width * 3;
        params.OwnOutput = true;
        params.CacheOutput = true;
        params.OutputInterpolation = interpolation;
        params.FlipOutput = flip;
        params.PanoramaWidth = output_width;
        params.PanoramaHeight = output_height;
        params.PanoramaStride = output_width * 3;
        params.OwnPanorama = true;
        params.CachePanorama = true;
        params.PanoramaInterpolation = interpolation;
        params.FlipPanorama = flip;
        processor.SetParameters(params);
    }

    // Every input pixel tells its own place: red 4 * x, green 4 * y.
    void FillNumbered() {
        ImageData& input = processor.Input();
        for (int y = 0; y < input.Height; ++y) {
            for (int x = 0; x < input.Width; ++x) {
                unsigned char* pixel = Pixel(input, y, x);
                pixel[0] = static_cast<unsigned char>(4 * x);
                pixel[1] = static_cast<unsigned char>(4 * y);
                pixel[2] = 50;
            }
        }
    }

    void FillWhite() {
        ImageData& input = processor.Input();
        std::fill(input.Data, input.Data + input.ByteCount(), static_cast<unsigned char>(255));
    }

    static unsigned char* Pixel(ImageData& image, int row, int column) {
        return image.Data + row * image.Stride + column * 3;
    }

    static Rgb At(ImageData& image, int row, int column) {
        unsigned char const* pixel = Pixel(image, row, column);
        return {pixel[0], pixel[1], pixel[2]};
    }

    Rgb Ptz(int row, int column) { return At(processor.PtzOutput(), row, column); }
    Rgb Panorama(int row, int column) { return At(processor.PanoramaOutput(), row, column); }
    Rgb Input(int row, int column) { return At(processor.Input(), row, column); }
    uint32_t PtzEntry(int row, int column) const {
        return processor.PrivateData().PtzMap[std::size_t(row * params.OutputWidth + column)];
    }

    // Bilinear blend of the input's 2 x 2 cell, the closed form of a replayed pixel.
    Rgb Blend(int row, int column, float fx, float fy) {
        Rgb result{};
        for (std::size_t channel = 0; channel < 3; ++channel) {
            float const sum = float(Input(row, column)[channel]) * (1 - fy) * (1 - fx) +
                              float(Input(row, column + 1)[channel]) * (1 - fy) * fx +
                              float(Input(row + 1, column)[channel]) * fy * (1 - fx) +
                              float(Input(row + 1, column + 1)[channel]) * fy * fx;
            result[channel] = int(sum) & 0xFF;
        }
        return result;
    }

    bool AllBlack(ImageData& image) {
        return std::all_of(image.Data, image.Data + image.ByteCount(),
                           [](unsigned char sample) { return sample == 0; });
    }

    ImageProcessorParams params;
    ImageProcessor processor;
};

TEST_F(ImageProcessorTest, StartsAtPanZeroTiltZeroZoomOne) {
    double pan = -1;
    double tilt = -1;
    double zoom = -1;
    processor.GetPanTiltZoom(pan, tilt, zoom);
    EXPECT_EQ(0.0, pan);
    EXPECT_EQ(0.0, tilt);
    EXPECT_EQ(1.0, zoom);
}

TEST_F(ImageProcessorTest, SettersTakeTheLimitsThemselves) {
    processor.SetPanTiltZoom(-180, 90, 1e-9);
    processor.SetPanTilt(180, -90);
    double pan = 0;
    double tilt = 0;
    double zoom = 0;
    processor.GetPanTiltZoom(pan, tilt, zoom);
    EXPECT_EQ(180.0, pan);
    EXPECT_EQ(-90.0, tilt);
    EXPECT_EQ(1e-9, zoom);
}

TEST_F(ImageProcessorTest, SetZoomOfZeroAborts) {
    EXPECT_DEATH(processor.SetZoom(0), "ImageProcessor:.*SetZoom.*Assertion `zoom > 0' failed");
}

TEST_F(ImageProcessorTest, PanBeyondHalfATurnAborts) {
    EXPECT_DEATH(processor.SetPan(180.5), "Assertion `pan >= -180 && pan <= 180' failed");
    EXPECT_DEATH(processor.SetPan(std::nan("")), "pan >= -180 && pan <= 180");
}

TEST_F(ImageProcessorTest, TiltBeyondAQuarterTurnAborts) {
    EXPECT_DEATH(processor.SetTilt(-90.5), "Assertion `tilt >= -90 && tilt <= 90' failed");
}

TEST_F(ImageProcessorTest, MiddleOfASameSizedOutputShowsTheMiddleOfTheCircle) {
    Configure(64, 64, 32, 32, 32, 64, 64, 0);
    FillNumbered();
    processor.ProcessImage();
    EXPECT_EQ(Input(32, 32), Ptz(32, 32));
    EXPECT_EQ(uint32_t(32 << 16 | 32), PtzEntry(32, 32));
}

TEST_F(ImageProcessorTest, OutputTopShowsTheTopOfTheCircleAtPanZero) {
    Configure(64, 64, 32, 32, 32, 64, 64, 0);
    FillNumbered();
    processor.ProcessImage();
    EXPECT_LT(Ptz(0, 32)[1], Ptz(63, 32)[1]);  // green counts input rows
    EXPECT_LT(Ptz(32, 0)[0], Ptz(32, 63)[0]);  // red counts input columns
}

TEST_F(ImageProcessorTest, PanHalfATurnShowsTheCircleUpsideDown) {
    Configure(64, 64, 32, 32, 32, 64, 64, 0);
    FillNumbered();
    processor.SetPan(180);
    processor.ProcessImage();
    EXPECT_GT(Ptz(0, 32)[1], Ptz(63, 32)[1]);
    EXPECT_GT(Ptz(32, 0)[0], Ptz(32, 63)[0]);
}

TEST_F(ImageProcessorTest, PixelsOutsideTheCircleAreBlackAlsoWithInterpolation) {
    // A full tilt moves the view by 30 degrees: the upper rows fall outside the circle, the
    // lower ones stay inside.
    Configure(64, 64, 32, 32, 32, 64, 64, 1);
    FillWhite();
    processor.SetTilt(90);
    processor.ProcessImage();
    for (int column = 0; column < 64; ++column) {
        EXPECT_EQ(BLACK, Ptz(16, column)) << column;
        EXPECT_EQ(NO_PIXEL, PtzEntry(16, column)) << column;
    }
    EXPECT_EQ((Rgb{255, 255, 255}), Ptz(48, 32));
}

TEST_F(ImageProcessorTest, RowsBehindTheLensAreBlackWithoutALookup) {
    // At full tilt a row lies behind the lens when its offset is below -f / tan(30 degrees).
    Configure(128, 128, 64, 64, 64, 128, 128, 0);
    FillWhite();
    processor.SetPanTiltZoom(0, 90, 0.25);
    processor.ProcessImage();
    EXPECT_EQ(BLACK, Ptz(0, 64));
    EXPECT_EQ(NO_PIXEL, PtzEntry(0, 64));
    EXPECT_EQ(NO_PIXEL, PtzEntry(0, 127));
}

TEST_F(ImageProcessorTest, InputPixelInTheLastColumnIsCopiedNeverBlended) {
    // The circle's centre is the input's last column; one output column to the right lands a
    // fraction past it.
    Configure(64, 64, 63, 32, 32, 64, 64, 1);
    FillNumbered();
    processor.ProcessImage();
    uint32_t const entry = PtzEntry(32, 33);
    ASSERT_EQ(uint32_t(32 << 16 | 63), entry);
    EXPECT_EQ(Input(32, 63), Ptz(32, 33));
}

TEST_F(ImageProcessorTest, InputPixelInTheLastRowIsCopiedNeverBlended) {
    Configure(64, 64, 32, 63, 32, 64, 64, 1);
    FillNumbered();
    processor.ProcessImage();
    ASSERT_EQ(uint32_t(63 << 16 | 32), PtzEntry(33, 32));
    EXPECT_EQ(Input(63, 32), Ptz(33, 32));
}

TEST_F(ImageProcessorTest, InterpolationOneBlendsOnTheFrameThatWorksTheMapOut) {
    Configure(64, 64, 32, 32, 32, 64, 64, 1);
    FillNumbered();
    processor.SetZoom(0.5);
    processor.ProcessImage();
    ImageProcessorPrivateData::Fraction const fraction =
        processor.PrivateData().PtzFractions[std::size_t(40 * 64 + 40)];
    uint32_t const entry = PtzEntry(40, 40);
    int const x = int(entry & 0xFFFF);
    int const y = int(entry >> 16);
    ASSERT_GT(fraction.x, 0.0f);
    EXPECT_EQ(Blend(y, x, fraction.x, fraction.y), Ptz(40, 40));
}

TEST_F(ImageProcessorTest, InterpolationTwoIsNearestOnANewMapAndBlendedOnItsReplay) {
    Configure(64, 64, 32, 32, 32, 64, 64, 2);
    FillNumbered();
    processor.SetZoom(0.5);
    processor.ProcessImage();
    uint32_t const entry = PtzEntry(40, 40);
    int const x = int(entry & 0xFFFF);
    int const y = int(entry >> 16);
    EXPECT_EQ(Input(y, x), Ptz(40, 40));
    ImageProcessorPrivateData::Fraction const fraction =
        processor.PrivateData().PtzFractions[std::size_t(40 * 64 + 40)];
    ASSERT_GT(fraction.x, 0.0f);
    ASSERT_GT(fraction.y, 0.0f);
    processor.ProcessImage();
    EXPECT_EQ(Blend(y, x, fraction.x, fraction.y), Ptz(40, 40));
    EXPECT_NE(Input(y, x), Ptz(40, 40));
}

TEST_F(ImageProcessorTest, AnUnchangedPositionReplaysTheMapAndANewOneWorksItOutAgain) {
    Configure(64, 64, 32, 32, 32, 64, 64, 0);
    FillNumbered();
    processor.SetPanTiltZoom(10, 20, 1.5);
    processor.ProcessImage();
    ImageProcessorPrivateData const& data = processor.PrivateData();
    EXPECT_TRUE(data.PtzMapValid);
    EXPECT_EQ(10.0, data.CachedPan);
    EXPECT_EQ(20.0, data.CachedTilt);
    EXPECT_EQ(1.5, data.CachedZoom);
    uint32_t const before = PtzEntry(10, 10);
    processor.SetPan(10.000001);
    processor.ProcessImage();
    EXPECT_EQ(10.000001, data.CachedPan);
    processor.SetPan(-90);
    processor.ProcessImage();
    EXPECT_NE(before, PtzEntry(10, 10));
}

TEST_F(ImageProcessorTest, ReplayTakesTheInputOfTheNewFrame) {
    Configure(64, 64, 32, 32, 32, 64, 64, 0);
    FillNumbered();
    processor.ProcessImage();
    FillWhite();
    processor.ProcessImage();
    EXPECT_EQ((Rgb{255, 255, 255}), Ptz(32, 32));
}

TEST_F(ImageProcessorTest, FlipMirrorsTheLookupsWhileTheMapIndexStaysTheOutputsOwn) {
    Configure(64, 64, 32, 32, 32, 64, 48, 0);
    FillNumbered();
    processor.SetPanTiltZoom(30, 40, 0.8);
    processor.ProcessImage();
    ImageProcessorPrivateData const& straight_data = processor.PrivateData();
    std::vector<uint32_t> const straight_map = straight_data.PtzMap;
    std::vector<Rgb> straight;
    for (int row = 0; row < 48; ++row) {
        for (int column = 0; column < 64; ++column) {
            straight.push_back(Ptz(row, column));
        }
    }
    Configure(64, 64, 32, 32, 32, 64, 48, 0, true);
    FillNumbered();
    processor.ProcessImage();
    for (int row = 0; row < 48; ++row) {
        for (int column = 0; column < 64; ++column) {
            std::size_t const mirrored = std::size_t((47 - row) * 64 + (63 - column));
            ASSERT_EQ(straight[mirrored], Ptz(row, column)) << row << "," << column;
            ASSERT_EQ(straight_map[mirrored], PtzEntry(row, column)) << row << "," << column;
        }
    }
}

TEST_F(ImageProcessorTest, ASecondSetParametersWithTheSameValuesDropsTheMaps) {
    Configure(64, 64, 32, 32, 32, 64, 64, 0);
    FillNumbered();
    processor.ProcessImage();
    processor.ProcessPanoramaImage();
    processor.SetParameters(params);
    EXPECT_FALSE(processor.PrivateData().PtzMapValid);
    EXPECT_FALSE(processor.PrivateData().PanoramaMapValid);
}

TEST_F(ImageProcessorTest, RadiusOfZeroGivesABlackPanoramaAndABlackView) {
    Configure(64, 64, 32, 32, 0, 64, 64, 2);
    FillWhite();
    for (int frame = 0; frame < 2; ++frame) {
        processor.ProcessImage();
        processor.ProcessPanoramaImage();
        EXPECT_TRUE(AllBlack(processor.PtzOutput())) << frame;
        EXPECT_TRUE(AllBlack(processor.PanoramaOutput())) << frame;
    }
}

TEST_F(ImageProcessorTest, OutputWithoutPixelsIsLeftAlone) {
    Configure(64, 64, 32, 32, 32, 0, 0, 0);
    processor.ProcessImage();
    processor.ProcessPanoramaImage();
    EXPECT_FALSE(processor.PrivateData().PtzMapValid);
}

TEST_F(ImageProcessorTest, AnInputOfNoPixelsGivesABlackView) {
    Configure(0, 0, 0, 0, 32, 16, 16, 2);
    processor.ProcessImage();
    EXPECT_TRUE(AllBlack(processor.PtzOutput()));
    EXPECT_EQ(NO_PIXEL, PtzEntry(8, 8));
}

TEST_F(ImageProcessorTest, PanoramaMapIsMadeOnceAndDependsOnNoPosition) {
    Configure(64, 64, 32, 32, 32, 32, 32, 0);
    FillNumbered();
    processor.ProcessPanoramaImage();
    EXPECT_TRUE(processor.PrivateData().PanoramaMapValid);
    std::vector<uint32_t> const first = processor.PrivateData().PanoramaMap;
    processor.SetPanTiltZoom(90, 45, 3);
    processor.ProcessPanoramaImage();
    EXPECT_EQ(first, processor.PrivateData().PanoramaMap);
}

TEST_F(ImageProcessorTest, PanoramaRowsRunFromTheRimOfTheCircleTowardsItsCentre) {
    Configure(200, 200, 100, 100, 100, 100, 100, 0);
    FillNumbered();
    processor.ProcessPanoramaImage();
    double const pi = std::acos(-1.0);
    auto const radius_of_row = [&](int row) {
        // Column 0 looks along +x, so the entry's column gives the radius.
        uint32_t const entry = processor.PrivateData().PanoramaMap[std::size_t(row * 100)];
        return int(entry & 0xFFFF) - 100;
    };
    double const outer = 100 * std::sin((0.1 + 0.75) * pi / 2) - 1;              // about 97 percent
    double const inner = 100 * std::sin((0.1 + 1.0 / 100 * 0.75) * pi / 2) - 1;  // about 16
    EXPECT_EQ(int(outer), radius_of_row(0));
    EXPECT_EQ(int(inner), radius_of_row(99));
    EXPECT_EQ(uint32_t(100 << 16 | (100 + int(outer))), processor.PrivateData().PanoramaMap[0]);
}

TEST_F(ImageProcessorTest, FlippedPanoramaMirrorsRowsAndColumns) {
    Configure(64, 64, 32, 32, 32, 32, 32, 0);
    FillNumbered();
    processor.ProcessPanoramaImage();
    std::vector<uint32_t> const straight = processor.PrivateData().PanoramaMap;
    Configure(64, 64, 32, 32, 32, 32, 32, 0, true);
    FillNumbered();
    processor.ProcessPanoramaImage();
    std::vector<uint32_t> const& flipped = processor.PrivateData().PanoramaMap;
    EXPECT_EQ(straight[0], flipped[31 * 32 + 31]);
    EXPECT_EQ(straight[5 * 32 + 7], flipped[26 * 32 + 24]);
}

TEST_F(ImageProcessorTest, PanoramaReplayBlendsWithInterpolationTwo) {
    Configure(64, 64, 32, 32, 32, 32, 32, 2);
    FillNumbered();
    processor.ProcessPanoramaImage();
    std::size_t const index = 10 * 32 + 5;
    uint32_t const entry = processor.PrivateData().PanoramaMap[index];
    int const x = int(entry & 0xFFFF);
    int const y = int(entry >> 16);
    EXPECT_EQ(Input(y, x), Panorama(10, 5));
    ImageProcessorPrivateData::Fraction const fraction =
        processor.PrivateData().PanoramaFractions[index];
    processor.ProcessPanoramaImage();
    EXPECT_EQ(Blend(y, x, fraction.x, fraction.y), Panorama(10, 5));
}

TEST_F(ImageProcessorTest, PanoramaLookupsThatLeaveThePictureAreBlack) {
    // The circle's centre lies near the left edge: half a turn round it leaves the picture.
    Configure(64, 64, 10, 32, 32, 32, 32, 0);
    FillWhite();
    processor.ProcessPanoramaImage();
    EXPECT_EQ((Rgb{255, 255, 255}), Panorama(0, 0));
    EXPECT_EQ(BLACK, Panorama(0, 16));
    EXPECT_EQ(NO_PIXEL, processor.PrivateData().PanoramaMap[16]);
}

TEST_F(ImageProcessorTest, InputAndOutputImagesCopyWholePictures) {
    Configure(4, 2, 2, 1, 1, 8, 2, 0);
    ImageData picture;
    picture.Width = 4;
    picture.Height = 2;
    picture.Stride = 12;
    picture.BitsPerPixel = 24;
    picture.InitData();
    picture.Data[23] = 77;
    processor.InputImage(picture);
    EXPECT_EQ(77, processor.Input().Data[23]);
    processor.PtzOutput().Data[47] = 9;
    ImageData copy;
    processor.OutputImage(copy);
    EXPECT_EQ(8, copy.Width);
    EXPECT_EQ(9, copy.Data[47]);
    processor.PanoramaOutput().Data[0] = 3;
    processor.OutputPanoramaImage(copy);
    EXPECT_EQ(3, copy.Data[0]);
}

TEST_F(ImageProcessorTest, OwnedOutputsBecomeUnownedWhenTheParametersSaySo) {
    Configure(4, 4, 2, 2, 2, 8, 4, 0);
    EXPECT_TRUE(processor.PtzOutput().OwnsData);
    ImageProcessorParams borrowed = params;
    borrowed.OwnOutput = false;
    processor.SetParameters(borrowed);
    EXPECT_FALSE(processor.PtzOutput().OwnsData);
    EXPECT_EQ(nullptr, processor.PtzOutput().Data);
    EXPECT_TRUE(processor.PanoramaOutput().OwnsData);
}

}  // namespace
