#pragma once

#include <cstdint>
#include <vector>

#include "ImageProcessorParams.h"

/// The working arrays of an `ImageProcessor`: per-column terms of the PTZ view, and for each output
/// a map of input pixels with their fractions. A map entry holds the input row in its upper and the
/// column in its lower 16 bits; all ones means no input pixel.
class ImageProcessorPrivateData {
public:
    struct Fraction {
        float x;
        float y;
    };
    static constexpr uint32_t NO_PIXEL = 0xFFFFFFFFu;

    ImageProcessorPrivateData();
    ImageProcessorPrivateData(ImageProcessorPrivateData const& other);
    ImageProcessorPrivateData& operator=(ImageProcessorPrivateData const& other);
    virtual ~ImageProcessorPrivateData();

    void InitData(ImageProcessorParams const& params);
    void DeleteData();
    void ReinitData(ImageProcessorParams const& params);

    std::vector<double> ColumnSquares;
    std::vector<double> ColumnCosines;
    std::vector<double> ColumnSines;
    double CachedPan;
    double CachedTilt;
    double CachedZoom;
    bool PtzMapValid;
    bool PanoramaMapValid;
    std::vector<uint32_t> PtzMap;
    std::vector<uint32_t> PanoramaMap;
    std::vector<Fraction> PtzFractions;
    std::vector<Fraction> PanoramaFractions;
};
