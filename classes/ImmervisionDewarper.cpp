#include "ImmervisionDewarper.h"

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <new>

#include "ImmervisionLibrary.h"

namespace {

constexpr int FORMAT = 23;
constexpr unsigned long COLOR_FORMAT = 11;  // the library's name for the frames of format 23
constexpr float MIN_FIELD_OF_VIEW = 23.0f;
constexpr float MAX_FIELD_OF_VIEW = 180.0f;
constexpr int LAST_RETRY = 4;  // an error count above this gives the stream up

// The camera models that come with a known lens, by the start of their model name.
struct ModelLens {
    char const* modelPrefix;
    char const* rplNumber;
};
constexpr ModelLens SAMSUNG_LENSES[] = {
    {"SNF-7010", "B5SST"},
    {"SNF-8010", "C7SST"},
    {"PNF-9010", "C8WWT"},
};

ImmervisionFunctions const& Api() {
    return ImmervisionLibraryInstance.Api();
}

// The plug-in has no link-time reference to the library, so `new IMV_CameraInterface` cannot be
// written. Storage of the size the header declares is ours; the library's own complete-object
// constructor and destructor build and tear the object down in it, as a linked `new` and
// `delete` would. Nothing thrown by the library may leave the plug-in.
IMV_CameraInterface* NewCamera() {
    void* const storage = ::operator new(sizeof(IMV_CameraInterface), std::nothrow);
    if (storage == nullptr) {
        return nullptr;
    }
    auto* const camera = static_cast<IMV_CameraInterface*>(storage);
    try {
        Api().Construct(camera);
    } catch (...) {
        ::operator delete(storage);
        return nullptr;
    }
    return camera;
}

// Without the library open its half of the object is gone with it: only the storage is freed.
void DeleteCamera(IMV_CameraInterface* camera) {
    if (ImmervisionLibraryInstance.IsOpen()) {
        Api().Destroy(camera);
    }
    ::operator delete(camera);
}

// The entry of `lens` in the library's list, or null for an index outside it. The library must
// be open.
IMV_LensDescription const* LensAt(int lens) {
    int const count = Api().StaticGetLensDescriptionCount();
    IMV_LensDescription const* const list = Api().StaticGetLensDescription();
    if (list == nullptr || lens < 0 || lens >= count) {
        return nullptr;
    }
    return list + lens;
}

// Sub-modes past 3 are not offered to the host; should one be set, it gets the single view.
unsigned long ViewType(int subMode, int position) {
    switch (subMode) {
        case 2:
            return position != 0 ? 4 : 2;
        case 3:
            return 2;
        default:
            return 0;
    }
}

// The whole picture, at the input's size.
void Describe(IMV_Buffer& image, int width, int height, unsigned char* data) {
    image.width = static_cast<unsigned long>(width);
    image.height = static_cast<unsigned long>(height);
    image.frameX = 0;
    image.frameY = 0;
    image.frameWidth = image.width;
    image.frameHeight = image.height;
    image.data = data;
}

}  // namespace

ImmervisionDewarper::ImmervisionDewarper(DewarpParams_t const& creationParams)
    : IDewarperBaseT(creationParams),
      errorCount(0),
      camera(nullptr),
      inputImage(nullptr),
      outputImage(nullptr) {
    Clear();
}

ImmervisionDewarper::~ImmervisionDewarper() {
    if (camera != nullptr) {
        DeleteCamera(camera);
        camera = nullptr;
    }
    delete inputImage;
    inputImage = nullptr;
    delete outputImage;
    outputImage = nullptr;
}

bool ImmervisionDewarper::Check() {
    // A library that is not open is never called: without it there is no camera to make.
    if (!ImmervisionLibraryInstance.IsOpen()) {
        return false;
    }
    if (camera == nullptr) {
        auto* const input = new (std::nothrow) IMV_Buffer();
        auto* const output = new (std::nothrow) IMV_Buffer();
        IMV_CameraInterface* const made =
            input != nullptr && output != nullptr ? NewCamera() : nullptr;
        if (made == nullptr) {
            delete input;
            delete output;
            return false;
        }
        camera = made;
        inputImage = input;
        outputImage = output;
    }
    return true;
}

// In a panorama, pan is the turn of the panorama, so it starts at the camera's offset.
void ImmervisionDewarper::SetSubMode(int newSubMode) {
    int const wanted = newSubMode == 0 ? 1 : newSubMode;
    if (wanted == subMode) {
        return;
    }
    subMode = wanted;
    optionsDirty = true;
    if (wanted != 1) {
        Clear();
        pan = float(params.panoramaOffset);
    }
}

bool ImmervisionDewarper::IsSubModeSupported(int candidate) {
    return candidate == 1 || candidate == 2 || (candidate == 3 && params.position != 0);
}

bool ImmervisionDewarper::IsNormalPTZSupported(int candidate) {
    return candidate == 2 || candidate == 3;
}

// A ceiling or floor panorama turns, so it pans in every sub-mode.
bool ImmervisionDewarper::CanPan(int) {
    if (errorCount > LAST_RETRY) {
        return false;
    }
    return subMode == 1 || params.position != 0;
}

bool ImmervisionDewarper::CanTilt(int) {
    return errorCount <= LAST_RETRY && subMode == 1;
}

bool ImmervisionDewarper::CanZoom(int) {
    return errorCount <= LAST_RETRY && subMode == 1;
}

// A failed setup is tried again once a frame, five times in all counting the first, and then not
// until the next change of buffers or sub-mode zeroes the count.
bool ImmervisionDewarper::GetImageOutputBuffer(int* width, int* height, unsigned char** buffer,
                                               unsigned int* size, int* format) {
    if (width != nullptr && height != nullptr) {
        *width = inputWidth;
        *height = inputHeight;
    }
    if (!IDewarperBase::GetImageOutputBuffer(width, height, buffer, size, format)) {
        return false;
    }
    if (errorCount > LAST_RETRY) {
        return false;
    }
    if (errorCount != 0) {
        if (!DoInitOptions()) {
            ++errorCount;
            return false;
        }
        errorCount = 0;
    }
    int const code = Api().Update(camera);
    if (code == 0) {
        return true;
    }
    Api().GetErrorString(camera, code);  // the text is dropped: the host only sees the failure
    return false;
}

// The picture keeps the input's size; a ceiling or floor panorama is shown four times as wide.
float ImmervisionDewarper::AdjustAspectRatio(float, float height) {
    return subMode == 2 && params.position != 0 ? height * 4.0f : height;
}

// The widest view.
void ImmervisionDewarper::Clear() {
    pan = 0.0f;
    tilt = 0.0f;
    zoom = MAX_FIELD_OF_VIEW;
}

// A lens without an RPL number is listed with an empty one rather than by printing a null.
int ImmervisionDewarper::GetLens(int lens, char* buffer, unsigned long size) {
    if (!ImmervisionLibraryInstance.IsOpen()) {
        return 0;  // no list to read
    }
    IMV_LensDescription const* const entry = LensAt(lens);
    if (entry == nullptr) {
        return 0;
    }
    char const* const rpl = entry->RPLNumber == nullptr ? "" : entry->RPLNumber;
    return std::snprintf(buffer, buffer == nullptr ? 0 : size, "RPL Number %s", rpl);
}

int ImmervisionDewarper::GetDefaultLens(int mode, char const*, char const* model) {
    if (mode != DewarperType::DewarperSamsung || model == nullptr) {
        return 0;
    }
    char const* wanted = nullptr;
    for (ModelLens const& known : SAMSUNG_LENSES) {
        if (std::strncmp(model, known.modelPrefix, std::strlen(known.modelPrefix)) == 0) {
            wanted = known.rplNumber;
            break;
        }
    }
    if (wanted == nullptr || !ImmervisionLibraryInstance.IsOpen()) {
        return 0;
    }
    int const count = Api().StaticGetLensDescriptionCount();
    IMV_LensDescription const* const list = Api().StaticGetLensDescription();
    for (int index = 0; list != nullptr && index < count; ++index) {
        char const* const rpl = list[index].RPLNumber;
        if (rpl != nullptr && std::strcmp(rpl, wanted) == 0) {
            return index;
        }
    }
    return 0;
}

bool ImmervisionDewarper::InitOptions() {
    errorCount = 0;
    if (DoInitOptions()) {
        return true;
    }
    errorCount = 1;
    return false;
}

// A lens index outside the list selects no lens, and that is no error. The library takes the RPL
// number as `char*` but only reads it.
bool ImmervisionDewarper::DoInitOptions() {
    if (!Check()) {
        return false;
    }
    Describe(*inputImage, inputWidth, inputHeight, inputBuffer);
    Describe(*outputImage, inputWidth, inputHeight, outputBuffer);
    unsigned long const viewType = ViewType(subMode, params.position);
    int code = 0;
    IMV_LensDescription const* const lens = LensAt(params.lens);
    if (lens != nullptr) {
        code = Api().SetLens(camera, const_cast<char*>(lens->RPLNumber));
    }
    if (code == 0) {
        code = Api().SetVideoParams(camera, inputImage, outputImage, COLOR_FORMAT, viewType,
                                    static_cast<unsigned long>(params.position));
    }
    if (code == 0) {
        code = Api().SetZoomLimits(camera, MIN_FIELD_OF_VIEW, MAX_FIELD_OF_VIEW);
    }
    if (code == 0) {
        UpdatePosition();
        return true;
    }
    Api().GetErrorString(camera, code);
    return false;
}

// The library may correct the position and writes it back into the three fields.
void ImmervisionDewarper::UpdatePosition() {
    if (!Check()) {
        return;
    }
    int const code = Api().SetPosition(camera, &pan, &tilt, &zoom, 0, 1);
    if (code != 0) {
        Api().GetErrorString(camera, code);
    }
}

// The zoom is a field of view: zooming in narrows it.
float ImmervisionDewarper::GetZoomScaleModifier() {
    return -0.785f;
}

float ImmervisionDewarper::LimitZoomRange(float value) {
    return std::min(std::max(MIN_FIELD_OF_VIEW, value), MAX_FIELD_OF_VIEW);
}

// Twelve bits a pixel, counted as the host counts them: signed, the division truncating.
void ImmervisionDewarper::GetFormatAndSize(int width, int height, unsigned int* size, int* format) {
    *format = FORMAT;
    *size = unsigned(int64_t(width) * int64_t(height) * 3 / 2);
}
