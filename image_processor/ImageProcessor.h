#pragma once

#include <cstdint>

#include "ImageData.h"
#include "ImageProcessorParams.h"
#include "ImageProcessorPrivateData.h"

/// A self-contained dewarper for a circular fisheye picture with interleaved 8-bit samples. It
/// makes a PTZ view, a tangent plane of the sphere of the circle's radius at a distance set by the
/// zoom, or a 360 degree panorama of the circle, and keeps a map of each so that a frame at an
/// unchanged position costs one lookup per pixel. Works in double precision. Owns its working
/// arrays; its three picture records may point at a caller's buffers. One thread at a time.
class ImageProcessor {
public:
    ImageProcessor();                                // position 0, 0, 1, nothing set up
    ImageProcessor(ImageProcessor const&) = delete;  // its records may point at a caller's buffers
    ImageProcessor& operator=(ImageProcessor const&) = delete;
    virtual ~ImageProcessor();

    /// Sizes the three records and drops both maps, even for unchanged values.
    void SetParameters(ImageProcessorParams const& params);
    ImageProcessorParams const& Parameters() const { return parameters; }

    // Pan within [-180, 180], tilt within [-90, 90] degrees and a positive zoom, else the process
    // aborts. A new position is judged at the next frame.
    void SetPan(double newPan);
    void SetTilt(double newTilt);
    void SetZoom(double newZoom);
    void SetPanTilt(double newPan, double newTilt);
    void SetPanTiltZoom(double newPan, double newTilt, double newZoom);
    void GetPanTiltZoom(double& currentPan, double& currentTilt, double& currentZoom) const;

    void InputImage(ImageData const& image);
    void OutputImage(ImageData& image) const;
    void OutputPanoramaImage(ImageData& image) const;

    /// The records the processor reads and writes; a caller may point them at its own buffers.
    ImageData& Input() { return input; }
    ImageData& PtzOutput() { return ptzOutput; }
    ImageData& PanoramaOutput() { return panoramaOutput; }
    ImageProcessorPrivateData const& PrivateData() const { return *data; }

    void ProcessImage();
    void ProcessPanoramaImage();

private:
    /// Where one output pixel's lookup is recorded; the pointers are null without a map.
    struct MapSlot {
        uint32_t* entry;
        ImageProcessorPrivateData::Fraction* fraction;
    };

    void InnerProcessImage();
    void InnerProcessPanoramaImage();
    bool CanRender(ImageData const& output, int width, int height) const;
    void SamplePixel(double x, double y, bool outside, int interpolation, MapSlot slot,
                     int pixel_bytes, unsigned char* pixel) const;

    ImageProcessorPrivateData* data;
    ImageProcessorParams parameters;
    double pan;
    double tilt;
    double zoom;
    ImageData input;
    ImageData ptzOutput;
    ImageData panoramaOutput;
};
