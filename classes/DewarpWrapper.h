#pragma once

// The host's view of the plug-in: the mode numbers, the camera record, the two interfaces and the
// four exported functions. The virtual-function order of both interfaces is the host's binary
// contract; append nothing in between and reorder nothing.

#define DEWARP_EXPORT extern "C" __attribute__((visibility("default")))

namespace DewarperType {
/// The kinds of dewarper, called modes by the host. Every value can come out of
/// `GetModeByCamera`; only some are registered.
enum DewarperTypes : int {
    DewarperNone = 0,
    DewarperImmervision = 1,
    DewarperSentry360 = 2,
    DewarperVivotek = 3,
    DewarperOncam = 4,
    DewarperActi = 5,
    DewarperInaxsys = 6,
    DewarperSamsung = 7,
    DewarperBrenvia = 8,
    DewarperGeovision = 9,
    DewarperAxis = 10,
    DewarperPanasonic = 11,
    DewarperBosch = 12,
    DewarperDahua = 13,
    DewarperStorm = 14,
    DewarperPelco = 15,
    DewarperHikvision = 16
};
}  // namespace DewarperType

/// How the host describes a camera to a dewarper. The layout is shared with the host, so the
/// record has no virtual destructor: a vtable pointer would move every field.
struct DewarpParams_t {
    int lens;            // index into the kind's lens list
    int position;        // 0 wall, 1 ceiling, 2 floor
    int panoramaOffset;  // degrees a panorama is turned by
    int circleX;         // image circle in the input, in pixels
    int circleY;
    int circleRadius;
    char* extra;  // optional text owned by the record, read by no dewarper

    DewarpParams_t();  // all zero
    DewarpParams_t(DewarpParams_t const& other);
    DewarpParams_t& operator=(DewarpParams_t const& other);
    ~DewarpParams_t();  // NOLINT(cppcoreguidelines-virtual-class-destructor) host layout
};

/// One video stream as the host drives it: frames in, dewarped frames out, PTZ commands between.
/// Not locked: one thread at a time.
class IDewarper {
public:
    IDewarper() = default;
    IDewarper(IDewarper const&) = default;
    IDewarper& operator=(IDewarper const&) = default;
    virtual ~IDewarper();

    virtual int Mode() = 0;
    virtual bool Check() = 0;
    virtual int SubMode() = 0;
    virtual void SetSubMode(int subMode) = 0;
    virtual bool IsSubModeSupported(int subMode) = 0;
    virtual bool IsNormalPTZSupported(int subMode) = 0;
    virtual bool CanPan(int subMode) = 0;
    virtual bool CanTilt(int subMode) = 0;
    virtual bool CanZoom(int subMode) = 0;
    virtual void Pan(int direction, int speed) = 0;
    virtual void Tilt(int direction, int speed) = 0;
    virtual void Zoom(int direction, int speed) = 0;
    virtual void SetPosition(float pan, float tilt, float zoom) = 0;
    virtual void GetPosition(float& pan, float& tilt, float& zoom) = 0;
    virtual bool GetImageInputBuffer(int width, int height, unsigned char** buffer,
                                     unsigned int* size, int* format) = 0;
    virtual bool GetImageOutputBuffer(int* width, int* height, unsigned char** buffer,
                                      unsigned int* size, int* format) = 0;
    virtual bool GetNeedsRotation() = 0;
    virtual bool GetFlipVertical() = 0;
    virtual bool GetFlipHorizontal() = 0;
    virtual float AdjustAspectRatio(float width, float height) = 0;
    virtual void Clear() = 0;
    virtual DewarpParams_t* Parameters() = 0;
    virtual int GetLens(int lens, char* buffer, unsigned long size) = 0;
    virtual void SetDewarperType(DewarperType::DewarperTypes type) = 0;
};

/// The registry of dewarper kinds as the host sees it.
class IDewarpRegister {
public:
    IDewarpRegister() = default;
    IDewarpRegister(IDewarpRegister const&) = default;
    IDewarpRegister& operator=(IDewarpRegister const&) = default;
    virtual ~IDewarpRegister();

    virtual bool IsCameraSpecific(int mode) = 0;
    /// Sets the three flags in this argument order, which is not the order of the record's fields.
    virtual void GetSupportedFeatures(int mode, bool& hasLenses, bool& hasCircle,
                                      bool& hasPosition) = 0;
    virtual bool IsLoaded(int mode) = 0;
    virtual char const* GetName(int mode) = 0;
    virtual int GetLens(int mode, int lens, char* buffer, unsigned long size) = 0;
    virtual int GetModeCount() = 0;
    virtual int GetModeByName(char const* name) = 0;
    virtual int GetModeByCamera(char const* make, char const* model, char const* url) = 0;
    virtual int GetDefaultLens(int mode, char const* make, char const* model) = 0;
    virtual IDewarper* Create(DewarperType::DewarperTypes type, DewarpParams_t const& params) = 0;
};

DEWARP_EXPORT IDewarpRegister* GetRegister();
DEWARP_EXPORT IDewarper* CreateDewarper(int type, DewarpParams_t const& params);
DEWARP_EXPORT bool DewarperLoaded(int type);
DEWARP_EXPORT void DeleteDewarper(IDewarper* dewarper);
