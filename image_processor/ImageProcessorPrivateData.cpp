#include "ImageProcessorPrivateData.h"

#include <cstddef>

namespace {
std::size_t PixelCount(int width, int height) {
    return width > 0 && height > 0 ? std::size_t(width) * std::size_t(height) : 0;
}
}  // namespace

ImageProcessorPrivateData::ImageProcessorPrivateData()
    : CachedPan(0.0),
      CachedTilt(0.0),
      CachedZoom(0.0),
      PtzMapValid(false),
      PanoramaMapValid(false) {}

ImageProcessorPrivateData::ImageProcessorPrivateData(ImageProcessorPrivateData const& other) =
    default;

ImageProcessorPrivateData& ImageProcessorPrivateData::operator=(
    ImageProcessorPrivateData const& other) = default;

ImageProcessorPrivateData::~ImageProcessorPrivateData() = default;

// Map entries start as "no pixel", so replaying a map that a frame left unwritten (a radius of 0,
// the odd last column) shows black, as that frame did.
void ImageProcessorPrivateData::InitData(ImageProcessorParams const& params) {
    std::size_t const columns = params.OutputWidth > 0 ? std::size_t(params.OutputWidth) : 0;
    ColumnSquares.assign(columns, 0.0);
    ColumnCosines.assign(columns, 0.0);
    ColumnSines.assign(columns, 0.0);
    if (params.CacheOutput) {
        std::size_t const pixels = PixelCount(params.OutputWidth, params.OutputHeight);
        PtzMap.assign(pixels, NO_PIXEL);
        PtzFractions.assign(pixels, Fraction{0.0f, 0.0f});
    }
    if (params.CachePanorama) {
        std::size_t const pixels = PixelCount(params.PanoramaWidth, params.PanoramaHeight);
        PanoramaMap.assign(pixels, NO_PIXEL);
        PanoramaFractions.assign(pixels, Fraction{0.0f, 0.0f});
    }
}

void ImageProcessorPrivateData::DeleteData() {
    ColumnSquares = std::vector<double>();
    ColumnCosines = std::vector<double>();
    ColumnSines = std::vector<double>();
    PtzMap = std::vector<uint32_t>();
    PanoramaMap = std::vector<uint32_t>();
    PtzFractions = std::vector<Fraction>();
    PanoramaFractions = std::vector<Fraction>();
    CachedPan = 0.0;
    CachedTilt = 0.0;
    CachedZoom = 0.0;
    PtzMapValid = false;
    PanoramaMapValid = false;
}

void ImageProcessorPrivateData::ReinitData(ImageProcessorParams const& params) {
    DeleteData();
    InitData(params);
}
