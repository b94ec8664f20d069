#pragma once

#include "IDewarperBase.h"

class ImageProcessor;

/// The dewarper of mode 2, on the in-library `ImageProcessor`: a PTZ view or a panorama of the
/// image circle that the host gives in the parameters. The processor reads and writes the
/// dewarper's own buffers, so no frame is copied. Owns the processor. One thread at a time.
class Sentry360Dewarper : public IDewarperBaseT<DewarperType::DewarperSentry360> {
public:
    explicit Sentry360Dewarper(DewarpParams_t const& creationParams);
    Sentry360Dewarper(Sentry360Dewarper const&) = delete;  // owns buffers and processor
    Sentry360Dewarper& operator=(Sentry360Dewarper const&) = delete;
    ~Sentry360Dewarper() override;

    bool Check() override;
    void SetSubMode(int newSubMode) override;
    bool IsSubModeSupported(int candidate) override;
    bool IsNormalPTZSupported(int candidate) override;
    /// In sub-mode 2 the panorama is half the input's size, whatever the host asked for.
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

private:
    ImageProcessor* processor;
};
