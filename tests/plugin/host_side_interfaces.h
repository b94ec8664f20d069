#pragma once

// The two interfaces as a client declares them for itself, from the slot order it was promised and
// nothing of the plug-in's own headers. A slot moved in the plug-in makes a call here land on the
// wrong function.

namespace host_side {

struct CameraRecord {
    int lens;
    int position;
    int panoramaOffset;
    int circleX;
    int circleY;
    int circleRadius;
    char* extra;
};

class Dewarper {
public:
    virtual ~Dewarper() = default;                                       // slots 0 and 1
    virtual int Mode() = 0;                                              // 2
    virtual bool Check() = 0;                                            // 3
    virtual int SubMode() = 0;                                           // 4
    virtual void SetSubMode(int sub_mode) = 0;                           // 5
    virtual bool IsSubModeSupported(int sub_mode) = 0;                   // 6
    virtual bool IsNormalPTZSupported(int sub_mode) = 0;                 // 7
    virtual bool CanPan(int sub_mode) = 0;                               // 8
    virtual bool CanTilt(int sub_mode) = 0;                              // 9
    virtual bool CanZoom(int sub_mode) = 0;                              // 10
    virtual void Pan(int direction, int speed) = 0;                      // 11
    virtual void Tilt(int direction, int speed) = 0;                     // 12
    virtual void Zoom(int direction, int speed) = 0;                     // 13
    virtual void SetPosition(float pan, float tilt, float zoom) = 0;     // 14
    virtual void GetPosition(float& pan, float& tilt, float& zoom) = 0;  // 15
    virtual bool GetImageInputBuffer(int width, int height, unsigned char** buffer,
                                     unsigned int* size, int* format) = 0;  // 16
    virtual bool GetImageOutputBuffer(int* width, int* height, unsigned char** buffer,
                                      unsigned int* size, int* format) = 0;  // 17
    virtual bool GetNeedsRotation() = 0;                                     // 18
    virtual bool GetFlipVertical() = 0;                                      // 19
    virtual bool GetFlipHorizontal() = 0;                                    // 20
    virtual float AdjustAspectRatio(float width, float height) = 0;          // 21
    virtual void Clear() = 0;                                                // 22
    virtual CameraRecord* Parameters() = 0;                                  // 23
    virtual int GetLens(int lens, char* buffer, unsigned long size) = 0;     // 24
    virtual void SetDewarperType(int type) = 0;                              // 25
};

class Registry {
public:
    virtual ~Registry() = default;                // slots 0 and 1
    virtual bool IsCameraSpecific(int mode) = 0;  // 2
    virtual void GetSupportedFeatures(int mode, bool& lenses, bool& circle,
                                      bool& position) = 0;                                  // 3
    virtual bool IsLoaded(int mode) = 0;                                                    // 4
    virtual char const* GetName(int mode) = 0;                                              // 5
    virtual int GetLens(int mode, int lens, char* buffer, unsigned long size) = 0;          // 6
    virtual int GetModeCount() = 0;                                                         // 7
    virtual int GetModeByName(char const* name) = 0;                                        // 8
    virtual int GetModeByCamera(char const* make, char const* model, char const* url) = 0;  // 9
    virtual int GetDefaultLens(int mode, char const* make, char const* model) = 0;          // 10
    virtual Dewarper* Create(int type, CameraRecord const& record) = 0;                     // 11
};

}  // namespace host_side
