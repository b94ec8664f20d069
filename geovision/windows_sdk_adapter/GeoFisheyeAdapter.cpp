#include "GeoFisheyeAdapter.h"

#include <cmath>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <new>

#include "GeoFisheyeLibrary.h"

geo_fisheye_context* gFisheyeContext = nullptr;

namespace {

constexpr int FAILED = -1;
constexpr int CEILING = 0;
constexpr int WALL = 1;
constexpr int FLOOR = 2;
constexpr int FRAMES = 4;  // frames of an FE_CurPosParams

// Where the positions of an internal view lie in the controller record: one word a layout for
// each of pan, tilt and zoom.
struct ViewWords {
    int layouts;
    int pan;
    int tilt;
    int zoom;
};

// Internal view 2 has no position, so it has no words.
bool WordsOfView(int internalView, ViewWords& words) {
    switch (internalView) {
        case 0:
            words = {GEO_FISHEYE_VIEW0_LAYOUTS, GEO_FISHEYE_VIEW0_PAN, GEO_FISHEYE_VIEW0_TILT,
                     GEO_FISHEYE_VIEW0_ZOOM};
            return true;
        case 1:
            words = {GEO_FISHEYE_VIEW1_LAYOUTS, GEO_FISHEYE_VIEW1_PAN, GEO_FISHEYE_VIEW1_TILT,
                     GEO_FISHEYE_VIEW1_ZOOM};
            return true;
        case 3:
            words = {GEO_FISHEYE_VIEW3_LAYOUTS, GEO_FISHEYE_VIEW3_PAN, GEO_FISHEYE_VIEW3_TILT,
                     GEO_FISHEYE_VIEW3_ZOOM};
            return true;
        default:
            return false;
    }
}

struct FrameLayout {
    int internalView;
    int frame;
    int layout;
};

// Frame 2 of view 0 and frame 3 of view 1 have no layout: the table is the SDK's, gaps included.
constexpr FrameLayout FRAME_LAYOUTS[] = {{0, 1, 0}, {0, 3, 2}, {0, 4, 3},
                                         {1, 1, 0}, {1, 2, 1}, {3, 1, 0}};

// Truncation towards zero into 16 bits. Out of range the value saturates rather than wraps, an
// open choice that keeps a wild float from becoming an undefined conversion; NaN gives 0.
short TruncateToShort(float value) {
    if (std::isnan(value)) {
        return 0;
    }
    if (value <= -32769.0f) {
        return INT16_MIN;
    }
    if (value >= 32768.0f) {
        return INT16_MAX;
    }
    return short(int(value));
}

unsigned short TruncateToUnsignedShort(float value) {
    if (std::isnan(value) || value <= -1.0f) {
        return 0;
    }
    if (value >= 65536.0f) {
        return UINT16_MAX;
    }
    return uint16_t(int(value));
}

// The library's sizes are floats; a size beyond an int saturates, and a negative one stays
// negative so that the library refuses it.
int32_t TruncateToInt(float value) {
    if (std::isnan(value)) {
        return 0;
    }
    if (value <= -2147483648.0f) {
        return INT32_MIN;
    }
    if (value >= 2147483648.0f) {
        return INT32_MAX;
    }
    return int32_t(value);
}

// Whether a view mode and mount of the SDK can reach the library.
bool ValidView(unsigned short viewMode, unsigned short mountType) {
    return GeoFisheyeAdapter::convertViewModeToInternal(viewMode) != FAILED &&
           GeoFisheyeAdapter::convertMountTypeToInternal(mountType) != FAILED;
}

GeoFisheyeFunctions const& Library() {
    return GeoFisheyeLibraryInstance.Api();
}

}  // namespace

int GeoFisheyeAdapter::convertViewModeToInternal(int viewMode) {
    switch (viewMode) {
        case 1:
            return 0;
        case 2:
            return 1;
        case 4:
            return 2;
        case 8:
            return 3;
        default:
            return FAILED;
    }
}

int GeoFisheyeAdapter::convertViewModeFromInternal(int internalView) {
    switch (internalView) {
        case 0:
            return 1;
        case 1:
            return 2;
        case 2:
            return 4;
        case 3:
            return 8;
        default:
            return FAILED;
    }
}

int GeoFisheyeAdapter::convertMountTypeToInternal(int mountType) {
    return mountType >= CEILING && mountType <= FLOOR ? mountType : FAILED;
}

int GeoFisheyeAdapter::convertMountTypeFromInternal(int mount) {
    return mount >= CEILING && mount <= FLOOR ? mount : FAILED;
}

int GeoFisheyeAdapter::convertFormatToInternal(int format) {
    return format == FE_FORMAT_RGB24 ? 1 : FAILED;
}

int GeoFisheyeAdapter::convertFormatFromInternal(int format) {
    return format == 1 ? FE_FORMAT_RGB24 : FAILED;
}

int GeoFisheyeAdapter::convertInternalLayoutIdFromSetFrame(int internalView, int frame) {
    for (FrameLayout const& entry : FRAME_LAYOUTS) {
        if (entry.internalView == internalView && entry.frame == frame) {
            return entry.layout;
        }
    }
    return FAILED;
}

int GeoFisheyeAdapter::convertInternalLayoutIdToSetFrame(int internalView, int layout) {
    for (FrameLayout const& entry : FRAME_LAYOUTS) {
        if (entry.internalView == internalView && entry.layout == layout) {
            return entry.frame;
        }
    }
    return FAILED;
}

// A ceiling or floor turns pan the other way round; on a wall the SDK's -900 to 900 spans the
// library's -90 to 90 degrees, and tilt points the other way.
float GeoFisheyeAdapter::calculatePanToInternal(short pan, int mount) {
    if (mount == CEILING || mount == FLOOR) {
        return float(pan) * -0.1f;
    }
    if (mount == WALL) {
        return (float(pan) + 900.0f) / 1800.0f * 180.0f - 90.0f;
    }
    return float(pan);
}

float GeoFisheyeAdapter::calculateTiltToInternal(short tilt, int mount) {
    if (mount == CEILING || mount == FLOOR) {
        return float(tilt) * 0.1f;
    }
    if (mount == WALL) {
        return float(tilt) * -0.1f;
    }
    return float(tilt);
}

// Zoom steps 0 to 800 become a field of view narrowing from 100 to 20 degrees.
float GeoFisheyeAdapter::calculateZoomToInternal(short zoom, int mount) {
    if (mount == CEILING || mount == WALL || mount == FLOOR) {
        return float(zoom) / -800.0f * 80.0f + 100.0f;
    }
    return float(zoom);
}

short GeoFisheyeAdapter::calculatePanFromInternal(float value, int mount) {
    if (mount == CEILING || mount == FLOOR) {
        return TruncateToShort(value * -10.0f);
    }
    if (mount == WALL) {
        return TruncateToShort((value + 90.0f) / 180.0f * 1800.0f - 900.0f);
    }
    return TruncateToShort(value);
}

short GeoFisheyeAdapter::calculateTiltFromInternal(float value, int mount) {
    if (mount == CEILING || mount == FLOOR) {
        return TruncateToShort(value * 10.0f);
    }
    if (mount == WALL) {
        return TruncateToShort(value * -10.0f);
    }
    return TruncateToShort(value);
}

short GeoFisheyeAdapter::calculateZoomFromInternal(float value, int mount) {
    if (mount == CEILING || mount == WALL || mount == FLOOR) {
        return TruncateToShort((value - 100.0f) / -80.0f * 800.0f);
    }
    return TruncateToShort(value);
}

float GeoFisheyeAdapter::calculatePanToInternalAbsolutePtz(short pan, int mount) {
    return calculatePanToInternal(pan, mount);
}

float GeoFisheyeAdapter::calculateTiltToInternalAbsolutePtz(short tilt, int mount) {
    return calculateTiltToInternal(tilt, mount);
}

float GeoFisheyeAdapter::calculateZoomToInternalAbsolutePtz(short zoom, int mount) {
    return calculateZoomToInternal(zoom, mount);
}

short GeoFisheyeAdapter::calculatePanFromInternalAbsolutePtz(float value, int mount) {
    return calculatePanFromInternal(value, mount);
}

short GeoFisheyeAdapter::calculateTiltFromInternalAbsolutePtz(float value, int mount) {
    return calculateTiltFromInternal(value, mount);
}

short GeoFisheyeAdapter::calculateZoomFromInternalAbsolutePtz(float value, int mount) {
    return calculateZoomFromInternal(value, mount);
}

bool GeoFisheyeAdapter::getPtzValue(int layout, geo_fisheye const* object, float& pan, float& tilt,
                                    float& zoom) {
    if (object == nullptr || !GeoFisheyeLibraryInstance.IsOpen()) {
        return false;
    }
    geo_fisheye_controller_info info{};
    Library().geo_fisheye_get_object_controller_info(object, &info);
    ViewWords words{};
    if (!WordsOfView(info.words[GEO_FISHEYE_VIEW_MODE].integer, words) || layout < 0 ||
        layout >= words.layouts) {
        return false;
    }
    pan = info.words[words.pan + layout].value;
    tilt = info.words[words.tilt + layout].value;
    zoom = info.words[words.zoom + layout].value;
    return true;
}

// With the library closed nothing can be called, so the adapter goes without a context.
GeoFisheyeAdapter::GeoFisheyeAdapter() : fisheyeObjects() {
    if (gFisheyeContext == nullptr && GeoFisheyeLibraryInstance.IsOpen()) {
        if (!Library().geo_fisheye_init(&gFisheyeContext)) {
            std::puts("failed to init fisheye context");
        }
    }
}

// The shutdown is unconditional although other adapters may share the context: the next adapter
// makes a new one only if the library nulled the global.
GeoFisheyeAdapter::~GeoFisheyeAdapter() {
    release();
    if (GeoFisheyeLibraryInstance.IsOpen()) {
        Library().geo_fisheye_shutdown(&gFisheyeContext);
    }
}

int GeoFisheyeAdapter::RegCallback(CFishEyeCallBack*) {
    return 0;
}

int GeoFisheyeAdapter::GvFE_Initialize(int channel, int inputWidth, int inputHeight,
                                       int outputWidth, int outputHeight, FORMAT format) {
    int const internalFormat = convertFormatToInternal(format);
    if (internalFormat == FAILED) {
        return FAILED;
    }
    geo_fisheye* const object = prepare_fisheye_object(channel);
    if (object == nullptr) {
        return FAILED;
    }
    geo_fisheye_source_description const description{inputWidth, inputHeight, internalFormat, true};
    if (!Library().geo_fisheye_init_object(gFisheyeContext, &description, object)) {
        return FAILED;
    }
    Library().geo_fisheye_update_object_bounds(object, 0.0f, 0.0f, float(outputWidth),
                                               float(outputHeight));
    return channel;
}

// A point outside every layout moves the layout of the view's frame; with neither, only the
// settings change. The view's own kind decides that frame's layout, since it is the kind the
// object is switched to before the moves.
int GeoFisheyeAdapter::GvFE_ParamsUpdated(int channel, FE_EventParams* event, FE_ViewParams* view) {
    if (event == nullptr || view == nullptr || !ValidView(view->viewMode, view->mountType)) {
        return FAILED;
    }
    geo_fisheye* const object = find_fisheye_object(channel);
    if (object == nullptr) {
        return FAILED;
    }
    int const internalView = convertViewModeToInternal(view->viewMode);
    int const mount = convertMountTypeToInternal(view->mountType);
    GeoFisheyeFunctions const& library = Library();
    library.geo_fisheye_update_object_bounds(object, float(view->x), float(view->y),
                                             float(view->width), float(view->height));
    int layout = library.geo_fisheye_get_object_layout_id(object, float(event->x), float(event->y));
    if (layout == FAILED) {
        layout = convertInternalLayoutIdFromSetFrame(internalView, view->frame);
    }
    library.geo_fisheye_change_object_view_mode(object, internalView);
    library.geo_fisheye_change_object_mount_type(object, mount);
    if (layout != FAILED) {
        float const pan = mount == CEILING ? -float(event->pan) : float(event->pan);
        library.geo_fisheye_pan_tilt_object(object, layout, pan, float(event->tilt));
        library.geo_fisheye_zoom_object(object, layout, float(event->zoom) / 32767.0f + 1.0f);
    }
    library.geo_fisheye_change_object_source_filter(object, 0, view->filter[0], view->filter[1],
                                                    view->filter[2]);
    library.geo_fisheye_change_object_source_filter(object, 1, 0.5f, 0.5f, 0.5f);
    return channel;
}

// The copy takes the rendered picture's own size: `width` and `height` are the input's.
int GeoFisheyeAdapter::GvFE_VideoInput(int channel, unsigned char* input, unsigned char* output,
                                       int, int, FORMAT, bool) {
    geo_fisheye* const object = find_fisheye_object(channel);
    if (object == nullptr || !Library().geo_fisheye_update_object_image(object, input)) {
        return FAILED;
    }
    if (output == nullptr) {
        return channel;
    }
    geo_fisheye_render_result* result = nullptr;
    if (!Library().geo_fisheye_create_render_result(
            gFisheyeContext, TruncateToInt(object->output_width),
            TruncateToInt(object->output_height), object, &result)) {
        return FAILED;
    }
    if (result != nullptr && result->pixels != nullptr && result->width > 0 && result->height > 0) {
        std::memcpy(output, result->pixels, size_t(result->width) * size_t(result->height) * 4u);
    }
    Library().geo_fisheye_release_render_result(&result);
    return channel;
}

// With the library closed its objects are gone with it; the entry is only forgotten.
int GeoFisheyeAdapter::GvFE_Close(int channel) {
    auto const entry = fisheyeObjects.find(channel);
    if (entry == fisheyeObjects.end()) {
        return FAILED;
    }
    if (GeoFisheyeLibraryInstance.IsOpen()) {
        Library().geo_fisheye_release_object(&entry->second);
    }
    fisheyeObjects.erase(entry);
    return channel;
}

int GeoFisheyeAdapter::GvFEalignmentTool(int, unsigned char*, int, int, FORMAT, FE_ViewParams*) {
    return FAILED;
}

// The second radius has no word of its own and is not read.
int GeoFisheyeAdapter::GvFESetPosition(int channel, FE_CurPosParams* params) {
    if (params == nullptr || !ValidView(params->viewMode, params->mountType)) {
        return FAILED;
    }
    geo_fisheye* const object = find_fisheye_object(channel);
    if (object == nullptr) {
        return FAILED;
    }
    int const internalView = convertViewModeToInternal(params->viewMode);
    int const mount = convertMountTypeToInternal(params->mountType);
    geo_fisheye_controller_info info{};
    Library().geo_fisheye_get_object_controller_info(object, &info);
    info.words[GEO_FISHEYE_VIEW_MODE].integer = internalView;
    info.words[GEO_FISHEYE_MOUNT_TYPE].integer = mount;
    info.words[GEO_FISHEYE_SOURCE_CENTER_X].value = float(params->centerX);
    info.words[GEO_FISHEYE_SOURCE_CENTER_Y].value = float(params->centerY);
    info.words[GEO_FISHEYE_SOURCE_RADIUS].value = float(params->radius);
    ViewWords words{};
    if (WordsOfView(internalView, words)) {
        for (int layout = 0; layout < words.layouts; ++layout) {
            FE_FramePosition const& frame = params->frame[layout];
            info.words[words.pan + layout].value = calculatePanToInternal(frame.pan, mount);
            info.words[words.tilt + layout].value = calculateTiltToInternal(frame.tilt, mount);
            info.words[words.zoom + layout].value = calculateZoomToInternal(frame.zoom, mount);
        }
    }
    Library().geo_fisheye_set_object_controller_info(&info, object);
    return channel;
}

// Frames the view does not have, and the reserved words, read as zero. Both radii take the
// library's one radius.
int GeoFisheyeAdapter::GvFEGetPosition(int channel, FE_CurPosParams* params) {
    geo_fisheye* const object = find_fisheye_object(channel);
    if (params == nullptr || object == nullptr) {
        return FAILED;
    }
    geo_fisheye_controller_info info{};
    Library().geo_fisheye_get_object_controller_info(object, &info);
    int const viewMode = convertViewModeFromInternal(info.words[GEO_FISHEYE_VIEW_MODE].integer);
    int const mount = info.words[GEO_FISHEYE_MOUNT_TYPE].integer;
    int const mountType = convertMountTypeFromInternal(mount);
    if (viewMode == FAILED || mountType == FAILED) {
        return FAILED;
    }
    FE_CurPosParams position{};
    position.viewMode = uint16_t(viewMode);
    position.mountType = uint16_t(mountType);
    position.centerX = TruncateToUnsignedShort(info.words[GEO_FISHEYE_SOURCE_CENTER_X].value);
    position.centerY = TruncateToUnsignedShort(info.words[GEO_FISHEYE_SOURCE_CENTER_Y].value);
    position.radius = TruncateToUnsignedShort(info.words[GEO_FISHEYE_SOURCE_RADIUS].value);
    position.radius2 = position.radius;
    for (int layout = 0; layout < FRAMES; ++layout) {
        float pan = 0.0f;
        float tilt = 0.0f;
        float zoom = 0.0f;
        if (getPtzValue(layout, object, pan, tilt, zoom)) {
            FE_FramePosition& frame = position.frame[layout];
            frame.pan = calculatePanFromInternal(pan, mount);
            frame.tilt = calculateTiltFromInternal(tilt, mount);
            frame.zoom = calculateZoomFromInternal(zoom, mount);
        }
    }
    *params = position;
    return channel;
}

int GeoFisheyeAdapter::SetInfo(int channel, int, int, void*) {
    return channel;
}

bool GeoFisheyeAdapter::GvFEGPUCreate(int, void*) {
    return true;
}

int GeoFisheyeAdapter::GvFEGPUDeviceReset(int channel) {
    return channel;
}

// The channel is looked up first, as in every channel operation, so an unknown channel fails
// even without a buffer.
int GeoFisheyeAdapter::GvFEGPUSnapShotRawData(int channel, Fisheye_SnapShot& snapshot) {
    geo_fisheye* const object = find_fisheye_object(channel);
    if (object == nullptr) {
        return FAILED;
    }
    if (snapshot.buffer == nullptr) {
        return 0;
    }
    geo_fisheye_render_result* result = nullptr;
    if (!Library().geo_fisheye_create_render_result(
            gFisheyeContext, TruncateToInt(object->output_width),
            TruncateToInt(object->output_height), object, &result)) {
        return FAILED;
    }
    if (result != nullptr && result->pixels != nullptr && result->width > 0 && result->height > 0) {
        size_t const pixels = size_t(result->width) * size_t(result->height);
        for (size_t index = 0; index < pixels; ++index) {
            std::memcpy(snapshot.buffer + index * 3u, result->pixels + index * 4u, 3u);
        }
    }
    if (result != nullptr) {
        snapshot.width = result->width;
        snapshot.height = result->height;
    }
    Library().geo_fisheye_release_render_result(&result);
    return 1;
}

int GeoFisheyeAdapter::GetAbsolutePositionFromInputVideoPoint(int channel, int x, int y, short& pan,
                                                              short& tilt) {
    geo_fisheye* const object = find_fisheye_object(channel);
    if (object == nullptr) {
        return FAILED;
    }
    float internalPan = 0.0f;
    float internalTilt = 0.0f;
    Library().geo_fisheye_calculate_object_pan_tilt(float(x), float(y), object, &internalPan,
                                                    &internalTilt);
    pan = calculatePanFromInternalAbsolutePtz(internalPan, object->mount_type);
    tilt = calculateTiltFromInternalAbsolutePtz(internalTilt, object->mount_type);
    return channel;
}

// Internal view 2 has no layout for any frame, so nothing in it can be moved.
int GeoFisheyeAdapter::SetAbsolutePTZ(int channel, short pan, short tilt, short zoom,
                                      unsigned short frame) {
    geo_fisheye* const object = find_fisheye_object(channel);
    if (object == nullptr) {
        return FAILED;
    }
    int const layout = convertInternalLayoutIdFromSetFrame(object->view_mode, frame);
    if (layout == FAILED) {
        return FAILED;
    }
    int const mount = object->mount_type;
    Library().geo_fisheye_set_object_pan_tilt(object, layout,
                                              calculatePanToInternalAbsolutePtz(pan, mount),
                                              calculateTiltToInternalAbsolutePtz(tilt, mount));
    Library().geo_fisheye_set_object_zoom(object, layout,
                                          calculateZoomToInternalAbsolutePtz(zoom, mount));
    return channel;
}

geo_fisheye* GeoFisheyeAdapter::find_fisheye_object(int channel) const {
    if (!GeoFisheyeLibraryInstance.IsOpen()) {
        return nullptr;
    }
    auto const entry = fisheyeObjects.find(channel);
    return entry == fisheyeObjects.end() ? nullptr : entry->second;
}

// No exception may leave the plug-in: a map that cannot grow gives the object back.
geo_fisheye* GeoFisheyeAdapter::prepare_fisheye_object(int channel) {
    if (!GeoFisheyeLibraryInstance.IsOpen()) {
        return nullptr;
    }
    geo_fisheye* const found = find_fisheye_object(channel);
    if (found != nullptr) {
        return found;
    }
    geo_fisheye* object = Library().geo_fisheye_create_object();
    if (object == nullptr) {
        return nullptr;
    }
    try {
        fisheyeObjects[channel] = object;
    } catch (std::bad_alloc const&) {
        Library().geo_fisheye_release_object(&object);
        return nullptr;
    }
    return object;
}

void GeoFisheyeAdapter::release() {
    if (GeoFisheyeLibraryInstance.IsOpen()) {
        for (auto& entry : fisheyeObjects) {
            if (entry.second != nullptr) {
                Library().geo_fisheye_release_object(&entry.second);
            }
        }
    }
    fisheyeObjects.clear();
}
