#pragma once

// libIMV1 (soname libIMV1.so.2), the closed panomorph dewarping library, as its own C++ header
// declares it. The plug-in takes types from here and never calls these functions directly: it
// reaches them at run time through ImmervisionLibraryInstance.

#include <cstddef>

/// A picture the library reads or writes: its size, the part of it in use and the pixels, which
/// the library reads again at each `Update`. Every field is 64 bits wide.
struct IMV_Buffer {
    unsigned long width;
    unsigned long height;
    unsigned long frameX;
    unsigned long frameY;
    unsigned long frameWidth;
    unsigned long frameHeight;
    unsigned char* data;
};

static_assert(sizeof(IMV_Buffer) == 56, "IMV_Buffer is seven 64-bit fields");
static_assert(offsetof(IMV_Buffer, width) == 0, "IMV_Buffer::width");
static_assert(offsetof(IMV_Buffer, height) == 8, "IMV_Buffer::height");
static_assert(offsetof(IMV_Buffer, frameX) == 16, "IMV_Buffer::frameX");
static_assert(offsetof(IMV_Buffer, frameY) == 24, "IMV_Buffer::frameY");
static_assert(offsetof(IMV_Buffer, frameWidth) == 32, "IMV_Buffer::frameWidth");
static_assert(offsetof(IMV_Buffer, frameHeight) == 40, "IMV_Buffer::frameHeight");
static_assert(offsetof(IMV_Buffer, data) == 48, "IMV_Buffer::data");

/// One lens the library knows, named by its RPL number. The RPL number may be null.
struct IMV_LensDescription {
    char const* RPLNumber;
    void const* reserved;  // the library's own; nobody outside it reads this
};

static_assert(sizeof(IMV_LensDescription) == 16, "a lens description is 16 bytes");
static_assert(offsetof(IMV_LensDescription, RPLNumber) == 0, "the RPL number comes first");

struct IMV_CameraState;

/// One dewarping camera of the library: a lens, the two pictures and a view into the lens. Every
/// `int` result is 0 on success and otherwise a code that `GetErrorString` explains.
///
/// The object's size is the one this header declares: the library keeps everything else behind
/// `state`, so a caller may allocate `sizeof(IMV_CameraInterface)` bytes and construct in them.
class IMV_CameraInterface {
public:
    IMV_CameraInterface();  // no lens and no video yet
    IMV_CameraInterface(IMV_CameraInterface const&) = delete;
    IMV_CameraInterface& operator=(IMV_CameraInterface const&) = delete;
    ~IMV_CameraInterface();

    /// The lenses the library knows, `StaticGetLensDescriptionCount()` of them.
    static IMV_LensDescription const* StaticGetLensDescription();
    static int StaticGetLensDescriptionCount();

    int SetLens(char* rpl);
    /// Both records stay the caller's and are read again at each `Update`.
    int SetVideoParams(IMV_Buffer* input, IMV_Buffer* output, unsigned long colorFormat,
                       unsigned long viewType, unsigned long position);
    int SetZoomLimits(float min, float max);
    /// The library may write a corrected position back through the three pointers.
    int SetPosition(float* pan, float* tilt, float* zoom, unsigned long, unsigned long);
    int Update();
    char const* GetErrorString(int code);

private:
    IMV_CameraState* state;
};

static_assert(sizeof(IMV_CameraInterface) == sizeof(void*), "the object is one pointer");
