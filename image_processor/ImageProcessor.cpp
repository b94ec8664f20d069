#include "ImageProcessor.h"

#include <algorithm>
#include <cmath>
#include <cstring>

#include "MapReplay.h"
#include "ProcessorAssert.h"
#include "ReplayPixel.h"

namespace {

constexpr double PI = 3.14159265358979323846;
// The panorama spans 2 pi / PANORAMA_TURN of the circle's circumference in its columns.
constexpr double PANORAMA_TURN = 1.5037593984962405;
constexpr double PANORAMA_SPAN = 4.178318229274425;  // 2 pi / PANORAMA_TURN

}  // namespace

ImageProcessor::ImageProcessor()
    : data(new ImageProcessorPrivateData), pan(0.0), tilt(0.0), zoom(1.0) {}

ImageProcessor::~ImageProcessor() {
    delete data;
}

void ImageProcessor::SetParameters(ImageProcessorParams const& params) {
    struct Sizing {
        ImageData& record;
        int width;
        int height;
        int stride;
        bool own;
    };
    Sizing const records[] = {
        {input, params.InputWidth, params.InputHeight, params.InputStride, params.OwnInput},
        {ptzOutput, params.OutputWidth, params.OutputHeight, params.OutputStride, params.OwnOutput},
        {panoramaOutput, params.PanoramaWidth, params.PanoramaHeight, params.PanoramaStride,
         params.OwnPanorama},
    };
    for (Sizing const& sizing : records) {
        sizing.record.Width = sizing.width;
        sizing.record.Height = sizing.height;
        sizing.record.Stride = sizing.stride;
        sizing.record.BitsPerPixel = params.InputBits;
        if (sizing.own) {
            sizing.record.ReInitData();
        } else if (sizing.record.OwnsData) {
            sizing.record.DeleteData();
        }
    }
    parameters = params;
    data->ReinitData(params);
}

void ImageProcessor::SetPan(double newPan) {
    ProcessorAssert(newPan >= -180 && newPan <= 180, "pan >= -180 && pan <= 180", "ImageProcessor",
                    __LINE__, __PRETTY_FUNCTION__);
    pan = newPan;
}

void ImageProcessor::SetTilt(double newTilt) {
    ProcessorAssert(newTilt >= -90 && newTilt <= 90, "tilt >= -90 && tilt <= 90", "ImageProcessor",
                    __LINE__, __PRETTY_FUNCTION__);
    tilt = newTilt;
}

void ImageProcessor::SetZoom(double newZoom) {
    ProcessorAssert(newZoom > 0, "zoom > 0", "ImageProcessor", __LINE__, __PRETTY_FUNCTION__);
    zoom = newZoom;
}

void ImageProcessor::SetPanTilt(double newPan, double newTilt) {
    SetPan(newPan);
    SetTilt(newTilt);
}

void ImageProcessor::SetPanTiltZoom(double newPan, double newTilt, double newZoom) {
    SetPan(newPan);
    SetTilt(newTilt);
    SetZoom(newZoom);
}

void ImageProcessor::GetPanTiltZoom(double& currentPan, double& currentTilt,
                                    double& currentZoom) const {
    currentPan = pan;
    currentTilt = tilt;
    currentZoom = zoom;
}

void ImageProcessor::InputImage(ImageData const& image) {
    input.CopyFrom(image);
}

void ImageProcessor::OutputImage(ImageData& image) const {
    image.CopyFrom(ptzOutput);
}

void ImageProcessor::OutputPanoramaImage(ImageData& image) const {
    image.CopyFrom(panoramaOutput);
}

void ImageProcessor::ProcessImage() {
    InnerProcessImage();
}

void ImageProcessor::ProcessPanoramaImage() {
    InnerProcessPanoramaImage();
}

// An output without pixels (a division by zero in the PTZ view) or a record that cannot hold what
// the parameters promise is left alone, so a bad setup shows nothing new instead of reading or
// writing out of bounds.
bool ImageProcessor::CanRender(ImageData const& output, int width, int height) const {
    int64_t const bytes = output.BitsPerPixel / 8;
    bool const output_fits = width > 0 && height > 0 && bytes > 0 && output.Data != nullptr &&
                             output.Width >= width && output.Height >= height &&
                             int64_t(output.Stride) >= width * bytes;
    bool const input_readable =
        input.Width <= 0 || input.Height <= 0 ||
        (input.Data != nullptr && int64_t(input.Stride) >= input.Width * bytes);
    return output_fits && input_readable;
}

// Steps shared by the PTZ view and the panorama for one output pixel at input offset (x, y) from
// the circle's centre. The column and row truncate while the fractions come from the floor, so
// for a negative offset they belong to different cells: kept as the processor has always done.
void ImageProcessor::SamplePixel(double x, double y, bool outside, int interpolation, MapSlot slot,
                                 int pixel_bytes, unsigned char* pixel) const {
    std::size_t const bytes = std::size_t(pixel_bytes);
    double const column = std::trunc(x) + double(parameters.CircleX);
    double const row = std::trunc(y) + double(parameters.CircleY);
    bool const inside = !outside && column >= 0.0 && column < double(input.Width) && row >= 0.0 &&
                        row < double(input.Height);
    int const ix = inside ? int(column) : -1;
    int const iy = inside ? int(row) : -1;
    if (slot.entry != nullptr) {
        *slot.entry = ReplayPixel::PackEntry(ix, iy);
    }
    if (!inside) {
        memset(pixel, 0, bytes);
        return;
    }
    unsigned char const* source =
        input.Data + std::size_t(iy) * std::size_t(input.Stride) + std::size_t(ix) * bytes;
    if (interpolation == 0 || ix == input.Width - 1 || iy == input.Height - 1) {
        memcpy(pixel, source, bytes);
        return;
    }
    float const fx = float(x - std::floor(x));
    float const fy = float(y - std::floor(y));
    if (slot.fraction != nullptr) {
        *slot.fraction = ImageProcessorPrivateData::Fraction{fx, fy};
    }
    // Interpolation 2 copies here and blends only on replay: a new view is nearest, the frames
    // after it blended.
    if (interpolation == 1) {
        ReplayPixel::Blend(input.Data, input.Stride, int(bytes), ix, iy, fx, fy, pixel);
    } else {
        memcpy(pixel, source, bytes);
    }
}

// The PTZ view: the output is a plane at distance zoom * R from the centre of the sphere of
// radius R, turned by pan about the optical axis and tilted by a third of the tilt; each plane
// point is projected onto the sphere and straight down onto the circle. The factor 2 in e1 and e2
// is how the view has always been tilted.
void ImageProcessor::InnerProcessImage() {
    ImageProcessorParams const& p = parameters;
    if (!CanRender(ptzOutput, p.OutputWidth, p.OutputHeight)) {
        return;
    }
    bool reuse = false;
    if (p.CacheOutput) {
        if (data->PtzMapValid && pan == data->CachedPan && tilt == data->CachedTilt &&
            zoom == data->CachedZoom) {
            reuse = true;
        } else {
            data->PtzMapValid = true;
            data->CachedPan = pan;
            data->CachedTilt = tilt;
            data->CachedZoom = zoom;
        }
    }
    if (reuse) {
        MapReplay(input, data->PtzMap.data(), data->PtzFractions.data())
            .Into(ptzOutput, p.OutputWidth, p.OutputHeight, p.OutputInterpolation);
        return;
    }
    int const bytes = ptzOutput.BitsPerPixel / 8;
    double const R = p.CircleRadius;
    double const a = tilt / 90 * 30 / 180 * PI;
    double const pan_radians = pan / 180 * PI;
    double const st = std::sin(a);
    double const ct = std::cos(a);
    double const sp = std::sin(pan_radians);
    double const cp = std::cos(pan_radians);
    double const f = zoom * R;
    int const dx = p.InputWidth / p.OutputWidth;
    int const dy = p.InputHeight / p.OutputHeight;
    int const hw = p.OutputWidth / 2;
    int const hh = p.OutputHeight / 2;
    for (int c = -hw; c < hw; ++c) {
        double const u = double(c * dx);
        std::size_t const i = std::size_t(c + hw);
        data->ColumnSquares[i] = u * u;
        data->ColumnCosines[i] = u * cp;
        data->ColumnSines[i] = u * sp;
    }
    for (int r = -hh; r < hh; ++r) {
        int const output_row = p.FlipOutput ? hh - r - 1 : r + hh;
        unsigned char* const row_start =
            ptzOutput.Data + std::size_t(output_row) * std::size_t(ptzOutput.Stride);
        std::size_t const row_index = std::size_t(output_row) * std::size_t(p.OutputWidth);
        double const w = double(r * dy);
        double const q = w * w + f * f;
        double const e1 = w * sp * ct - 2 * f * st * sp;
        double const e2 = -w * cp * ct + 2 * f * st * cp;
        if (w * st + f * ct < 0) {  // the row lies behind the lens
            memset(row_start, 0, std::size_t(p.OutputWidth) * std::size_t(bytes));
            if (p.CacheOutput) {
                std::fill_n(data->PtzMap.begin() + std::ptrdiff_t(row_index), p.OutputWidth,
                            ImageProcessorPrivateData::NO_PIXEL);
            }
            continue;
        }
        for (int c = -hw; c < hw; ++c) {
            std::size_t const i = std::size_t(p.FlipOutput ? hw - c - 1 : c + hw);
            double const s = R / std::sqrt(data->ColumnSquares[i] + q);
            double const x = s * (data->ColumnCosines[i] - e1);
            double const y = s * (data->ColumnSines[i] - e2);
            std::size_t const index = row_index + std::size_t(c + hw);
            MapSlot const slot = p.CacheOutput
                                     ? MapSlot{&data->PtzMap[index], &data->PtzFractions[index]}
                                     : MapSlot{nullptr, nullptr};
            SamplePixel(x, y, x * x + y * y >= R * R, p.OutputInterpolation, slot, bytes,
                        row_start + std::size_t(c + hw) * std::size_t(bytes));
        }
    }
}

// The panorama: row r takes the circle at a radius falling from about 97 to 16 percent of R, and
// the columns walk around it. The map depends on no position, so it is made once per setup.
void ImageProcessor::InnerProcessPanoramaImage() {
    ImageProcessorParams const& p = parameters;
    if (!CanRender(panoramaOutput, p.PanoramaWidth, p.PanoramaHeight)) {
        return;
    }
    bool reuse = false;
    if (p.CachePanorama) {
        reuse = data->PanoramaMapValid;
        data->PanoramaMapValid = true;
    }
    if (reuse) {
        MapReplay(input, data->PanoramaMap.data(), data->PanoramaFractions.data())
            .Into(panoramaOutput, p.PanoramaWidth, p.PanoramaHeight, p.PanoramaInterpolation);
        return;
    }
    if (p.CircleRadius <= 0) {
        return;
    }
    int const bytes = panoramaOutput.BitsPerPixel / 8;
    double const R = p.CircleRadius;
    int64_t const dc = int64_t(std::trunc(PANORAMA_SPAN * R)) / p.PanoramaWidth;
    int const dr = p.CircleRadius / p.PanoramaHeight;
    for (int r = 0; r < p.PanoramaHeight; ++r) {
        int const output_row = p.FlipPanorama ? p.PanoramaHeight - r - 1 : r;
        unsigned char* const row_start =
            panoramaOutput.Data + std::size_t(output_row) * std::size_t(panoramaOutput.Stride);
        std::size_t const row_index = std::size_t(output_row) * std::size_t(p.PanoramaWidth);
        double const v = double(int64_t(r) * dr);
        double const rho = R * std::sin((0.1 + (R - v) / R * 0.75) * PI / 2) - 1;
        for (int c = 0; c < p.PanoramaWidth; ++c) {
            int const cc = p.FlipPanorama ? p.PanoramaWidth - c - 1 : c;
            double const t = PANORAMA_TURN * double(cc * dc) / R;
            std::size_t const index = row_index + std::size_t(c);
            MapSlot const slot = p.CachePanorama ? MapSlot{&data->PanoramaMap[index],
                                                           &data->PanoramaFractions[index]}
                                                 : MapSlot{nullptr, nullptr};
            SamplePixel(rho * std::cos(t), rho * std::sin(t), false, p.PanoramaInterpolation, slot,
                        bytes, row_start + std::size_t(c) * std::size_t(bytes));
        }
    }
}
