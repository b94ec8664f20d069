#pragma once

#include "IDewarperBase.h"
#include "vendor/IMV_CameraInterface.h"

/// The dewarper of modes 1 and 7, on libIMV1's camera object: a PTZ view, a panorama or a dual
/// panorama of a panomorph lens, in pictures of the input's size. Zoom is the field of view in
/// degrees. The library reads and writes the dewarper's own buffers. Owns the camera object and
/// the two picture records. One thread at a time.
class ImmervisionDewarper : public IDewarperBaseT<DewarperType::DewarperImmervision> {
public:
    explicit ImmervisionDewarper(DewarpParams_t const& creationParams);
    ImmervisionDewarper(ImmervisionDewarper const&) = delete;  // owns buffers and camera
    ImmervisionDewarper& operator=(ImmervisionDewarper const&) = delete;
    ~ImmervisionDewarper() override;

    /// Makes the camera object on first use; false while libIMV1 is not open.
    bool Check() override;
    void SetSubMode(int newSubMode) override;
    bool IsSubModeSupported(int candidate) override;
    bool IsNormalPTZSupported(int candidate) override;
    bool CanPan(int candidate) override;
    bool CanTilt(int candidate) override;
    bool CanZoom(int candidate) override;
    /// The output is always of the input's size, whatever the host asks for.
    bool GetImageOutputBuffer(int* width, int* height, unsigned char** buffer, unsigned int* size,
                              int* format) override;
    float AdjustAspectRatio(float width, float height) override;
    void Clear() override;
    /// "RPL Number " and the lens's RPL number, as `snprintf` writes and counts it.
    int GetLens(int lens, char* buffer, unsigned long size) override;

    /// The index in libIMV1's lens list of the lens a Samsung camera model comes with; 0 for any
    /// other mode or model, or while the library is not open.
    static int GetDefaultLens(int mode, char const* make, char const* model);

protected:
    bool InitOptions() override;
    void UpdatePosition() override;
    float GetZoomScaleModifier() override;
    float LimitZoomRange(float value) override;
    void GetFormatAndSize(int width, int height, unsigned int* size, int* format) override;

    /// One attempt to set the camera up for the present buffers, sub-mode and lens.
    bool DoInitOptions();

    int errorCount;  // failed setups in a row; past 4 the stream is given up
    IMV_CameraInterface* camera;
    IMV_Buffer* inputImage;
    IMV_Buffer* outputImage;
};
