#pragma once

#include "IDewarperBase.h"
#include "vexmap/dewarp_types.h"

/// The dewarper of mode 8, on the library's own engine: a channel opened with the built-in camera
/// model at the stream's size, giving a PTZ view, a panorama or a dual panorama of YUV 4:2:0
/// frames. The host's tilt is the engine's tilt raised by ten times the root of the zoom. Owns the
/// channel. One thread at a time; the engine locks its channel itself.
class BrenviaDewarper : public IDewarperBaseT<DewarperType::DewarperBrenvia> {
public:
    explicit BrenviaDewarper(DewarpParams_t const& creationParams);
    BrenviaDewarper(BrenviaDewarper const&) = delete;  // owns buffers and channel
    BrenviaDewarper& operator=(BrenviaDewarper const&) = delete;
    ~BrenviaDewarper() override;

    bool Check() override;
    void SetSubMode(int newSubMode) override;
    bool IsSubModeSupported(int candidate) override;
    bool IsNormalPTZSupported(int candidate) override;
    void SetPosition(float newPan, float newTilt, float newZoom) override;
    void GetPosition(float& currentPan, float& currentTilt, float& currentZoom) override;
    bool GetImageOutputBuffer(int* width, int* height, unsigned char** buffer, unsigned int* size,
                              int* format) override;
    float AdjustAspectRatio(float width, float height) override;
    void Clear() override;
    void SetDewarperType(DewarperType::DewarperTypes newType) override;

protected:
    bool InitOptions() override;
    void UpdatePosition() override;
    float GetZoomScaleModifier() override;
    float LimitZoomRange(float value) override;
    void GetTiltRange(float& min, float& max, float& step, bool& wrap) override;
    float LimitTiltRange(float value) override;
    void GetFormatAndSize(int width, int height, unsigned int* size, int* format) override;

    void* channel;                         // the engine's handle; null while closed
    _DEWARP_INTERNAL_CAMERA_MODEL camera;  // the built-in model at the stream's size

private:
    _DEWARP_IMAGE Frame(int width, int height, unsigned char* data) const;
};
