#pragma once

#include "IDewarperBase.h"

namespace VivotekLenses {
constexpr int COUNT = 8;
/// The lens names libfisheyesw knows, at the indices of the host's lens list. "Default" is only
/// listed: the library is never asked for it.
inline constexpr char const* LensTypes[COUNT] = {"Default", "FE8171", "FE8172", "FE8173",
                                                 "FE8174",  "VC8201", "FE8180", "FE8181"};
}  // namespace VivotekLenses

/// The dewarper of mode 3, on libfisheyesw: a PTZ view, a panorama or a dual panorama of a
/// fisheye picture that fills the frame, in YUV 4:2:0 frames. The library reads and writes the
/// dewarper's own buffers. Owns the library's object, which is made anew for each sub-mode. One
/// thread at a time.
class VivotekDewarper : public IDewarperBaseT<DewarperType::DewarperVivotek> {
public:
    explicit VivotekDewarper(DewarpParams_t const& creationParams);
    VivotekDewarper(VivotekDewarper const&) = delete;  // owns buffers and the library's object
    VivotekDewarper& operator=(VivotekDewarper const&) = delete;
    ~VivotekDewarper() override;

    /// Makes the library's object on first use; false while libfisheyesw is not open.
    bool Check() override;
    void SetSubMode(int newSubMode) override;
    bool IsSubModeSupported(int candidate) override;
    bool IsNormalPTZSupported(int candidate) override;
    bool CanPan(int candidate) override;
    bool GetImageOutputBuffer(int* width, int* height, unsigned char** buffer, unsigned int* size,
                              int* format) override;
    float AdjustAspectRatio(float width, float height) override;
    void Clear() override;
    /// The lens's name, cut to `size` bytes with its zero byte; returns the name's full length.
    int GetLens(int lens, char* buffer, unsigned long size) override;

protected:
    bool InitOptions() override;
    void UpdatePosition() override;
    float GetZoomScaleModifier() override;
    float LimitZoomRange(float value) override;
    void GetFormatAndSize(int width, int height, unsigned int* size, int* format) override;

    void* handle;  // the library's object; null until Check makes it

private:
    void ReleaseHandle();
};
