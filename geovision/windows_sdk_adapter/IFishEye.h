#pragma once

// The interface of Geovision's fisheye SDK as it is on Windows: channels by number, positions in
// tenths of a degree as 16-bit integers. The records hold the fields this system uses; whatever
// else the SDK puts in them is the SDK's business and is left out.

/// Pixel layouts of the SDK: 24-bit R, G, B is the only one.
enum FORMAT : int { FE_FORMAT_RGB24 = 1 };

/// The position of one frame of a view, in tenths of a degree; zoom 0 is the widest view and 800
/// the narrowest.
struct FE_FramePosition {
    short pan;
    short tilt;
    short zoom;
    short reserved;
};

/// A whole view: its kind, the mount, the image circle in source pixels and up to four frames.
struct FE_CurPosParams {
    unsigned short viewMode;   // 1, 2, 4 or 8
    unsigned short mountType;  // 0 ceiling, 1 wall, 2 floor
    unsigned short centerY;
    unsigned short centerX;
    unsigned short radius;
    unsigned short radius2;  // a second radius; the library has one, so it is not read
    FE_FramePosition frame[4];
};
static_assert(sizeof(FE_CurPosParams) == 44, "six words and four frames of four words");

/// A mouse event on the output: the point under the pointer, a relative move and a wheel step
/// (32767 doubles the magnification).
struct FE_EventParams {
    int x;  // output pixels
    int y;
    short pan;
    short tilt;
    short zoom;
};

/// The output rectangle of a view, its kind, and the setting of the first source filter.
struct FE_ViewParams {
    unsigned short viewMode;   // as in FE_CurPosParams
    unsigned short mountType;  // as in FE_CurPosParams
    unsigned short frame;      // moved when no layout lies under the event's point
    int x;                     // output pixels
    int y;
    int width;
    int height;
    float filter[3];
};

/// A still picture of a channel: the caller's buffer, 3 bytes a pixel R, G, B, large enough for
/// the channel's output size, and the size that was written.
struct Fisheye_SnapShot {
    unsigned char* buffer;
    int width;
    int height;
};

/// The SDK's callback object; nothing in this system calls back, so it has no members here.
struct CFishEyeCallBack {};

/// The SDK's fisheye object. The slot order is the SDK's binary contract.
class IFishEye {
public:
    IFishEye() = default;
    IFishEye(IFishEye const&) = default;
    IFishEye& operator=(IFishEye const&) = default;
    virtual ~IFishEye() = default;

    virtual int RegCallback(CFishEyeCallBack* callback) = 0;
    virtual int GvFE_Initialize(int channel, int inputWidth, int inputHeight, int outputWidth,
                                int outputHeight, FORMAT format) = 0;
    virtual int GvFE_ParamsUpdated(int channel, FE_EventParams* event, FE_ViewParams* view) = 0;
    virtual int GvFE_VideoInput(int channel, unsigned char* input, unsigned char* output, int width,
                                int height, FORMAT format, bool flag) = 0;
    virtual int GvFE_Close(int channel) = 0;
    virtual int GvFEalignmentTool(int channel, unsigned char* input, int width, int height,
                                  FORMAT format, FE_ViewParams* view) = 0;
    virtual int GvFESetPosition(int channel, FE_CurPosParams* params) = 0;
    virtual int GvFEGetPosition(int channel, FE_CurPosParams* params) = 0;
    virtual int SetInfo(int channel, int kind, int value, void* data) = 0;
    virtual bool GvFEGPUCreate(int channel, void* device) = 0;
    virtual int GvFEGPUDeviceReset(int channel) = 0;
    virtual int GvFEGPUSnapShotRawData(int channel, Fisheye_SnapShot& snapshot) = 0;
    virtual int GetAbsolutePositionFromInputVideoPoint(int channel, int x, int y, short& pan,
                                                       short& tilt) = 0;
    virtual int SetAbsolutePTZ(int channel, short pan, short tilt, short zoom,
                               unsigned short frame) = 0;
};
