#pragma once

// The plug-in's interfaces as a host declares them on its own: the same record layout and the same
// virtual-function order, and nothing taken from the plug-in's sources.

namespace vexmap_host {

/// The camera description handed to `CreateDewarper`.
struct DewarpParams {
    int lens;
    int position;  // 0 wall, 1 ceiling, 2 floor
    int panoramaOffset;
    int circleX;
    int circleY;
    int circleRadius;
    char* extra;
};

class Dewarper {
public:
    virtual ~Dewarper() = default;
    virtual int Mode() = 0;
    virtual bool Check() = 0;
    virtual int SubMode() = 0;
    virtual void SetSubMode(int sub_mode) = 0;
    virtual bool IsSubModeSupported(int sub_mode) = 0;
    virtual bool IsNormalPTZSupported(int sub_mode) = 0;
    virtual bool CanPan(int sub_mode) = 0;
    virtual bool CanTilt(int sub_mode) = 0;
    virtual bool CanZoom(int sub_mode) = 0;
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
    virtual DewarpParams* Parameters() = 0;
    virtual int GetLens(int lens, char* buffer, unsigned long size) = 0;
    virtual void SetDewarperType(int type) = 0;
};

class DewarpRegister {
public:
    virtual ~DewarpRegister() = default;
    virtual bool IsCameraSpecific(int mode) = 0;
    virtual void GetSupportedFeatures(int mode, bool& has_lenses, bool& has_circle,
                                      bool& has_position) = 0;
    virtual bool IsLoaded(int mode) = 0;
    virtual char const* GetName(int mode) = 0;
    virtual int GetLens(int mode, int lens, char* buffer, unsigned long size) = 0;
    virtual int GetModeCount() = 0;
    virtual int GetModeByName(char const* name) = 0;
    virtual int GetModeByCamera(char const* make, char const* model, char const* url) = 0;
    virtual int GetDefaultLens(int mode, char const* make, char const* model) = 0;
    virtual Dewarper* Create(int type, DewarpParams const& params) = 0;
};

using GetRegisterFunction = DewarpRegister* (*)();
using CreateDewarperFunction = Dewarper* (*)(int, DewarpParams const&);
using DewarperLoadedFunction = bool (*)(int);
using DeleteDewarperFunction = void (*)(Dewarper*);

}  // namespace vexmap_host
