#pragma once

#include "IDewarperBase.h"

class IFishEye;

/// The dewarper of mode 9, on Geovision's fisheye SDK interface (`IFishEye`, over libgeofisheye):
/// a PTZ view, or the library's four-way view in sub-mode 3, from 24-bit input into 32-bit
/// output. Positions are tenths of a degree; zoom runs from 0 (widest) to 800. The adapter is
/// made anew at each setup and owned here. One thread at a time, and since every adapter of the
/// process shares one library context, the host serialises all Geovision dewarpers.
class GeovisionDewarper : public IDewarperBaseT<DewarperType::DewarperGeovision> {
public:
    explicit GeovisionDewarper(DewarpParams_t const& creationParams);
    GeovisionDewarper(GeovisionDewarper const&) = delete;  // owns buffers and adapter
    GeovisionDewarper& operator=(GeovisionDewarper const&) = delete;
    ~GeovisionDewarper() override;

    /// Makes the adapter if there is none; false while libgeofisheye is not open.
    bool Check() override;
    void SetSubMode(int newSubMode) override;
    bool IsSubModeSupported(int candidate) override;
    bool IsNormalPTZSupported(int candidate) override;
    /// Fits the request into the input's size with its shape kept and a height that is a
    /// multiple of 4; the first frame after a setup is fed to the adapter twice.
    bool GetImageOutputBuffer(int* width, int* height, unsigned char** buffer, unsigned int* size,
                              int* format) override;
    float AdjustAspectRatio(float width, float height) override;
    void Clear() override;

protected:
    bool InitOptions() override;
    void UpdatePosition() override;
    float GetZoomScaleModifier() override;
    float LimitZoomRange(float value) override;
    bool InvertPan() override;
    bool InvertTilt() override;
    void GetPanRange(float& min, float& max, float& step, bool& wrap) override;
    void GetTiltRange(float& min, float& max, float& step, bool& wrap) override;
    void GetInputFormatAndSize(int width, int height, unsigned int* size, int* format) override;
    void GetOutputFormatAndSize(int width, int height, unsigned int* size, int* format) override;

    IFishEye* fishEye;   // null until Check makes it
    int fishEyeChannel;  // -1 while closed
    bool firstFrame;     // no frame has been drawn since the last setup
};
